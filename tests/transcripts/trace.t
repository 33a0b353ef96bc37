# nebu --trace
# The JTAG operations of bus calls as they happen, discovery first (core list, master status,
# clock reset, bus reset polled until done). Raw reads and writes carry hexadecimal text, highest
# word first: a burst for more than one word, a single transfer for one; text that is no
# hexadecimal number writes nothing.
> write 0 1 1 0x22 3 abcd12345678
jtag status device=0 chain=1 core=0 type=3
jtag status device=0 chain=1 core=1 type=14
jtag status device=0 chain=1 core=1 type=14
jtag write cmd=7 bits=4 data=0x1
jtag write cmd=7 bits=4 data=0x0
jtag read cmd=7 bits=3 data=0x0
jtag write cmd=1 bits=10 data=0x3FF
jtag write cmd=1 bits=10 data=0x3FE
jtag read cmd=2 bits=4 data=0x0
jtag read cmd=2 bits=4 data=0x2
jtag write cmd=1 bits=10 data=0x000
jtag write cmd=4 bits=29 data=0x00160003
jtag write cmd=5 bits=19 data=0x20022
jtag write cmd=6 bits=50 data=0x0ABCD12345678
jtag flush
rc=0x00000000
> write 0 1 1 0x25 1 BEEF
jtag write cmd=4 bits=29 data=0x00100000
jtag write cmd=5 bits=19 data=0x20025
jtag write cmd=6 bits=18 data=0x0BEEF
jtag flush
rc=0x00000000
> read 0 1 1 0x22 3
jtag write cmd=4 bits=29 data=0x00160003
jtag write cmd=5 bits=19 data=0x00022
jtag read cmd=6 bits=48 data=0xABCD12345678
rc=0x00000000
data=ABCD12345678
> read 0 1 1 0x25 1
jtag write cmd=4 bits=29 data=0x00100000
jtag write cmd=5 bits=19 data=0x00025
jtag read cmd=6 bits=16 data=0xBEEF
rc=0x00000000
data=BEEF
> write 0 1 1 0x20 1 12G4
message 256: Invalid hexadecimal number "12G4".
rc=0x80000000
> write 0 1 1 0x20 2 0002000
message 256: OrvNebu_write() argument checking failed:strlen(data) == (size*4)
rc=0x80000000
> read 0 1 1 0x20 0
message 256: OrvNebu_read() argument checking failed:(data != 0) && (size != 0)
rc=0x80000000
data=
> peek 0 1 1 0x20 1
peek=0x0000
# exit 1
