// Reading console command lines: words, quotes, comments, numbers and map entries.
#include <gtest/gtest.h>

#include "CommandLine.h"
#include "UsageError.h"

namespace nebu {
namespace {

using Words = std::vector<std::string>;

TEST(CommandLineTest, SplitsAtBlanksAndTabsAndDropsTheLineEnd) {
    EXPECT_EQ(splitWords("peek 0  1\t0 0x10"), (Words{"peek", "0", "1", "0", "0x10"}));
    EXPECT_EQ(splitWords("  \t stats \t "), (Words{"stats"}));
    EXPECT_EQ(splitWords("stats\r\n"), (Words{"stats"}));
    EXPECT_EQ(splitWords(""), Words{});
    EXPECT_EQ(splitWords(" \t\r\n"), Words{});
}

TEST(CommandLineTest, QuotesKeepBlanksAndCommasAndAreRemoved) {
    EXPECT_EQ(splitWords("setParameters 0 1 2 \"line rate=10.3, 2 lanes\" x=1"),
              (Words{"setParameters", "0", "1", "2", "line rate=10.3, 2 lanes", "x=1"}));
    // Quotes may stand inside a word, as in NAME="VALUE WITH BLANKS".
    EXPECT_EQ(splitWords("set mode=\"loop back\"end"), (Words{"set", "mode=loop backend"}));
    // An empty pair of quotes is an empty word, not nothing.
    EXPECT_EQ(splitWords("a \"\" b"), (Words{"a", "", "b"}));
    // '#' inside quotes is text, and so is a tab.
    EXPECT_EQ(splitWords("a \"#1\tx\" # note"), (Words{"a", "#1\tx"}));
    EXPECT_THROW(splitWords("a \"open quote"), UsageError);
}

TEST(CommandLineTest, HashOutsideQuotesStartsAComment) {
    EXPECT_EQ(splitWords("# a whole comment"), Words{});
    EXPECT_EQ(splitWords("   # indented comment \"with quote"), Words{});
    EXPECT_EQ(splitWords("stats # the counters"), (Words{"stats"}));
    EXPECT_EQ(splitWords("peek 0 1 0 0x10#3"), (Words{"peek", "0", "1", "0", "0x10"}));
}

TEST(CommandLineTest, NumbersAreDecimalOrHexWithin32Bits) {
    EXPECT_EQ(parseNumber("0", "N"), 0u);
    EXPECT_EQ(parseNumber("42", "N"), 42u);
    EXPECT_EQ(parseNumber("007", "N"), 7u);
    EXPECT_EQ(parseNumber("0x1fFf0", "N"), 0x1FFF0u);
    EXPECT_EQ(parseNumber("0XABCD", "N"), 0xABCDu);
    EXPECT_EQ(parseNumber("4294967295", "N"), 0xFFFFFFFFu);
    EXPECT_EQ(parseNumber("0xFFFFFFFF", "N"), 0xFFFFFFFFu);
    EXPECT_EQ(parseNumber("0x00000000000000001", "N"), 1u);
    for (const char* bad : {"", "0x", "x10", "-1", "+1", " 1", "1 ", "12a", "0x1G", "1.5",
                            "4294967296", "0x100000000", "99999999999999999999999"}) {
        EXPECT_THROW(parseNumber(bad, "N"), UsageError) << bad;
    }
}

TEST(CommandLineTest, MapWordsSplitAtTheFirstEquals) {
    using Entry = std::pair<std::string, std::string>;
    EXPECT_EQ(splitMapWord("CTRL"), (Entry{"CTRL", ""}));
    EXPECT_EQ(splitMapWord("CTRL=0x1"), (Entry{"CTRL", "0x1"}));
    EXPECT_EQ(splitMapWord("expr=a=b=c"), (Entry{"expr", "a=b=c"}));
    EXPECT_EQ(splitMapWord("empty="), (Entry{"empty", ""}));
    EXPECT_EQ(splitMapWord("=value"), (Entry{"", "value"}));
}

}  // namespace
}  // namespace nebu
