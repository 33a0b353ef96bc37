// The console's output shapes: escaping, return codes, bus words, maps and word lists.
#include <gtest/gtest.h>

#include "TextFormat.h"

namespace nebu {
namespace {

TEST(TextFormatTest, EscapesBackslashAndControlBytes) {
    EXPECT_EQ(escapeText("plain text, with = and \"quotes\""), "plain text, with = and \"quotes\"");
    EXPECT_EQ(escapeText("a\\b"), "a\\\\b");
    EXPECT_EQ(escapeText("line\nfeed\rreturn\ttab"), "line\\nfeed\\rreturn\\ttab");
    EXPECT_EQ(escapeText(std::string("\x01\x1F\x1B", 3)), "\\x01\\x1F\\x1B");
    EXPECT_EQ(escapeText(std::string("nul\0end", 7)), "nul\\x00end");
    // Blank, DEL and bytes above 0x7F pass unchanged.
    EXPECT_EQ(escapeText(" \x7F\xC3\xA9"), " \x7F\xC3\xA9");
    EXPECT_EQ(escapeText(""), "");
}

TEST(TextFormatTest, ReturnCodeHasEightUpperCaseDigits) {
    EXPECT_EQ(formatRc(0), "rc=0x00000000");
    EXPECT_EQ(formatRc(0x80000000u), "rc=0x80000000");
    EXPECT_EQ(formatRc(0xabcdef12u), "rc=0xABCDEF12");
}

TEST(TextFormatTest, DataWordsHaveFourDigitsUnlessLarger) {
    EXPECT_EQ(formatDataWord(0), "0x0000");
    EXPECT_EQ(formatDataWord(0xab), "0x00AB");
    EXPECT_EQ(formatDataWord(0xFFFF), "0xFFFF");
    EXPECT_EQ(formatDataWord(0x10000), "0x10000");
    EXPECT_EQ(formatDataWord(0xFFFFFFFFu), "0xFFFFFFFF");
}

TEST(TextFormatTest, MapLinesAreSortedByByteAndEscaped) {
    const std::unordered_map<std::string, std::string> map = {
        {"b", "2"},         {"a.b", "dot"},    {"B", "upper"},       {"aa", "x"},
        {"a", "tab\there"}, {"\xC3\xA9", "e"}, {"new\nline", "n\\"}, {"empty", ""}};
    const std::vector<std::string> expected = {
        "B=upper", "a=tab\\there", "a.b=dot",          "aa=x",
        "b=2",     "empty=",       "new\\nline=n\\\\", "\xC3\xA9=e"};
    EXPECT_EQ(formatMapLines(map), expected);
    EXPECT_TRUE(formatMapLines({}).empty());
}

TEST(TextFormatTest, WordListsOnOneLine) {
    EXPECT_EQ(formatDataWords("buffer", {0x1, 0xBEEF, 0x12345}), "buffer=0x0001 0xBEEF 0x12345");
    EXPECT_EQ(formatDataWords("buffer", {}), "buffer=");
    EXPECT_EQ(formatDecimalWords("errorStatus", {0, 4, 0xFFFFFFFFu}), "errorStatus=0 4 4294967295");
    EXPECT_EQ(formatDecimalWords("slaveHandles", {7}), "slaveHandles=7");
}

}  // namespace
}  // namespace nebu
