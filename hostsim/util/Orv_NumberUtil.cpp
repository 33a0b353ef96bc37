// The host's number and text conversions: hexadecimal, decimal and binary digit texts.
#include <algorithm>
#include <limits>
#include <stdexcept>
#include <string>

#include "host/OrvUtil.h"

namespace OrvRT {

namespace {

int hexDigit(char c) {
    if (c >= '0' && c <= '9') return c - '0';
    if (c >= 'a' && c <= 'f') return c - 'a' + 10;
    if (c >= 'A' && c <= 'F') return c - 'A' + 10;
    return -1;
}

bool isBlank(char c) { return c == ' ' || c == '\t' || c == '\r' || c == '\n'; }

[[noreturn]] void badHex(const std::string& text) {
    throw std::logic_error("Invalid hexadecimal number \"" + text + "\".");
}

// The digits of a hexadecimal text: blanks around and a 0x/0X prefix dropped, every
// character checked. Empty when the text is empty or blank.
std::pair<size_t, size_t> hexDigits(const std::string& text) {
    size_t begin = 0;
    size_t end = text.size();
    while (begin < end && isBlank(text[begin])) ++begin;
    while (end > begin && isBlank(text[end - 1])) --end;
    if (end - begin >= 2 && text[begin] == '0' &&
        (text[begin + 1] == 'x' || text[begin + 1] == 'X')) {
        begin += 2;
        if (begin == end) badHex(text);  // a prefix without digits
    }
    for (size_t i = begin; i < end; ++i) {
        if (hexDigit(text[i]) < 0) badHex(text);
    }
    return {begin, end};
}

uint64_t parseHex(const std::string& text, uint64_t max, const char* typeName) {
    const auto [begin, end] = hexDigits(text);
    uint64_t value = 0;
    for (size_t i = begin; i < end; ++i) {
        const auto digit = static_cast<uint64_t>(hexDigit(text[i]));
        if (value > (max - digit) / 16u) {
            throw std::logic_error("Hexadecimal number \"" + text + "\" is too large for " +
                                   typeName + ".");
        }
        value = value * 16u + digit;
    }
    return value;
}

}  // namespace

uint64_t Orv_NumberUtil::hexStr2ULL(const std::string& text) {
    return parseHex(text, std::numeric_limits<uint64_t>::max(), "64 bits");
}

uint32_t Orv_NumberUtil::hexStr2UInt(const std::string& text) {
    return static_cast<uint32_t>(parseHex(text, std::numeric_limits<uint32_t>::max(), "32 bits"));
}

uint64_t Orv_NumberUtil::decStr2ULL(const std::string& text) {
    size_t i = 0;
    while (i < text.size() && isBlank(text[i])) ++i;
    // A minus sign would wrap to a huge unsigned value; there is no unsigned number there.
    if (i < text.size() && text[i] == '-') return 0;
    if (i < text.size() && text[i] == '+') ++i;
    uint64_t value = 0;
    const uint64_t max = std::numeric_limits<uint64_t>::max();
    for (; i < text.size() && text[i] >= '0' && text[i] <= '9'; ++i) {
        const auto digit = static_cast<uint64_t>(text[i] - '0');
        if (value > (max - digit) / 10u) return max;  // saturates, like strtoull
        value = value * 10u + digit;
    }
    return value;
}

std::string& Orv_NumberUtil::uLL2HexStr(uint64_t value, std::string& out) {
    static const char DIGITS[] = "0123456789ABCDEF";
    char buf[16];
    size_t n = 0;
    do {
        buf[n++] = DIGITS[value & 0xFu];
        value >>= 4;
    } while (value != 0);
    out.assign(std::reverse_iterator<char*>(buf + n), std::reverse_iterator<char*>(buf));
    return out;
}

std::string& Orv_NumberUtil::uLL2DecStr(uint64_t value, std::string& out) {
    char buf[20];
    size_t n = 0;
    do {
        buf[n++] = static_cast<char>('0' + value % 10u);
        value /= 10u;
    } while (value != 0);
    out.assign(std::reverse_iterator<char*>(buf + n), std::reverse_iterator<char*>(buf));
    return out;
}

std::string& Orv_NumberUtil::uInt2DecStr(uint32_t value, std::string& out) {
    return uLL2DecStr(value, out);
}

std::string& Orv_NumberUtil::hexStr2BinStr(const std::string& hex, uint32_t width,
                                           std::string& out) {
    // Far wider than any register a bus can hold; refused before a huge allocation.
    constexpr uint32_t MAX_WIDTH = 1u << 24;
    if (width > MAX_WIDTH) {
        throw std::logic_error("Binary width " + std::to_string(width) + " for \"" + hex +
                               "\" is larger than " + std::to_string(MAX_WIDTH) + " bits.");
    }
    const auto [begin, end] = hexDigits(hex);
    // A register value must name its bits: empty text is no number, unlike a 0 digit.
    if (begin == end) badHex(hex);
    // Built aside so that a failure leaves out untouched.
    std::string bits(width, '0');
    // Bit b of the value is bit b%4 of the digit b/4 places from the end.
    const size_t digits = end - begin;
    for (uint32_t b = 0; b < width; ++b) {
        const size_t fromEnd = b / 4u;
        if (fromEnd >= digits) break;
        const int digit = hexDigit(hex[end - 1 - fromEnd]);
        if ((digit >> (b % 4u)) & 1) bits[width - 1u - b] = '1';
    }
    out.swap(bits);
    return out;
}

std::string& Orv_NumberUtil::binStr2HexStr(const std::string& bits, std::string& out) {
    static const char DIGITS[] = "0123456789ABCDEF";
    for (char c : bits) {
        if (c != '0' && c != '1') {
            throw std::logic_error("Invalid binary number \"" + bits + "\".");
        }
    }
    const size_t n = bits.size();
    // No bits is the value 0, which still has a digit.
    const size_t digits = n == 0 ? 1u : n / 4u + (n % 4u != 0 ? 1u : 0u);
    std::string hex(digits, '0');
    // Bit b counts from the least significant end, the last character.
    for (size_t d = 0; d < digits; ++d) {
        unsigned value = 0;
        for (unsigned k = 0; k < 4u; ++k) {
            const size_t b = d * 4u + k;
            if (b < n && bits[n - 1 - b] == '1') value |= 1u << k;
        }
        hex[digits - 1 - d] = DIGITS[value];
    }
    out.swap(hex);
    return out;
}

}  // namespace OrvRT
