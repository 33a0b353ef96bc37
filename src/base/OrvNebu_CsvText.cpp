// Comma split and saturating C-style number readings.
#include "base/OrvNebu_CsvText.h"

#include <boost/algorithm/string/classification.hpp>
#include <boost/algorithm/string/split.hpp>
#include <cctype>

namespace OrvRT {

namespace {

int digitValue(char c) {
    if (c >= '0' && c <= '9') return c - '0';
    if (c >= 'a' && c <= 'z') return c - 'a' + 10;
    if (c >= 'A' && c <= 'Z') return c - 'A' + 10;
    return 99;
}

// Reads digits of the base from text[pos]; saturates instead of overflowing.
int32_t readDigits(const std::string& text, size_t pos, int base, bool negative) {
    const int64_t limit = negative ? int64_t{2147483648} : int64_t{2147483647};
    int64_t value = 0;
    for (; pos < text.size(); ++pos) {
        int d = digitValue(text[pos]);
        if (d >= base) break;
        value = value * base + d;
        if (value > limit) value = limit;
    }
    return static_cast<int32_t>(negative ? -value : value);
}

size_t skipBlanksAndSign(const std::string& text, bool& negative) {
    size_t pos = 0;
    while (pos < text.size() && std::isspace(static_cast<unsigned char>(text[pos]))) ++pos;
    negative = false;
    if (pos < text.size() && (text[pos] == '+' || text[pos] == '-')) {
        negative = text[pos] == '-';
        ++pos;
    }
    return pos;
}

}  // namespace

void OrvNebu_CsvText::splitCommas(const std::string& line, std::vector<std::string>& fields) {
    boost::algorithm::split(fields, line, boost::algorithm::is_any_of(","),
                            boost::algorithm::token_compress_off);
}

std::string OrvNebu_CsvText::hexText(uint32_t value) {
    static const char* const DIGITS = "0123456789abcdef";
    std::string text;
    do {
        text.insert(text.begin(), DIGITS[value & 0xFu]);
        value >>= 4;
    } while (value != 0);
    return text;
}

bool OrvNebu_CsvText::hasInnerCR(const std::string& line) {
    const size_t cr = line.find('\r');
    return cr != std::string::npos && cr + 1 < line.size();
}

int32_t OrvNebu_CsvText::decimalToInt32(const std::string& text) {
    bool negative = false;
    size_t pos = skipBlanksAndSign(text, negative);
    return readDigits(text, pos, 10, negative);
}

int32_t OrvNebu_CsvText::autoBaseToInt32(const std::string& text) {
    bool negative = false;
    size_t pos = skipBlanksAndSign(text, negative);
    if (pos < text.size() && text[pos] == '0') {
        if (pos + 2 < text.size() && (text[pos + 1] == 'x' || text[pos + 1] == 'X') &&
            digitValue(text[pos + 2]) < 16) {
            return readDigits(text, pos + 2, 16, negative);
        }
        return readDigits(text, pos, 8, negative);
    }
    return readDigits(text, pos, 10, negative);
}

void OrvNebu_CsvText::openFile(std::ifstream& in, const std::string& path) {
#if defined(_WIN32)
    if (!path.empty() && (path.back() == ' ' || path.back() == '.')) return;
#endif
    in.open(path, std::ios::in | std::ios::binary);
}

}  // namespace OrvRT
