// Named register reads and writes through the exported calls, checked on the board and on
// the wire: block bursts, bit mapping, merging, name checks.
#include <algorithm>

#include "support/RegsFixture.h"

namespace {

class DefaultRegisterHandlerTest : public RegsFixture {
protected:
    void SetUp() override {
        RegsFixture::SetUp();
        ASSERT_EQ(initialize(0), ORVNEBU_OK);
        watchBus();
    }
};

TEST_F(DefaultRegisterHandlerTest, RegisterOverTwoWordsWritesAndReadsBack) {
    poke(0, 0x10, 0x1111);
    poke(0, 0x11, 0xFF00);
    ORV_HASHMAP_HANDLE map = makeMap({{"WIDE", "ABCDEF"}});
    ASSERT_EQ(setRegs(0, map), ORVNEBU_OK);
    EXPECT_EQ(peek(0, 0x10), 0xCDEF);
    EXPECT_EQ(peek(0, 0x11), 0xFFAB);  // bits 8 to 15 belong to no slice and stay

    auto t = transfers();
    ASSERT_EQ(t.size(), 2u);
    EXPECT_TRUE(t[0].burst && !t[0].write && t[0].increment);
    EXPECT_EQ(t[0].address, 0x10u);
    EXPECT_EQ(t[0].count, 2u);
    EXPECT_TRUE(t[1].burst && t[1].write);
    EXPECT_EQ(t[1].address, 0x10u);
    EXPECT_EQ(t[1].count, 2u);
    EXPECT_EQ(t[1].dataBits, 2u * 16u + 2u);

    ORV_HASHMAP_HANDLE back = makeMap({{"WIDE", ""}});
    ASSERT_EQ(getRegs(0, back), ORVNEBU_OK);
    EXPECT_EQ(mapOf(back)["WIDE"], "ABCDEF");
    EXPECT_NO_MESSAGES();
}

TEST_F(DefaultRegisterHandlerTest, BitReversedSliceMapsBitZeroToTheFirstDigit) {
    poke(0, 0x20, 0xAB01);
    ORV_HASHMAP_HANDLE map = makeMap({{"REV", ""}});
    ASSERT_EQ(getRegs(0, map), ORVNEBU_OK);
    EXPECT_EQ(mapOf(map)["REV"], "80");  // digits 1 then seven 0

    ORV_HASHMAP_HANDLE set = makeMap({{"REV", "03"}});
    ASSERT_EQ(setRegs(0, set), ORVNEBU_OK);
    EXPECT_EQ(peek(0, 0x20), 0xABC0);  // digits ...11 land in bits 6 and 7
}

TEST_F(DefaultRegisterHandlerTest, SlicesOfOneWordJoinHighestOrderFirst) {
    poke(0, 0x30, 0x00F0);
    ORV_HASHMAP_HANDLE set = makeMap({{"TRIPLE", "ABC"}});
    ASSERT_EQ(setRegs(0, set), ORVNEBU_OK);
    EXPECT_EQ(peek(0, 0x30), 0xABFC);
    poke(0, 0x30, 0x5F06);
    ORV_HASHMAP_HANDLE get = makeMap({{"TRIPLE", ""}});
    ASSERT_EQ(getRegs(0, get), ORVNEBU_OK);
    EXPECT_EQ(mapOf(get)["TRIPLE"], "5F6");
    auto t = transfers();
    ASSERT_EQ(t.size(), 3u);  // read + write, then one read
    for (const auto& x : t) EXPECT_EQ(x.count, 1u);
}

TEST_F(DefaultRegisterHandlerTest, WriteOfTwoDistantRegistersMovesTheWholeSpanOnce) {
    for (uint32_t a = 2; a <= 8; ++a) poke(0, a, static_cast<uint16_t>(0x1000 + a));
    poke(0, 8, 0xF00F);
    ORV_HASHMAP_HANDLE map = makeMap({{"A", "1234"}, {"B", "AB"}});
    ASSERT_EQ(setRegs(0, map), ORVNEBU_OK);

    EXPECT_EQ(peek(0, 2), 0x1234);
    for (uint32_t a = 3; a <= 7; ++a) EXPECT_EQ(peek(0, a), 0x1000 + a) << "word " << a;
    EXPECT_EQ(peek(0, 8), 0xFABF);

    auto t = transfers();
    ASSERT_EQ(t.size(), 2u);
    EXPECT_FALSE(t[0].write);
    EXPECT_TRUE(t[1].write);
    for (const auto& x : t) {
        EXPECT_TRUE(x.burst);
        EXPECT_EQ(x.address, 2u);
        EXPECT_EQ(x.count, 7u);
    }
    // One read round trip and one flush, whatever the number of registers.
    OrvSim::JtagStats s = stats();
    EXPECT_EQ(s.roundTrips, 2u);
    EXPECT_EQ(s.flushes, 1u);
}

TEST_F(DefaultRegisterHandlerTest, ReadCoversOnlyTheNamedRegistersOrTheWholeFile) {
    poke(0, 0x40, 0x4242);
    ORV_HASHMAP_HANDLE one = makeMap({{"FAR", "old"}});
    ASSERT_EQ(getRegs(0, one), ORVNEBU_OK);
    EXPECT_EQ(mapOf(one).size(), 1u);
    EXPECT_EQ(mapOf(one)["FAR"], "4242");
    auto t = transfers();
    ASSERT_EQ(t.size(), 1u);
    EXPECT_EQ(t[0].address, 0x40u);
    EXPECT_EQ(t[0].count, 1u);
    EXPECT_EQ(stats().roundTrips, 1u);

    clearTrace();
    poke(0, 0x02, 0x0102);
    ORV_HASHMAP_HANDLE all = makeMap();
    ASSERT_EQ(getRegs(0, all), ORVNEBU_OK);
    std::vector<std::string> names;
    for (const auto& e : mapOf(all)) names.push_back(e.first);
    std::sort(names.begin(), names.end());
    EXPECT_EQ(names, (std::vector<std::string>{"A", "B", "FAR", "REV", "TRIPLE", "WIDE"}));
    EXPECT_EQ(mapOf(all)["A"], "0102");
    EXPECT_EQ(mapOf(all)["WIDE"], "000000");
    t = transfers();
    ASSERT_EQ(t.size(), 1u);
    EXPECT_EQ(t[0].address, 0x02u);
    EXPECT_EQ(t[0].count, 0x40u - 0x02u + 1u);
}

TEST_F(DefaultRegisterHandlerTest, InvalidNamesAreRefusedBeforeAnyBusAccess) {
    for (const char* bad : {"nope", "wide", ""}) {
        clearMessages();
        clearTrace();
        ORV_HASHMAP_HANDLE map = makeMap({{"A", "keep"}, {bad, "also"}});
        EXPECT_EQ(getRegs(0, map), ORVNEBU_FAILED) << bad;
        auto m = messages();
        ASSERT_EQ(m.size(), 2u) << bad;
        EXPECT_EQ(m[0].severity, 256u);
        EXPECT_EQ(m[0].text, std::string("Invalid Register Name: ") + bad + "\n");
        EXPECT_EQ(m[1].severity, 32768u);
        EXPECT_EQ(m[1].text, "Orv abort command");
        EXPECT_EQ(mapOf(map)["A"], "keep");
        EXPECT_EQ(mapOf(map)[bad], "also");
        EXPECT_TRUE(trace().empty()) << bad;

        clearTrace();
        EXPECT_EQ(setRegs(0, map), ORVNEBU_FAILED);
        EXPECT_TRUE(trace().empty());
    }
}

TEST_F(DefaultRegisterHandlerTest, ValueThatIsNoHexNumberWritesNothing) {
    poke(0, 2, 0x5555);
    ORV_HASHMAP_HANDLE map = makeMap({{"A", "12"}, {"B", "XYZ"}});
    EXPECT_EQ(setRegs(0, map), ORVNEBU_FAILED);
    EXPECT_EQ(messages().size(), 1u);
    EXPECT_EQ(lastMessage().severity, 256u);
    EXPECT_TRUE(trace().empty());
    EXPECT_EQ(peek(0, 2), 0x5555);
}

TEST_F(DefaultRegisterHandlerTest, EmptyWriteAndEmptyFileMoveNoWords) {
    ORV_HASHMAP_HANDLE none = makeMap();
    EXPECT_EQ(setRegs(0, none), ORVNEBU_OK);
    EXPECT_TRUE(trace().empty());

    // A slave whose register file has no registers: an empty read returns nothing.
    data_.write("regs.csv", "header only\n");
    ASSERT_EQ(terminate(0), ORVNEBU_OK);  // releases the cached handler of the old file
    ASSERT_EQ(initialize(0), ORVNEBU_OK);
    clearTrace();
    ORV_HASHMAP_HANDLE all = makeMap();
    EXPECT_EQ(getRegs(0, all), ORVNEBU_OK);
    EXPECT_TRUE(mapOf(all).empty());
    EXPECT_EQ(setRegs(0, all), ORVNEBU_OK);
    EXPECT_TRUE(trace().empty());
    EXPECT_NO_MESSAGES();
}

TEST_F(DefaultRegisterHandlerTest, SlicesOfEqualOrderKeepFileOrder) {
    data_.write("regs.csv",
                "h\n"
                "PAIR,1,0,0,3,first,rw,,y\n"
                "PAIR,2,0,0,3,second,rw,,y\n");
    ASSERT_EQ(terminate(0), ORVNEBU_OK);
    ASSERT_EQ(initialize(0), ORVNEBU_OK);
    poke(0, 1, 0x1);
    poke(0, 2, 0x2);
    ORV_HASHMAP_HANDLE map = makeMap({{"PAIR", ""}});
    ASSERT_EQ(getRegs(0, map), ORVNEBU_OK);
    // The later line counts as the higher slice.
    EXPECT_EQ(mapOf(map)["PAIR"], "21");
}

TEST_F(DefaultRegisterHandlerTest, RegisterOfManyWordsWiderThan64Bits) {
    std::string file = "h\n";
    for (int i = 0; i < 5; ++i) {
        file += "HUGE,5" + std::to_string(i) + "," + std::to_string(i) + ",0,15,,rw,,y\n";
    }
    data_.write("regs.csv", file);
    ASSERT_EQ(terminate(0), ORVNEBU_OK);
    ASSERT_EQ(initialize(0), ORVNEBU_OK);
    ORV_HASHMAP_HANDLE set = makeMap({{"HUGE", "11112222333344445555"}});
    ASSERT_EQ(setRegs(0, set), ORVNEBU_OK);
    EXPECT_EQ(peek(0, 0x50), 0x5555);
    EXPECT_EQ(peek(0, 0x54), 0x1111);
    ORV_HASHMAP_HANDLE get = makeMap({{"HUGE", ""}});
    ASSERT_EQ(getRegs(0, get), ORVNEBU_OK);
    EXPECT_EQ(mapOf(get)["HUGE"], "11112222333344445555");
}

}  // namespace
