// Output formatting of the console.
#include "TextFormat.h"

#include <algorithm>
#include <cstdio>
#include <utility>

namespace nebu {

std::string escapeText(const std::string& text) {
    std::string out;
    out.reserve(text.size());
    for (char c : text) {
        const auto byte = static_cast<unsigned char>(c);
        switch (c) {
            case '\\':
                out += "\\\\";
                break;
            case '\n':
                out += "\\n";
                break;
            case '\r':
                out += "\\r";
                break;
            case '\t':
                out += "\\t";
                break;
            default:
                if (byte < 0x20) {
                    char hex[8];
                    std::snprintf(hex, sizeof hex, "\\x%02X", static_cast<unsigned>(byte));
                    out += hex;
                } else {
                    out += c;
                }
        }
    }
    return out;
}

std::string formatRc(uint32_t rc) {
    char text[24];
    std::snprintf(text, sizeof text, "rc=0x%08X", static_cast<unsigned>(rc));
    return text;
}

std::string formatDataWord(uint32_t word) {
    char text[16];
    std::snprintf(text, sizeof text, "0x%04X", static_cast<unsigned>(word));
    return text;
}

std::vector<std::string> formatMapLines(const std::unordered_map<std::string, std::string>& map) {
    std::vector<std::pair<std::string, std::string>> entries(map.begin(), map.end());
    // std::string compares through char_traits<char>, which orders bytes as unsigned char.
    std::sort(entries.begin(), entries.end(),
              [](const auto& a, const auto& b) { return a.first < b.first; });
    std::vector<std::string> lines;
    lines.reserve(entries.size());
    for (const auto& [name, value] : entries) {
        lines.push_back(escapeText(name) + "=" + escapeText(value));
    }
    return lines;
}

namespace {
template <class Format>
std::string joinWords(const std::string& name, const std::vector<uint32_t>& words, Format format) {
    std::string line = name + "=";
    for (size_t i = 0; i < words.size(); ++i) {
        if (i != 0) line += ' ';
        line += format(words[i]);
    }
    return line;
}
}  // namespace

std::string formatDataWords(const std::string& name, const std::vector<uint32_t>& words) {
    return joinWords(name, words, formatDataWord);
}

std::string formatDecimalWords(const std::string& name, const std::vector<uint32_t>& words) {
    return joinWords(name, words, [](uint32_t w) { return std::to_string(w); });
}

}  // namespace nebu
