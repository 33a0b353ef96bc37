// The console's output shapes the transcripts do not reach: escaping and the order of map lines.
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

}  // namespace
}  // namespace nebu
