// `nebu check`: each transcript runs in a console of its own (a child process on POSIX, so that
// every file gets a fresh host and a freshly loaded plug-in), and what it printed is written
// back in the transcript's own shape, so comparing and updating are the same text.
#include "Check.h"

#include <algorithm>
#include <cstdint>
#include <filesystem>
#include <fstream>
#include <functional>
#include <ostream>
#include <sstream>
#include <string>
#include <vector>

#if !defined(_WIN32)
#include <sys/wait.h>
#include <unistd.h>
#endif

#include "App.h"
#include "CommandLine.h"
#include "Console.h"
#include "Options.h"
#include "UsageError.h"
#include "hostsim/Sim.h"

namespace nebu {

namespace {

const std::string HEADER = "# nebu";
const std::string EXIT = "# exit ";
const std::string COMMAND = "> ";
const std::string PROGRAM = "$ nebu";

struct Transcript {
    std::string path;
    std::string folder;
    std::vector<std::string> lines;
    Options options;
};

bool isExitLine(const std::string& line) {
    return line.size() > EXIT.size() && line.compare(0, EXIT.size(), EXIT) == 0 &&
           line.find_first_not_of("0123456789", EXIT.size()) == std::string::npos;
}

bool isComment(const std::string& line) { return line.empty() || line[0] == '#'; }

bool isCommand(const std::string& line) { return line.compare(0, COMMAND.size(), COMMAND) == 0; }

bool isProgram(const std::string& line) {
    return line.compare(0, PROGRAM.size(), PROGRAM) == 0 &&
           (line.size() == PROGRAM.size() || line[PROGRAM.size()] == ' ');
}

std::string escapeLine(const std::string& line) {
    if (line.empty() || line[0] == '#' || line[0] == '>' || line[0] == '$' || line[0] == '\\') {
        return '\\' + line;
    }
    return line;
}

std::vector<std::string> splitLines(const std::string& text) {
    std::vector<std::string> lines;
    std::istringstream in(text);
    std::string line;
    while (std::getline(in, line)) lines.push_back(stripLineEnd(line));
    return lines;
}

std::string relativeTo(const std::string& folder, const std::string& path) {
    if (path.empty() || std::filesystem::path(path).is_absolute()) return path;
    return (std::filesystem::path(folder) / path).string();
}

Transcript readTranscript(const std::string& path) {
    std::ifstream in(path, std::ios::binary);
    if (!in) throw UsageError("cannot open transcript " + path);
    Transcript t;
    t.path = path;
    std::string line;
    while (std::getline(in, line)) t.lines.push_back(stripLineEnd(line));

    const std::string first = t.lines.empty() ? std::string() : t.lines[0];
    if (first.compare(0, HEADER.size(), HEADER) != 0 ||
        (first.size() > HEADER.size() && first[HEADER.size()] != ' ')) {
        throw UsageError(path + ":1: a transcript begins with '" + HEADER +
                         "' and the console's options");
    }
    try {
        t.options = parseOptions(splitWords(first.substr(HEADER.size())));
    } catch (const UsageError& e) {
        throw UsageError(path + ":1: " + e.what());
    }
    if (!t.options.commands.empty() || !t.options.script.empty() || t.options.help) {
        throw UsageError(path + ":1: only console options belong on the first line");
    }
    const std::string folder = std::filesystem::path(path).parent_path().string();
    t.folder = folder;
    t.options.boardFile = relativeTo(folder, t.options.boardFile);
    t.options.dataDir = relativeTo(folder, t.options.dataDir);
    t.options.pluginPath = relativeTo(folder, t.options.pluginPath);
    return t;
}

#if defined(_WIN32)
std::string isolated(const std::function<std::string()>& run, std::string& failure) {
    failure.clear();
    return run();
}
#else
// In a child process: a host and a plug-in of its own, and a crash stays the child's.
std::string isolated(const std::function<std::string()>& run, std::string& failure) {
    failure.clear();
    int fds[2];
    if (pipe(fds) != 0) throw UsageError("cannot create a pipe");
    const pid_t pid = fork();
    if (pid < 0) throw UsageError("cannot start a process");
    if (pid == 0) {
        close(fds[0]);
        const std::string text = run();
        for (size_t done = 0; done < text.size();) {
            const ssize_t n = write(fds[1], text.data() + done, text.size() - done);
            if (n <= 0) _exit(3);
            done += static_cast<size_t>(n);
        }
        _exit(0);
    }
    close(fds[1]);
    std::string text;
    char buffer[4096];
    ssize_t n;
    while ((n = read(fds[0], buffer, sizeof buffer)) > 0) text.append(buffer, n);
    close(fds[0]);
    int wait = 0;
    waitpid(pid, &wait, 0);
    if (WIFSIGNALED(wait)) {
        failure = "the console was killed by signal " + std::to_string(WTERMSIG(wait));
    } else if (!WIFEXITED(wait) || WEXITSTATUS(wait) != 0) {
        failure = "the console did not finish";
    }
    return text;
}
#endif

// A "$ nebu ARGS" line: the program run with those arguments in the transcript's folder, with
// nothing on its standard input; what it printed, then "[exit N]" unless N is 0.
std::string runProgram(const Transcript& t, const std::string& line) {
    std::vector<std::string> args = {"nebu"};
    for (auto& word : splitWords(line.substr(PROGRAM.size()))) args.push_back(word);
    std::vector<char*> argv;
    for (auto& arg : args) argv.push_back(arg.data());
    argv.push_back(nullptr);
    const std::filesystem::path before = std::filesystem::current_path();
    if (!t.folder.empty()) std::filesystem::current_path(t.folder);
    std::istringstream in;
    std::ostringstream output;
    const int status =
        runNebu(static_cast<int>(args.size()), argv.data(), in, output, output, false);
    std::filesystem::current_path(before);
    OrvSim::resetHost();
    return output.str() + (status == 0 ? "" : "[exit " + std::to_string(status) + "]\n");
}

// The transcript as this run writes it: the first line, comments and commands where they
// stand, each command followed by what it printed, then the exit status.
std::vector<std::string> runTranscript(const Transcript& t, const std::string& exeDir) {
    // Program runs come first: each is a process of its own (on POSIX), done before this
    // console starts.
    std::vector<std::string> programOutput(t.lines.size());
    for (size_t i = 1; i < t.lines.size(); ++i) {
        if (!isProgram(t.lines[i])) continue;
        std::string failure;
        programOutput[i] = isolated([&] { return runProgram(t, t.lines[i]); }, failure);
        if (!failure.empty()) programOutput[i] += "[" + failure + "]\n";
    }
    std::vector<size_t> commandLines;
    for (size_t i = 1; i < t.lines.size(); ++i) {
        if (isCommand(t.lines[i])) commandLines.push_back(i);
    }
    std::vector<std::string> printed(commandLines.size());
    std::ostringstream output;
    const int status = runConsole(t.options, exeDir, output, output, [&](Console& console) {
        for (size_t c = 0; c < commandLines.size() && !console.quitRequested(); ++c) {
            console.runLine(t.lines[commandLines[c]].substr(COMMAND.size()));
            printed[c] = output.str();
            output.str("");
        }
        // The next transcript of this process meets a fresh host, not the listeners of a
        // plug-in that is about to be unloaded.
        OrvSim::resetHost();
    });

    std::vector<std::string> actual = {t.lines[0]};
    size_t c = 0;
    for (size_t i = 1; i < t.lines.size(); ++i) {
        if (isProgram(t.lines[i])) {
            actual.push_back(t.lines[i]);
            for (const auto& line : splitLines(programOutput[i]))
                actual.push_back(escapeLine(line));
        } else if (isCommand(t.lines[i])) {
            // The echo comes first, as the command stands; output lines are escaped.
            const std::vector<std::string> lines = splitLines(printed[c++]);
            for (size_t l = 0; l < lines.size(); ++l) {
                const bool echo = l == 0 && lines[0] == t.lines[i];
                actual.push_back(echo ? lines[l] : escapeLine(lines[l]));
            }
        } else if (isComment(t.lines[i]) && !(i + 1 == t.lines.size() && isExitLine(t.lines[i]))) {
            actual.push_back(t.lines[i]);
        }
    }
    for (const auto& line : splitLines(output.str())) actual.push_back(escapeLine(line));
    actual.push_back(EXIT + std::to_string(status));
    return actual;
}

std::vector<std::string> runIsolated(const Transcript& t, const std::string& exeDir,
                                     std::string& failure) {
    return splitLines(isolated(
        [&] {
            std::string text;
            for (const auto& line : runTranscript(t, exeDir)) text += line + '\n';
            return text;
        },
        failure));
}

// Longest common subsequence of the lines between the common head and tail, as a list of
// edits: ' ' kept, '-' only expected, '+' only actual, with the line indices.
struct Edit {
    char kind;
    size_t expected;
    size_t actual;
};

std::vector<Edit> diffLines(const std::vector<std::string>& a, const std::vector<std::string>& b) {
    size_t head = 0;
    while (head < a.size() && head < b.size() && a[head] == b[head]) ++head;
    size_t tail = 0;
    while (tail < a.size() - head && tail < b.size() - head &&
           a[a.size() - 1 - tail] == b[b.size() - 1 - tail]) {
        ++tail;
    }
    const size_t n = a.size() - head - tail;
    const size_t m = b.size() - head - tail;
    std::vector<std::vector<uint32_t>> lcs(n + 1, std::vector<uint32_t>(m + 1, 0));
    for (size_t i = n; i-- > 0;) {
        for (size_t j = m; j-- > 0;) {
            lcs[i][j] = a[head + i] == b[head + j] ? lcs[i + 1][j + 1] + 1
                                                   : std::max(lcs[i + 1][j], lcs[i][j + 1]);
        }
    }
    std::vector<Edit> edits;
    for (size_t i = 0; i < head; ++i) edits.push_back({' ', i, i});
    size_t i = 0;
    size_t j = 0;
    while (i < n || j < m) {
        if (i < n && j < m && a[head + i] == b[head + j]) {
            edits.push_back({' ', head + i++, head + j++});
        } else if (i < n && (j == m || lcs[i + 1][j] >= lcs[i][j + 1])) {
            edits.push_back({'-', head + i++, head + j});
        } else {
            edits.push_back({'+', head + i, head + j++});
        }
    }
    for (size_t k = tail; k-- > 0;) edits.push_back({' ', a.size() - 1 - k, b.size() - 1 - k});
    return edits;
}

std::string range(size_t first, size_t count) {
    // A hunk that holds no line of a side names the line before it.
    return std::to_string(count == 0 ? first : first + 1) + "," + std::to_string(count);
}

std::string unifiedDiff(const std::vector<Edit>& edits, const std::vector<std::string>& a,
                        const std::vector<std::string>& b) {
    const size_t context = 3;
    std::vector<size_t> changes;
    for (size_t k = 0; k < edits.size(); ++k) {
        if (edits[k].kind != ' ') changes.push_back(k);
    }
    std::string text;
    for (size_t c = 0; c < changes.size();) {
        // Changes closer than twice the context share a hunk.
        const size_t first = changes[c];
        size_t last = first;
        while (++c < changes.size() && changes[c] - last <= 2 * context + 1) last = changes[c];
        const size_t begin = first >= context ? first - context : 0;
        const size_t end = std::min(edits.size(), last + context + 1);
        size_t expectedCount = 0;
        size_t actualCount = 0;
        std::string body;
        for (size_t e = begin; e < end; ++e) {
            const Edit& edit = edits[e];
            if (edit.kind != '+') ++expectedCount;
            if (edit.kind != '-') ++actualCount;
            body += edit.kind;
            body += (edit.kind == '+' ? b[edit.actual] : a[edit.expected]) + "\n";
        }
        text += "@@ -" + range(edits[begin].expected, expectedCount) + " +" +
                range(edits[begin].actual, actualCount) + " @@\n" + body;
    }
    return text;
}

void writeLines(const std::string& path, const std::vector<std::string>& lines) {
    std::ofstream file(path, std::ios::binary | std::ios::trunc);
    for (const auto& line : lines) file << line << '\n';
    if (!file.flush()) throw UsageError("cannot write transcript " + path);
}

}  // namespace

int runCheck(const std::vector<std::string>& args, const std::string& exeDir, std::ostream& out,
             std::ostream& err) {
    bool update = false;
    std::vector<std::string> files;
    for (const std::string& arg : args) {
        if (arg == "--help" || arg == "-h") {
            out << "usage: nebu check [--update] TRANSCRIPT...\n"
                   "  runs each transcript in a fresh console and compares its output with the\n"
                   "  transcript's; prints a unified diff for each difference; --update writes\n"
                   "  the output as run into the transcript instead; exit status 0 when all\n"
                   "  match, 1 when one differs, 2 for a usage error\n";
            return 0;
        }
        if (arg == "--update") {
            update = true;
        } else if (arg.size() > 1 && arg[0] == '-') {
            err << "nebu: unknown check option '" << arg << "'" << std::endl;
            return 2;
        } else {
            files.push_back(arg);
        }
    }
    if (files.empty()) {
        err << "nebu: check needs a transcript" << std::endl;
        return 2;
    }
    int status = 0;
    size_t differing = 0;
    for (const std::string& path : files) {
        try {
            const Transcript t = readTranscript(path);
            out.flush();
            std::string failure;
            const std::vector<std::string> actual = runIsolated(t, exeDir, failure);
            if (!failure.empty()) {
                out << path << ": " << failure << '\n';
                status = std::max(status, 1);
                ++differing;
                continue;
            }
            if (actual == t.lines) continue;
            ++differing;
            if (update) {
                writeLines(path, actual);
                out << path << ": updated\n";
                continue;
            }
            const std::vector<Edit> edits = diffLines(t.lines, actual);
            const auto first = std::find_if(edits.begin(), edits.end(),
                                            [](const Edit& e) { return e.kind != ' '; });
            out << path << ":" << std::min(first->expected + 1, t.lines.size())
                << ": output differs\n"
                << "--- " << path << "\n+++ " << path << " (as run)\n"
                << unifiedDiff(edits, t.lines, actual);
            status = std::max(status, 1);
        } catch (const UsageError& e) {
            out.flush();
            err << "nebu: " << oneLine(e.what()) << std::endl;
            status = 2;
        }
    }
    out << "check: " << files.size() << (files.size() == 1 ? " transcript, " : " transcripts, ")
        << differing << (update ? " updated" : (differing == 1 ? " differs" : " differ"))
        << std::endl;
    return status;
}

}  // namespace nebu
