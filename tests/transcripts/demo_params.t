# nebu
# Choice parameters of the demo data: a choice writes several registers; reset_default shares
# its settings with zeros, which comes first and is what reading gives back.
> initialize 0 1 0
rc=0x00000000
> setParameters 0 1 0 mode=SELF_TEST test_pattern=ones
rc=0x00000000
> getRegisters 0 1 0 CTRL_ENABLE CTRL_MODE CTRL_LOOPBACK PATTERN
rc=0x00000000
CTRL_ENABLE=1
CTRL_LOOPBACK=1
CTRL_MODE=2
PATTERN=FFF
> getParameters 0 1 0 mode test_pattern
rc=0x00000000
mode=self_test
test_pattern=ones
> getParameterChoices 0 1 0 test_pattern
rc=0x00000000
choice=zeros
choice=ones
choice=alternating
choice=reset_default
choice=custom
> setParameters 0 1 0 test_pattern=reset_default
rc=0x00000000
> getParameters 0 1 0 test_pattern
rc=0x00000000
test_pattern=zeros
> setParameters 0 1 0 clock_divider=fastest
message 256: Setting Parameter 'clock_divider' to value 'fastest' is not a valid choice.
rc=0x80000000
# exit 1
