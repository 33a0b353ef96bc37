# nebu --trace
# The JTAG operations of bus calls as they happen: discovery (core list, master status, clock
# reset, bus reset polled until done), a single read and a burst write.
> getSlaveCount 0 1
jtag status device=0 chain=1 core=0 type=3
jtag status device=0 chain=1 core=1 type=14
jtag status device=0 chain=1 core=1 type=14
jtag write cmd=7 bits=4 data=0x1
jtag write cmd=7 bits=4 data=0x0
jtag read cmd=7 bits=3 data=0x0
jtag write cmd=1 bits=10 data=0x3FF
jtag write cmd=1 bits=10 data=0x3FE
jtag read cmd=2 bits=4 data=0x0
jtag read cmd=2 bits=4 data=0x2
jtag write cmd=1 bits=10 data=0x000
rc=0x00000000
count=8
> singleSlaveRead 0 1 0 0x0003
jtag write cmd=4 bits=29 data=0x00000000
jtag write cmd=5 bits=19 data=0x00003
jtag read cmd=6 bits=16 data=0x1234
jtag read cmd=3 bits=10 data=0x000
rc=0x00000000
buffer=0x1234
status=0
> burstSlaveWrite 0 1 1 0x0100 1 0x1111 0x2222
jtag write cmd=4 bits=29 data=0x00160002
jtag write cmd=5 bits=19 data=0x20100
jtag write cmd=6 bits=34 data=0x022221111
jtag flush
jtag read cmd=3 bits=10 data=0x000
rc=0x00000000
status=0
> stats
stats commands=16 writeBits=168 readBits=47 flushes=1 statusReads=4 roundTrips=11 cableUs=1382
> peek 0 1 1 0x0100 2
peek=0x1111 0x2222
# exit 0
