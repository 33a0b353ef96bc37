// A throwaway data directory for tests that need their own definition files.
#pragma once

#include <filesystem>
#include <fstream>
#include <string>

#include "support/NebuRun.h"

class TempDataDir {
public:
    TempDataDir() : path_(nebutest::makeTempDir("nebu-data-").string()) {}
    ~TempDataDir() {
        std::error_code ignored;
        std::filesystem::remove_all(path_, ignored);
    }
    TempDataDir(const TempDataDir&) = delete;
    TempDataDir& operator=(const TempDataDir&) = delete;

    // The directory with a trailing separator, as the host hands it out.
    std::string dir() const { return path_ + "/"; }
    std::string path(const std::string& name) const { return path_ + "/" + name; }
    // Writes the text as it stands (no line end added).
    void write(const std::string& name, const std::string& text) const {
        std::ofstream out(path(name), std::ios::binary | std::ios::trunc);
        out << text;
    }

private:
    std::string path_;
};
