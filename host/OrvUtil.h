// Utility library of the host: bit buffers, number and text conversions, the data directory.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "host/OrvExport.h"

namespace OrvRT {

// A zeroed byte array read as bits: bit k is bit k%8 of byte k/8.
class ORV_UTIL_API Orv_ByteBuffer {
public:
    // size: bytes; growBy, reserve: kept for the host's bookkeeping, no effect on content.
    Orv_ByteBuffer(uint32_t size, uint32_t growBy, uint32_t reserve);
    ~Orv_ByteBuffer();
    Orv_ByteBuffer(const Orv_ByteBuffer&) = delete;
    Orv_ByteBuffer& operator=(const Orv_ByteBuffer&) = delete;

    // Bits first..first+count-1 as a number, least significant first; count at most 64.
    // Bits past the end read 0.
    uint64_t getBits(uint32_t first, uint32_t count) const;
    uint32_t getSize() const;
    char* ptr();
    uint8_t* uPtr();
    // Reads the characters first..last (inclusive) as one hexadecimal number and stores it
    // in place, least significant byte first from byte 0 (the last two digits become byte 0).
    // Returns the number of bytes produced. Throws std::logic_error on a non-hex character or
    // a range outside the buffer.
    uint32_t hex2Bin(uint32_t first, uint32_t last);

private:
    std::vector<uint8_t> bytes_;
};

// Text and number conversions. Bad text throws std::logic_error naming the text.
class ORV_UTIL_API Orv_NumberUtil {
public:
    // Blanks around and a 0x/0X prefix allowed; empty text is 0; too large for the type throws.
    static uint64_t hexStr2ULL(const std::string& text);
    static uint32_t hexStr2UInt(const std::string& text);
    // The leading decimal number, 0 when there is none (like strtoull).
    static uint64_t decStr2ULL(const std::string& text);
    // Upper-case digits, no leading zeros ("0" for zero). Returns out.
    static std::string& uLL2HexStr(uint64_t value, std::string& out);
    static std::string& uLL2DecStr(uint64_t value, std::string& out);
    static std::string& uInt2DecStr(uint32_t value, std::string& out);
    // Exactly width '0'/'1' digits, most significant first: the low width bits of the value,
    // any width. Throws std::logic_error for text that is not hexadecimal, empty or blank text
    // included. Returns out.
    static std::string& hexStr2BinStr(const std::string& hex, uint32_t width, std::string& out);
    // ceil(n/4) upper-case hex digits, zero padded; "0" for no bits. Returns out.
    static std::string& binStr2HexStr(const std::string& bits, std::string& out);
};

class ORV_UTIL_API Orv_Util {
public:
    // 0 when equal without regard to case, else <0 or >0 like strcmp.
    static int stricmp(const std::string& a, const std::string& b);
    static int stricmp(const char* a, const char* b);
    // A copy without blanks and tabs at both ends.
    static std::string trimWhitespace(const std::string& text);
    // Removes one trailing carriage return in place.
    static void stripEndingCR(std::string& text);
    // Removes one pair of surrounding double quotes from each element.
    static void unQuote(std::vector<std::string>& fields);
    // The data directory the host application set, ending in a separator.
    static std::string getVanduDataDirPath();
};

}  // namespace OrvRT
