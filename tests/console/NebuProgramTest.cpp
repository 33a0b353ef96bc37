// The built nebu program run as a user runs it: options, board files, -e commands, scripts
// and standard input, checking standard output, standard error and the exit status.
#include <gtest/gtest.h>

#if !defined(_WIN32)
#include <fcntl.h>
#include <poll.h>
#include <pty.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>
#endif

#include <cstdio>
#include <filesystem>
#include <fstream>
#include <map>
#include <sstream>
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

const char* NO_JTAG_STATS =
    "stats commands=0 writeBits=0 readBits=0 flushes=0 statusReads=0 roundTrips=0 cableUs=0";

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
    // With the test board and the plug-in under test.
    Result runOnBoard(std::vector<std::string> args, const std::string& input = "") {
        args.insert(args.begin(), {"--board", board_, "--plugin", NEBU_PLUGIN_PATH});
        return run(args, input);
    }

    fs::path dir_;
    std::string board_;
};

TEST_F(NebuProgramTest, StartUpUsageErrorsStopTheConsoleWithOneLine) {
    Result r = run({"--bogus", "-e", "stats"});
    EXPECT_EQ(r.status, 2);
    EXPECT_EQ(r.out, "");
    EXPECT_EQ(r.err, "nebu: unknown option '--bogus'\n");

    r = run({"--session", "0x1Z", "-e", "stats"});
    EXPECT_EQ(r.status, 2);
    EXPECT_EQ(r.err, "nebu: bad number '0x1Z' for --session\n");

    r = run({"--board"});
    EXPECT_EQ(r.status, 2);
    EXPECT_EQ(r.err, "nebu: option --board needs an argument\n");

    r = run({"--board", board_, (dir_ / "missing.nebu").string()});
    EXPECT_EQ(r.status, 2);
    EXPECT_EQ(r.err, "nebu: cannot open script " + (dir_ / "missing.nebu").string() + "\n");

    r = run({"--board", board_, "--plugin", (dir_ / "nothing.so").string(), "-e", "stats"});
    EXPECT_EQ(r.status, 2);
    EXPECT_EQ(r.out, "");
    EXPECT_EQ(r.err.rfind("nebu: cannot load plug-in " + (dir_ / "nothing.so").string(), 0), 0u)
        << r.err;
    EXPECT_EQ(lines(r.err).size(), 1u);
}

TEST_F(NebuProgramTest, BadBoardFilesAreNamedAndTheConsoleDoesNotStart) {
    const std::vector<std::string> boards = {
        (dir_ / "absent.json").string(),
        write("broken.json", "{\"devices\": [ {\"chains\": "),
        write("shape.json", "{\"devices\": 5}"),
        write(
            "range.json",
            R"({"devices": [{"chains": {"1": {"cores": [{"type": 14, "master": {"slaveCount": 300}}]}}}]})"),
        write("deep.json", std::string(100000, '[') + std::string(100000, ']')),
        write("twice.json", R"({"devices": [{"chains": {"1": {}, "1": {}}}]})"),
    };
    for (const auto& board : boards) {
        const Result r = run({"--board", board, "--plugin", NEBU_PLUGIN_PATH, "-e", "stats"});
        EXPECT_EQ(r.status, 2) << board;
        EXPECT_EQ(r.out, "") << board;
        EXPECT_EQ(r.err.rfind("nebu: ", 0), 0u) << r.err;
        EXPECT_NE(r.err.find(fs::path(board).filename().string()), std::string::npos) << r.err;
        EXPECT_EQ(lines(r.err).size(), 1u) << r.err;
    }
}

