# nebu --tck-mhz=1 --round-trip-us 0
# At 1 MHz without latency a bit costs a microsecond; a second stats sees nothing new.
> getSlaveCount 0 1
rc=0x00000000
count=8
> stats
stats commands=8 writeBits=38 readBits=11 flushes=0 statusReads=4 roundTrips=7 cableUs=49
> stats
stats commands=0 writeBits=0 readBits=0 flushes=0 statusReads=0 roundTrips=0 cableUs=0
# exit 0
