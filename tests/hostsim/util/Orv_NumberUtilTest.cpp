// The host's number conversions at their edges: widths, padding and cutting, case, prefixes,
// blanks, bad characters and overflow.
#include <gtest/gtest.h>

#include <cstdint>
#include <stdexcept>
#include <string>

#include "host/OrvUtil.h"

using OrvRT::Orv_NumberUtil;

namespace {

// The what() of the logic_error that call throws; fails the test when it throws nothing.
template <class Call>
std::string logicErrorOf(Call&& call) {
    try {
        call();
    } catch (const std::logic_error& e) {
        return e.what();
    }
    ADD_FAILURE() << "no std::logic_error thrown";
    return std::string();
}

TEST(Orv_NumberUtilTest, HexToUnsignedAcceptsPrefixCaseBlanksAndEmptyText) {
    EXPECT_EQ(Orv_NumberUtil::hexStr2ULL(""), 0u);
    EXPECT_EQ(Orv_NumberUtil::hexStr2ULL("   "), 0u);
    EXPECT_EQ(Orv_NumberUtil::hexStr2ULL("  0x1aF \t"), 0x1AFu);
    EXPECT_EQ(Orv_NumberUtil::hexStr2ULL("0XfF"), 0xFFu);
    EXPECT_EQ(Orv_NumberUtil::hexStr2ULL("abcdef"), 0xABCDEFu);
    EXPECT_EQ(Orv_NumberUtil::hexStr2ULL("FFFFFFFFFFFFFFFF"), UINT64_MAX);
    // Leading zeros do not count against the width.
    EXPECT_EQ(Orv_NumberUtil::hexStr2ULL("000000000000000000000001"), 1u);
    EXPECT_EQ(Orv_NumberUtil::hexStr2UInt("FFFFFFFF"), UINT32_MAX);
    EXPECT_EQ(Orv_NumberUtil::hexStr2UInt("0x00000000FFFFFFFF"), UINT32_MAX);
    EXPECT_EQ(Orv_NumberUtil::hexStr2UInt("0x1FFFF"), 0x1FFFFu);
}

TEST(Orv_NumberUtilTest, HexToUnsignedRejectsBadTextAndOverflowNamingTheText) {
    for (const char* bad : {"12G", "1 2", "0x", "-1", "0x0x1", "1h", "+5"}) {
        const std::string what = logicErrorOf([&] { Orv_NumberUtil::hexStr2ULL(bad); });
        EXPECT_NE(what.find(std::string("\"") + bad + "\""), std::string::npos) << what;
        EXPECT_THROW(Orv_NumberUtil::hexStr2UInt(bad), std::logic_error) << bad;
    }
    std::string what = logicErrorOf([] { Orv_NumberUtil::hexStr2ULL("10000000000000000"); });
    EXPECT_NE(what.find("\"10000000000000000\""), std::string::npos) << what;
    EXPECT_NE(what.find("64 bits"), std::string::npos) << what;
    what = logicErrorOf([] { Orv_NumberUtil::hexStr2UInt("0x100000000"); });
    EXPECT_NE(what.find("\"0x100000000\""), std::string::npos) << what;
    EXPECT_NE(what.find("32 bits"), std::string::npos) << what;
    EXPECT_THROW(Orv_NumberUtil::hexStr2ULL("1FFFFFFFFFFFFFFFF"), std::logic_error);
}

TEST(Orv_NumberUtilTest, DecimalReadsTheLeadingNumberLikeStrtoull) {
    EXPECT_EQ(Orv_NumberUtil::decStr2ULL("123abc"), 123u);
    EXPECT_EQ(Orv_NumberUtil::decStr2ULL("  42"), 42u);
    EXPECT_EQ(Orv_NumberUtil::decStr2ULL("+7"), 7u);
    EXPECT_EQ(Orv_NumberUtil::decStr2ULL("abc"), 0u);
    EXPECT_EQ(Orv_NumberUtil::decStr2ULL(""), 0u);
    EXPECT_EQ(Orv_NumberUtil::decStr2ULL("0x10"), 0u);
    EXPECT_EQ(Orv_NumberUtil::decStr2ULL("18446744073709551615"), UINT64_MAX);
    // Too large saturates instead of wrapping; a minus sign gives no unsigned number.
    EXPECT_EQ(Orv_NumberUtil::decStr2ULL("18446744073709551616"), UINT64_MAX);
    EXPECT_EQ(Orv_NumberUtil::decStr2ULL("99999999999999999999999"), UINT64_MAX);
    EXPECT_EQ(Orv_NumberUtil::decStr2ULL("-5"), 0u);
}

TEST(Orv_NumberUtilTest, NumbersToTextUseUpperCaseWithoutLeadingZerosAndReturnTheOutput) {
    std::string out = "stale";
    EXPECT_EQ(&Orv_NumberUtil::uLL2HexStr(0, out), &out);
    EXPECT_EQ(out, "0");
    EXPECT_EQ(Orv_NumberUtil::uLL2HexStr(0xABC, out), "ABC");
    EXPECT_EQ(Orv_NumberUtil::uLL2HexStr(0x0F00, out), "F00");
    EXPECT_EQ(Orv_NumberUtil::uLL2HexStr(UINT64_MAX, out), "FFFFFFFFFFFFFFFF");
    EXPECT_EQ(&Orv_NumberUtil::uLL2DecStr(0, out), &out);
    EXPECT_EQ(out, "0");
    EXPECT_EQ(Orv_NumberUtil::uLL2DecStr(UINT64_MAX, out), "18446744073709551615");
    EXPECT_EQ(&Orv_NumberUtil::uInt2DecStr(UINT32_MAX, out), &out);
    EXPECT_EQ(out, "4294967295");
    EXPECT_EQ(Orv_NumberUtil::uInt2DecStr(1000, out), "1000");
}

TEST(Orv_NumberUtilTest, HexToBinaryGivesExactlyTheWidthAtAnyWidth) {
    std::string out = "stale";
    EXPECT_EQ(&Orv_NumberUtil::hexStr2BinStr("5", 0, out), &out);
    EXPECT_EQ(out, "");
    EXPECT_EQ(Orv_NumberUtil::hexStr2BinStr("1", 1, out), "1");
    EXPECT_EQ(Orv_NumberUtil::hexStr2BinStr("2", 1, out), "0");           // cut to the low bit
    EXPECT_EQ(Orv_NumberUtil::hexStr2BinStr("A", 8, out), "00001010");    // padded
    EXPECT_EQ(Orv_NumberUtil::hexStr2BinStr("ABC", 8, out), "10111100");  // cut
    EXPECT_EQ(Orv_NumberUtil::hexStr2BinStr("ab", 8, out), "10101011");
    EXPECT_EQ(Orv_NumberUtil::hexStr2BinStr("AB", 8, out), "10101011");
    EXPECT_EQ(Orv_NumberUtil::hexStr2BinStr("  0x5 ", 4, out), "0101");
    EXPECT_EQ(Orv_NumberUtil::hexStr2BinStr("FFFFFFFFFFFFFFFF", 64, out), std::string(64, '1'));
    EXPECT_EQ(Orv_NumberUtil::hexStr2BinStr("8000000000000001", 64, out),
              "1" + std::string(62, '0') + "1");
    EXPECT_EQ(Orv_NumberUtil::hexStr2BinStr("1FFFFFFFFFFFFFFFF", 65, out), std::string(65, '1'));
    EXPECT_EQ(Orv_NumberUtil::hexStr2BinStr("0x10000000000000000", 65, out),
              "1" + std::string(64, '0'));
    EXPECT_EQ(Orv_NumberUtil::hexStr2BinStr("0x10000000000000000", 64, out), std::string(64, '0'));
    EXPECT_EQ(Orv_NumberUtil::hexStr2BinStr("3" + std::string(32, 'F'), 130, out),
              std::string(130, '1'));
    EXPECT_EQ(Orv_NumberUtil::hexStr2BinStr("1", 130, out), std::string(129, '0') + "1");
}

TEST(Orv_NumberUtilTest, HexToBinaryRejectsBadTextAndLeavesTheOutput) {
    std::string out = "kept";
    // Empty or blank text is no number either, at any width.
    for (const char* bad : {"xyz", "G1", "1 1", "0x", "", " ", "\t"}) {
        const std::string what = logicErrorOf([&] { Orv_NumberUtil::hexStr2BinStr(bad, 4, out); });
        EXPECT_NE(what.find(std::string("\"") + bad + "\""), std::string::npos) << what;
        EXPECT_EQ(out, "kept");
    }
    EXPECT_THROW(Orv_NumberUtil::hexStr2BinStr("", 0, out), std::logic_error);
    EXPECT_EQ(out, "kept");
    // An absurd width is refused instead of allocating gigabytes.
    const std::string what =
        logicErrorOf([&] { Orv_NumberUtil::hexStr2BinStr("1", UINT32_MAX, out); });
    EXPECT_NE(what.find("4294967295"), std::string::npos) << what;
    EXPECT_EQ(out, "kept");
}

TEST(Orv_NumberUtilTest, BinaryToHexPadsToTheFullWidthAtAnyWidth) {
    std::string out = "stale";
    // No bits is the value 0: a number the other way round.
    EXPECT_EQ(&Orv_NumberUtil::binStr2HexStr("", out), &out);
    EXPECT_EQ(out, "0");
    EXPECT_EQ(Orv_NumberUtil::binStr2HexStr("1", out), "1");
    EXPECT_EQ(Orv_NumberUtil::binStr2HexStr("0000", out), "0");
    EXPECT_EQ(Orv_NumberUtil::binStr2HexStr("00000", out), "00");
    EXPECT_EQ(Orv_NumberUtil::binStr2HexStr("10000", out), "10");
    EXPECT_EQ(Orv_NumberUtil::binStr2HexStr("10101011", out), "AB");
    EXPECT_EQ(Orv_NumberUtil::binStr2HexStr(std::string(64, '1'), out), "FFFFFFFFFFFFFFFF");
    EXPECT_EQ(Orv_NumberUtil::binStr2HexStr("1" + std::string(64, '0'), out),
              "1" + std::string(16, '0'));
    EXPECT_EQ(Orv_NumberUtil::binStr2HexStr("10" + std::string(128, '1'), out),
              "2" + std::string(32, 'F'));
}

TEST(Orv_NumberUtilTest, BinaryToHexRejectsOtherCharactersAndRoundTripsWideValues) {
    std::string out = "kept";
    for (const char* bad : {"0102", " 1", "1 ", "x"}) {
        const std::string what = logicErrorOf([&] { Orv_NumberUtil::binStr2HexStr(bad, out); });
        EXPECT_NE(what.find(std::string("\"") + bad + "\""), std::string::npos) << what;
        EXPECT_EQ(out, "kept");
    }
    const std::string wide = "2" + std::string(15, '0') + "DEADBEEF" + std::string(8, '0') + "1";
    std::string bits;
    Orv_NumberUtil::hexStr2BinStr(wide, 130, bits);
    ASSERT_EQ(bits.size(), 130u);
    EXPECT_EQ(Orv_NumberUtil::binStr2HexStr(bits, out), wide);
}

}  // namespace