TEST_F(NebuProgramTest, PeekAndPokeReachTheBoardDirectly) {
    Result r = runOnBoard({"-e", "peek 0 1 0 0x10", "-e", "peek 0 1 0 0x20 3", "-e",
                           "poke 0 1 0 0x21 0xbeef 7", "-e", "peek 0 1 0 0x1F 4", "-e",
                           "peek 0 1 0 0x1FFFF 2", "-e", "poke 0 1 0 0x1FFFF 5 6", "-e",
                           "peek 0 1 0 0x1FFFF 2", "-e", "peek 0 1 0 0 0", "-e", "stats"});
    EXPECT_EQ(r.err, "");
    EXPECT_EQ(r.status, 0);
    EXPECT_EQ(
        lines(r.out),
        (std::vector<std::string>{
            "> peek 0 1 0 0x10", "peek=0x1234", "> peek 0 1 0 0x20 3", "peek=0x0001 0x0002 0x0003",
            "> poke 0 1 0 0x21 0xbeef 7", "> peek 0 1 0 0x1F 4", "peek=0x0000 0x0001 0xBEEF 0x0007",
            // the address wraps at the end of the bus
            "> peek 0 1 0 0x1FFFF 2", "peek=0xAAAA 0x0000", "> poke 0 1 0 0x1FFFF 5 6",
            "> peek 0 1 0 0x1FFFF 2", "peek=0x0005 0x0006", "> peek 0 1 0 0 0", "peek=",
            // no JTAG was involved
            "> stats", NO_JTAG_STATS}));
}

TEST_F(NebuProgramTest, BadPeekAndPokeWriteNothingAndTheConsoleGoesOn) {
    const Result r = runOnBoard({"-e", "poke 0 1 0 0x10 1 0x10000", "-e", "poke 0 1 0 0x10 2 x",
                                 "-e", "peek 0 1 0 0x20000", "-e", "peek 0 1 9 0", "-e",
                                 "peek 0 2 0 0", "-e", "poke 0 1 0 0x10", "-e", "peek 0 1 0 0x10"});
    EXPECT_EQ(r.status, 2);
    EXPECT_EQ(lines(r.out),
              (std::vector<std::string>{"> poke 0 1 0 0x10 1 0x10000", "> poke 0 1 0 0x10 2 x",
                                        "> peek 0 1 0 0x20000", "> peek 0 1 9 0", "> peek 0 2 0 0",
                                        "> poke 0 1 0 0x10", "> peek 0 1 0 0x10", "peek=0x1234"}));
    const auto errors = lines(r.err);
    ASSERT_EQ(errors.size(), 6u) << r.err;
    EXPECT_EQ(errors[0], "nebu: VALUE 0x10000 does not fit 16 bits");
    EXPECT_EQ(errors[1], "nebu: bad number 'x' for VALUE");
    EXPECT_EQ(errors[2], "nebu: ADDRESS 0x20000 is outside the bus (0..0x1FFFF)");
    EXPECT_EQ(errors[3].rfind("nebu: peek: ", 0), 0u);
    EXPECT_EQ(errors[4].rfind("nebu: peek: ", 0), 0u);
    EXPECT_EQ(errors[5], "nebu: usage: poke D C S ADDRESS VALUE...");
}

TEST_F(NebuProgramTest, UnknownCommandsAndBadNumbersAreUsageErrors) {
    const Result r = runOnBoard({"-e", "frobnicate 1 2", "-e", "peek 0 1 0 0x1G", "-e",
                                 "getSlaveCount 0 1", "-e", "peek 0 1 0 0x10"});
    EXPECT_EQ(r.status, 2);
    EXPECT_EQ(lines(r.out).front(), "> frobnicate 1 2");
    EXPECT_EQ(lines(r.out).back(), "peek=0x1234");
    const auto errors = lines(r.err);
    ASSERT_GE(errors.size(), 2u);
    EXPECT_EQ(errors[0], "nebu: unknown command 'frobnicate'");
    EXPECT_EQ(errors[1], "nebu: bad number '0x1G' for ADDRESS");
}

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

TEST_F(NebuProgramTest, SessionsStatusAndStatsAreConsoleCommands) {
    const Result r =
        runOnBoard({"--session", "9", "-e", "stats", "-e", "session 3", "-e", "status off", "-e",
                    "status on", "-e", "endSession", "-e", "endSession 9", "-e", "stats"});
    EXPECT_EQ(r.err, "");
    EXPECT_EQ(r.status, 0);
    EXPECT_EQ(lines(r.out), (std::vector<std::string>{"> stats", NO_JTAG_STATS, "> session 3",
                                                      "> status off", "> status on", "> endSession",
                                                      "> endSession 9", "> stats", NO_JTAG_STATS}));

    const Result bad = runOnBoard({"-e", "session -1", "-e", "endSession 1 2", "-e", "stats x"});
    EXPECT_EQ(bad.status, 2);
    EXPECT_EQ(lines(bad.err),
              (std::vector<std::string>{"nebu: bad number '-1' for N",
                                        "nebu: usage: endSession [N]", "nebu: usage: stats"}));
}

