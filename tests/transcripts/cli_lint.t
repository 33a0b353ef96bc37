# nebu
# nebu lint on the demo data and on broken directories (cli_lint/): each problem with its file
# and line, in file and line order; usage errors exit 2.
$ nebu lint ../../data
lint ../../data/: 9 directory lines, 12 definition files, no problems
$ nebu lint cli_lint/many
cli_lint/many/a_params.csv:3: parameter mode, choice run: value 0x4 of register LOOP needs 3 bits, the register has 1
cli_lint/many/a_params.csv:4: parameter mode, choice loop: register LOOPER is not in cli_lint/many/a_regs.csv
cli_lint/many/a_regs.csv:4: register OVER overlaps register MODE (line 2) in bit 3 of word 0x0
cli_lint/many/a_regs.csv:4: register OVER overlaps register LOOP (line 3) in bit 4 of word 0x0
cli_lint/many/a_regs.csv:5: register MODE holds bits 2 to 3 of word 0x0 twice (also on line 2): a value written does not read back
cli_lint/many/a_regs.csv:5: register MODE overlaps register OVER (line 4) in bit 3 of word 0x0
cli_lint/many/a_regs.csv:6: register WIDE: bits 12 to 16 of word 0x1f lie beyond the 16-bit bus word
cli_lint/many/a_regs.csv:7: slice without a register name: no call can reach it
cli_lint/many/a_regs.csv:8: registers span words 0x0 (line 2) to 0x1ffff (line 8): 131072 words, more than one burst moves (131071), so a read of every register fails
cli_lint/many/c_params.csv:1: the first line is a parameter row, but the first line of a parameter file is its header: choice off of parameter mode is lost
cli_lint/many/c_params.csv:2: choice_index out-of-order (the plug-in refuses the file)
cli_lint/many/c_regs.csv:1: the first line is a register line, but the first line of a register file is its header: register C is lost
cli_lint/many/d_regs.csv:1: line ends are carriage returns alone: the plug-in reads the whole file as one header line and finds no registers
cli_lint/many/e_params.csv:3: choice_index out-of-order (the plug-in refuses the file)
cli_lint/many/e_params.csv:5: choice_index out-of-order (the plug-in refuses the file)
cli_lint/many/g_regs.csv:2: line of 4 columns: a register line needs 9 columns (the plug-in refuses the file)
cli_lint/many/h5_params.csv:2: row of 1 field: a row needs 4 (parameter, choice index, choice, settings) (the plug-in refuses the file)
cli_lint/many/h5_params.csv:3: setting B is not of the form REGISTER=bits (the plug-in refuses the file)
cli_lint/many/orvnebu_directory.csv:3: Unable to open OrvNebu register file: cli_lint/many/missing_regs.csv
cli_lint/many/orvnebu_directory.csv:4: Unable to open OrvNebu register file: cli_lint/many/b_regs.csv  (blanks around the name are part of it)
cli_lint/many/orvnebu_directory.csv:5: Unable to open OrvNebu parameter file: cli_lint/many/missing_params.csv
cli_lint/many/orvnebu_directory.csv:6: slave type 0x11: driver versions 1 to 1 are already covered by line 2, which wins
cli_lint/many/orvnebu_directory.csv:7: slave type 0x31: driver versions 5 to 4 is an empty range
cli_lint/many/orvnebu_directory.csv:8: slave type 0x32 has no register file: its slaves cannot be created
cli_lint/many/orvnebu_directory.csv:9: line of 2 fields is never used: the key columns need 3
cli_lint/many/orvnebu_directory.csv:12: slave type 0x45 (R3Qrb transceiver) has no parameter file, so its slaves have none of their computed parameters
cli_lint/many/orvnebu_directory.csv:12: slave type 0x45 (R3Qrb transceiver) needs register RXUSERCLKOUT_FREQ_CNT2, which cli_lint/many/f_regs.csv lacks
cli_lint/many/orvnebu_directory.csv:13: slave type 0x42 (R2Qra transceiver) needs parameter pll_divsel_ref, which cli_lint/many/f_params.csv lacks
cli_lint/many/orvnebu_directory.csv:18: slave type 0xa0: driver versions 5 to 4 is an empty range
cli_lint/many/orvnebu_directory.csv:20: slave type 0x38 has no register file: its slaves cannot be created
lint cli_lint/many/: 18 directory lines, 13 definition files, 30 problems
[exit 1]
$ nebu lint cli_lint
cli_lint/orvnebu_directory.csv: Unable to open cli_lint/orvnebu_directory.csv
lint cli_lint/: 0 directory lines, 0 definition files, 1 problem
[exit 1]
$ nebu lint cli_lint/absent
nebu: lint: no data directory 'cli_lint/absent'
[exit 2]
$ nebu lint ../../data ../../data
nebu: lint takes one data directory, not also '../../data'
[exit 2]
$ nebu lint --strict ../../data
nebu: unknown lint option '--strict'
[exit 2]
$ nebu lint --help
usage: nebu lint [DATA_DIR]
  checks the directory file of DATA_DIR (default: the demo data directory),
  the register and parameter files it names and what transceiver slaves
  need; prints FILE:LINE: problem lines and a summary; exit status 0 when
  clean, 1 with problems, 2 for a usage error
# exit 0
