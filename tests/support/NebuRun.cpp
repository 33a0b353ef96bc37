// Processes, folders and the environment for the tests, on POSIX systems and Windows.
#include "support/NebuRun.h"

#if defined(_WIN32)
#include <windows.h>
#else
#include <fcntl.h>
#include <sys/wait.h>
#include <unistd.h>
#endif

#include <chrono>
#include <cstdint>
#include <cstdlib>
#include <fstream>
#include <iterator>
#include <random>
#include <stdexcept>

namespace nebutest {

std::string readFile(const std::filesystem::path& path) {
    std::ifstream in(path, std::ios::binary);
    return std::string(std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>());
}

std::filesystem::path makeTempDir(const std::string& prefix) {
    // Seeded with the clock too: some C++ runtimes give a fixed random_device sequence.
    static std::mt19937_64 random{
        std::random_device{}() ^
        static_cast<uint64_t>(std::chrono::steady_clock::now().time_since_epoch().count())};
    const auto base = std::filesystem::temp_directory_path();
    for (int attempt = 0; attempt < 100; ++attempt) {
        const auto dir = base / (prefix + std::to_string(random() % 1000000000u));
        if (std::filesystem::create_directory(dir)) return dir;
    }
    throw std::runtime_error("cannot make a folder in " + base.string());
}

void setEnv(const char* name, const char* value) {
#if defined(_WIN32)
    _putenv_s(name, value);
#else
    setenv(name, value, 1);
#endif
}

void unsetEnv(const char* name) {
#if defined(_WIN32)
    _putenv_s(name, "");
#else
    unsetenv(name);
#endif
}

int runProgram(const std::string& program, const std::vector<std::string>& args,
               const std::filesystem::path& in, const std::filesystem::path& out,
               const std::filesystem::path& err, const std::filesystem::path& cwd) {
#if defined(_WIN32)
    // One command line, quoted the way the C runtime splits it again.
    auto quote = [](const std::string& arg) {
        std::string q = "\"";
        size_t backslashes = 0;
        for (char c : arg) {
            if (c == '\\') {
                ++backslashes;
                continue;
            }
            q.append(c == '"' ? 2 * backslashes + 1 : backslashes, '\\');
            backslashes = 0;
            q += c;
        }
        return q + std::string(2 * backslashes, '\\') + "\"";
    };
    std::string line = quote(program);
    for (const auto& arg : args) line += " " + quote(arg);
    SECURITY_ATTRIBUTES inherit{sizeof(SECURITY_ATTRIBUTES), nullptr, TRUE};
    auto open = [&](const std::filesystem::path& path, bool write) {
        return CreateFileW(path.wstring().c_str(), write ? GENERIC_WRITE : GENERIC_READ,
                           FILE_SHARE_READ | FILE_SHARE_WRITE, &inherit,
                           write ? CREATE_ALWAYS : OPEN_EXISTING, FILE_ATTRIBUTE_NORMAL, nullptr);
    };
    STARTUPINFOA startup{};
    startup.cb = sizeof startup;
    startup.dwFlags = STARTF_USESTDHANDLES;
    startup.hStdInput = open(in, false);
    startup.hStdOutput = open(out, true);
    startup.hStdError = err == out ? startup.hStdOutput : open(err, true);
    PROCESS_INFORMATION process{};
    const std::string folder = cwd.string();
    const bool started =
        CreateProcessA(nullptr, line.data(), nullptr, nullptr, TRUE, 0, nullptr,
                       folder.empty() ? nullptr : folder.c_str(), &startup, &process) != 0;
    DWORD status = static_cast<DWORD>(-1);
    if (started) {
        WaitForSingleObject(process.hProcess, INFINITE);
        GetExitCodeProcess(process.hProcess, &status);
        CloseHandle(process.hProcess);
        CloseHandle(process.hThread);
    }
    CloseHandle(startup.hStdInput);
    CloseHandle(startup.hStdOutput);
    if (err != out) CloseHandle(startup.hStdError);
    return started ? static_cast<int>(status) : -1;
#else
    std::vector<std::string> words{program};
    words.insert(words.end(), args.begin(), args.end());
    std::vector<char*> argv;
    for (auto& word : words) argv.push_back(word.data());
    argv.push_back(nullptr);
    const pid_t pid = fork();
    if (pid < 0) return -1;
    if (pid == 0) {
        auto redirect = [](const std::filesystem::path& path, int flags, int fd) {
            const int opened = ::open(path.c_str(), flags, 0600);
            if (opened < 0 || dup2(opened, fd) < 0) _exit(127);
            close(opened);
        };
        if (!cwd.empty() && chdir(cwd.c_str()) != 0) _exit(127);
        redirect(in, O_RDONLY, 0);
        redirect(out, O_WRONLY | O_CREAT | O_TRUNC, 1);
        if (err == out) {
            dup2(1, 2);
        } else {
            redirect(err, O_WRONLY | O_CREAT | O_TRUNC, 2);
        }
        execv(argv[0], argv.data());
        _exit(127);
    }
    int wait = 0;
    if (waitpid(pid, &wait, 0) != pid) return -1;
    return WIFEXITED(wait) ? WEXITSTATUS(wait) : -1;
#endif
}

Result runNebu(const std::vector<std::string>& args, const std::filesystem::path& stdinPath,
               const std::filesystem::path& stderrPath, const std::filesystem::path& cwd,
               bool mergeErr) {
    auto outPath = stderrPath;
    outPath += ".stdout";
    Result result;
    result.status = runProgram(NEBU_CONSOLE_PATH, args, stdinPath, outPath,
                               mergeErr ? outPath : stderrPath, cwd);
    result.out = readFile(outPath);
    if (!mergeErr) result.err = readFile(stderrPath);
    std::error_code ignored;
    std::filesystem::remove(outPath, ignored);
    return result;
}

}  // namespace nebutest
