# nebu
# Setting a line rate retunes the measurement windows from the system clock: a clock that is
# not a positive number is refused, and nothing is written.
> initialize 0 2 0
rc=0x00000000
> initialize 0 2 4
rc=0x00000000
> getRegisters 0 2 0 PLL_DIVSEL_FB0 TXUSRCLK_FREQ_TUNE0 TXUSRCLK2_FREQ_TUNE0
rc=0x00000000
PLL_DIVSEL_FB0=3
TXUSRCLK2_FREQ_TUNE0=FFFF
TXUSRCLK_FREQ_TUNE0=AF00
> setParameters 0 2 0 "line_rate0=2500.000 FB=2, REF=1, DIVSEL=1" sysclk_freq=-50
message 256: Cannot calculate new line rate tune values, since sysclk_freq '-50' is not a positive number.
rc=0x80000000
> setParameters 0 2 0 "line_rate0=2500.000 FB=2, REF=1, DIVSEL=1" sysclk_freq=0x32
message 256: Cannot calculate new line rate tune values, since sysclk_freq '0x32' is not a positive number.
rc=0x80000000
> setParameters 0 2 4 "line_rate=2400.000 FB=2, REF=1, DIVSEL=1" sysclk_freq=abc
message 256: Cannot calculate new line rate tune values, since sysclk_freq 'abc' is not a positive number.
rc=0x80000000
> getRegisters 0 2 0 PLL_DIVSEL_FB0 TXUSRCLK_FREQ_TUNE0 TXUSRCLK2_FREQ_TUNE0
rc=0x00000000
PLL_DIVSEL_FB0=3
TXUSRCLK2_FREQ_TUNE0=FFFF
TXUSRCLK_FREQ_TUNE0=AF00
# Its leading decimal number counts: 5O is 5 MHz.
> setParameters 0 2 0 "line_rate0=2500.000 FB=2, REF=1, DIVSEL=1" sysclk_freq=5O
rc=0x00000000
> getRegisters 0 2 0 PLL_DIVSEL_FB0 TXUSRCLK_FREQ_TUNE0 TXUSRCLK2_FREQ_TUNE0
rc=0x00000000
PLL_DIVSEL_FB0=1
TXUSRCLK2_FREQ_TUNE0=2300
TXUSRCLK_FREQ_TUNE0=1180
# exit 1
