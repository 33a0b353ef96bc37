# nebu --board memory.json
# slave 0, memory and identity
> peek 0 1 0 0x10 2
peek=0x1234 0x0001
> getSlaveInfo 0 1 0 "#note=kept"
> peek 0 1 0 0x1G
# exit 0
