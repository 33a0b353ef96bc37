// The shipped parameter file on the demo board, as a console user sees it: dump, the choice
// calls and printParameterFile, run through the built nebu program.
#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <string>
#include <vector>

#include "TextFormat.h"
#include "support/NebuRun.h"

namespace {

using ConsoleRun = nebutest::Result;

// Runs nebu with the demo board and data and one -e per command; stderr goes to stdout.
ConsoleRun console(const std::vector<std::string>& commands) {
    std::vector<std::string> args;
    for (const std::string& c : commands) args.insert(args.end(), {"-e", c});
    const std::filesystem::path dir = nebutest::makeTempDir("nebu_demo_params_");
    std::ofstream(dir / "stdin.txt").close();
    ConsoleRun run = nebutest::runNebu(args, dir / "stdin.txt", dir / "out.txt", {}, true);
    std::filesystem::remove_all(dir);
    return run;
}

std::string between(const std::string& text, const std::string& from, const std::string& to) {
    const size_t start = text.find(from);
    if (start == std::string::npos) return "<" + from + " missing>";
    const size_t end = text.find(to, start + from.size());
    return text.substr(start + from.size(),
                       end == std::string::npos ? std::string::npos : end - start - from.size());
}

}  // namespace

TEST(DemoParams, DumpShowsTheControlBlockParameters) {
    const ConsoleRun run = console({"dump 0 1 0"});
    EXPECT_EQ(0, run.status) << run.out;
    EXPECT_EQ(
        "parameters: rc=0x00000000\n"
        "  clock_divider=full\n"
        "  mode=idle\n"
        "  test_pattern=custom\n",
        "parameters: " + between(run.out, "parameters: ", "\n> "))
        << run.out;
}

TEST(DemoParams, SettingAChoiceWritesSeveralRegisters) {
    const ConsoleRun run =
        console({"initialize 0 1 0", "setParameters 0 1 0 mode=SELF_TEST test_pattern=ones",
                 "getRegisters 0 1 0 CTRL_ENABLE CTRL_MODE CTRL_LOOPBACK PATTERN",
                 "getParameters 0 1 0 mode test_pattern", "getParameterChoices 0 1 0 test_pattern",
                 "setParameters 0 1 0 test_pattern=reset_default",
                 "getParameters 0 1 0 test_pattern", "setParameters 0 1 0 clock_divider=fastest"});
    EXPECT_EQ(1, run.status) << run.out;
    EXPECT_EQ(
        "rc=0x00000000\n"
        "CTRL_ENABLE=1\nCTRL_LOOPBACK=1\nCTRL_MODE=2\nPATTERN=FFF\n",
        between(run.out, "> getRegisters 0 1 0 CTRL_ENABLE CTRL_MODE CTRL_LOOPBACK PATTERN\n",
                "> "));
    EXPECT_EQ("rc=0x00000000\nmode=self_test\ntest_pattern=ones\n",
              between(run.out, "> getParameters 0 1 0 mode test_pattern\n", "> "));
    EXPECT_EQ(
        "rc=0x00000000\nchoice=zeros\nchoice=ones\nchoice=alternating\nchoice=reset_default\n"
        "choice=custom\n",
        between(run.out, "> getParameterChoices 0 1 0 test_pattern\n", "> "));
    // reset_default shares its settings with zeros, which comes first.
    EXPECT_EQ("rc=0x00000000\ntest_pattern=zeros\n",
              between(run.out, "> getParameters 0 1 0 test_pattern\n", "> "));
    EXPECT_EQ(
        "message 256: Setting Parameter 'clock_divider' to value 'fastest' is not a valid "
        "choice.\nrc=0x80000000\n",
        between(run.out, "> setParameters 0 1 0 clock_divider=fastest\n", "> "));
}

TEST(DemoParams, PrintParameterFile) {
    const std::filesystem::path dir = nebutest::makeTempDir("nebu_print_params_");
    const std::string path = (dir / "p.csv").string();
    std::ofstream(path, std::ios::binary) << "Param,Index,Choice\r\n\"M\",0,a,R=01,\nM,1,b,\n";
    const std::string bad = (dir / "bad.csv").string();
    std::ofstream(bad, std::ios::binary) << "h\nM,0\n";

    const ConsoleRun run = console(
        {"printParameterFile " + path, "printParameterFile " + path, "printParameterFile " + bad});
    std::filesystem::remove_all(dir);
    const std::string image = "Param,Index,Choice\nM,0,a,R=01\nM,1,b\n";
    EXPECT_EQ("> printParameterFile " + path + "\n" + image + "> printParameterFile " + path +
                  "\n" + image + "> printParameterFile " + bad +
                  "\nmessage 512: Unable to parse file: " + nebu::escapeText(bad) +
                  " line:2: M,0\n",
              run.out);
    EXPECT_EQ(1, run.status);
}
