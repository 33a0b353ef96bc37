// `nebu lint`: checks a data directory as a whole, with the library's own file readers.
#pragma once

#include <iosfwd>
#include <string>
#include <vector>

namespace nebu {

// dir with a separator at its end, ready for a file name: '/' joins on Windows too, as the
// stand-in host joins the data directory, and there a trailing backslash serves as well.
std::string asDirectoryPrefix(std::string dir);

// args: the words after "lint" ([DATA_DIR]; defaultDataDir when absent). Writes one
// "FILE:LINE: problem" line per problem ("FILE: problem" when no line is concerned), sorted
// by file and line, then a summary line, on out. Returns 0 when clean, 1 with problems, 2 for
// a usage error (reported on err as one "nebu: " line).
int runLint(const std::vector<std::string>& args, const std::string& defaultDataDir,
            std::ostream& out, std::ostream& err);

}  // namespace nebu
