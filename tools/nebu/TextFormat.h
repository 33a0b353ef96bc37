// How the console prints what it gets back: escaped texts, return codes, bus words, maps and
// word lists, in the exact shapes scripts and tests read.
#pragma once

#include <cstdint>
#include <string>
#include <unordered_map>
#include <vector>

namespace nebu {

// Backslash as \\, line feed \n, carriage return \r, tab \t, other bytes below 0x20 as \xNN.
std::string escapeText(const std::string& text);

// rc=0x and 8 upper-case hexadecimal digits.
std::string formatRc(uint32_t rc);

// 0x and at least 4 upper-case hexadecimal digits (more only above 0xFFFF).
std::string formatDataWord(uint32_t word);

// One "NAME=VALUE" line per entry, sorted by name in byte order, both escaped.
std::vector<std::string> formatMapLines(const std::unordered_map<std::string, std::string>& map);

// "NAME=W0 W1 ..." with the words as bus data words or in decimal; "NAME=" when empty.
std::string formatDataWords(const std::string& name, const std::vector<uint32_t>& words);
std::string formatDecimalWords(const std::string& name, const std::vector<uint32_t>& words);

}  // namespace nebu
