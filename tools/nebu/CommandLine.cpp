// Parsing of console command lines.
#include "CommandLine.h"

#include "UsageError.h"

namespace nebu {

std::string stripLineEnd(const std::string& line) {
    size_t end = line.size();
    while (end > 0 && (line[end - 1] == '\n' || line[end - 1] == '\r')) --end;
    return line.substr(0, end);
}

std::vector<std::string> splitWords(const std::string& rawLine) {
    const std::string line = stripLineEnd(rawLine);
    std::vector<std::string> words;
    std::string word;
    bool inWord = false;  // "" must still count as a word
    bool inQuotes = false;
    for (char c : line) {
        if (inQuotes) {
            if (c == '"') {
                inQuotes = false;
            } else {
                word += c;
            }
        } else if (c == '"') {
            inQuotes = true;
            inWord = true;
        } else if (c == '#') {
            break;
        } else if (c == ' ' || c == '\t') {
            if (inWord) words.push_back(word);
            word.clear();
            inWord = false;
        } else {
            word += c;
            inWord = true;
        }
    }
    if (inQuotes) throw UsageError("unterminated quote in: " + line);
    if (inWord) words.push_back(word);
    return words;
}

uint32_t parseNumber(const std::string& word, const std::string& what) {
    auto bad = [&]() { return UsageError("bad number '" + word + "' for " + what); };
    const bool hex = word.size() > 2 && word[0] == '0' && (word[1] == 'x' || word[1] == 'X');
    const size_t start = hex ? 2 : 0;
    const uint64_t base = hex ? 16 : 10;
    if (word.size() <= start) throw bad();
    uint64_t value = 0;
    for (size_t i = start; i < word.size(); ++i) {
        const char c = word[i];
        uint64_t digit;
        if (c >= '0' && c <= '9') {
            digit = static_cast<uint64_t>(c - '0');
        } else if (hex && c >= 'a' && c <= 'f') {
            digit = static_cast<uint64_t>(c - 'a' + 10);
        } else if (hex && c >= 'A' && c <= 'F') {
            digit = static_cast<uint64_t>(c - 'A' + 10);
        } else {
            throw bad();
        }
        value = value * base + digit;
        if (value > 0xFFFFFFFFull) throw bad();
    }
    return static_cast<uint32_t>(value);
}

std::pair<std::string, std::string> splitMapWord(const std::string& word) {
    const size_t eq = word.find('=');
    if (eq == std::string::npos) return {word, std::string()};
    return {word.substr(0, eq), word.substr(eq + 1)};
}

}  // namespace nebu
