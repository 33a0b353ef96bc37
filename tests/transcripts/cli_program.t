# nebu
# The program run with a script and -e commands (the script first; CR LF, comments, blanks and
# quotes; a usage error does not stop a script), bad board files, and `nebu check` itself: where a
# transcript differs, and files that are no transcripts.
$ nebu --board cli_board/memory.json cli_board/tour.nebu -e "peek 0 1 0 0x3F 2"
\> poke 0 1 0 0x40 "0x0042"   # quoted number
\> peek 0 1 0 0x40
peek=0x0042
\> 	stats 	
stats commands=0 writeBits=0 readBits=0 flushes=0 statusReads=0 roundTrips=0 cableUs=0
\> peek 0 1 0 0x3F 2
peek=0x0000 0x0042
$ nebu --board cli_board/memory.json cli_board/bad.nebu
\> bogus
nebu: unknown command 'bogus'
\> peek 0 1 0 0x10
peek=0x1234
[exit 2]
$ nebu --board cli_board/absent.json -e stats
nebu: cli_board/absent.json: cannot be read: No such file or directory
[exit 2]
$ nebu --board cli_board/broken.json -e stats
nebu: cli_board/broken.json: not valid JSON: parse error at line 1, column 26: syntax error while parsing value - unexpected end of input; expected '[', '{', or a literal
[exit 2]
$ nebu --board cli_board -e stats
nebu: cli_board: cannot be read: Is a directory
[exit 2]
$ nebu check cli_board/session.t
cli_board/session.t:4: output differs
--- cli_board/session.t
+++ cli_board/session.t (as run)
@@ -1,7 +1,21 @@
 # nebu --board memory.json
 # slave 0, memory and identity
 > peek 0 1 0 0x10 2
-peek=0x1234 0x0001
+peek=0x1234 0x0000
 > getSlaveInfo 0 1 0 "#note=kept"
+rc=0x00000000
+\#note=kept
+cg_alpha_ver=0
+cg_ver=0.0
+cg_ver.major=0
+cg_ver.minor=0
+core_type=0
+eda_ver=0.0
+eda_ver.major=0
+eda_ver.minor=0
+next_slave=0
+orv_drv_ver=0
+slave_type=68
 > peek 0 1 0 0x1G
-# exit 0
+nebu: bad number '0x1G' for ADDRESS
+# exit 2
check: 1 transcript, 1 differs
[exit 1]
$ nebu check cli_board/plain.t cli_board/commands.t cli_board/absent.t
nebu: cli_board/plain.t:1: a transcript begins with '# nebu' and the console's options
nebu: cli_board/commands.t:1: only console options belong on the first line
nebu: cannot open transcript cli_board/absent.t
check: 3 transcripts, 0 differ
[exit 2]
$ nebu check
nebu: check needs a transcript
[exit 2]
$ nebu check --bogus
nebu: unknown check option '--bogus'
[exit 2]
# exit 0
