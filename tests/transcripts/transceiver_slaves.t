# nebu
# The transceiver slaves of the demo board (chain 2) through the exported calls, with the
# demo data: registers poked on the board, parameters read and set.
# M3Qrc (slave 0): a clock frequency from its counter and window needs the system clock.
> initialize 0 2 0
rc=0x00000000
> poke 0 2 0 0x18 55998
> poke 0 2 0 0x19 16000
> getParameters 0 2 0 txusrclk0_freq sysclk_freq=50
rc=0x00000000
sysclk_freq=50
txusrclk0_freq=700.000000
> getParameters 0 2 0 txusrclk0_freq
message 256: Cannot calculate clock frequencies, since sysclk_freq has not been passed in to getParam() function.
rc=0x80000000
txusrclk0_freq=
# Line rates: data width 20, every divider 1.
> poke 0 2 0 0x04 0x0300
> getParameterChoices 0 2 0 line_rate0
message 256: Cannot calculate line rate choices, since refclk_freq0 has not been passed in to getParamChoices() function.
rc=0x80000000
> setParameters 0 2 0 "line_rate0=2500.000 FB=2, REF=1, DIVSEL=1" sysclk_freq=50
rc=0x00000000
> peek 0 2 0 0x04 26
peek=0x0301 0x035C 0x0000 0x0000 0x0000 0x0000 0x0000 0x0000 0x0000 0x0000 0x0000 0x0000 0xDABE 0xAF00 0xC7FD 0xFFFF 0xDABE 0xAF00 0xC7FD 0xFFFF 0xDABE 0xAF00 0xC7FD 0xFFFF 0x9FFD 0xFFFF
> getParameters 0 2 0 line_rate0 refclk_freq0=125
rc=0x00000000
line_rate0=2500.000 FB=2, REF=1, DIVSEL=1
refclk_freq0=125
# First family (duals 1 to 3, chained by next_slave): whole numbers.
> initialize 0 2 1
rc=0x00000000
> initialize 0 2 2
rc=0x00000000
> initialize 0 2 3
rc=0x00000000
> poke 0 2 3 0x03 0x1004
> getParameters 0 2 3 line_rate0 line_rate1 refclk_freq=125
rc=0x00000000
line_rate0=6250
line_rate1=3125
refclk_freq=125
> poke 0 2 3 0x02 0
> getParameters 0 2 3 line_rate0 line_rate1 refclk_freq=125
rc=0x00000000
line_rate0=5000
line_rate1=2500
refclk_freq=125
> poke 0 2 3 0x02 0x0100
> getParameters 0 2 3 line_rate0 line_rate1 refclk_freq=125
rc=0x00000000
line_rate0=6250
line_rate1=3125
refclk_freq=125
> poke 0 2 3 0x14 100 3
> getParameters 0 2 3 txusrclk20_freq sysclk_freq=50.9
rc=0x00000000
sysclk_freq=50.9
txusrclk20_freq=6666
> getParameters 0 2 3 line_rate1
message 256: Cannot calculate line rate, since refclk_freq has not been passed in to getParam() function.
rc=0x80000000
line_rate1=
> getParameterChoices 0 2 3 line_rate0
message 256: OrvNebu_getParameterChoices(): param 'line_rate0' is not a choice parameter.
rc=0x80000000
# The reference clock source along the chain of duals.
> poke 0 2 2 0x00 2
> poke 0 2 2 0x02 3
> getParameters 0 2 2 refclk_source
rc=0x00000000
refclk_source=dual_02:0013
> poke 0 2 2 0x02 6
> getParameters 0 2 2 refclk_source
rc=0x00000000
refclk_source=GREFCLK
> poke 0 2 3 0x02 5
> getParameters 0 2 3 refclk_source
rc=0x00000000
refclk_source=Unknown ref clock source
> poke 0 2 1 0x02 1
> getParameters 0 2 1 refclk_source
rc=0x00000000
refclk_source=Unknown ref clock source
# The third dual takes the north line; the second passes it on; the first drives it.
> poke 0 2 1 0x00 0x11 0x0A03 0x20
> poke 0 2 3 0x02 1
> getParameters 0 2 3 refclk_source
rc=0x00000000
refclk_source=dual_11:0A03
> poke 0 2 2 0x02 1
> getParameters 0 2 2 refclk_source
rc=0x00000000
refclk_source=dual_11:0A03
# The other way: the first dual takes the south line that the third drives.
> poke 0 2 3 0x00 0x33
> poke 0 2 3 0x02 0x10
> poke 0 2 1 0x02 7
> getParameters 0 2 1 refclk_source
rc=0x00000000
refclk_source=dual_33:0014
# R3Qrb (slave 5) and R3Qra (slave 4): their own names; setting copies to the receive PLL.
> initialize 0 2 4
rc=0x00000000
> initialize 0 2 5
rc=0x00000000
> getParameters 0 2 5 rxuserclkout_freq3 sysclk_freq=50
rc=0x00000000
rxuserclkout_freq3=156.249332
sysclk_freq=50
> getParameters 0 2 5 line_rate0
message 256: OrvNebu_getParameter() - Unknown parameter name 'line_rate0'
rc=0x80000000
line_rate0=
> poke 0 2 4 0x04 0x302B
> getParameters 0 2 4 line_rate refclk_freq=125
rc=0x00000000
line_rate=2500.000 FB=4, REF=1, DIVSEL=2
refclk_freq=125
> setParameters 0 2 4 "line_rate=2500.000 FB=2, REF=1, DIVSEL=1" sysclk_freq=50
rc=0x00000000
> peek 0 2 4 0x04 2
peek=0x3009 0x0009
# exit 1
