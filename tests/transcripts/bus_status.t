# nebu --board bus_board.json
# A reset that never completes fails after eleven 4-bit polls (readBits=44); the slave reset
# has the same handshake.
> getSlaveCount 0 6
message 256: NEBU Master timed out.\n
rc=0x80000000
count=0
> stats
stats commands=14 writeBits=12 readBits=44 flushes=1 statusReads=3 roundTrips=15 cableUs=1877
> resetSlave 0 6 1
message 256: NEBU Master timed out.\n
rc=0x80000000
> stats
stats commands=14 writeBits=12 readBits=44 flushes=1 statusReads=0 roundTrips=12 cableUs=1502
# The clock poll stops at the first read that shows the clock running or locked, and fails
# after eleven 3-bit reads, with no bus reset then.
> getSlaveCount 0 8
rc=0x00000000
count=1
> stats
stats commands=7 writeBits=17 readBits=7 flushes=0 statusReads=3 roundTrips=5 cableUs=626
> getSlaveCount 0 9
rc=0x00000000
count=1
> stats
stats commands=9 writeBits=17 readBits=13 flushes=0 statusReads=3 roundTrips=7 cableUs=876
> getSlaveCount 0 7
message 256: NEBU Master could not reset the System Clock.\nThe System Clock is not locked.\nThe System Clock is not running.\n
rc=0x80000000
count=0
> stats
stats commands=13 writeBits=8 readBits=33 flushes=0 statusReads=3 roundTrips=14 cableUs=1751
# Each call's status: the bus error bits (bit 1 is left from the failed reset of chain 6) and
# the slave's own bit; a broadcast shows the bus bits only.
> singleSlaveRead 0 6 0 0
rc=0x00000000
buffer=0x0000
status=6
> broadcastSingleWrite 0 6 0x31 1
rc=0x00000000
status=2
> getBusErrorStatus 0 6 5
rc=0x00000000
errorStatus=6 2 4294967295 4294967295 4294967295
> getBusErrorStatus 0 6 1
message 256: errorStatusLen must equal to maximum slaves supported.\n
rc=0x80000000
errorStatus=4294967295
# A status for a position past the bus fails after the transfer.
> singleSlaveRead 0 6 2 0
message 256: Invalid slave index (Slave Index >= Maximum Slaves Supported).\n
rc=0x80000000
buffer=0x0000
status=0
# An empty position sets bus error bit 0; slave 1 is faulty and adds its own bit 2. A slave
# reset clears its own bit, a bus reset every bit.
> getSlaveCount 0 1
rc=0x00000000
count=4
> singleSlaveWrite 0 1 2 0 1
rc=0x00000000
status=1
> singleSlaveRead 0 1 0 0x10
rc=0x00000000
buffer=0xABCD
status=1
> burstSlaveWrite 0 1 1 0 1 7
rc=0x00000000
status=5
> singleSlaveReadModifyWrite 0 1 0 0x10 0 0xFFFF
rc=0x00000000
status=1
> singleSlaveWriteAndInspect 0 1 1 0 9
rc=0x00000000
rdBuf=0x0009
status=5
> broadcastSingleWrite 0 1 0x30 0x4242
rc=0x00000000
status=1
> getBusErrorStatus 0 1 4
rc=0x00000000
errorStatus=1 5 1 1
> resetSlave 0 1 1
rc=0x00000000
> getBusErrorStatus 0 1 4
rc=0x00000000
errorStatus=1 1 1 1
> clearBusErrorStatus 0 1
rc=0x00000000
> singleSlaveRead 0 1 0 0x10
rc=0x00000000
buffer=0xABCD
status=0
# A slave whose transfers the host refuses is no slave; the bus itself still resets.
> initialize 0 10 0
message 256: Command 4 to core 0 on user chain 10 of device 0 failed.
message 256: Device:0, user chain number:10, slave index:0, is not a valid OrvNebu Slave core.
rc=0x80000000
> resetBus 0 10
rc=0x00000000
# exit 1
