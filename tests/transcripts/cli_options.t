# nebu
# The program's options: start-up mistakes stop it with one line and exit 2, before any board
# or plug-in is touched; the demo board, data and plug-in are found beside the program.
$ nebu -e stats
\> stats
stats commands=0 writeBits=0 readBits=0 flushes=0 statusReads=0 roundTrips=0 cableUs=0
$ nebu --board=../../boards/demo.json --board cli_board/memory.json --data-dir=../../data --session 0x10 --trace -e "peek 0 1 0 0x10"
\> peek 0 1 0 0x10
peek=0x1234
$ nebu --tck-mhz=1e1 --round-trip-us .5 -e "singleSlaveRead 0 1 0 3" -e stats
\> singleSlaveRead 0 1 0 3
rc=0x00000000
buffer=0x1234
status=0
\> stats
stats commands=12 writeBits=86 readBits=37 flushes=0 statusReads=4 roundTrips=9 cableUs=17
$ nebu --help
usage: nebu [--board FILE] [--data-dir DIR] [--session N] [--trace] [--plugin PATH] [--tck-mhz F]
            [--round-trip-us R] [-e COMMAND]... [SCRIPT]
  --board FILE     virtual board (JSON); default: the demo board
  --data-dir DIR   host data directory; default: the demo data directory
  --session N      session handle of the first command (default 1)
  --trace          print every JTAG operation
  --plugin PATH    plug-in library to load; default: the one built beside nebu
  --tck-mhz F      cable test clock in MHz for the stats estimate (default 30)
  --round-trip-us R  cost of one cable round trip in microseconds (default 125)
  -e COMMAND       run one command (repeatable); SCRIPT runs first when given
  SCRIPT           file of commands; without -e and SCRIPT, standard input
       nebu lint [DATA_DIR]   check a data directory (default: the demo data)
       nebu check [--update] TRANSCRIPT...   run transcripts of sessions again
       nebu doc [DATA_DIR] -o DIR   write its register-map pages into DIR
Type 'help' at the prompt (or -e help) for the commands.
$ nebu --bogus -e stats
nebu: unknown option '--bogus'
[exit 2]
$ nebu --session 1x
nebu: bad number '1x' for --session
[exit 2]
$ nebu a.nebu b.nebu
nebu: more than one script: 'a.nebu', 'b.nebu'
[exit 2]
$ nebu --board=
nebu: option --board needs a file name
[exit 2]
$ nebu -- -x
nebu: cannot open script -x
[exit 2]
$ nebu --tck-mhz 0
nebu: --tck-mhz must be above 0, not 0
[exit 2]
$ nebu --tck-mhz inf
nebu: bad number 'inf' for --tck-mhz
[exit 2]
$ nebu --tck-mhz 30MHz
nebu: bad number '30MHz' for --tck-mhz
[exit 2]
$ nebu --round-trip-us
nebu: option --round-trip-us needs an argument
[exit 2]
# exit 0
