// `nebu lint`: the data directory read with the library's definition-file reader, which
// returns every problem it finds as data, printed here one a line.
#include "Lint.h"

#include <algorithm>
#include <filesystem>
#include <ostream>
#include <string>
#include <vector>

#include "base/OrvNebu_DataDirectory.h"
#include "base/OrvNebu_FileProblem.h"

namespace nebu {

namespace {

using OrvRT::OrvNebu_FileProblem;

bool isDirectory(const std::string& path) {
    std::error_code error;
    return std::filesystem::is_directory(path, error);
}

// The data directory to check, or the status of a usage error (already reported).
int parseArguments(const std::vector<std::string>& args, std::string& dataDir, std::ostream& out,
                   std::ostream& err) {
    size_t given = 0;
    for (const std::string& arg : args) {
        if (arg == "--help" || arg == "-h") {
            out << "usage: nebu lint [DATA_DIR]\n"
                   "  checks the directory file of DATA_DIR (default: the demo data directory),\n"
                   "  the register and parameter files it names and what transceiver slaves\n"
                   "  need; prints FILE:LINE: problem lines and a summary; exit status 0 when\n"
                   "  clean, 1 with problems, 2 for a usage error\n";
            return 0;
        }
        if (arg.size() > 1 && arg[0] == '-') {
            err << "nebu: unknown lint option '" << arg << "'" << std::endl;
            return 2;
        }
        if (++given > 1) {
            err << "nebu: lint takes one data directory, not also '" << arg << "'" << std::endl;
            return 2;
        }
        dataDir = arg;
    }
    if (dataDir.empty() || !isDirectory(dataDir)) {
        err << "nebu: lint: no data directory '" << dataDir << "'" << std::endl;
        return 2;
    }
    dataDir = asDirectoryPrefix(dataDir);
    return -1;
}

void printProblem(const OrvNebu_FileProblem& p, std::ostream& out) {
    out << p.file;
    if (p.line != 0) out << ':' << p.line;
    out << ": " << p.text;
    // The plug-in quotes the line it stops at.
    if (p.refusesFile() &&
        p.messages.back().severity == OrvNebu_FileProblem::SEVERITY_MALFORMED_LINE) {
        out << " (the plug-in refuses the file)";
    }
    out << '\n';
}

}  // namespace

std::string asDirectoryPrefix(std::string dir) {
#if defined(_WIN32)
    const bool separated = !dir.empty() && (dir.back() == '/' || dir.back() == '\\');
#else
    const bool separated = !dir.empty() && dir.back() == '/';
#endif
    if (!separated) dir += '/';
    return dir;
}

int runLint(const std::vector<std::string>& args, const std::string& defaultDataDir,
            std::ostream& out, std::ostream& err) {
    std::string dataDir = defaultDataDir;
    const int usage = parseArguments(args, dataDir, out, err);
    if (usage >= 0) return usage;

    const OrvRT::OrvNebu_DataDirectory data(dataDir);
    std::vector<const OrvNebu_FileProblem*> problems;
    for (const OrvNebu_FileProblem& p : data.problems()) problems.push_back(&p);
    // By file and line; in the order found within a line.
    std::stable_sort(problems.begin(), problems.end(),
                     [](const OrvNebu_FileProblem* a, const OrvNebu_FileProblem* b) {
                         return a->file != b->file ? a->file < b->file : a->line < b->line;
                     });
    for (const OrvNebu_FileProblem* p : problems) printProblem(*p, out);

    const size_t n = problems.size();
    out << "lint " << dataDir << ": " << data.directory().rows().size() << " directory lines, "
        << data.filesRead() << " definition files, ";
    if (n == 0) {
        out << "no problems" << std::endl;
        return 0;
    }
    out << n << (n == 1 ? " problem" : " problems") << std::endl;
    return 1;
}

}  // namespace nebu
