// `nebu doc`: options, the output directory's safety rules, writing the pages.
#include "Doc.h"

#include <filesystem>
#include <fstream>
#include <ostream>
#include <string>
#include <vector>

#include "DocReader.h"
#include "DocSite.h"
#include "Lint.h"
#include "UsageError.h"

namespace nebu {

namespace {

namespace fs = std::filesystem;

const char* const USAGE =
    "usage: nebu doc [DATA_DIR] -o DIR\n"
    "  writes a web page per register and parameter file of DATA_DIR (default: the demo data\n"
    "  directory), and an index of its directory file, into DIR (made when missing); lint's\n"
    "  problems are shown on the pages. Files in DIR that nebu doc did not write are never\n"
    "  replaced. Exit status 0 when written, 2 for a usage error or an unwritable DIR\n";

// Whether the file's first lines carry the marker of the pages this command writes.
bool writtenByDoc(const fs::path& path) {
    std::ifstream in(path, std::ios::binary);
    std::string head(512, '\0');
    in.read(&head[0], static_cast<std::streamsize>(head.size()));
    head.resize(static_cast<size_t>(in.gcount()));
    return head.find(doc::MARKER) != std::string::npos;
}

struct Options {
    std::string dataDir;
    std::string outDir;
    bool help = false;
};

Options parseDocOptions(const std::vector<std::string>& args, const std::string& defaultDataDir) {
    Options options;
    bool dataGiven = false;
    for (size_t i = 0; i < args.size(); ++i) {
        const std::string& arg = args[i];
        if (arg == "--help" || arg == "-h") {
            options.help = true;
        } else if (arg == "-o") {
            if (i + 1 == args.size()) throw UsageError("doc: -o needs a directory");
            options.outDir = args[++i];
        } else if (arg.size() > 1 && arg[0] == '-') {
            throw UsageError("unknown doc option '" + arg + "'");
        } else if (dataGiven) {
            throw UsageError("doc takes one data directory, not also '" + arg + "'");
        } else {
            options.dataDir = arg;
            dataGiven = true;
        }
    }
    if (!dataGiven) options.dataDir = defaultDataDir;
    if (options.help) return options;
    if (options.outDir.empty()) throw UsageError("doc needs an output directory: -o DIR");
    std::error_code error;
    if (options.dataDir.empty() || !fs::is_directory(options.dataDir, error)) {
        throw UsageError("doc: no data directory '" + options.dataDir + "'");
    }
    options.dataDir = asDirectoryPrefix(options.dataDir);
    return options;
}

void prepareOutput(const fs::path& dir, const std::vector<doc::Page>& pages) {
    std::error_code error;
    fs::create_directories(dir, error);
    if (error || !fs::is_directory(dir, error)) {
        throw UsageError("doc: cannot make output directory '" + dir.string() + "'" +
                         (error ? ": " + error.message() : ""));
    }
    // Checked before anything is written, so that a refusal leaves DIR as it was.
    for (const doc::Page& page : pages) {
        const fs::path path = dir / page.file;
        if (fs::exists(fs::symlink_status(path, error)) &&
            (!fs::is_regular_file(fs::symlink_status(path, error)) || !writtenByDoc(path))) {
            throw UsageError("doc: " + path.string() +
                             " was not written by nebu doc; it is left alone and nothing is "
                             "written");
        }
    }
}

void writePages(const fs::path& dir, const std::vector<doc::Page>& pages) {
    for (const doc::Page& page : pages) {
        const fs::path path = dir / page.file;
        std::ofstream file(path, std::ios::binary | std::ios::trunc);
        file << page.text;
        file.close();
        if (!file) throw UsageError("doc: cannot write " + path.string());
    }
}

}  // namespace

int runDoc(const std::vector<std::string>& args, const std::string& defaultDataDir,
           std::ostream& out, std::ostream& err) {
    try {
        const Options options = parseDocOptions(args, defaultDataDir);
        if (options.help) {
            out << USAGE;
            return 0;
        }
        doc::Site site = doc::readSite(options.dataDir);
        doc::assignPages(site);
        const std::vector<doc::Page> pages = doc::renderSite(site);
        prepareOutput(options.outDir, pages);
        writePages(options.outDir, pages);
        const size_t n = site.problems.size();
        out << "doc " << options.dataDir << " -> " << options.outDir << ": " << site.rows.size()
            << " directory rows, " << site.registerFiles.size() << " register pages, "
            << site.parameterFiles.size() << " parameter pages, "
            << (n == 0 ? std::string("no problems")
                       : std::to_string(n) + (n == 1 ? " problem" : " problems"))
            << std::endl;
        return 0;
    } catch (const UsageError& e) {
        out.flush();
        err << "nebu: " << oneLine(e.what()) << std::endl;
        return 2;
    }
}

}  // namespace nebu
