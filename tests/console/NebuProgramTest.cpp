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

    r = run({"--tck-mhz", "0", "-e", "stats"});
    EXPECT_EQ(r.status, 2);
    EXPECT_EQ(r.err, "nebu: --tck-mhz must be above 0, not 0\n");

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

TEST_F(NebuProgramTest, CheckShowsWhereATranscriptDiffersAndUpdateWritesWhatRan) {
    const std::string t = write("session.t",
                                "# nebu --board board.json\n"
                                "# slave 0, memory and identity\n"
                                "> peek 0 1 0 0x10 2\n"
                                "peek=0x1234 0x0001\n"
                                "> getSlaveInfo 0 1 0 \"#note=kept\"\n"
                                "> peek 0 1 0 0x1G\n"
                                "# exit 0\n");
    Result r = run({"check", t});
    EXPECT_EQ(r.status, 1);
    EXPECT_EQ(r.err, "");
    EXPECT_EQ(r.out.substr(0, r.out.find("@@")),
              t + ":4: output differs\n--- " + t + "\n+++ " + t + " (as run)\n");
    EXPECT_EQ(r.out.substr(r.out.find("@@")),
              "@@ -1,7 +1,21 @@\n"
              " # nebu --board board.json\n"
              " # slave 0, memory and identity\n"
              " > peek 0 1 0 0x10 2\n"
              "-peek=0x1234 0x0001\n"
              "+peek=0x1234 0x0000\n"
              " > getSlaveInfo 0 1 0 \"#note=kept\"\n"
              "+rc=0x00000000\n"
              "+\\#note=kept\n"
              "+cg_alpha_ver=0\n"
              "+cg_ver=0.0\n"
              "+cg_ver.major=0\n"
              "+cg_ver.minor=0\n"
              "+core_type=0\n"
              "+eda_ver=0.0\n"
              "+eda_ver.major=0\n"
              "+eda_ver.minor=0\n"
              "+next_slave=0\n"
              "+orv_drv_ver=0\n"
              "+slave_type=68\n"
              " > peek 0 1 0 0x1G\n"
              "-# exit 0\n"
              "+nebu: bad number '0x1G' for ADDRESS\n"
              "+# exit 2\n"
              "check: 1 transcript, 1 differs\n");

    r = run({"check", "--update", t});
    EXPECT_EQ(r.status, 0);
    EXPECT_EQ(r.out, t + ": updated\ncheck: 1 transcript, 1 updated\n");
    EXPECT_EQ(lines(readFile(t))[6], "\\#note=kept");
    r = run({"check", t, t});
    EXPECT_EQ(r.status, 0);
    EXPECT_EQ(r.out, "check: 2 transcripts, 0 differ\n");
}

TEST_F(NebuProgramTest, CheckRefusesFilesThatAreNoTranscripts) {
    const std::string noHeader = write("plain.t", "peek 0 1 0 0x10\n");
    const std::string commands = write("commands.t", "# nebu -e stats\n# exit 0\n");
    const Result r = run({"check", noHeader, commands, (dir_ / "absent.t").string()});
    EXPECT_EQ(r.status, 2);
    EXPECT_EQ(r.err, "nebu: " + noHeader +
                         ":1: a transcript begins with '# nebu' and the console's options\n"
                         "nebu: " +
                         commands +
                         ":1: only console options belong on the first line\n"
                         "nebu: cannot open transcript " +
                         (dir_ / "absent.t").string() + "\n");
    EXPECT_EQ(run({"check"}).err, "nebu: check needs a transcript\n");
}

}  // namespace
