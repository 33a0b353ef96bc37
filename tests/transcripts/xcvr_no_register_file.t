# nebu
# A transceiver slave whose register file cannot be opened is not created; the reader's report
# is told once more by the creation.
$ nebu --data-dir xcvr_noregs -e "initialize 0 2 0"
\> initialize 0 2 0
message 256: Unable to open OrvNebu register file: xcvr_noregs/none.csv
message 256: Unable to open OrvNebu register file: xcvr_noregs/none.csv
message 32768: Orv abort command
rc=0x80000000
[exit 1]
# exit 0
