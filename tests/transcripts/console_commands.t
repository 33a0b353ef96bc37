# nebu --session 9
# Session and stats are the console's own: no call reaches the plug-in.
> stats
stats commands=0 writeBits=0 readBits=0 flushes=0 statusReads=0 roundTrips=0 cableUs=0
> session 3
> endSession
> stats
stats commands=0 writeBits=0 readBits=0 flushes=0 statusReads=0 roundTrips=0 cableUs=0
# Usage errors: one "nebu:" line each, and the console goes on.
> frobnicate 1 2
nebu: unknown command 'frobnicate'
> peek 0 1 0 0x1G
nebu: bad number '0x1G' for ADDRESS
> getRegisters 0 1 "2
nebu: unterminated quote in: getRegisters 0 1 "2
> peek 0 1 0 0x0010
peek=0xABCD
# exit 2
