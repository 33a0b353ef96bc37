// What the fuzz targets share: a scratch directory for inputs that the readers take as files,
// a stream that swallows output, the demo data and board, and a fresh stand-in host per run.
#pragma once

#include <sys/stat.h>
#include <unistd.h>

#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <map>
#include <memory>
#include <ostream>
#include <sstream>
#include <streambuf>
#include <string>
#include <utility>

#include "base/OrvNebu_FileProblem.h"
#include "hostsim/Sim.h"
#include "hostsim/board/Board.h"

namespace nebufuzz {

// A directory of this process, made on first use and removed at exit.
class ScratchDir {
public:
    static ScratchDir& instance() {
        static ScratchDir dir;
        return dir;
    }
    // The directory with a trailing separator, as the host hands a data directory out.
    const std::string& dir() const { return dir_; }
    std::string path(const std::string& name) const { return dir_ + name; }
    void write(const std::string& name, const uint8_t* data, size_t size) const {
        std::ofstream out(path(name), std::ios::binary | std::ios::trunc);
        out.write(reinterpret_cast<const char*>(data), static_cast<std::streamsize>(size));
    }
    void write(const std::string& name, const std::string& text) const {
        write(name, reinterpret_cast<const uint8_t*>(text.data()), text.size());
    }

private:
    ScratchDir() {
        // Memory, where there is some: rewriting a file on a disk mounted with discard costs
        // milliseconds, a hundred times the run itself.
        const char* tmp = std::getenv("TMPDIR");
        std::string base = tmp != nullptr && *tmp != '\0' ? tmp : "/tmp";
        struct stat info;
        if (stat("/dev/shm", &info) == 0 && S_ISDIR(info.st_mode) && access("/dev/shm", W_OK) == 0)
            base = "/dev/shm";
        std::string pattern = base + "/nebu-fuzz-XXXXXX";
        if (mkdtemp(pattern.data()) == nullptr) {
            std::perror("mkdtemp");
            std::abort();
        }
        dir_ = pattern + "/";
    }
    ~ScratchDir() {
        std::string cmd = "rm -rf '" + dir_ + "'";
        if (std::system(cmd.c_str()) != 0) std::fputs("could not remove the scratch dir\n", stderr);
    }
    std::string dir_;
};

// Output nobody reads; formatting still runs.
class NullBuffer : public std::streambuf {
protected:
    int_type overflow(int_type c) override { return traits_type::not_eof(c); }
    std::streamsize xsputn(const char*, std::streamsize n) override { return n; }
};
inline std::ostream& nullStream() {
    static NullBuffer buffer;
    static std::ostream stream(&buffer);
    return stream;
}

inline std::string readText(const std::string& path) {
    std::ifstream in(path, std::ios::binary);
    std::ostringstream text;
    text << in.rdbuf();
    return text.str();
}

// The demo data directory of the source tree, with a trailing separator.
inline std::string demoDataDir() { return std::string(NEBU_FUZZ_DATA_DIR) + "/"; }
inline std::string demoFile(const std::string& name) { return demoDataDir() + name; }

// Stops the program on a broken promise of the code under test, so the fuzzer reports it.
#define NEBU_FUZZ_CHECK(cond)                                                             \
    do {                                                                                  \
        if (!(cond)) {                                                                    \
            std::fprintf(stderr, "%s:%d: check failed: %s\n", __FILE__, __LINE__, #cond); \
            std::abort();                                                                 \
        }                                                                                 \
    } while (0)

// What the definition-file reader promises of the problems it returns, and that the plug-in's
// reading (which stops at the first refusal) and the file tools' (which read on) agree on it.
template <class File>
void checkBothReadings(const std::string& path) {
    const File plugin(path);
    const File tools(path, File::EVERY_PROBLEM);
    const OrvRT::OrvNebu_FileProblem* first =
        OrvRT::OrvNebu_FileProblem::firstRefusal(plugin.problems());
    const OrvRT::OrvNebu_FileProblem* same =
        OrvRT::OrvNebu_FileProblem::firstRefusal(tools.problems());
    NEBU_FUZZ_CHECK((first == nullptr) == (same == nullptr));
    if (first != nullptr) {
        NEBU_FUZZ_CHECK(first == &plugin.problems().back());
        NEBU_FUZZ_CHECK(first->line == same->line && first->text == same->text);
    }
    for (const OrvRT::OrvNebu_FileProblem& p : tools.problems()) {
        NEBU_FUZZ_CHECK(p.file == path && !p.text.empty());
        NEBU_FUZZ_CHECK((p.severity == OrvRT::OrvNebu_FileProblem::SEVERITY_WARNING) ==
                        !p.refusesFile());
    }
}

// The board of a board file text as loaded, without parsing the text on every run: a copy of
// the board loaded the first time.
inline std::shared_ptr<OrvSim::Board> freshBoard(const std::string& boardJson) {
    static std::map<std::string, std::shared_ptr<const OrvSim::Board>> loaded;
    auto it = loaded.find(boardJson);
    if (it == loaded.end()) {
        it = loaded.emplace(boardJson, OrvSim::Board::loadText(boardJson, "fuzz board")).first;
    }
    return it->second->copy();
}

// One run against a fresh stand-in host: the board, the data directory, and the promise every
// exported call keeps: it returns OK or FAILED, and a failure has been reported on the session
// channel.
class HostRun {
public:
    HostRun(const std::string& boardJson, const std::string& dataDir)
        : HostRun(freshBoard(boardJson), dataDir) {}
    HostRun(std::shared_ptr<OrvSim::Board> board, const std::string& dataDir) {
        OrvSim::resetHost();
        OrvSim::setMessageSink([this](uint32_t, uint32_t, const std::string&) { ++messages_; });
        OrvSim::setBoard(std::move(board));
        OrvSim::setDataDir(dataDir);
    }
    // Ends every session: the plug-in drops its slave objects and cached files.
    ~HostRun() { OrvSim::resetHost(); }
    HostRun(const HostRun&) = delete;
    HostRun& operator=(const HostRun&) = delete;

    // Checks the return code of the call just made; true for OK.
    bool check(uint32_t rc) {
        NEBU_FUZZ_CHECK(rc == 0x00000000u || rc == 0x80000000u);
        if (rc != 0) NEBU_FUZZ_CHECK(messages_ > 0);
        messages_ = 0;
        return rc == 0;
    }

private:
    uint64_t messages_ = 0;
};

}  // namespace nebufuzz
