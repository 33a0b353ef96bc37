# nebu --board ../files/engine/board.json --data-dir ../files/order
# Parameters are set in the order of their rows, not of their names: of two that write the
# same bit the later row wins. EN is bit 0 of word 0.
> initialize 0 1 0
rc=0x00000000
> setParameters 0 1 0 A=on Z=off
rc=0x00000000
> peek 0 1 0 0
peek=0x00D1
> setParameters 0 1 0 A=off Z=on
rc=0x00000000
> peek 0 1 0 0
peek=0x00D0
# exit 0
