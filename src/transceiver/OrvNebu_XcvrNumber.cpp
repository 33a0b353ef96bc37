// Number reading and formatting shared by the transceiver actions.
#include "transceiver/OrvNebu_XcvrNumber.h"

#include <cinttypes>
#include <cstdio>
#include <cstdlib>
#include <vector>

namespace OrvRT {

double OrvNebu_XcvrNumber::readDouble(const std::string& text) {
    return std::strtod(text.c_str(), nullptr);
}

int64_t OrvNebu_XcvrNumber::readLld(const std::string& text) {
    long long v = std::strtoll(text.c_str(), nullptr, 10);
    return static_cast<int64_t>(v);
}

std::string OrvNebu_XcvrNumber::formatF(double value) {
    // "%f" of a large double runs to hundreds of digits: size the buffer from the first pass.
    char small[64];
    int n = std::snprintf(small, sizeof small, "%f", value);
    if (n < 0) return std::string();
    if (static_cast<size_t>(n) < sizeof small) return std::string(small, static_cast<size_t>(n));
    std::vector<char> big(static_cast<size_t>(n) + 1);
    std::snprintf(big.data(), big.size(), "%f", value);
    return std::string(big.data(), static_cast<size_t>(n));
}

std::string OrvNebu_XcvrNumber::formatLld(int64_t value) {
    char buf[32];
    int n = std::snprintf(buf, sizeof buf, "%" PRId64, value);
    return std::string(buf, n > 0 ? static_cast<size_t>(n) : 0);
}

bool OrvNebu_XcvrNumber::multiply(uint64_t a, uint64_t b, uint64_t& out) {
    if (a != 0 && b > UINT64_MAX / a) return false;
    out = a * b;
    return true;
}

uint64_t OrvNebu_XcvrNumber::magnitude(int64_t value) {
    return value < 0 ? 0u - static_cast<uint64_t>(value) : static_cast<uint64_t>(value);
}

}  // namespace OrvRT
