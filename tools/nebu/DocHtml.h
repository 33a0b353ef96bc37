// Small text helpers shared by the pages and pictures of `nebu doc`.
#pragma once

#include <cstdint>
#include <string>

namespace nebu {
namespace doc {

// Text and attribute values: & < > " ' escaped.
std::string esc(const std::string& text);

// A bus word address: 0x and at least 4 hexadecimal digits.
std::string wordText(uint32_t address);

// A slave type or driver version as the index shows it: 0x and lower-case hexadecimal digits
// (negative numbers keep their sign).
std::string hexText(int32_t value);

// A slave type as directory files write it: 0x01, 0x15.
std::string typeText(int32_t type);

// "15:12", or "7" for one bit: the first bit drawn at the left.
std::string bitSpan(uint32_t left, uint32_t right);

// An id fragment for any name: letters, digits and '_' kept, every other byte as -XX.
std::string idPart(const std::string& name);

// Where a bus word's picture is on its register file page.
inline std::string wordId(uint32_t address) { return "word-" + wordText(address); }
// Where a register's first table row is on its register file page.
inline std::string registerId(const std::string& name) { return "reg-" + idPart(name); }

}  // namespace doc
}  // namespace nebu
