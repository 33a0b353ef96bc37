// The host's text helpers and the data directory.
#include <string>
#include <vector>

#include "host/OrvUtil.h"
#include "support/TestHost.h"

using OrvRT::Orv_Util;

namespace {

TEST(Orv_UtilTest, StricmpComparesWithoutRegardToCaseLikeStrcmp) {
    EXPECT_EQ(Orv_Util::stricmp(std::string("Slave_Type"), std::string("sLAVE_tYPE")), 0);
    EXPECT_LT(Orv_Util::stricmp(std::string("abc"), std::string("ABD")), 0);
    EXPECT_GT(Orv_Util::stricmp(std::string("abd"), std::string("ABC")), 0);
    EXPECT_LT(Orv_Util::stricmp(std::string("ab"), std::string("AB_")), 0);
    EXPECT_GT(Orv_Util::stricmp(std::string("AB_"), std::string("ab")), 0);
    EXPECT_EQ(Orv_Util::stricmp(std::string(), std::string()), 0);
    EXPECT_EQ(Orv_Util::stricmp("Tx_Rate", "TX_RATE"), 0);
    EXPECT_LT(Orv_Util::stricmp("a", "b"), 0);
    EXPECT_GT(Orv_Util::stricmp("ab", "a"), 0);
    EXPECT_EQ(Orv_Util::stricmp(static_cast<const char*>(nullptr), nullptr), 0);
    EXPECT_LT(Orv_Util::stricmp(nullptr, "a"), 0);
    EXPECT_GT(Orv_Util::stricmp("a", nullptr), 0);
}

TEST(Orv_UtilTest, TrimAndStripTouchOnlyTheirCharacters) {
    EXPECT_EQ(Orv_Util::trimWhitespace(" \tab c\t "), "ab c");
    EXPECT_EQ(Orv_Util::trimWhitespace(" \t "), "");
    EXPECT_EQ(Orv_Util::trimWhitespace(""), "");
    EXPECT_EQ(Orv_Util::trimWhitespace("\nx\r"), "\nx\r");
    std::string text = "a\r\r";
    Orv_Util::stripEndingCR(text);
    EXPECT_EQ(text, "a\r");
    Orv_Util::stripEndingCR(text);
    EXPECT_EQ(text, "a");
    Orv_Util::stripEndingCR(text);
    EXPECT_EQ(text, "a");
    text.clear();
    Orv_Util::stripEndingCR(text);
    EXPECT_EQ(text, "");
}

TEST(Orv_UtilTest, UnQuoteRemovesOnePairOfSurroundingQuotes) {
    std::vector<std::string> fields{"\"a\"", "\"", "\"\"", "b\"", "\"x", "\"\"a\"\"", "plain", ""};
    Orv_Util::unQuote(fields);
    EXPECT_EQ(fields,
              (std::vector<std::string>{"a", "\"", "", "b\"", "\"x", "\"a\"", "plain", ""}));
}

class DataDirTest : public TestHost {};

TEST_F(DataDirTest, DataDirEndsInASeparatorAndIsForgottenByAFreshHost) {
    setDataDir("/opt/data");
    EXPECT_EQ(Orv_Util::getVanduDataDirPath(), "/opt/data/");
    setDataDir("/opt/data/");
    EXPECT_EQ(Orv_Util::getVanduDataDirPath(), "/opt/data/");
    setDataDir("C:\\data\\");
    EXPECT_EQ(Orv_Util::getVanduDataDirPath(), "C:\\data\\");
    setDataDir("");
    EXPECT_EQ(Orv_Util::getVanduDataDirPath(), "./");
    setDataDir("rel");
    OrvSim::resetHost();
    EXPECT_EQ(Orv_Util::getVanduDataDirPath(), "./");
}

}  // namespace
