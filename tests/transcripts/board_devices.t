# nebu --board board_files/two.json
# A board of three devices: chains in any order, plain cores before and between bus masters,
# a chain without cores, a Trellom device (which the plug-in leaves out) and an empty device.
> scan
device 0 chain 2: 1 slave
  slave 0: slave_type=0 orv_drv_ver=0 core_type=0 cg_ver=0.0 cg_alpha_ver=0 eda_ver=0.0 next_slave=0
device 0 chain 4: no bus
device 0 chain 7: 2 slaves
  slave 0: slave_type=0 orv_drv_ver=0 core_type=0 cg_ver=0.0 cg_alpha_ver=0 eda_ver=0.0 next_slave=0
  slave 1: slave_type=18 orv_drv_ver=0 core_type=0 cg_ver=0.0 cg_alpha_ver=0 eda_ver=0.0 next_slave=0
device 1 chain 1: no bus
device 2: no chains
> getSlaveCount 0 7
rc=0x00000000
count=2
> getSlaveCount 0 2
rc=0x00000000
count=1
> getSlaveCount 0 4
rc=0x00000000
count=0
> peek 0 7 1 0x5
peek=0x0055
> peek 0 2 0 0x5
peek=0x0022
> peek 0 7 1 0x20000
nebu: ADDRESS 0x20000 is outside the bus (0..0x1FFFF)
> peek 0 4 0 0
nebu: peek: device 0 chain 4 has no bus master
> peek 3 7 0 0
nebu: peek: the board has no device 3
# exit 2
