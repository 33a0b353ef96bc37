// Runs the built nebu program as a user would and collects its output and exit status; the
// few system calls the tests need (a fresh folder, an environment variable), on POSIX systems
// and Windows alike.
#pragma once

#include <filesystem>
#include <string>
#include <vector>

namespace nebutest {

struct Result {
    int status = -1;
    std::string out;
    std::string err;
};

std::string readFile(const std::filesystem::path& path);

// A new empty folder in the system's temporary folder, its name starting with prefix.
std::filesystem::path makeTempDir(const std::string& prefix);

// An empty value is a set variable on POSIX systems but none on Windows: use unsetEnv for
// "not set".
void setEnv(const char* name, const char* value);
void unsetEnv(const char* name);

// Runs program with args (no shell), standard input from in, standard output and error into
// files (one file for both when the paths are equal), in folder cwd (the current one when
// empty). Returns the exit status, -1 when the program could not run.
int runProgram(const std::string& program, const std::vector<std::string>& args,
               const std::filesystem::path& in, const std::filesystem::path& out,
               const std::filesystem::path& err, const std::filesystem::path& cwd = {});

// nebu with the arguments, standard input from stdinPath; standard error goes through the file
// stderrPath, standard output through stderrPath + ".stdout" (error merged into it when
// mergeErr).
Result runNebu(const std::vector<std::string>& args, const std::filesystem::path& stdinPath,
               const std::filesystem::path& stderrPath, const std::filesystem::path& cwd = {},
               bool mergeErr = false);

}  // namespace nebutest
