// Named register reads and writes through the exported calls, with either handler: bit
// mapping and merging on the board, name and value checks; the block handler's bursts.
#include <algorithm>

#include "support/RegsFixture.h"

namespace {

class RegisterValuesTest : public RegsFixture {
protected:
    // The fixture's registers plus PAIR (two slices of equal order) and HUGE (five words, wider
    // than 64 bits); slave 0 takes the block handler, slave 1 the single-register one.
    void SetUp() override {
        RegsFixture::SetUp();
        std::string file = std::string(REGS) + "PAIR,61,0,0,3,,rw,,y\nPAIR,62,0,0,3,,rw,,y\n";
        for (int i = 0; i < 5; ++i)
            file += "HUGE,5" + std::to_string(i) + "," + std::to_string(i) + ",0,15,,rw,,y\n";
        data_.write("regs.csv", file);
        ASSERT_EQ(initialize(0), ORVNEBU_OK);
        nebutest::setEnv("ZAN_ORV_SWITCH_REG_HANDLER", "1");
        ASSERT_EQ(initialize(1), ORVNEBU_OK);
        watchBus();
    }
    std::string get(uint32_t slave, const std::string& name) {
        ORV_HASHMAP_HANDLE map = makeMap({{name, "old"}});
        EXPECT_EQ(getRegs(slave, map), ORVNEBU_OK) << name;
        EXPECT_EQ(mapOf(map).size(), 1u);
        return mapOf(map)[name];
    }
};

TEST_F(RegisterValuesTest, BothHandlersMapAndMergeTheSameBits) {
    struct Row {
        const char* name;
        std::vector<std::pair<uint32_t, uint16_t>> before;  // words poked first
        const char* read;                                   // what they read as
        const char* set;
        std::vector<std::pair<uint32_t, uint16_t>> after;  // words after the set
    };
    const Row rows[] = {
        // Bits 8 to 15 of word 0x11 belong to no slice and stay.
        {"WIDE",
         {{0x10, 0x1111}, {0x11, 0xFF00}},
         "001111",
         "ABCDEF",
         {{0x10, 0xCDEF}, {0x11, 0xFFAB}}},
        // Bit-reversed: bit 0 is the first digit.
        {"REV", {{0x20, 0xAB01}}, "80", "03", {{0x20, 0xABC0}}},
        // Slices of one word join highest order first; bits 4 to 7 stay.
        {"TRIPLE", {{0x30, 0x5FF6}}, "5F6", "ABC", {{0x30, 0xABFC}}},
        {"A", {{0x02, 0x0102}}, "0102", "1234", {{0x02, 0x1234}}},
        {"B", {{0x08, 0xF00F}}, "00", "AB", {{0x08, 0xFABF}}},
        // Equal order: the later line is the higher slice.
        {"PAIR", {{0x61, 0x1}, {0x62, 0x2}}, "21", "5A", {{0x61, 0xA}, {0x62, 0x5}}},
        {"HUGE",
         {{0x50, 0x5555}, {0x54, 0x1111}},
         "11110000000000005555",
         "11112222333344445555",
         {{0x50, 0x5555}, {0x51, 0x4444}, {0x54, 0x1111}}},
    };
    for (uint32_t slave : {0u, 1u}) {
        for (const Row& row : rows) {
            SCOPED_TRACE(std::string(row.name) + " slave " + std::to_string(slave));
            for (const auto& w : row.before) poke(slave, w.first, w.second);
            EXPECT_EQ(get(slave, row.name), row.read);
            ORV_HASHMAP_HANDLE map = makeMap({{row.name, row.set}});
            ASSERT_EQ(setRegs(slave, map), ORVNEBU_OK);
            for (const auto& w : row.after) EXPECT_EQ(peek(slave, w.first), w.second) << w.first;
            EXPECT_EQ(get(slave, row.name), row.set);
        }
    }
    // A read of every register: the same map from either handler.
    ORV_HASHMAP_HANDLE block = makeMap(), single = makeMap();
    ASSERT_EQ(getRegs(0, block), ORVNEBU_OK);
    ASSERT_EQ(getRegs(1, single), ORVNEBU_OK);
    EXPECT_EQ(mapOf(block).size(), 8u);
    EXPECT_EQ(mapOf(single), mapOf(block));
    EXPECT_NO_MESSAGES();
}

TEST_F(RegisterValuesTest, BadNamesAndValuesAreRefusedBeforeAnyBusAccess) {
    struct Row {
        std::pair<std::string, std::string> bad;
        bool read;  // refused on a read too (a name)
        std::string message;
    };
    const Row rows[] = {{{"nope", "1"}, true, "Invalid Register Name: nope\n"},
                        {{"wide", "1"}, true, "Invalid Register Name: wide\n"},
                        {{"", "1"}, true, "Invalid Register Name: \n"},
                        {{"B", "XYZ"}, false, "Invalid hexadecimal number \"XYZ\"."}};
    for (uint32_t slave : {0u, 1u}) {
        poke(slave, 2, 0x5555);
        for (const Row& row : rows) {
            SCOPED_TRACE(row.bad.first + " slave " + std::to_string(slave));
            ORV_HASHMAP_HANDLE map = makeMap({{"A", "12"}, row.bad});
            for (bool read : {true, false}) {
                if (read && !row.read) continue;
                clearMessages();
                EXPECT_EQ(read ? getRegs(slave, map) : setRegs(slave, map), ORVNEBU_FAILED);
                const auto m = messages();
                ASSERT_GE(m.size(), 1u);
                EXPECT_EQ(m[0].severity, 256u);
                EXPECT_EQ(m[0].text, row.message);
                EXPECT_EQ(m.size(), row.read ? 2u : 1u);  // a bad name aborts the command
                EXPECT_EQ(mapOf(map)["A"], "12");
                EXPECT_TRUE(trace().empty());
            }
        }
        EXPECT_EQ(peek(slave, 2), 0x5555);
        ORV_HASHMAP_HANDLE none = makeMap();
        EXPECT_EQ(setRegs(slave, none), ORVNEBU_OK);
        EXPECT_TRUE(trace().empty());
    }
}

class DefaultRegisterHandlerTest : public RegsFixture {
protected:
    void SetUp() override {
        RegsFixture::SetUp();
        ASSERT_EQ(initialize(0), ORVNEBU_OK);
        watchBus();
    }
};

TEST_F(DefaultRegisterHandlerTest, AWriteMovesTheWholeSpanOnceEachWay) {
    struct Row {
        std::pair<std::string, std::string> a, b;
        uint32_t address, count;
    };
    const Row rows[] = {{{"A", "1234"}, {"B", "AB"}, 2, 7},
                        {{"WIDE", "ABCDEF"}, {"WIDE", "ABCDEF"}, 0x10, 2},
                        {{"TRIPLE", "ABC"}, {"TRIPLE", "ABC"}, 0x30, 1}};
    for (const Row& row : rows) {
        SCOPED_TRACE(row.a.first);
        for (uint32_t a = 2; a <= 8; ++a) poke(0, a, static_cast<uint16_t>(0x1000 + a));
        clearTrace();
        stats();
        ORV_HASHMAP_HANDLE map = makeMap({row.a, row.b});
        ASSERT_EQ(setRegs(0, map), ORVNEBU_OK);
        const auto t = transfers();
        ASSERT_EQ(t.size(), 2u);
        EXPECT_FALSE(t[0].write);
        EXPECT_TRUE(t[1].write);
        for (const auto& x : t) {
            EXPECT_TRUE(x.burst && x.increment);
            EXPECT_EQ(x.address, row.address);
            EXPECT_EQ(x.count, row.count);
        }
        EXPECT_EQ(t[1].dataBits, row.count * 16u + 2u);
        // One read round trip and one flush, whatever the number of registers.
        OrvSim::JtagStats s = stats();
        EXPECT_EQ(s.roundTrips, 2u);
        EXPECT_EQ(s.flushes, 1u);
    }
    for (uint32_t a = 3; a <= 7; ++a) EXPECT_EQ(peek(0, a), 0x1000 + a) << "word " << a;
}

TEST_F(DefaultRegisterHandlerTest, ReadCoversOnlyTheNamedRegistersOrTheWholeFile) {
    poke(0, 0x40, 0x4242);
    ORV_HASHMAP_HANDLE one = makeMap({{"FAR", "old"}});
    ASSERT_EQ(getRegs(0, one), ORVNEBU_OK);
    EXPECT_EQ(mapOf(one)["FAR"], "4242");
    auto t = transfers();
    ASSERT_EQ(t.size(), 1u);
    EXPECT_EQ(t[0].address, 0x40u);
    EXPECT_EQ(t[0].count, 1u);
    EXPECT_EQ(stats().roundTrips, 1u);

    clearTrace();
    ORV_HASHMAP_HANDLE all = makeMap();
    ASSERT_EQ(getRegs(0, all), ORVNEBU_OK);
    std::vector<std::string> names;
    for (const auto& e : mapOf(all)) names.push_back(e.first);
    std::sort(names.begin(), names.end());
    EXPECT_EQ(names, (std::vector<std::string>{"A", "B", "FAR", "REV", "TRIPLE", "WIDE"}));
    EXPECT_EQ(mapOf(all)["WIDE"], "000000");
    t = transfers();
    ASSERT_EQ(t.size(), 1u);
    EXPECT_EQ(t[0].address, 0x02u);
    EXPECT_EQ(t[0].count, 0x40u - 0x02u + 1u);

    // A register file without registers: an empty read returns nothing and moves no word.
    data_.write("regs.csv", "header only\n");
    ASSERT_EQ(terminate(0), ORVNEBU_OK);  // releases the cached handler of the old file
    ASSERT_EQ(initialize(0), ORVNEBU_OK);
    clearTrace();
    ORV_HASHMAP_HANDLE empty = makeMap();
    EXPECT_EQ(getRegs(0, empty), ORVNEBU_OK);
    EXPECT_TRUE(mapOf(empty).empty());
    EXPECT_EQ(setRegs(0, empty), ORVNEBU_OK);
    EXPECT_TRUE(trace().empty());
    EXPECT_NO_MESSAGES();
}

}  // namespace
