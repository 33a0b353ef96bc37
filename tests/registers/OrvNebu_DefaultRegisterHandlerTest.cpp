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
    // A bad name is refused on a read too, and aborts the command.
    const std::pair<std::string, std::string> rows[] = {
        {"nope", "Invalid Register Name: nope\n"},
        {"wide", "Invalid Register Name: wide\n"},
        {"", "Invalid Register Name: \n"},
        {"B", "Invalid hexadecimal number \"XYZ\"."}};
    for (uint32_t slave : {0u, 1u}) {
        poke(slave, 2, 0x5555);
        for (const auto& row : rows) {
            const bool name = row.first != "B";
            ORV_HASHMAP_HANDLE map = makeMap({{"A", "12"}, {row.first, "XYZ"}});
            for (bool read : {name, false}) {
                SCOPED_TRACE(row.first + " " + std::to_string(slave) + (read ? " read" : ""));
                clearMessages();
                EXPECT_EQ(read ? getRegs(slave, map) : setRegs(slave, map), ORVNEBU_FAILED);
                std::vector<std::string> got;
                for (const auto& m : messages())
                    got.push_back(std::to_string(m.severity) + " " + m.text);
                std::vector<std::string> want{"256 " + row.second};
                if (name) want.push_back("32768 Orv abort command");
                EXPECT_EQ(got, want);
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
