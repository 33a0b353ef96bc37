# nebu
# Line rates of the PLL families on the demo board: the choices in divider order within the
# PLL's range and under the highest line rate, the current rate, and a setting with its windows.
> initialize 0 2 0
rc=0x00000000
# M3Qrc, data width 20 (factor 5), highest rate 2499.0: 2500.0 is one above and still listed.
> poke 0 2 0 0x02 0xB6C0 0x94F3
> getParameterChoices 0 2 0 line_rate0 refclk_freq0=125
rc=0x00000000
choice=2500.000 FB=2, REF=1, DIVSEL=1
choice=1250.000 FB=2, REF=1, DIVSEL=2
choice=625.000 FB=2, REF=1, DIVSEL=4
choice=2500.000 FB=4, REF=2, DIVSEL=1
choice=1250.000 FB=4, REF=2, DIVSEL=2
choice=625.000 FB=4, REF=2, DIVSEL=4
choice=1562.500 FB=5, REF=2, DIVSEL=2
choice=781.250 FB=5, REF=2, DIVSEL=4
# Width 16 (a multiple of 8: factor 4) and no highest rate; 1228.8, the lowest VCO, is in range.
> poke 0 2 0 0x02 0 0 0x020B
> getParameterChoices 0 2 0 line_rate0 refclk_freq0=153.6
rc=0x00000000
choice=2457.600 FB=2, REF=1, DIVSEL=1
choice=1228.800 FB=2, REF=1, DIVSEL=2
choice=614.400 FB=2, REF=1, DIVSEL=4
choice=2457.600 FB=4, REF=2, DIVSEL=1
choice=1228.800 FB=4, REF=2, DIVSEL=2
choice=614.400 FB=4, REF=2, DIVSEL=4
choice=3072.000 FB=5, REF=2, DIVSEL=1
choice=1536.000 FB=5, REF=2, DIVSEL=2
choice=768.000 FB=5, REF=2, DIVSEL=4
# Width 32: the transmit divider counts, the receive one does not; a divider without choice is 0.
> poke 0 2 0 0x04 0x0491
> getParameters 0 2 0 line_rate0 refclk_freq0=125
rc=0x00000000
line_rate0=1000.000 FB=2, REF=1, DIVSEL=2
refclk_freq0=125
> getParameters 0 2 0 line_rate0 refclk_freq0=2e68
rc=0x00000000
line_rate0=1599999999999999924488355602210668907060020661645787176486745975816192.000 FB=2, REF=1, DIVSEL=2
refclk_freq0=2e68
> poke 0 2 0 0x04 0x04B1
> getParameters 0 2 0 line_rate0 refclk_freq0=125
rc=0x00000000
line_rate0=0.000 FB=2, REF=1, DIVSEL=0
refclk_freq0=125
> getParameters 0 2 0 line_rate0
message 256: Cannot calculate line rate choice, since refclk_freq0 has not been passed in to getParam() function.
rc=0x80000000
line_rate0=
> getParameters 0 2 0 txusrclk0_freq sysclk_freq=1e56
rc=0x00000000
sysclk_freq=1e56
txusrclk0_freq=500000000000000024173346057776829528764197422945257127936.000000
# Setting at width 16 (no multiple of 10: the flagged clocks run at rate / 8) writes both output
# dividers and every window.
> poke 0 2 0 0x04 0x0280
# A rate below the data width gives windows of 0, and so does a window under one count (a
# tiny system clock).
> setParameters 0 2 0 "line_rate0=1 FB=2, REF=1, DIVSEL=1" sysclk_freq=50
rc=0x00000000
> peek 0 2 0 0x10 4
peek=0xDABE 0x0000 0xC7FD 0xFFFF
> setParameters 0 2 0 "line_rate0=1e15 FB=2, REF=1, DIVSEL=1" sysclk_freq=1e-320
rc=0x00000000
> peek 0 2 0 0x10 4
peek=0xDABE 0x0000 0xC7FD 0xFFFF
> setParameters 0 2 0 "line_rate0=1250.000 FB=2, REF=1, DIVSEL=2 and more" sysclk_freq=10
rc=0x00000000
> peek 0 2 0 0x04 36
peek=0x0251 0x035C 0x0000 0x0000 0x0000 0x0000 0x0000 0x0000 0x0000 0x0000 0x0000 0x0000 0xDABE 0x3816 0xC7FD 0xFFFF 0xDABE 0x3816 0xC7FD 0xFFFF 0xDABE 0x3816 0xC7FD 0xFFFF 0x9FFD 0x702D 0x63FD 0xFFFF 0xDABE 0x3816 0xC7FD 0xFFFF 0x9FFD 0x702D 0x63FD 0xFFFF
# Refused settings write nothing.
> setParameters 0 2 0 "line_rate0=18446744073709551616 FB=2, REF=1, DIVSEL=1" sysclk_freq=50
message 256: Unable to set line rate from string '18446744073709551616 FB=2, REF=1, DIVSEL=1'
rc=0x80000000
> setParameters 0 2 0 "line_rate0=foo" sysclk_freq=50
message 256: Unable to set line rate from string 'foo'
rc=0x80000000
> setParameters 0 2 0 "line_rate0=2500.000 FB=2, REF=1, DIVSEL=1"
message 256: Cannot calculate new line rate tune values, since sysclk_freq has not been passed in to setParam() function.
rc=0x80000000
> setParameters 0 2 0 "line_rate0=2500.000 FB=9, REF=1, DIVSEL=1" sysclk_freq=50
message 256: Setting Parameter 'pll_divsel_fb_0' to value '9' is not a valid choice.
rc=0x80000000
> poke 0 2 0 0x04 0x0780
> setParameters 0 2 0 "line_rate0=2500.000 FB=2, REF=1, DIVSEL=1" sysclk_freq=50
message 256: Cannot calculate new line rate tune values, since tx_data_width0 is 0.
rc=0x80000000
> peek 0 2 0 0x04 36
peek=0x0780 0x035C 0x0000 0x0000 0x0000 0x0000 0x0000 0x0000 0x0000 0x0000 0x0000 0x0000 0xDABE 0x3816 0xC7FD 0xFFFF 0xDABE 0x3816 0xC7FD 0xFFFF 0xDABE 0x3816 0xC7FD 0xFFFF 0x9FFD 0x702D 0x63FD 0xFFFF 0xDABE 0x3816 0xC7FD 0xFFFF 0x9FFD 0x702D 0x63FD 0xFFFF
# R3Qra: oversampling lists each rate's fifth after it when at most 481.0, also when the rate
# itself is over the highest one (2000.0).
> initialize 0 2 4
rc=0x00000000
> poke 0 2 4 0x02 0x9400 0x7735 0x3108
> getParameterChoices 0 2 4 line_rate refclk_freq=962
rc=0x00000000
choice=481.000 FB=1, REF=2, DIVSEL=2
choice=1202.500 FB=1, REF=2, DIVSEL=4
choice=240.500 FB=1, REF=2, DIVSEL=4
choice=601.250 FB=1, REF=2, DIVSEL=8
choice=120.250 FB=1, REF=2, DIVSEL=8
> poke 0 2 4 0x04 0x3109
> getParameters 0 2 4 line_rate refclk_freq=125
rc=0x00000000
line_rate=500.000 FB=2, REF=1, DIVSEL=1
refclk_freq=125
# Width 32 doubles the windows of the flagged clocks; the receive PLL gets the transmit dividers.
> poke 0 2 4 0x04 0x4000
> setParameters 0 2 4 "line_rate=4800.000 FB=4, REF=1, DIVSEL=1" sysclk_freq=25
rc=0x00000000
> peek 0 2 4 0x04 24
peek=0x4003 0x000B 0x0000 0x0000 0x0000 0x0000 0x0000 0x0000 0x0000 0x0000 0x0000 0x0000 0x9FFD 0x48EA 0x9FFD 0x91D5 0x9FFD 0x48EA 0x9FFD 0x91D5 0x9FFD 0x91D5 0x9FFD 0x91D5
# Every parameter: the line rate needs the reference clock, so it is left out.
> getParameters 0 2 4
rc=0x00000000
rxpll_divsel45_fb=5
rxpll_divsel_fb=4
rxpll_divsel_out=1
rxpll_divsel_ref=1
tx_data_width=32
tx_oversample=off
txpll_divsel45_fb=4
txpll_divsel_fb=4
txpll_divsel_out=1
txpll_divsel_ref=1
# R2Qra: whole numbers, 156.25 counts as 156; only the channel asked for is given; an output
# divider without choice gives 0.
> initialize 0 2 1
rc=0x00000000
> getParameters 0 2 1 line_rate1 refclk_freq=156.25
rc=0x00000000
line_rate1=1950
refclk_freq=156.25
> poke 0 2 1 0x03 0x2304
> getParameters 0 2 1 line_rate0 line_rate1 refclk_freq=9223372036854775807
message 256: Cannot calculate line_rate1, since the result does not fit in 64 bits.
rc=0x80000000
line_rate0=0
line_rate1=
refclk_freq=9223372036854775807
> getParameters 0 2 1
rc=0x00000000
pll_divsel_fb=5
pll_divsel_ref=1
pll_rxdivsel_out_0=
pll_rxdivsel_out_1=4
refclk_input=own
# exit 1
