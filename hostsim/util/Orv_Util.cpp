// The host's text helpers and the data directory the host application sets.
#include <algorithm>
#include <cctype>
#include <cstring>
#include <mutex>

#include "host/OrvUtil.h"
#include "hostsim/Sim.h"

namespace OrvRT {

namespace {

std::mutex dataDirMutex;
// Empty: never set. Never destroyed, like the host's other process-wide state.
std::string& dataDir() {
    static auto* dir = new std::string();
    return *dir;
}

int lowerChar(char c) { return std::tolower(static_cast<unsigned char>(c)); }

}  // namespace

int Orv_Util::stricmp(const std::string& a, const std::string& b) {
    const size_t n = std::min(a.size(), b.size());
    for (size_t i = 0; i < n; ++i) {
        const int d = lowerChar(a[i]) - lowerChar(b[i]);
        if (d != 0) return d;
    }
    if (a.size() == b.size()) return 0;
    return a.size() < b.size() ? -1 : 1;
}

int Orv_Util::stricmp(const char* a, const char* b) {
    if (a == nullptr || b == nullptr) {
        if (a == b) return 0;
        return a == nullptr ? -1 : 1;
    }
    for (;; ++a, ++b) {
        const int d = lowerChar(*a) - lowerChar(*b);
        if (d != 0 || *a == '\0') return d;
    }
}

std::string Orv_Util::trimWhitespace(const std::string& text) {
    const size_t begin = text.find_first_not_of(" \t");
    if (begin == std::string::npos) return std::string();
    const size_t end = text.find_last_not_of(" \t");
    return text.substr(begin, end - begin + 1);
}

void Orv_Util::stripEndingCR(std::string& text) {
    if (!text.empty() && text.back() == '\r') text.pop_back();
}

void Orv_Util::unQuote(std::vector<std::string>& fields) {
    for (std::string& field : fields) {
        if (field.size() >= 2 && field.front() == '"' && field.back() == '"') {
            field = field.substr(1, field.size() - 2);
        }
    }
}

std::string Orv_Util::getVanduDataDirPath() {
    std::lock_guard<std::mutex> guard(dataDirMutex);
    return dataDir().empty() ? std::string("./") : dataDir();
}

}  // namespace OrvRT

namespace OrvSim {

void setDataDir(const std::string& dir) {
    std::string path = dir;
    if (!path.empty() && path.back() != '/' && path.back() != '\\') path += '/';
    std::lock_guard<std::mutex> guard(OrvRT::dataDirMutex);
    OrvRT::dataDir() = path;
}

}  // namespace OrvSim
