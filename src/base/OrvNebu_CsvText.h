// Plain text helpers of the definition-file readers: the comma split and the C-style number
// readings the files rely on, without the undefined behaviour of atoi/strtol on overflow.
#pragma once

#include <cstdint>
#include <fstream>
#include <string>
#include <vector>

namespace OrvRT {

class OrvNebu_CsvText {
public:
    // Splits at every comma; adjacent commas give empty fields.
    static void splitCommas(const std::string& line, std::vector<std::string>& fields);

    // Lower-case hexadecimal digits without prefix or leading zeros ("0" for zero), as the
    // readers write addresses and slave types.
    static std::string hexText(uint32_t value);

    // A carriage return before the end of the line: a file whose lines end in CR alone, read
    // as one line.
    static bool hasInnerCR(const std::string& line);

    // Leading blanks, optional sign, decimal digits; 0 without digits. Values beyond the
    // 32-bit range saturate at INT32_MIN/INT32_MAX.
    static int32_t decimalToInt32(const std::string& text);

    // As decimalToInt32, but the base follows the text: 0x/0X hexadecimal, a leading 0 octal,
    // decimal otherwise. Reading stops at the first character that does not fit the base.
    static int32_t autoBaseToInt32(const std::string& text);

    // Opens a file for the readers, in binary: Windows' text mode would end it at a Ctrl-Z (the
    // readers strip the CR of CR LF themselves). On Windows a name ending in a blank or a dot
    // stays closed: Windows would drop them and open another file than the one named.
    static void openFile(std::ifstream& in, const std::string& path);
};

}  // namespace OrvRT
