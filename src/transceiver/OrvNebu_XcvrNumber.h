// Number reading and formatting shared by the transceiver actions: the C library's scan and
// print rules, without their undefined corners (overflow, unbounded output).
#pragma once

#include <cstdint>
#include <string>

namespace OrvRT {

class OrvNebu_XcvrNumber {
public:
    // The leading decimal floating-point number of the text (blanks, sign, digits with a
    // decimal point, exponent), 0 when there is none: hexadecimal, nan and inf texts read
    // their leading decimal number, or 0. Too large a number reads as infinite.
    static double readDouble(const std::string& text);
    // The same from a C text; end is set after the number, or to text when there is none.
    static double readDecimal(const char* text, const char** end);
    // The leading signed decimal integer ("%lld" rules), 0 when there is none; saturates
    // instead of overflowing.
    static int64_t readLld(const std::string& text);
    static std::string formatF(double value);
    static std::string formatLld(int64_t value);
    // a * b into out; false when the product does not fit in 64 bits.
    static bool multiply(uint64_t a, uint64_t b, uint64_t& out);
    // The magnitude of a signed value, defined for INT64_MIN too.
    static uint64_t magnitude(int64_t value);
};

}  // namespace OrvRT
