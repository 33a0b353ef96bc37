// Runs the built nebu program as a user would and collects its output and exit status.
#pragma once

#include <sys/wait.h>

#include <cstdio>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>
#include <vector>

namespace nebutest {

struct Result {
    int status = -1;
    std::string out;
    std::string err;
};

inline std::string quote(const std::string& text) {
    std::string q = "'";
    for (char c : text) q += c == '\'' ? std::string("'\\''") : std::string(1, c);
    return q + "'";
}

inline std::string readFile(const std::filesystem::path& path) {
    std::ifstream in(path, std::ios::binary);
    return std::string(std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>());
}

// nebu with the arguments, standard input from stdinPath, standard error kept in stderrPath.
inline Result runNebu(const std::vector<std::string>& args, const std::string& stdinPath,
                      const std::filesystem::path& stderrPath) {
    std::string command = quote(NEBU_CONSOLE_PATH);
    for (const auto& arg : args) command += " " + quote(arg);
    command += " <" + quote(stdinPath) + " 2>" + quote(stderrPath.string());
    Result result;
    FILE* pipe = popen(command.c_str(), "r");
    if (pipe == nullptr) return result;
    char buffer[4096];
    size_t n;
    while ((n = fread(buffer, 1, sizeof buffer, pipe)) > 0) result.out.append(buffer, n);
    const int wait = pclose(pipe);
    result.status = WIFEXITED(wait) ? WEXITSTATUS(wait) : -1;
    result.err = readFile(stderrPath);
    return result;
}

}  // namespace nebutest
