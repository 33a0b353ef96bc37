# nebu
# initialize takes only indices the bus lists, on a bus that exists.
> initialize 0 1 8
message 256: Device:0, user chain number:1, slave index:8, does not have a valid OrvNebu slave index.\n
rc=0x80000000
> initialize 0 5 0
message 256: Invalid NEBU Bus Device:0, user chain number/bus:5.
rc=0x80000000
# exit 1
