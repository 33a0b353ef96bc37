# nebu --data-dir ../files/transceiver
# A transceiver slave whose parameter file lacks a divider its line rate needs stays out; one
# without a parameter file has no parameters at all.
> initialize 0 2 0
message 256: Internal error: During init linerate choice, cannot find parameter: pll_divsel_fb_0
message 32768: Orv abort command
rc=0x80000000
> initialize 0 2 1
message 256: Intenal error: When calculating linerate, cannot find parameterpll_divsel_fb
message 32768: Orv abort command
rc=0x80000000
> getParameters 0 2 0 sysclk_freq=50
message 256: Data structures not initialized for OrvNebu slave Device:0, user chain number/bus:2, slave index:0.
rc=0x80000000
sysclk_freq=50
> initialize 0 2 5
rc=0x00000000
> getParameters 0 2 5 sysclk_freq=50
message 256: OrvNebu_getParameter() - Unknown parameter name 'sysclk_freq'
rc=0x80000000
sysclk_freq=50
# exit 1
