# nebu
# The print commands: a file's image as the plug-in's reader reads it (columns past the ninth
# dropped but the last, access words sorted), or the reader's messages and exit status 1.
$ nebu -e "printRegisterFile cli_board/r.csv" -e "printParameterFile cli_board/p.csv"
\> printRegisterFile cli_board/r.csv
h
A,0b,0,3,0,x,rw,,y,more
\> printParameterFile cli_board/p.csv
h
M,0,a,R=01
$ nebu -e "printRegisterFile cli_board/bad.csv" -e "printRegisterFile cli_board/none.csv"
\> printRegisterFile cli_board/bad.csv
message 512: Unable to parse file: cli_board/bad.csv line:2: \n
\> printRegisterFile cli_board/none.csv
message 256: Unable to open OrvNebu register file: cli_board/none.csv
[exit 1]
# exit 0
