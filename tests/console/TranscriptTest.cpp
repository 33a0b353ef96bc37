// Console transcripts on the demo board and data: each tests/transcripts/NAME.nebu runs in a
// console of its own, and what it prints (standard output, then standard error with each line
// marked, then the exit status) must be NAME.out.
#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <string>
#include <vector>

#include "support/NebuRun.h"

namespace {

namespace fs = std::filesystem;

std::vector<std::string> transcripts() {
    std::vector<std::string> names;
    for (const auto& entry : fs::directory_iterator(NEBU_TEST_TRANSCRIPTS_DIR)) {
        if (entry.path().extension() == ".nebu") names.push_back(entry.path().stem().string());
    }
    std::sort(names.begin(), names.end());
    return names;
}

class TranscriptTest : public ::testing::TestWithParam<std::string> {};

TEST_P(TranscriptTest, PrintsTheRecordedOutput) {
    const fs::path dir = NEBU_TEST_TRANSCRIPTS_DIR;
    // Other builds may run the same transcript at the same time.
    const fs::path work = nebutest::makeTempDir("nebu_transcript_");
    std::ofstream(work / "stdin.txt").close();
    const nebutest::Result result = nebutest::runNebu(
        {"--board", NEBU_TEST_BOARDS_DIR "/demo.json", "--data-dir", NEBU_TEST_DATA_DIR "/",
         "--plugin", NEBU_PLUGIN_PATH, (dir / (GetParam() + ".nebu")).string()},
        work / "stdin.txt", work / "stderr.txt");
    fs::remove_all(work);
    std::string actual = result.out;
    for (size_t start = 0; start < result.err.size();) {
        const size_t end = std::min(result.err.find('\n', start), result.err.size());
        actual += "stderr: " + result.err.substr(start, end - start) + "\n";
        start = end + 1;
    }
    actual += "exit status " + std::to_string(result.status) + "\n";
    EXPECT_EQ(nebutest::readFile(dir / (GetParam() + ".out")), actual);
}

INSTANTIATE_TEST_SUITE_P(Demo, TranscriptTest, ::testing::ValuesIn(transcripts()),
                         [](const ::testing::TestParamInfo<std::string>& row) {
                             return row.param;
                         });

}  // namespace
