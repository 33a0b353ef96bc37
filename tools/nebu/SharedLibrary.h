// The platform's dynamic loader behind one small class, and where the executable lives.
#pragma once

#include <string>

namespace nebu {

class SharedLibrary {
public:
    // Loads the library; throws UsageError naming the path and the loader's reason.
    explicit SharedLibrary(const std::string& path);
    // Unloads it.
    ~SharedLibrary();
    SharedLibrary(const SharedLibrary&) = delete;
    SharedLibrary& operator=(const SharedLibrary&) = delete;

    // The address of an exported symbol, null when the library does not export it.
    void* symbol(const char* name) const;

private:
    void* handle_;
};

// The directory of the running executable (argv0 as a fallback), without a trailing separator.
std::string executableDirectory(const char* argv0);

// The plug-in as the build and the install lay it out relative to the executable's directory.
std::string defaultPluginPath(const std::string& exeDir);

}  // namespace nebu