// The counters of a stats line, by name.
std::map<std::string, uint64_t> statsFields(const std::string& line) {
    std::map<std::string, uint64_t> fields;
    std::istringstream words(line);
    std::string word;
    words >> word;
    while (words >> word) {
        const size_t eq = word.find('=');
        if (eq != std::string::npos) fields[word.substr(0, eq)] = std::stoull(word.substr(eq + 1));
    }
    return fields;
}

TEST_F(NebuProgramTest, StatsEstimatesTheTimeOnACable) {
    const std::vector<std::string> discovery = {"-e",   "getSlaveCount 0 1", "-e", "stats", "-e",
                                                "stats"};
    std::vector<std::vector<std::string>> runs = {
        {}, {"--tck-mhz", "1", "--round-trip-us", "0"}, {"--tck-mhz=1e9", "--round-trip-us=1000"}};
    std::vector<std::map<std::string, uint64_t>> seen;
    for (auto args : runs) {
        args.insert(args.end(), discovery.begin(), discovery.end());
        const Result r = runOnBoard(args);
        ASSERT_EQ(r.status, 0) << r.err;
        const std::vector<std::string> out = lines(r.out);
        ASSERT_EQ(out.size(), 7u) << r.out;
        EXPECT_EQ(out[1], "rc=0x00000000");
        seen.push_back(statsFields(out[4]));
        // The second stats sees nothing since the first.
        EXPECT_EQ(out[6], NO_JTAG_STATS);
    }
    const auto& counts = seen[0];
    ASSERT_EQ(counts.size(), 7u);
    ASSERT_GT(counts.at("roundTrips"), 0u);
    ASSERT_GT(counts.at("writeBits") + counts.at("readBits"), 0u);
    for (const auto& s : seen) EXPECT_EQ(s.at("roundTrips"), counts.at("roundTrips"));
    // At 1 MHz without latency a bit costs a microsecond; at 1 THz only the round trips count.
    EXPECT_EQ(seen[1].at("cableUs"), counts.at("writeBits") + counts.at("readBits"));
    EXPECT_EQ(seen[2].at("cableUs"), counts.at("roundTrips") * 1000u);
    const double standard =
        static_cast<double>(counts.at("writeBits") + counts.at("readBits")) / 30.0 +
        static_cast<double>(counts.at("roundTrips")) * 125.0;
    EXPECT_NEAR(static_cast<double>(counts.at("cableUs")), standard, 0.5);

    const Result bad = runOnBoard({"--tck-mhz", "0", "-e", "stats"});
    EXPECT_EQ(bad.status, 2);
    EXPECT_EQ(bad.out, "");
    EXPECT_EQ(bad.err, "nebu: --tck-mhz must be above 0, not 0\n");
}

TEST_F(NebuProgramTest, StandardInputWithoutATerminalHasNoPrompt) {
    const Result r =
        runOnBoard({}, "peek 0 1 0 0x10\n\n   # a comment\r\n\tstats \t\npoke 0 1 0 0x10 1");
    EXPECT_EQ(r.err, "");
    EXPECT_EQ(r.status, 0);
    EXPECT_EQ(r.out, std::string("> peek 0 1 0 0x10\npeek=0x1234\n> \tstats \t\n") + NO_JTAG_STATS +
                         "\n> poke 0 1 0 0x10 1\n");
}

