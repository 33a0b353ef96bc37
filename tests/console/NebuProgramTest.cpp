// The built nebu program where a transcript cannot take it: another library as the plug-in, a
// path of the platform's own form, and `nebu check --update` rewriting a file.
#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <string>
#include <vector>

#include "support/NebuRun.h"

namespace {

namespace fs = std::filesystem;

using nebutest::readFile;
using nebutest::Result;

// Lines of text, without their line feeds.
std::vector<std::string> lines(const std::string& text) {
    std::vector<std::string> result;
    size_t start = 0;
    while (start < text.size()) {
        size_t end = text.find('\n', start);
        if (end == std::string::npos) end = text.size();
        result.push_back(text.substr(start, end - start));
        start = end + 1;
    }
    return result;
}

// The demo board of the console contract, with memory to peek at.
const char* BOARD = R"({"devices": [{"chains": {"1": {"cores": [
    {"type": 3},
    {"type": 14, "master": {"slaveCount": 4, "slaves": {
        "0": {"slaveType": "0x44", "memory": {"0x0010": "0x1234", "0x0020": [1, 2, "0x3"],
                                              "0x1FFFF": "0xAAAA"}}}}}]}}}]})";

class NebuProgramTest : public ::testing::Test {
protected:
    void SetUp() override {
        dir_ = nebutest::makeTempDir("nebu_console_test_");
        board_ = write("board.json", BOARD);
    }
    void TearDown() override { fs::remove_all(dir_); }

    std::string write(const std::string& name, const std::string& text) {
        const fs::path path = dir_ / name;
        std::ofstream(path, std::ios::binary) << text;
        return path.string();
    }

    // Runs nebu with the arguments, standard input from a file (never a terminal).
    Result run(const std::vector<std::string>& args, const std::string& input = "") {
        return nebutest::runNebu(args, write("stdin.txt", input), dir_ / "stderr.txt");
    }

    fs::path dir_;
    std::string board_;
};

TEST_F(NebuProgramTest, FunctionsThePluginDoesNotExportAreUnknownCommands) {
    // A host library exports none of the plug-in's functions.
    const std::string noExports = NEBU_HOST_LIBRARY_PATH;
    const Result r = run({"--board", board_, "--plugin", noExports, "-e", "getSlaveCount 0 1", "-e",
                          "scan", "-e", "status off", "-e", "peek 0 1 0 0x10"});
    EXPECT_EQ(r.status, 2);
    EXPECT_EQ(lines(r.out),
              (std::vector<std::string>{"> getSlaveCount 0 1", "> scan", "> status off",
                                        "> peek 0 1 0 0x10", "peek=0x1234"}));
    EXPECT_EQ(lines(r.err),
              (std::vector<std::string>{
                  "nebu: unknown command 'getSlaveCount' (the plug-in does not export "
                  "OrvNebu_getSlaveCount)",
                  "nebu: unknown command 'scan' (the plug-in does not export "
                  "OrvNebu_getSlaveCount)"}));
}


// '\' on Windows: the platform's separator at the end gets no second one.
TEST_F(NebuProgramTest, LintTakesTheDataDirectoryEndingInTheSeparator) {
    const std::string separated = (fs::path(NEBU_TEST_DATA_DIR) / "").string();
    const Result r = run({"lint", separated});
    EXPECT_EQ(r.status, 0);
    EXPECT_EQ(r.out,
              "lint " + separated + ": 9 directory lines, 12 definition files, no problems\n");
}

TEST_F(NebuProgramTest, CheckUpdateWritesWhatRan) {
    const std::string t = write("session.t",
                                "# nebu --board board.json\n"
                                "# slave 0, memory and identity\n"
                                "> peek 0 1 0 0x10 2\n"
                                "peek=0x1234 0x0001\n"
                                "> getSlaveInfo 0 1 0 \"#note=kept\"\n"
                                "> peek 0 1 0 0x1G\n"
                                "# exit 0\n");
    Result r = run({"check", "--update", t});
    EXPECT_EQ(r.status, 0);
    EXPECT_EQ(r.out, t + ": updated\ncheck: 1 transcript, 1 updated\n");
    const std::vector<std::string> updated = lines(readFile(t));
    ASSERT_EQ(updated.size(), 21u);
    EXPECT_EQ(updated[1], "# slave 0, memory and identity");
    EXPECT_EQ(updated[3], "peek=0x1234 0x0000");
    EXPECT_EQ(updated[6], "\\#note=kept");
    EXPECT_EQ(updated[20], "# exit 2");
    r = run({"check", t, t});
    EXPECT_EQ(r.status, 0);
    EXPECT_EQ(r.out, "check: 2 transcripts, 0 differ\n");
}

}  // namespace
