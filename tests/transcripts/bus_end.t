# nebu
# An incrementing transfer must end at 0x1FFFF at the latest: one that would run past it is
# refused before anything is sent, like a start address beyond it. The raw data calls return
# the failure of the bus call they make.
> peek 0 1 2 0x1FFFE 2
peek=0x0000 0x0000
> getSlaveCount 0 1
rc=0x00000000
count=8
> stats
stats commands=8 writeBits=38 readBits=11 flushes=0 statusReads=4 roundTrips=7 cableUs=877
> write 0 1 2 0x1FFFF 2 BEEF0000
message 256: Invalid burst end address (Address + Word Count - 1 > Maximum Address 0x1FFFF).\n
rc=0x80000000
> burstSlaveWrite 0 1 2 0x1FFFE 1 0x1 0x2 0x3
message 256: Invalid burst end address (Address + Word Count - 1 > Maximum Address 0x1FFFF).\n
rc=0x80000000
status=0
> read 0 1 2 0x1FFFF 3
message 256: Invalid burst end address (Address + Word Count - 1 > Maximum Address 0x1FFFF).\n
rc=0x80000000
data=000000000000
> burstSlaveRead 0 1 2 0x1FFFF 1 2
message 256: Invalid burst end address (Address + Word Count - 1 > Maximum Address 0x1FFFF).\n
rc=0x80000000
buffer=0xFFFFFFFF 0xFFFFFFFF
status=0
> read 0 1 2 0x20000 1
message 256: Invalid bus address (Address > Maximum Address 0x1FFFF).\n
rc=0x80000000
data=0000
> write 0 1 2 0x20000 1 BEEF
message 256: Invalid bus address (Address > Maximum Address 0x1FFFF).\n
rc=0x80000000
> stats
stats commands=0 writeBits=0 readBits=0 flushes=0 statusReads=0 roundTrips=0 cableUs=0
> peek 0 1 2 0x0000 2
peek=0xCAFE 0xBEEF
# The last word of the bus is still reached, and a fixed address never moves.
> write 0 1 2 0x1FFFE 2 BEEF0001
rc=0x00000000
> read 0 1 2 0x1FFFE 2
rc=0x00000000
data=BEEF0001
> burstSlaveRead 0 1 2 0x1FFFF 0 3
rc=0x00000000
buffer=0xBEEF 0xBEEF 0xBEEF
status=0
# exit 1
