// The single-register handler chosen by ZAN_ORV_SWITCH_REG_HANDLER: one single transfer per
// slice, only the words of named registers, its own cache.
#include <set>

#include "registers/OrvNebu_DefaultRegisterHandler.h"
#include "registers/OrvNebu_SingleRegisterHandler.h"
#include "support/RegsFixture.h"

using OrvRT::OrvNebu_DefaultRegisterHandler;
using OrvRT::OrvNebu_SingleRegisterHandler;

namespace {

class SingleRegisterHandlerTest : public RegsFixture {
protected:
    void SetUp() override {
        RegsFixture::SetUp();
        nebutest::setEnv("ZAN_ORV_SWITCH_REG_HANDLER", "1");
        ASSERT_EQ(initialize(0), ORVNEBU_OK);
        watchBus();
    }
};

TEST_F(SingleRegisterHandlerTest, WriteTouchesOnlyTheWordsOfTheNamedRegisters) {
    for (uint32_t a = 2; a <= 8; ++a) poke(0, a, static_cast<uint16_t>(0x1000 + a));
    poke(0, 8, 0xF00F);
    ORV_HASHMAP_HANDLE map = makeMap({{"A", "1234"}, {"B", "AB"}});
    ASSERT_EQ(setRegs(0, map), ORVNEBU_OK);
    EXPECT_EQ(peek(0, 2), 0x1234);
    EXPECT_EQ(peek(0, 8), 0xFABF);
    for (uint32_t a = 3; a <= 7; ++a) EXPECT_EQ(peek(0, a), 0x1000 + a);

    auto t = transfers();
    ASSERT_EQ(t.size(), 4u);  // a read-modify-write of each word
    std::multiset<uint32_t> reads, writes;
    for (const auto& x : t) {
        EXPECT_FALSE(x.burst);
        EXPECT_EQ(x.count, 0u);
        (x.write ? writes : reads).insert(x.address);
    }
    EXPECT_EQ(reads, (std::multiset<uint32_t>{2, 8}));
    EXPECT_EQ(writes, (std::multiset<uint32_t>{2, 8}));
    EXPECT_NO_MESSAGES();
}

TEST_F(SingleRegisterHandlerTest, SlicesOfOneWordMoveOneByOneHighestOrderFirst) {
    poke(0, 0x30, 0x00F0);
    ORV_HASHMAP_HANDLE set = makeMap({{"TRIPLE", "ABC"}});
    ASSERT_EQ(setRegs(0, set), ORVNEBU_OK);
    EXPECT_EQ(peek(0, 0x30), 0xABFC);
    auto t = transfers();
    ASSERT_EQ(t.size(), 6u);
    // Each write carries the word as it stands after that slice's merge.
    EXPECT_EQ(t[1].data, 0xA0F0u);
    EXPECT_EQ(t[3].data, 0xABF0u);
    EXPECT_EQ(t[5].data, 0xABFCu);
    for (size_t i = 0; i < t.size(); ++i) {
        EXPECT_EQ(t[i].address, 0x30u);
        EXPECT_EQ(t[i].write, i % 2 == 1);
    }

    clearTrace();
    ORV_HASHMAP_HANDLE get = makeMap({{"TRIPLE", ""}});
    ASSERT_EQ(getRegs(0, get), ORVNEBU_OK);
    EXPECT_EQ(mapOf(get)["TRIPLE"], "ABC");
    t = transfers();
    ASSERT_EQ(t.size(), 3u);
    for (const auto& x : t) {
        EXPECT_FALSE(x.write);
        EXPECT_FALSE(x.burst);
        EXPECT_EQ(x.address, 0x30u);
    }
}

TEST_F(SingleRegisterHandlerTest, SameResultsAsTheBlockHandler) {
    ORV_HASHMAP_HANDLE set = makeMap({{"WIDE", "ABCDEF"}, {"REV", "01"}});
    ASSERT_EQ(setRegs(0, set), ORVNEBU_OK);
    EXPECT_EQ(peek(0, 0x10), 0xCDEF);
    EXPECT_EQ(peek(0, 0x11), 0x00AB);
    EXPECT_EQ(peek(0, 0x20), 0x0080);
    ORV_HASHMAP_HANDLE all = makeMap();
    ASSERT_EQ(getRegs(0, all), ORVNEBU_OK);
    EXPECT_EQ(mapOf(all).size(), 6u);
    EXPECT_EQ(mapOf(all)["WIDE"], "ABCDEF");
    EXPECT_EQ(mapOf(all)["REV"], "01");
}

TEST_F(SingleRegisterHandlerTest, EmptyWriteAndBadInputSendNothing) {
    ORV_HASHMAP_HANDLE none = makeMap();
    EXPECT_EQ(setRegs(0, none), ORVNEBU_OK);
    EXPECT_TRUE(trace().empty());

    ORV_HASHMAP_HANDLE bad = makeMap({{"A", "1"}, {"Nope", "2"}});
    EXPECT_EQ(setRegs(0, bad), ORVNEBU_FAILED);
    EXPECT_MESSAGE(256, "Invalid Register Name: Nope\n");
    EXPECT_LAST_MESSAGE(32768, "Orv abort command");
    EXPECT_TRUE(trace().empty());

    poke(0, 2, 0x7777);
    ORV_HASHMAP_HANDLE badValue = makeMap({{"A", "1"}, {"B", "not hex"}});
    EXPECT_EQ(setRegs(0, badValue), ORVNEBU_FAILED);
    EXPECT_TRUE(trace().empty());
    EXPECT_EQ(peek(0, 2), 0x7777);
}

TEST_F(SingleRegisterHandlerTest, ReadsNothingBeforeEveryKeyPassedThenHighestOrderFirst) {
    ORV_HASHMAP_HANDLE bad = makeMap({{"A", ""}, {"WIDE", ""}, {"Nope", ""}});
    EXPECT_EQ(getRegs(0, bad), ORVNEBU_FAILED);
    EXPECT_MESSAGE(256, "Invalid Register Name: Nope\n");
    EXPECT_TRUE(trace().empty());

    poke(0, 0x10, 0xCDEF);
    poke(0, 0x11, 0x00AB);
    ORV_HASHMAP_HANDLE wide = makeMap({{"WIDE", ""}});
    ASSERT_EQ(getRegs(0, wide), ORVNEBU_OK);
    EXPECT_EQ(mapOf(wide)["WIDE"], "ABCDEF");
    const auto t = transfers();
    ASSERT_EQ(t.size(), 2u);
    EXPECT_EQ(t[0].address, 0x11u);  // order 1
    EXPECT_EQ(t[1].address, 0x10u);  // order 0
}

TEST_F(SingleRegisterHandlerTest, AnyNonEmptyValueOfTheVariableSelectsIt) {
    // The value is not looked at: "0" selects the single-register handler too.
    nebutest::setEnv("ZAN_ORV_SWITCH_REG_HANDLER", "0");
    ASSERT_EQ(initialize(1), ORVNEBU_OK);
    EXPECT_EQ(OrvNebu_SingleRegisterHandler::getHandlerCount(), 2u);
    EXPECT_EQ(OrvNebu_DefaultRegisterHandler::getHandlerCount(), 0u);
    clearTrace();
    ORV_HASHMAP_HANDLE map = makeMap({{"A", ""}, {"B", ""}});
    ASSERT_EQ(getRegs(1, map), ORVNEBU_OK);
    ASSERT_EQ(transfers().size(), 2u);
    EXPECT_FALSE(transfers()[0].burst);
}

TEST_F(SingleRegisterHandlerTest, EachHandlerClassKeepsItsOwnCache) {
    const std::string file = data_.path("regs.csv");
    EXPECT_NE(OrvNebu_SingleRegisterHandler::findRegisterHandler(HANDLE, file), nullptr);
    EXPECT_EQ(OrvNebu_DefaultRegisterHandler::findRegisterHandler(HANDLE, file), nullptr);
    EXPECT_EQ(OrvNebu_SingleRegisterHandler::getHandlerCount(), 1u);

    // An empty value counts as unset: the next slave takes the default handler.
    nebutest::setEnv("ZAN_ORV_SWITCH_REG_HANDLER", "");
    ASSERT_EQ(initialize(1), ORVNEBU_OK);
    EXPECT_NE(OrvNebu_DefaultRegisterHandler::findRegisterHandler(HANDLE, file), nullptr);
    EXPECT_NE(OrvNebu_DefaultRegisterHandler::findRegisterHandler(HANDLE, file),
              OrvNebu_SingleRegisterHandler::findRegisterHandler(HANDLE, file));
    EXPECT_EQ(OrvNebu_DefaultRegisterHandler::getHandlerCount(), 1u);
    EXPECT_EQ(OrvNebu_SingleRegisterHandler::getHandlerCount(), 1u);
    clearTrace();
    ORV_HASHMAP_HANDLE map = makeMap({{"A", ""}, {"B", ""}});
    ASSERT_EQ(getRegs(1, map), ORVNEBU_OK);
    ASSERT_EQ(transfers().size(), 1u);
    EXPECT_TRUE(transfers()[0].burst);

    // Each slave gives its reference back to the class that supplied it, whatever the
    // variable says by then.
    nebutest::setEnv("ZAN_ORV_SWITCH_REG_HANDLER", "1");
    ASSERT_EQ(terminate(1), ORVNEBU_OK);
    EXPECT_EQ(OrvNebu_DefaultRegisterHandler::getHandlerCount(), 0u);
    EXPECT_EQ(OrvNebu_DefaultRegisterHandler::findRegisterHandler(HANDLE, file), nullptr);
    EXPECT_NE(OrvNebu_SingleRegisterHandler::findRegisterHandler(HANDLE, file), nullptr);
    ASSERT_EQ(terminate(0), ORVNEBU_OK);
    EXPECT_EQ(OrvNebu_SingleRegisterHandler::getHandlerCount(), 0u);
    EXPECT_EQ(OrvNebu_SingleRegisterHandler::findRegisterHandler(HANDLE, file), nullptr);
}

}  // namespace
