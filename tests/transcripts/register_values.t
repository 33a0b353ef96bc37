# nebu
# A register value must be hexadecimal: empty or blank text is refused like any other
# non-hex text, and nothing of the call is written, not even its valid registers.
> initialize 0 1 0
rc=0x00000000
> setRegisters 0 1 0 CTRL_ENABLE=0 SCRATCH=
message 256: Invalid hexadecimal number "".
rc=0x80000000
> setRegisters 0 1 0 CTRL_ENABLE=0 "SCRATCH= "
message 256: Invalid hexadecimal number " ".
rc=0x80000000
> getRegisters 0 1 0 CTRL_ENABLE SCRATCH
rc=0x00000000
CTRL_ENABLE=1
SCRATCH=BEEF
# A blank around the digits is still a number.
> setRegisters 0 1 0 "SCRATCH= 0x00AB "
rc=0x00000000
> getRegisters 0 1 0 SCRATCH
rc=0x00000000
SCRATCH=00AB
# exit 1
