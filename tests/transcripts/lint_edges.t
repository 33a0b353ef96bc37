# nebu
# nebu lint at the edges of what it checks: values written in binary digits with leading zeros,
# choice indexes of two digits or followed by a blank (both read as the plug-in reads them), a
# parameter file two rows share (its problems shown once), a transceiver row without files, a
# full-width register over bit 0, two high halves, an excluded line without a name.
$ nebu lint lint_edges
