# nebu
# A negative reference clock gives a negative whole-number line rate.
> initialize 0 2 1
rc=0x00000000
> getParameters 0 2 1 line_rate0 refclk_freq=125
rc=0x00000000
line_rate0=3125
refclk_freq=125
> getParameters 0 2 1 line_rate0 refclk_freq=-125
rc=0x00000000
line_rate0=-3125
refclk_freq=-125
# exit 0
