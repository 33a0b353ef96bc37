// The host's number conversions at their edges: widths, padding and cutting, case, prefixes,
// blanks, bad characters and overflow.
#include <gtest/gtest.h>

#include <cstdint>
#include <stdexcept>
#include <string>

#include "host/OrvUtil.h"

using OrvRT::Orv_NumberUtil;

namespace {

std::string n(size_t count, char c) { return std::string(count, c); }

struct Conversion {
    const char* call;
    std::string in;
    uint32_t width;
    // What the call gives, or "!" and a text the refusal must hold besides the quoted input.
    std::string expected;
};

// Every call writes into and returns the caller's string; a refusal leaves it as it was.
std::string convert(const Conversion& c) {
    std::string out = "kept";
    const std::string call = c.call;
    try {
        std::string* got = nullptr;
        if (call == "hex64")
            got = &Orv_NumberUtil::uLL2HexStr(Orv_NumberUtil::hexStr2ULL(c.in), out);
        if (call == "hex32")
            got = &Orv_NumberUtil::uLL2HexStr(Orv_NumberUtil::hexStr2UInt(c.in), out);
        if (call == "dec") got = &Orv_NumberUtil::uLL2DecStr(Orv_NumberUtil::decStr2ULL(c.in), out);
        if (call == "dec32") {
            got = &Orv_NumberUtil::uInt2DecStr(
                static_cast<uint32_t>(Orv_NumberUtil::decStr2ULL(c.in)), out);
        }
        if (call == "bin") got = &Orv_NumberUtil::hexStr2BinStr(c.in, c.width, out);
        if (call == "unbin") got = &Orv_NumberUtil::binStr2HexStr(c.in, out);
        return got == &out ? out : "not the caller's string";
    } catch (const std::logic_error& e) {
        const std::string what = e.what();
        const std::string named = c.width == UINT32_MAX ? "4294967295" : "\"" + c.in + "\"";
        if (what.find(named) == std::string::npos) return "refusal without " + named + ": " + what;
        if (what.find(c.expected.substr(1)) == std::string::npos) return "refusal: " + what;
        return out == "kept" ? c.expected : "refusal wrote " + out;
    }
}

TEST(Orv_NumberUtilTest, ConversionsAtTheirEdges) {
    const Conversion table[] = {
        {"hex64", "", 0, "0"},  // empty or blank text reads as 0 here
        {"hex64", "   ", 0, "0"},
        {"hex64", "  0x1aF \t", 0, "1AF"},
        {"hex64", "0XfF", 0, "FF"},
        {"hex64", "abcdef", 0, "ABCDEF"},
        {"hex64", n(16, 'F'), 0, n(16, 'F')},
        {"hex64", "000000000000000000000001", 0, "1"},  // leading zeros are no width
        {"hex64", "0F00", 0, "F00"},
        {"hex64", "10000000000000000", 0, "!64 bits"},
        {"hex64", "1FFFFFFFFFFFFFFFF", 0, "!"},
        {"hex32", "FFFFFFFF", 0, "FFFFFFFF"},
        {"hex32", "0x00000000FFFFFFFF", 0, "FFFFFFFF"},
        {"hex32", "0x1FFFF", 0, "1FFFF"},
        {"hex32", "0x100000000", 0, "!32 bits"},
        {"dec", "123abc", 0, "123"},  // the leading number, as strtoull reads it
        {"dec", "  42", 0, "42"},
        {"dec", "+7", 0, "7"},
        {"dec", "abc", 0, "0"},
        {"dec", "", 0, "0"},
        {"dec", "0x10", 0, "0"},
        {"dec", "-5", 0, "0"},
        {"dec", "18446744073709551615", 0, "18446744073709551615"},
        {"dec", "18446744073709551616", 0, "18446744073709551615"},  // saturates
        {"dec", "99999999999999999999999", 0, "18446744073709551615"},
        {"dec32", "4294967295", 0, "4294967295"},
        {"dec32", "1000", 0, "1000"},
        {"bin", "5", 0, ""},
        {"bin", "1", 1, "1"},
        {"bin", "2", 1, "0"},  // cut to the low bits
        {"bin", "A", 8, "00001010"},
        {"bin", "ABC", 8, "10111100"},
        {"bin", "ab", 8, "10101011"},
        {"bin", "  0x5 ", 4, "0101"},
        {"bin", n(16, 'F'), 64, n(64, '1')},
        {"bin", "8000000000000001", 64, "1" + n(62, '0') + "1"},
        {"bin", "1" + n(16, 'F'), 65, n(65, '1')},
        {"bin", "0x1" + n(16, '0'), 65, "1" + n(64, '0')},
        {"bin", "0x1" + n(16, '0'), 64, n(64, '0')},
        {"bin", "3" + n(32, 'F'), 130, n(130, '1')},
        {"bin", "1", 130, n(129, '0') + "1"},
        {"bin", "1", UINT32_MAX, "!"},  // an absurd width, not gigabytes
        {"unbin", "", 0, "0"},
        {"unbin", "1", 0, "1"},
        {"unbin", "0000", 0, "0"},
        {"unbin", "00000", 0, "00"},  // padded to the full width
        {"unbin", "10000", 0, "10"},
        {"unbin", "10101011", 0, "AB"},
        {"unbin", n(64, '1'), 0, n(16, 'F')},
        {"unbin", "1" + n(64, '0'), 0, "1" + n(16, '0')},
        {"unbin", "10" + n(128, '1'), 0, "2" + n(32, 'F')},
    };
    for (const Conversion& c : table) EXPECT_EQ(convert(c), c.expected) << c.call << " " << c.in;
    for (const char* bad : {"12G", "1 2", "0x", "-1", "0x0x1", "1h", "+5"}) {
        EXPECT_EQ(convert({"hex64", bad, 0, "!"}), "!") << bad;
        EXPECT_EQ(convert({"hex32", bad, 0, "!"}), "!") << bad;
    }
    for (const char* bad : {"xyz", "G1", "1 1", "0x", "", " ", "\t"}) {
        EXPECT_EQ(convert({"bin", bad, 4, "!"}), "!") << bad;
    }
    EXPECT_EQ(convert({"bin", "", 0, "!"}), "!");
    for (const char* bad : {"0102", " 1", "1 ", "x"})
        EXPECT_EQ(convert({"unbin", bad, 0, "!"}), "!");
    const std::string wide = "2" + n(15, '0') + "DEADBEEF" + n(8, '0') + "1";
    std::string bits;
    EXPECT_EQ(convert({"unbin", Orv_NumberUtil::hexStr2BinStr(wide, 130, bits), 0, wide}), wide);
}

}  // namespace
