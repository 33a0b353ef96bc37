# nebu -e stats
# exit 0
