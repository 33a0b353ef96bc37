# nebu
# The tour of the demo board (scripts/demo.nebu) with its output, on the demo board and data.

# Slave memory as the board holds it, read and written directly, without JTAG:
# four words of slave 0 (its control block), then two words written and read back.
> peek 0 1 0 0x0000 4
peek=0x0001 0x0000 0x00FF 0x1234
> poke 0 1 0 0x0020 0x1111 0x2222
> peek 0 1 0 0x0020 2
peek=0x1111 0x2222
> peek 0 1 1 0x0100
peek=0x5A5A

# Bus calls print their status word unless told otherwise; sessions are numbered by the host.
> status on
> session 1

# JTAG traffic of the session since the last look: peek and poke cost nothing.
> stats
stats commands=0 writeBits=0 readBits=0 flushes=0 statusReads=0 roundTrips=0 cableUs=0

# The bus: discovery counts the slave positions and resets the bus (see it with --trace).
> getSlaveCount 0 1
rc=0x00000000
count=8
> getBusInfo 0 1
rc=0x00000000
dclk_has_reset=1
period_frc=0
period_int=10
> getSlaveHandles 0 1 8
rc=0x00000000
slaveHandles=0 1 2 3 4 5 6 7
> scan
device 0 chain 1: 8 slaves
  slave 0: slave_type=17 orv_drv_ver=1 core_type=1 cg_ver=2.3 cg_alpha_ver=0 eda_ver=10.1 next_slave=0
  slave 1: slave_type=18 orv_drv_ver=1 core_type=2 cg_ver=2.3 cg_alpha_ver=0 eda_ver=10.1 next_slave=0
  slave 2: slave_type=19 orv_drv_ver=1 core_type=3 cg_ver=1.4 cg_alpha_ver=0 eda_ver=10.2 next_slave=0
  slave 3: slave_type=0 orv_drv_ver=0 core_type=0 cg_ver=0.0 cg_alpha_ver=0 eda_ver=0.0 next_slave=0
  slave 4: slave_type=0 orv_drv_ver=0 core_type=0 cg_ver=0.0 cg_alpha_ver=0 eda_ver=0.0 next_slave=0
  slave 5: slave_type=0 orv_drv_ver=0 core_type=0 cg_ver=0.0 cg_alpha_ver=0 eda_ver=0.0 next_slave=0
  slave 6: slave_type=0 orv_drv_ver=0 core_type=0 cg_ver=0.0 cg_alpha_ver=0 eda_ver=0.0 next_slave=0
  slave 7: slave_type=0 orv_drv_ver=0 core_type=0 cg_ver=0.0 cg_alpha_ver=0 eda_ver=0.0 next_slave=0
device 0 chain 2: 8 slaves
  slave 0: slave_type=68 orv_drv_ver=1 core_type=5 cg_ver=3.1 cg_alpha_ver=0 eda_ver=10.1 next_slave=0
  slave 1: slave_type=66 orv_drv_ver=1 core_type=6 cg_ver=3.1 cg_alpha_ver=0 eda_ver=10.1 next_slave=1
  slave 2: slave_type=66 orv_drv_ver=1 core_type=6 cg_ver=3.1 cg_alpha_ver=0 eda_ver=10.1 next_slave=1
  slave 3: slave_type=66 orv_drv_ver=1 core_type=6 cg_ver=3.1 cg_alpha_ver=0 eda_ver=10.1 next_slave=0
  slave 4: slave_type=67 orv_drv_ver=1 core_type=7 cg_ver=3.1 cg_alpha_ver=0 eda_ver=10.1 next_slave=0
  slave 5: slave_type=69 orv_drv_ver=1 core_type=8 cg_ver=3.1 cg_alpha_ver=0 eda_ver=10.1 next_slave=0
  slave 6: slave_type=0 orv_drv_ver=0 core_type=0 cg_ver=0.0 cg_alpha_ver=0 eda_ver=0.0 next_slave=0
  slave 7: slave_type=0 orv_drv_ver=0 core_type=0 cg_ver=0.0 cg_alpha_ver=0 eda_ver=0.0 next_slave=0
device 1 chain 1: no bus
# scan read the empty positions 3 to 7 too, which sets bus error bit 0: clear it.
> getBusErrorStatus 0 1 8
rc=0x00000000
errorStatus=1 1 1 1 1 1 1 1
> clearBusErrorStatus 0 1
rc=0x00000000

# Raw bus access, with and without a slave object.
> singleSlaveRead 0 1 0 0x0003
rc=0x00000000
buffer=0x1234
status=0
> burstSlaveRead 0 1 0 0x0000 1 4
rc=0x00000000
buffer=0x0001 0x0000 0x00FF 0x1234
status=0
> singleSlaveWrite 0 1 0 0x0020 0x5555
rc=0x00000000
status=0
> singleSlaveReadModifyWrite 0 1 0 0x0020 0x0012 0xFF00
rc=0x00000000
status=0
> peek 0 1 0 0x0020
peek=0x5512
> read 0 1 0 0x0000 2
rc=0x00000000
data=00000001
> getBusErrorStatus 0 1 8
rc=0x00000000
errorStatus=0 0 0 0 0 0 0 0

# A slave object: identity, every register and every parameter, then a parameter set by name.
> initialize 0 1 0
rc=0x00000000
> getSlaveInfo 0 1 0
rc=0x00000000
cg_alpha_ver=0
cg_ver=2.3
cg_ver.major=2
cg_ver.minor=3
core_type=1
eda_ver=10.1
eda_ver.major=10
eda_ver.minor=1
next_slave=0
orv_drv_ver=1
slave_type=17
> dump 0 1 0
registers: rc=0x00000000
  BUILD_ID=123400FF
  CTRL_CLK_DIV=00
  CTRL_ENABLE=1
  CTRL_LOOPBACK=0
  CTRL_MODE=0
  LANE_MAP=AC
  PATTERN=9A5
  SCRATCH=BEEF
  STATUS_ERROR_COUNT=00
  STATUS_LOCKED=0
  STATUS_READY=0
  TIMESTAMP=12ABCD
parameters: rc=0x00000000
  clock_divider=full
  mode=idle
  test_pattern=custom
> getParameterChoices 0 1 0 mode
rc=0x00000000
choice=off
choice=idle
choice=run
choice=self_test
choice=custom
> stats
stats commands=115 writeBits=1436 readBits=2932 flushes=2 statusReads=14 roundTrips=57 cableUs=7271
# exit 0
