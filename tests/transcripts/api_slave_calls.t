# nebu
# initialize takes only indices the bus lists; register calls need an initialized slave;
# initialize twice is fine, terminate removes the slave, and terminating nothing is quiet.
> initialize 0 1 8
message 256: Device:0, user chain number:1, slave index:8, does not have a valid OrvNebu slave index.\n
rc=0x80000000
> initialize 0 5 0
message 256: Invalid NEBU Bus Device:0, user chain number/bus:5.
rc=0x80000000
> getRegisters 0 1 1 EVENT_COUNT
message 256: Data structures not initialized for OrvNebu slave Device:0, user chain number/bus:1, slave index:1.
rc=0x80000000
EVENT_COUNT=
> initialize 0 1 1
rc=0x00000000
> initialize 0 1 1
rc=0x00000000
> getRegisters 0 1 1 EVENT_COUNT
rc=0x00000000
EVENT_COUNT=02000100
> terminate 0 1 1
rc=0x00000000
> terminate 0 1 1
rc=0x00000000
> getRegisters 0 1 1 EVENT_COUNT
message 256: Data structures not initialized for OrvNebu slave Device:0, user chain number/bus:1, slave index:1.
rc=0x80000000
EVENT_COUNT=
> setRegisters 0 1 1 EVENT_COUNT=1
message 256: Data structures not initialized for OrvNebu slave Device:0, user chain number/bus:1, slave index:1.
rc=0x80000000
# exit 1
