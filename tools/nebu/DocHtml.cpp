// Text helpers of `nebu doc`.
#include "DocHtml.h"

namespace nebu {
namespace doc {

namespace {
const char* const DIGITS = "0123456789abcdef";
}

std::string esc(const std::string& text) {
    std::string out;
    out.reserve(text.size());
    for (char c : text) {
        switch (c) {
            case '&':
                out += "&amp;";
                break;
            case '<':
                out += "&lt;";
                break;
            case '>':
                out += "&gt;";
                break;
            case '"':
                out += "&quot;";
                break;
            case '\'':
                out += "&#39;";
                break;
            default:
                out += c;
        }
    }
    return out;
}

std::string wordText(uint32_t address) {
    std::string digits;
    do {
        digits.insert(digits.begin(), DIGITS[address & 0xFu]);
        address >>= 4;
    } while (address != 0);
    if (digits.size() < 4) digits.insert(0, 4 - digits.size(), '0');
    return "0x" + digits;
}

std::string hexText(int32_t value) {
    const bool negative = value < 0;
    uint32_t magnitude =
        negative ? 0u - static_cast<uint32_t>(value) : static_cast<uint32_t>(value);
    std::string digits;
    do {
        digits.insert(digits.begin(), DIGITS[magnitude & 0xFu]);
        magnitude >>= 4;
    } while (magnitude != 0);
    return (negative ? "-0x" : "0x") + digits;
}

std::string typeText(int32_t type) {
    const std::string text = hexText(type);
    return text.size() == 3 ? "0x0" + text.substr(2) : text;
}

std::string bitSpan(uint32_t left, uint32_t right) {
    if (left == right) return std::to_string(left);
    return std::to_string(left) + ":" + std::to_string(right);
}

std::string idPart(const std::string& name) {
    std::string out;
    for (unsigned char c : name) {
        if ((c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || (c >= '0' && c <= '9') ||
            c == '_') {
            out += static_cast<char>(c);
        } else {
            out += '-';
            out += DIGITS[c >> 4];
            out += DIGITS[c & 0xFu];
        }
    }
    return out;
}

}  // namespace doc
}  // namespace nebu
