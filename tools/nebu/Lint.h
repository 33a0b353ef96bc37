// `nebu lint`: checks a data directory as a whole, with the library's own file readers.
#pragma once

#include <cstdint>
#include <iosfwd>
#include <string>
#include <vector>

namespace nebu {

struct LintProblem {
    std::string file;  // data directory + the name the directory file gives
    uint32_t line;     // 0: the file as a whole
    std::string text;
};

// A line of the directory file that reaches the key columns.
struct LintDirectoryLine {
    uint32_t line;
    int32_t slaveType;
    int32_t minVersion;
    int32_t maxVersion;
    std::string registers;   // as the line gives it
    std::string parameters;  // as the line gives it; may be empty
};

struct LintResult {
    std::vector<LintDirectoryLine> directoryLines;
    std::vector<LintProblem> problems;  // sorted by file and line
    size_t filesRead = 0;
};

// Everything lint finds in dataDir (which ends in a separator).
LintResult lintDataDir(const std::string& dataDir);

// args: the words after "lint" ([DATA_DIR]; defaultDataDir when absent). Writes one
// "FILE:LINE: problem" line per problem ("FILE: problem" when no line is concerned), sorted
// by file and line, then a summary line, on out. Returns 0 when clean, 1 with problems, 2 for
// a usage error (reported on err as one "nebu: " line).
int runLint(const std::vector<std::string>& args, const std::string& defaultDataDir,
            std::ostream& out, std::ostream& err);

}  // namespace nebu