#if !defined(_WIN32)
// A terminal of its own for the console is a pseudo-terminal, which Windows does not have.
TEST_F(NebuProgramTest, TerminalInputGetsAPrompt) {
    int master = -1;
    int terminal = -1;
    ASSERT_EQ(openpty(&master, &terminal, nullptr, nullptr, nullptr), 0);
    const std::string err = (dir_ / "stderr.txt").string();
    posix_spawn_file_actions_t actions;
    posix_spawn_file_actions_init(&actions);
    posix_spawn_file_actions_adddup2(&actions, terminal, 0);
    posix_spawn_file_actions_adddup2(&actions, terminal, 1);
    posix_spawn_file_actions_addopen(&actions, 2, err.c_str(), O_WRONLY | O_CREAT | O_TRUNC, 0600);
    posix_spawn_file_actions_addclose(&actions, master);
    posix_spawn_file_actions_addclose(&actions, terminal);
    std::vector<std::string> args = {NEBU_CONSOLE_PATH, "--board", board_, "--plugin",
                                     NEBU_PLUGIN_PATH};
    std::vector<char*> argv;
    for (auto& arg : args) argv.push_back(arg.data());
    argv.push_back(nullptr);
    pid_t pid = -1;
    const int spawned =
        posix_spawn(&pid, NEBU_CONSOLE_PATH, &actions, nullptr, argv.data(), environ);
    posix_spawn_file_actions_destroy(&actions);
    close(terminal);
    ASSERT_EQ(spawned, 0);

    // A command, then end-of-file (Ctrl-D at the start of a line).
    const std::string typed = "peek 0 1 0 0x10\n\x04";
    ASSERT_EQ(::write(master, typed.data(), typed.size()), static_cast<ssize_t>(typed.size()));
    std::string screen;
    for (;;) {
        pollfd ready{master, POLLIN, 0};
        if (poll(&ready, 1, 10000) <= 0) break;  // only a guard against a hang
        char buffer[512];
        const ssize_t n = read(master, buffer, sizeof buffer);
        if (n <= 0) break;  // the console has exited and closed the terminal
        screen.append(buffer, static_cast<size_t>(n));
    }
    close(master);
    int wait = 0;
    ASSERT_EQ(waitpid(pid, &wait, 0), pid);
    EXPECT_TRUE(WIFEXITED(wait) && WEXITSTATUS(wait) == 0) << wait;
    EXPECT_EQ(readFile(err), "");
    // The terminal shows the prompt, the typed line, the echo and the result; a prompt again
    // before end-of-file.
    const size_t prompt = screen.find("nebu> ");
    const size_t result = screen.find("> peek 0 1 0 0x10\r\npeek=0x1234\r\n");
    ASSERT_NE(prompt, std::string::npos) << screen;
    ASSERT_NE(result, std::string::npos) << screen;
    EXPECT_LT(prompt, result);
    EXPECT_NE(screen.find("nebu> ", result), std::string::npos) << screen;
}

#endif

TEST_F(NebuProgramTest, ScriptRunsBeforeTheCommandsOfTheCommandLine) {
    const std::string script = write("tour.nebu",
                                     "# a tour (\x1a\x1a: old Windows' end of file)\r\n"
                                     "poke 0 1 0 0x40 \"0x0042\"   # quoted number\r\n"
                                     "\r\n"
                                     "peek 0 1 0 0x40\n");
    Result r = runOnBoard({script, "-e", "peek 0 1 0 0x3F 2"});
    EXPECT_EQ(r.err, "");
    EXPECT_EQ(r.status, 0);
    EXPECT_EQ(lines(r.out),
              (std::vector<std::string>{"> poke 0 1 0 0x40 \"0x0042\"   # quoted number",
                                        "> peek 0 1 0 0x40", "peek=0x0042", "> peek 0 1 0 0x3F 2",
                                        "peek=0x0000 0x0042"}));
    // A script's usage error does not stop the script.
    const std::string bad = write("bad.nebu", "bogus\npeek 0 1 0 0x10\n");
    r = runOnBoard({bad});
    EXPECT_EQ(r.status, 2);
    EXPECT_EQ(lines(r.out),
              (std::vector<std::string>{"> bogus", "> peek 0 1 0 0x10", "peek=0x1234"}));
    EXPECT_EQ(r.err, "nebu: unknown command 'bogus'\n");
}

TEST_F(NebuProgramTest, DemoBoardDataDirAndPluginAreFoundBesideTheProgram) {
    const Result r = run({"-e", "stats"});
    EXPECT_EQ(r.err, "");
    EXPECT_EQ(r.status, 0);
    EXPECT_EQ(lines(r.out), (std::vector<std::string>{"> stats", NO_JTAG_STATS}));

    const Result help = run({"--help"});
    EXPECT_EQ(help.status, 0);
    EXPECT_EQ(help.out.rfind("usage: nebu [--board FILE]", 0), 0u);
}

}  // namespace
