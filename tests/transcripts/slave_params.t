# nebu --board ../files/engine/board.json --data-dir ../files/engine
# The parameter engine of the default slave (params.csv): EN is bit 0 and SEL bits 5..4 of
# word 0, LVL bits 3..0 of word 1, WIDE word 2. Settings match as numbers: 001F is 11111.
> initialize 0 1 0
rc=0x00000000
> stats
stats commands=7 writeBits=66 readBits=132 flushes=0 statusReads=4 roundTrips=6 cableUs=757
> getParameters 0 1 0 MODE=ignored LEVEL COUNT
rc=0x00000000
COUNT=Small
LEVEL=Mid
MODE=On
> stats
stats commands=3 writeBits=48 readBits=48 flushes=0 statusReads=0 roundTrips=1 cableUs=128
# 0000 matches the empty setting; a value no choice holds reads as the empty text; a choice
# without settings matches anything.
> poke 0 1 0 0 0x0020 0x0003 0x0000
> getParameters 0 1 0
rc=0x00000000
COUNT=Zero
LEVEL=
MODE=Off
> poke 0 1 0 2 0x1234
> poke 0 1 0 0 0x0021
> getParameters 0 1 0 MODE COUNT
rc=0x00000000
COUNT=Other
MODE=Fast
> getParameters 0 1 0 LEVEL NOPE=x
message 256: OrvNebu_getParameter() - Unknown parameter name 'NOPE'
rc=0x80000000
LEVEL=
NOPE=x
> getParameterChoices 0 1 0
message 256: OrvNebu_getParameterChoices(): 'params' argument has no parameter name passed in.
rc=0x80000000
> getParameterChoices 0 1 0 Mode
message 256: OrvNebu_getParameterChoices(): param 'Mode' is not a valid parameter.
rc=0x80000000
# Setting: any letter case, other bits kept, one read and one write for the whole request.
> poke 0 1 0 0 0xFF00
> stats
stats commands=6 writeBits=96 readBits=96 flushes=0 statusReads=0 roundTrips=2 cableUs=256
> setParameters 0 1 0 MODE=FAST
rc=0x00000000
> stats
stats commands=6 writeBits=114 readBits=16 flushes=1 statusReads=0 roundTrips=2 cableUs=254
> peek 0 1 0 0
peek=0xFF21
> setParameters 0 1 0 MODE=off
rc=0x00000000
> peek 0 1 0 0
peek=0xFF20
> stats
stats commands=6 writeBits=114 readBits=16 flushes=1 statusReads=0 roundTrips=2 cableUs=254
> setParameters 0 1 0 MODE=On COUNT=small
rc=0x00000000
> stats
stats commands=6 writeBits=146 readBits=48 flushes=1 statusReads=0 roundTrips=2 cableUs=256
> peek 0 1 0 0 3
peek=0xFF11 0x0003 0x001F
> setParameters 0 1 0 COUNT=Zero
rc=0x00000000
> peek 0 1 0 2
peek=0x0000
# The empty value and a choice without settings write nothing; an unknown choice or name
# fails before anything is written, also the valid request beside it.
> stats
stats commands=6 writeBits=114 readBits=16 flushes=1 statusReads=0 roundTrips=2 cableUs=254
> setParameters 0 1 0 MODE= COUNT=other
rc=0x00000000
> setParameters 0 1 0 MODE=Fast LEVEL=Max
message 256: Setting Parameter 'LEVEL' to value 'Max' is not a valid choice.
rc=0x80000000
> setParameters 0 1 0 mode=On
message 256: OrvNebu_getParameter() - Unknown parameter name 'mode'
rc=0x80000000
> stats
stats commands=0 writeBits=0 readBits=0 flushes=0 statusReads=0 roundTrips=0 cableUs=0
> peek 0 1 0 0
peek=0xFF11
# exit 1
