// Dynamic loading for POSIX systems and Windows.
#include "SharedLibrary.h"

#include "UsageError.h"

#if defined(_WIN32)
#include <windows.h>
#else
#include <dlfcn.h>
#include <unistd.h>

#include <climits>
#endif

namespace nebu {

#if defined(_WIN32)

SharedLibrary::SharedLibrary(const std::string& path)
    : handle_(reinterpret_cast<void*>(LoadLibraryA(path.c_str()))) {
    if (handle_ == nullptr) {
        throw UsageError("cannot load plug-in " + path + ": error " +
                         std::to_string(GetLastError()));
    }
}

SharedLibrary::~SharedLibrary() { FreeLibrary(reinterpret_cast<HMODULE>(handle_)); }

void* SharedLibrary::symbol(const char* name) const {
    return reinterpret_cast<void*>(GetProcAddress(reinterpret_cast<HMODULE>(handle_), name));
}

std::string executableDirectory(const char* argv0) {
    char path[MAX_PATH];
    DWORD n = GetModuleFileNameA(nullptr, path, MAX_PATH);
    std::string exe = (n > 0 && n < MAX_PATH) ? std::string(path, n) : std::string(argv0);
    const size_t slash = exe.find_last_of("\\/");
    return slash == std::string::npos ? std::string(".") : exe.substr(0, slash);
}

std::string defaultPluginPath(const std::string& exeDir) { return exeDir + "\\orvnebu.dll"; }

#else

namespace {
// Under AddressSanitizer the plug-in stays mapped after dlclose: what its statics still hold
// (the process-wide bus list lives until exit) remains visible to the leak checker, and its
// frames can still be symbolized.
#if defined(__SANITIZE_ADDRESS__)
constexpr int KEEP_MAPPED = RTLD_NODELETE;
#elif defined(__has_feature)
#if __has_feature(address_sanitizer)
constexpr int KEEP_MAPPED = RTLD_NODELETE;
#else
constexpr int KEEP_MAPPED = 0;
#endif
#else
constexpr int KEEP_MAPPED = 0;
#endif
}  // namespace

SharedLibrary::SharedLibrary(const std::string& path)
    : handle_(dlopen(path.c_str(), RTLD_NOW | RTLD_LOCAL | KEEP_MAPPED)) {
    if (handle_ == nullptr) {
        const char* reason = dlerror();
        throw UsageError("cannot load plug-in " + path + ": " +
                         (reason != nullptr ? reason : "unknown reason"));
    }
}

SharedLibrary::~SharedLibrary() { dlclose(handle_); }

void* SharedLibrary::symbol(const char* name) const { return dlsym(handle_, name); }

std::string executableDirectory(const char* argv0) {
    std::string exe;
#if defined(__linux__)
    char path[PATH_MAX];
    const ssize_t n = readlink("/proc/self/exe", path, sizeof path - 1);
    if (n > 0) exe.assign(path, static_cast<size_t>(n));
#endif
    if (exe.empty() && argv0 != nullptr) exe = argv0;
    const size_t slash = exe.find_last_of('/');
    if (slash == std::string::npos) return ".";
    return slash == 0 ? std::string("/") : exe.substr(0, slash);
}

std::string defaultPluginPath(const std::string& exeDir) {
#if defined(__APPLE__)
    return exeDir + "/../lib/liborvnebu.dylib";
#else
    return exeDir + "/../lib/liborvnebu.so";
#endif
}

#endif

}  // namespace nebu
