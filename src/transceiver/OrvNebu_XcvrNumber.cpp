// Number reading and formatting shared by the transceiver actions.
#include "transceiver/OrvNebu_XcvrNumber.h"

#include <cctype>
#include <cinttypes>
#include <cstdio>
#include <cstdlib>
#include <vector>

namespace OrvRT {

namespace {
bool isDigit(char c) { return c >= '0' && c <= '9'; }
bool isBlank(char c) { return std::isspace(static_cast<unsigned char>(c)) != 0; }
}  // namespace

double OrvNebu_XcvrNumber::readDouble(const std::string& text) {
    const char* end = nullptr;
    return readDecimal(text.c_str(), &end);
}

double OrvNebu_XcvrNumber::readDecimal(const char* text, const char** end) {
    // strtod alone would also take hexadecimal numbers, nan and inf: only the decimal form
    // is cut out here and handed to it.
    const char* p = text;
    while (isBlank(*p)) ++p;
    const char* start = p;
    if (*p == '+' || *p == '-') ++p;
    size_t digits = 0;
    for (; isDigit(*p); ++p) ++digits;
    if (*p == '.') {
        for (++p; isDigit(*p); ++p) ++digits;
    }
    if (digits == 0) {
        *end = text;
        return 0.0;
    }
    if (*p == 'e' || *p == 'E') {
        const char* q = p + 1;
        if (*q == '+' || *q == '-') ++q;
        if (isDigit(*q)) {
            while (isDigit(*q)) ++q;
            p = q;
        }
    }
    *end = p;
    return std::strtod(std::string(start, p).c_str(), nullptr);
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
