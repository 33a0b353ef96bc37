# nebu
# nebu lint at the edges of what it checks: values written in binary digits with leading zeros,
# choice indexes of two digits or followed by a blank (both read as the plug-in reads them), a
# parameter file two rows share (its problems shown once), a transceiver row without files, a
# full-width register over bit 0, two high halves, an excluded line without a name or at the end
# of the bus, unnamed slices on one word, a first line that only looks like a register line, a
# driver version 0 that makes no transceiver; a blank before a name hinted at only when the name
# without it is a file. Then a header without its minimum-version column, and the print of a
# parameter row with settings of two widths (one empty) and of a register at address a.
$ nebu lint lint_edges
lint_edges/g_params.csv:3: parameter r, choice wide: value 0x10 of register R needs 5 bits, the register has 4
lint_edges/g_params.csv:4: parameter s, choice a: value 0xA of register S needs 4 bits, the register has 3
lint_edges/g_params.csv:5: parameter s, choice f: value 0xF of register S needs 4 bits, the register has 3
lint_edges/g_params.csv:6: parameter s, choice e: value 0xE of register S needs 4 bits, the register has 3
lint_edges/g_regs.csv:4: register A: bits 0 to 31 of word 0x2 lie beyond the 16-bit bus word
lint_edges/g_regs.csv:5: register B overlaps register A (line 4) in bit 0 of word 0x2
lint_edges/g_regs.csv:6: register H: bits 16 to 31 of word 0x3 lie beyond the 16-bit bus word
lint_edges/g_regs.csv:7: register K: bits 16 to 31 of word 0x3 lie beyond the 16-bit bus word
lint_edges/g_regs.csv:7: register K overlaps register H (line 6) in bits 16 to 31 of word 0x3
lint_edges/h_regs.csv:1: the first line is a register line, but the first line of a register file is its header: register A is lost
lint_edges/i_regs.csv:2: slice without a register name: no call can reach it
lint_edges/i_regs.csv:3: slice without a register name: no call can reach it
lint_edges/i_regs.csv:6: registers span words 0x0 (line 6) to 0x1ffff (line 4): 131072 words, more than one burst moves (131071), so a read of every register fails
lint_edges/orvnebu_directory.csv:4: slave type 0x42 has no register file: its slaves cannot be created
lint_edges/orvnebu_directory.csv:4: slave type 0x42 (R2Qra transceiver) has no parameter file, so its slaves have none of their computed parameters
lint_edges/orvnebu_directory.csv:5: Unable to open OrvNebu parameter file: lint_edges/ nosuch.csv
lint_edges/orvnebu_directory.csv:6: slave type 0x15 has no register file: its slaves cannot be created
lint_edges/orvnebu_directory.csv:7: Unable to open OrvNebu parameter file: lint_edges/ empty.csv (blanks around the name are part of it)
lint lint_edges/: 8 directory lines, 5 definition files, 18 problems
[exit 1]
$ nebu lint lint_nomin
lint_nomin/orvnebu_directory.csv:1: Unable to parse header of CSV file: lint_nomin/orvnebu_directory.csv: it has no orv_drv_ver_min column
lint lint_nomin/: 0 directory lines, 0 definition files, 1 problem
[exit 1]
$ nebu -e "printParameterFile lint_edges/print_params.csv" -e "printRegisterFile lint_edges/print_regs.csv"
\> printParameterFile lint_edges/print_params.csv
h
p,0,a,R1=1,R2=101
p,1,b,A=1,BB=
\> printRegisterFile lint_edges/print_regs.csv
h
A,0a,0,3,0,x,rw,,y
# exit 0
