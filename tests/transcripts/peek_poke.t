# nebu
# peek and poke reach the slave memory of the board directly, without JTAG.
> peek 0 1 0 0x0010 2
peek=0xABCD 0x0012
> poke 0 1 0 0x0021 0xbeef 7
> peek 0 1 0 0x001F 4
peek=0x0000 0x0000 0xBEEF 0x0007
# Addresses wrap at the end of the bus.
> peek 0 1 2 0x1FFEF
peek=0x0042
> poke 0 1 0 0x1FFFF 5 6
> peek 0 1 0 0x1FFFF 2
peek=0x0005 0x0006
> peek 0 1 0 0 0
peek=
> stats
stats commands=0 writeBits=0 readBits=0 flushes=0 statusReads=0 roundTrips=0 cableUs=0
# Bad values write nothing; each is a usage error and the console goes on.
> poke 0 1 0 0x10 1 0x10000
nebu: VALUE 0x10000 does not fit 16 bits
> poke 0 1 0 0x10 2 x
nebu: bad number 'x' for VALUE
> peek 0 1 0 0x20000
nebu: ADDRESS 0x20000 is outside the bus (0..0x1FFFF)
> peek 0 1 9 0
nebu: peek: no slave at position 9 (slaveCount 8)
> peek 0 3 0 0
nebu: peek: device 0 chain 3 has no bus master
> poke 0 1 0 0x10
nebu: usage: poke D C S ADDRESS VALUE...
> peek 0 1 0 0x10
peek=0xABCD
# exit 2
