// Reading a command line: words, quotes, comments, numbers and map entries.
#pragma once

#include <cstdint>
#include <string>
#include <utility>
#include <vector>

namespace nebu {

// Splits at blanks and tabs. Double quotes group blanks and commas into a word and are removed
// (they may stand anywhere in a word; "" is an empty word); '#' outside quotes ends the line.
// A trailing line feed or carriage return is ignored. Throws UsageError on an open quote.
std::vector<std::string> splitWords(const std::string& line);

// Decimal, or hexadecimal after 0x/0X; must fit 32 bits. Throws UsageError naming the word
// and what it stands for.
uint32_t parseNumber(const std::string& word, const std::string& what);

// NAME (empty value) or NAME=VALUE, split at the first '='.
std::pair<std::string, std::string> splitMapWord(const std::string& word);

// The line without its line terminator (what the console echoes).
std::string stripLineEnd(const std::string& line);

}  // namespace nebu
