// The built nebu program where a transcript cannot take it: a path of the platform's own form,
// and `nebu check --update` rewriting a file.
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

class NebuProgramTest : public ::testing::Test {
protected:
    void SetUp() override {
        dir_ = nebutest::makeTempDir("nebu_console_test_");
        fs::copy_file(fs::path(NEBU_TEST_FILES_DIR) / "../transcripts/cli_board/memory.json",
                      dir_ / "board.json");
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
};

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
    // Comments and commands stay; output, escapes and the exit status are as run.
    const std::string updated = readFile(t);
    for (const char* part :
         {"# nebu --board board.json\n# slave 0, memory and identity\n> peek "
          "0 1 0 0x10 2\npeek=0x1234 0x0000\n",
          "\n\\#note=kept\n", "\nnebu: bad number '0x1G' for ADDRESS\n# exit 2\n"})
        EXPECT_NE(updated.find(part), std::string::npos) << part << updated;
    r = run({"check", t, t});
    EXPECT_EQ(r.status, 0);
    EXPECT_EQ(r.out, "check: 2 transcripts, 0 differ\n");
}

}  // namespace
