// `nebu check`: console sessions written down as transcripts, run again and compared with the
// output they hold.
#pragma once

#include <iosfwd>
#include <string>
#include <vector>

namespace nebu {

// A transcript: a first line "# nebu OPTIONS" (paths relative to the transcript's folder),
// then the commands as the console echoes them ("> COMMAND"), each followed by its output:
// standard output and the "nebu: " lines of standard error in the order they come. An output
// line that is empty or begins with '#', '>', '$' or '\' is written with a '\' in front. Other
// '#' lines and empty lines are comments; the last line, "# exit N", is the console's exit
// status. A line "$ nebu ARGS" runs the program itself with ARGS in the transcript's folder,
// before the session; its output follows it, then "[exit N]" when N is not 0.
//
// args: [--update] FILE... Each file runs in a fresh console of its own. A difference is
// reported as "FILE:LINE: output differs" and a unified diff (expected, then as run) on out;
// --update writes the output as run into the file instead. Returns 0 when every transcript
// matches (or was updated), 1 when one differs, 2 for a usage error.
int runCheck(const std::vector<std::string>& args, const std::string& exeDir, std::ostream& out,
             std::ostream& err);

}  // namespace nebu
