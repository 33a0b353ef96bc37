# nebu --trace --board bus_board.json
# Discovery: the core list up to the first master (of two, the lower-indexed one), its status,
# a clock reset where the master has one, then a bus reset polled until done. Commands carry
# slave count + 2 control bits.
> getSlaveCount 0 1
jtag status device=0 chain=1 core=0 type=3
jtag status device=0 chain=1 core=1 type=14
jtag status device=0 chain=1 core=1 type=14
jtag write cmd=7 bits=4 data=0x1
jtag write cmd=7 bits=4 data=0x0
jtag read cmd=7 bits=3 data=0x2
jtag write cmd=1 bits=6 data=0x3F
jtag write cmd=1 bits=6 data=0x3E
jtag read cmd=2 bits=4 data=0x2
jtag write cmd=1 bits=6 data=0x00
rc=0x00000000
count=4
# No slave positions, no cores, a configuration controller (never probed), no device: no bus.
> getSlaveCount 0 3
jtag status device=0 chain=3 core=0 type=14
rc=0x00000000
count=0
> getSlaveCount 1 1
rc=0x00000000
count=0
> getSlaveCount 4294967295 4000000000
rc=0x00000000
count=0
> resetBus 0 3
jtag status device=0 chain=3 core=0 type=14
message 256: Invalid NEBU Bus Device:0, user chain number/bus:3.
rc=0x80000000
> getSlaveHandles 0 5 1
message 256: Invalid NEBU Bus Device:0, user chain number/bus:5.
rc=0x80000000
slaveHandles=4294967295
> resetBus 1 1
message 256: Invalid NEBU Bus Device:1, user chain number/bus:1.
rc=0x80000000
# A known bus is found without device access; calls that need no transfer send nothing.
> getSlaveHandles 0 1 5
rc=0x00000000
slaveHandles=0 1 2 3 4
> testSlaveInterface 0 1 0
rc=0x00000000
result=0
> disableSlave 0 1 0
rc=0x00000000
> enableSlave 0 1 200
rc=0x00000000
> getBusInfo 0 1
jtag status device=0 chain=1 core=1 type=14
rc=0x00000000
dclk_has_reset=1
period_frc=517
period_int=1000
# The slave information is the text of its eight identification words, one burst.
> getSlaveInfo 0 1 0 mine=stays slave_type=replaced
jtag write cmd=4 bits=29 data=0x00060008
jtag write cmd=5 bits=19 data=0x1FFF0
jtag read cmd=6 bits=128 data=0x000300090A0100070203000500010044
rc=0x00000000
cg_alpha_ver=7
cg_ver=2.3
cg_ver.major=2
cg_ver.minor=3
core_type=5
eda_ver=10.1
eda_ver.major=10
eda_ver.minor=1
mine=stays
next_slave=3
orv_drv_ver=1
slave_type=68
# Each call on the wire, without status.
> status off
> clearBusErrorStatus 0 1
jtag status device=0 chain=1 core=1 type=14
jtag write cmd=7 bits=4 data=0x1
jtag write cmd=7 bits=4 data=0x0
jtag read cmd=7 bits=3 data=0x2
jtag write cmd=1 bits=6 data=0x3F
jtag write cmd=1 bits=6 data=0x3E
jtag read cmd=2 bits=4 data=0x2
jtag write cmd=1 bits=6 data=0x00
rc=0x00000000
> resetSlave 0 1 2
jtag write cmd=1 bits=6 data=0x09
jtag write cmd=1 bits=6 data=0x08
jtag read cmd=2 bits=4 data=0x2
jtag write cmd=1 bits=6 data=0x00
rc=0x00000000
> singleSlaveWrite 0 1 3 0x1FFFF 0xFFFF1234
jtag write cmd=4 bits=29 data=0x00300000
jtag write cmd=5 bits=19 data=0x3FFFF
jtag write cmd=6 bits=18 data=0x01234
jtag flush
rc=0x00000000
> singleSlaveReadModifyWrite 0 1 0 0x10 0x12 0xFF00
jtag write cmd=4 bits=29 data=0x00000000
jtag write cmd=5 bits=19 data=0x00010
jtag read cmd=6 bits=16 data=0xABCD
jtag write cmd=4 bits=29 data=0x00000000
jtag write cmd=5 bits=19 data=0x20010
jtag write cmd=6 bits=18 data=0x0AB12
jtag flush
rc=0x00000000
> singleSlaveWriteAndInspect 0 1 0 0x11 0x7777
jtag write cmd=4 bits=29 data=0x00000000
jtag write cmd=5 bits=19 data=0x20011
jtag write cmd=6 bits=18 data=0x07777
jtag flush
jtag write cmd=4 bits=29 data=0x00000000
jtag write cmd=5 bits=19 data=0x00011
jtag read cmd=6 bits=16 data=0x7777
rc=0x00000000
rdBuf=0x7777
> burstSlaveRead 0 1 0 0x20 1 3
jtag write cmd=4 bits=29 data=0x00060003
jtag write cmd=5 bits=19 data=0x00020
jtag read cmd=6 bits=48 data=0x000300020001
rc=0x00000000
buffer=0x0001 0x0002 0x0003
> burstSlaveWrite 0 1 0 0x21 1 0x1234
jtag write cmd=4 bits=29 data=0x00060001
jtag write cmd=5 bits=19 data=0x20021
jtag write cmd=6 bits=18 data=0x01234
jtag flush
rc=0x00000000
> broadcastSingleWrite 0 1 0x1FFFF 0x4243
jtag write cmd=4 bits=29 data=0x00080000
jtag write cmd=5 bits=19 data=0x3FFFF
jtag write cmd=6 bits=18 data=0x04243
jtag flush
rc=0x00000000
# A position past the bus is sent; only its status would fail.
> singleSlaveRead 0 1 5 0
jtag write cmd=4 bits=29 data=0x00500000
jtag write cmd=5 bits=19 data=0x00000
jtag read cmd=6 bits=16 data=0x0000
rc=0x00000000
buffer=0x0000
# What the master cannot carry is refused before anything is sent.
> singleSlaveRead 0 1 256 0x10
message 256: Invalid slave index (Slave Index >= Maximum Slaves Supported).\n
rc=0x80000000
buffer=0x0000
> singleSlaveWrite 0 1 256 0x10 1
message 256: Invalid slave index (Slave Index >= Maximum Slaves Supported).\n
rc=0x80000000
> singleSlaveWrite 0 1 0 0x20010 1
message 256: Invalid bus address (Address > Maximum Address 0x1FFFF).\n
rc=0x80000000
> singleSlaveReadModifyWrite 0 1 0 0x20010 1 0
message 256: Invalid bus address (Address > Maximum Address 0x1FFFF).\n
rc=0x80000000
> broadcastSingleWrite 0 1 0x20010 1
message 256: Invalid bus address (Address > Maximum Address 0x1FFFF).\n
rc=0x80000000
> burstSlaveRead 0 1 256 0 1 1
message 256: Invalid slave index (Slave Index >= Maximum Slaves Supported).\n
rc=0x80000000
buffer=0xFFFFFFFF
> burstSlaveWrite 0 1 0 0x20000 0 1
message 256: Invalid bus address (Address > Maximum Address 0x1FFFF).\n
rc=0x80000000
> resetSlave 0 1 4
message 256: Invalid slave index (Slave Index >= Maximum Slaves Supported).\n
rc=0x80000000
> resetSlave 0 1 300
message 256: Invalid slave index (Slave Index >= Maximum Slaves Supported).\n
rc=0x80000000
# Sessions have their own buses: an ended session discovers anew, another keeps its own.
# Chain 2 has the most slave positions a master can have.
> session 2
> getSlaveHandles 0 2 1
jtag status device=0 chain=2 core=0 type=14
jtag status device=0 chain=2 core=0 type=14
jtag write cmd=1 bits=257 data=0x1FFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFF
jtag write cmd=1 bits=257 data=0x1FFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFE
jtag read cmd=2 bits=4 data=0x2
jtag write cmd=1 bits=257 data=0x00000000000000000000000000000000000000000000000000000000000000000
rc=0x00000000
slaveHandles=0
# The highest slave index a transfer can name, all 8 bits of it on the wire.
> singleSlaveRead 0 2 255 0
jtag write cmd=4 bits=29 data=0x0FF00000
jtag write cmd=5 bits=19 data=0x00000
jtag read cmd=6 bits=16 data=0x0000
rc=0x00000000
buffer=0x0000
> endSession 1
> getSlaveHandles 0 2 1
rc=0x00000000
slaveHandles=0
> session 1
> getSlaveHandles 0 1 1
jtag status device=0 chain=1 core=0 type=3
jtag status device=0 chain=1 core=1 type=14
jtag status device=0 chain=1 core=1 type=14
jtag write cmd=7 bits=4 data=0x1
jtag write cmd=7 bits=4 data=0x0
jtag read cmd=7 bits=3 data=0x2
jtag write cmd=1 bits=6 data=0x3F
jtag write cmd=1 bits=6 data=0x3E
jtag read cmd=2 bits=4 data=0x2
jtag write cmd=1 bits=6 data=0x00
rc=0x00000000
slaveHandles=0
# exit 1
