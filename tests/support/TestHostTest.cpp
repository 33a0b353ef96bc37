// The fixture's own helpers: maps and message checks.
#include <string>

#include "host/OrvCore.h"
#include "host/OrvJtag.h"
#include "support/TestHost.h"

namespace {

class TestHostTest : public TestHost {};

TEST_F(TestHostTest, MapsAreHostMapsFilledWithTheGivenEntries) {
    const std::string value = "125";
    ORV_HASHMAP_HANDLE map = makeMap({{"refclk_freq", value}, {"line_rate", ""}});
    EXPECT_EQ(mapOf(map).size(), 2u);
    EXPECT_STREQ(OrvContainer_hashmapCStr_getCStr(map, "refclk_freq"), "125");
    EXPECT_STREQ(OrvContainer_hashmapCStr_getCStr(map, "line_rate"), "");
    EXPECT_TRUE(mapOf(makeMap()).empty());
}

TEST_F(TestHostTest, MessageChecksMatchSeverityAndExactText) {
    EXPECT_TRUE(noMessages());
    OrvJtag_session_sendMessage(HANDLE, SEVERITY_FILE_LINE, "line 3");
    OrvJtag_session_sendMessage(HANDLE, SEVERITY_ERROR, "failed\n");
    EXPECT_FALSE(noMessages());
    EXPECT_MESSAGE(SEVERITY_FILE_LINE, "line 3");
    EXPECT_FALSE(hasMessage(SEVERITY_ERROR, "line 3"));
    EXPECT_FALSE(hasMessage(SEVERITY_ERROR, "failed"));
    EXPECT_LAST_MESSAGE(SEVERITY_ERROR, "failed\n");
    EXPECT_FALSE(lastMessageIs(SEVERITY_FILE_LINE, "line 3"));
    clearMessages();
    EXPECT_NO_MESSAGES();
}

TEST_F(TestHostTest, BoardsComeFromTextOrFileAndStandBehindEverySession) {
    loadBoardFile(NEBU_TEST_BOARDS_DIR "/demo.json");
    uint32_t count = 0;
    ASSERT_EQ(OrvCore_getCoreCount(HANDLE, 0, 1, &count), 0);
    EXPECT_EQ(count, 2u);
    loadBoard(BUS_BOARD);
    EXPECT_EQ(OrvSim::getBoard(), board());
    EXPECT_EQ(board()->peek(0, 1, 1, 0x10), 0x1234u);
    EXPECT_THROW(loadBoard("{ \"devices\": 3 }"), OrvSim::BoardError);
}

}  // namespace
