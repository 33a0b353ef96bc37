# nebu
# Number texts of the transceiver parameters are decimal in every family: the leading decimal
# number of the text, 0 when there is none; hexadecimal, nan and inf texts are no exception.
> initialize 0 2 0
rc=0x00000000
> initialize 0 2 1
rc=0x00000000
> initialize 0 2 4
rc=0x00000000
> getParameters 0 2 0 txusrclk0_freq sysclk_freq=0x32
rc=0x00000000
sysclk_freq=0x32
txusrclk0_freq=0.000000
> getParameters 0 2 1 txusrclk0_freq sysclk_freq=0x32
rc=0x00000000
sysclk_freq=0x32
txusrclk0_freq=0
> getParameters 0 2 0 txusrclk0_freq sysclk_freq=+5e1
rc=0x00000000
sysclk_freq=+5e1
txusrclk0_freq=250.000000
> getParameters 0 2 0 line_rate0 refclk_freq0=nan
rc=0x00000000
line_rate0=0.000 FB=4, REF=2, DIVSEL=1
refclk_freq0=nan
> getParameters 0 2 0 line_rate0 refclk_freq0=inf
rc=0x00000000
line_rate0=0.000 FB=4, REF=2, DIVSEL=1
refclk_freq0=inf
> getParameters 0 2 0 line_rate0 "refclk_freq0= 125.0e0MHz"
rc=0x00000000
line_rate0=2500.000 FB=4, REF=2, DIVSEL=1
refclk_freq0= 125.0e0MHz
> getParameters 0 2 4 line_rate refclk_freq=-infinity
rc=0x00000000
line_rate=0.000 FB=4, REF=1, DIVSEL=2
refclk_freq=-infinity
> getParameters 0 2 1 line_rate0 refclk_freq=0x7D
rc=0x00000000
line_rate0=0
refclk_freq=0x7D
> getParameterChoices 0 2 0 line_rate0 refclk_freq0=0x7D
rc=0x00000000
> getParameterChoices 0 2 4 line_rate refclk_freq=NAN
rc=0x00000000
# exit 0
