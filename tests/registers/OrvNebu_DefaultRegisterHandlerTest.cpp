// Named register reads and writes through the exported calls, with either handler: bit
// mapping and merging on the board, name and value checks; the block handler's bursts.
#include <algorithm>

#include "support/RegsFixture.h"

namespace {

using Words = std::vector<std::pair<uint32_t, uint16_t>>;

class RegisterValuesTest : public RegsFixture {
protected:
    // The fixture's registers plus PAIR (two slices of equal order) and HUGE (five words, wider
    // than 64 bits); slave 0 takes the block handler, slave 1 the single-register one.
    void SetUp() override {
        RegsFixture::SetUp();
        std::string file = std::string(REGS) + "PAIR,61,0,0,3,,rw,,y\nPAIR,62,0,0,3,,rw,,y\n";
        for (char i = '0'; i < '5'; ++i)
            file += "HUGE,5" + std::string(1, i) + "," + i + ",0,15,,rw,,y\n";
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
    const struct {
        const char *name, *read, *set;  // read: what the words poked first read as
        Words before, after;            // after: words after the set
    } rows[] = {
        // Bits 8 to 15 of word 0x11 belong to no slice and stay.
        {"WIDE",
         "001111",
         "ABCDEF",
         {{0x10, 0x1111}, {0x11, 0xFF00}},
         {{0x10, 0xCDEF}, {0x11, 0xFFAB}}},
        // Bit-reversed: bit 0 is the first digit.
        {"REV", "80", "03", {{0x20, 0xAB01}}, {{0x20, 0xABC0}}},
        // Slices of one word join highest order first; bits 4 to 7 stay.
        {"TRIPLE", "5F6", "ABC", {{0x30, 0x5FF6}}, {{0x30, 0xABFC}}},
        {"A", "0102", "1234", {{0x02, 0x0102}}, {{0x02, 0x1234}}},
        {"B", "00", "AB", {{0x08, 0xF00F}}, {{0x08, 0xFABF}}},
        // Equal order: the later line is the higher slice.
        {"PAIR", "21", "5A", {{0x61, 0x1}, {0x62, 0x2}}, {{0x61, 0xA}, {0x62, 0x5}}},
        {"HUGE",
         "11110000000000005555",
         "11112222333344445555",
         {{0x50, 0x5555}, {0x54, 0x1111}},
         {{0x50, 0x5555}, {0x51, 0x4444}, {0x54, 0x1111}}},
    };
    for (uint32_t slave : {0u, 1u}) {
        for (const auto& row : rows) {
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
    const struct {
        std::pair<std::string, std::string> bad;
        std::string message;  // a bad name is refused on a read too, and aborts the command
    } rows[] = {{{"nope", "1"}, "Invalid Register Name: nope\n"},
                {{"wide", "1"}, "Invalid Register Name: wide\n"},
                {{"", "1"}, "Invalid Register Name: \n"},
                {{"B", "XYZ"}, "Invalid hexadecimal number \"XYZ\"."}};
    for (uint32_t slave : {0u, 1u}) {
        poke(slave, 2, 0x5555);
        for (const auto& row : rows) {
            const bool name = row.bad.first != "B";
            ORV_HASHMAP_HANDLE map = makeMap({{"A", "12"}, row.bad});
            for (bool read : {true, false}) {
                if (read && !name) continue;
                SCOPED_TRACE(row.bad.first + " slave " + std::to_string(slave) +
                             (read ? " read" : ""));
                clearMessages();
                EXPECT_EQ(read ? getRegs(slave, map) : setRegs(slave, map), ORVNEBU_FAILED);
                const auto m = messages();
                ASSERT_EQ(m.size(), name ? 2u : 1u);
                EXPECT_EQ(m[0].severity, 256u);
                EXPECT_EQ(m[0].text, row.message);
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

TEST_F(RegisterValuesTest, TheBlockHandlerMovesTheWholeSpanOnceEachWay) {
    const struct {
        std::pair<std::string, std::string> a, b;
        uint32_t address, count;
    } rows[] = {{{"A", "1234"}, {"B", "AB"}, 2, 7},
                {{"WIDE", "ABCDEF"}, {"WIDE", "ABCDEF"}, 0x10, 2},
                {{"TRIPLE", "ABC"}, {"TRIPLE", "ABC"}, 0x30, 1},
                {{"FAR", ""}, {"FAR", ""}, 0x40, 1}};  // a read of the one register named
    for (const auto& row : rows) {
        SCOPED_TRACE(row.a.first);
        const bool write = !row.a.second.empty();
        for (uint32_t a = 2; a <= 8; ++a) poke(0, a, static_cast<uint16_t>(0x1000 + a));
        clearTrace();
        stats();
        ORV_HASHMAP_HANDLE map = makeMap({row.a, row.b});
        ASSERT_EQ(write ? setRegs(0, map) : getRegs(0, map), ORVNEBU_OK);
        const auto t = transfers();
        ASSERT_EQ(t.size(), write ? 2u : 1u);
        for (size_t i = 0; i < t.size(); ++i) {
            EXPECT_EQ(t[i].write, i == 1);
            EXPECT_TRUE(t[i].burst && t[i].increment);
            EXPECT_EQ(t[i].address, row.address);
            EXPECT_EQ(t[i].count, row.count);
        }
        EXPECT_EQ(t.back().dataBits, row.count * 16u + (write ? 2u : 0u));
        // One read round trip and one flush, whatever the number of registers.
        OrvSim::JtagStats s = stats();
        EXPECT_EQ(s.roundTrips, write ? 2u : 1u);
        EXPECT_EQ(s.flushes, write ? 1u : 0u);
    }
    for (uint32_t a = 3; a <= 7; ++a) EXPECT_EQ(peek(0, a), 0x1000 + a) << "word " << a;

    // Reading all: one burst over the whole file.
    poke(0, 0x40, 0x4242);
    clearTrace();
    ORV_HASHMAP_HANDLE all = makeMap();
    ASSERT_EQ(getRegs(0, all), ORVNEBU_OK);
    EXPECT_EQ(mapOf(all)["FAR"], "4242");
    EXPECT_EQ(mapOf(all)["HUGE"], "00000000000000000000");
    const auto t = transfers();
    ASSERT_EQ(t.size(), 1u);
    EXPECT_EQ(t[0].address, 0x02u);
    EXPECT_EQ(t[0].count, 0x62u - 0x02u + 1u);
}

TEST_F(RegsFixture, AFileWithoutRegistersReadsAndWritesNothing) {
    data_.write("regs.csv", "header only\n");
    ASSERT_EQ(initialize(0), ORVNEBU_OK);
    watchBus();
    ORV_HASHMAP_HANDLE empty = makeMap();
    EXPECT_EQ(getRegs(0, empty), ORVNEBU_OK);
    EXPECT_TRUE(mapOf(empty).empty());
    EXPECT_EQ(setRegs(0, empty), ORVNEBU_OK);
    EXPECT_TRUE(trace().empty());
    EXPECT_NO_MESSAGES();
}

}  // namespace
