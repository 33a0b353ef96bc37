// Named register reads and writes through the exported calls, with either handler: bit
// mapping and merging on the board, name and value checks; the printed image of a register
// file and the reference-counted handler caches.
#include <sstream>

#include "registers/OrvNebu_DefaultRegisterHandler.h"
#include "registers/OrvNebu_SingleRegisterHandler.h"
#include "support/RegsFixture.h"

using H = OrvRT::OrvNebu_DefaultRegisterHandler;

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
        {"nope", "Invalid Register Name: nope\n"}, {"B", "Invalid hexadecimal number \"XYZ\"."}};
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

// The single-register handler chosen by ZAN_ORV_SWITCH_REG_HANDLER keeps a cache of its own.
TEST_F(RegsFixture, TheVariableChoosesAndEachClassKeepsItsOwnCache) {
    using D = OrvRT::OrvNebu_DefaultRegisterHandler;
    using S = OrvRT::OrvNebu_SingleRegisterHandler;
    nebutest::setEnv("ZAN_ORV_SWITCH_REG_HANDLER", "1");
    ASSERT_EQ(initialize(0), ORVNEBU_OK);
    watchBus();
    const std::string file = data_.path("regs.csv");
    EXPECT_NE(S::findRegisterHandler(HANDLE, file), nullptr);
    EXPECT_EQ(D::findRegisterHandler(HANDLE, file), nullptr);
    // The value is not looked at: "0" selects the single-register handler too.
    nebutest::setEnv("ZAN_ORV_SWITCH_REG_HANDLER", "0");
    ASSERT_EQ(initialize(2), ORVNEBU_OK);
    EXPECT_EQ(S::getHandlerCount(), 2u);
    EXPECT_EQ(D::getHandlerCount(), 0u);

    // An empty value counts as unset: the next slave takes the default handler.
    nebutest::setEnv("ZAN_ORV_SWITCH_REG_HANDLER", "");
    ASSERT_EQ(initialize(1), ORVNEBU_OK);
    EXPECT_NE(D::findRegisterHandler(HANDLE, file), S::findRegisterHandler(HANDLE, file));
    EXPECT_EQ(D::getHandlerCount(), 1u);

    // Each slave gives its reference back to the class that supplied it, whatever the
    // variable says by then.
    nebutest::setEnv("ZAN_ORV_SWITCH_REG_HANDLER", "1");
    ASSERT_EQ(terminate(1), ORVNEBU_OK);
    EXPECT_EQ(D::getHandlerCount(), 0u);
    EXPECT_EQ(D::findRegisterHandler(HANDLE, file), nullptr);
    EXPECT_NE(S::findRegisterHandler(HANDLE, file), nullptr);
    ASSERT_EQ(terminate(0), ORVNEBU_OK);
    ASSERT_EQ(terminate(2), ORVNEBU_OK);
    EXPECT_EQ(S::getHandlerCount(), 0u);
    EXPECT_EQ(S::findRegisterHandler(HANDLE, file), nullptr);
}

TEST_F(RegsFixture, PrintedImageNormalisesTheColumns) {
    const std::pair<const char*, const char*> rows[] = {
        {"name,addr,order,start,end,t6,acc,t8,inc\n"
         "A,10,0,0,7,x,rw,y,y,extra,more\nB,0b,1,3,0,,wr,,\nC,a0,2,0,0,,read/write,,N\n"
         "D,5,0,0,0,,,,yes\nE,0000f,0,1,1,,r,,y\nF,9,0,0,0,,w,,y\n",
         "name,addr,order,start,end,t6,acc,t8,inc\n"
         "A,10,0,0,7,x,rw,y,y,more\nB,0b,1,3,0,,rw,,y\nC,a0,2,0,0,,rw,,y\n"
         "D,5,0,0,0,,,,y\nE,0f,0,1,1,,r,,y\nF,9,0,0,0,,w,,y\n"},
        // Quotes are removed after the split; CR LF reads as LF; one column past the ninth kept.
        {"h\r\n\"Q\",\"5\",\"0\",0,3,\"txt\",\"rw\",,y,t\r\n", "h\nQ,5,0,0,3,txt,rw,,y,t\n"},
    };
    for (const auto& row : rows) {
        data_.write("print.csv", row.first);
        std::ostringstream out;
        H::readAndPrint(HANDLE, data_.path("print.csv"), out);
        EXPECT_EQ(out.str(), row.second);
    }
    EXPECT_NO_MESSAGES();
}

TEST_F(RegsFixture, OneHandlerPerFileSharedUntilTheLastSlaveGoes) {
    const std::string file = data_.path("regs.csv");
    // Printing counts nothing.
    std::ostringstream out;
    H::readAndPrint(HANDLE, file, out);
    EXPECT_EQ(out.str(), REGS);
    EXPECT_EQ(H::getHandlerCount(), 0u);
    EXPECT_EQ(H::findRegisterHandler(HANDLE, file), nullptr);
    ASSERT_EQ(initialize(0), ORVNEBU_OK);
    OrvRT::OrvNebu_RegisterHandler* shared = H::findRegisterHandler(HANDLE, file);
    ASSERT_NE(shared, nullptr);
    EXPECT_EQ(shared->getMinAddress(), 2u);
    ASSERT_EQ(initialize(1), ORVNEBU_OK);
    ASSERT_EQ(initialize(2), ORVNEBU_OK);  // another slave type naming the same file
    EXPECT_EQ(H::findRegisterHandler(HANDLE, file), shared);
    EXPECT_EQ(H::getHandlerCount(), 3u);

    // A file that cannot be opened: reported, and only its own reference given back.
    clearMessages();
    EXPECT_EQ(initialize(6), ORVNEBU_FAILED);
    EXPECT_MESSAGE(256, "Unable to open OrvNebu register file: " + data_.path("missing.csv"));
    EXPECT_LAST_MESSAGE(32768, "Orv abort command");
    EXPECT_EQ(H::getHandlerCount(), 3u);
    EXPECT_THROW(H::readAndPrint(HANDLE, data_.path("missing.csv"), out), std::logic_error);

    // A changed file is not read while any slave of the class still holds a handler.
    data_.write("regs.csv", "h\nNEW,2,0,0,15,,rw,,y\n");
    ASSERT_EQ(terminate(0), ORVNEBU_OK);
    ASSERT_EQ(terminate(1), ORVNEBU_OK);
    EXPECT_EQ(H::findRegisterHandler(HANDLE, file), shared);
    ASSERT_EQ(initialize(0), ORVNEBU_OK);
    poke(2, 2, 0x2222);
    ORV_HASHMAP_HANDLE old = makeMap({{"A", ""}});
    ASSERT_EQ(getRegs(2, old), ORVNEBU_OK);
    EXPECT_EQ(mapOf(old)["A"], "2222");

    ASSERT_EQ(terminate(2), ORVNEBU_OK);
    ASSERT_EQ(terminate(0), ORVNEBU_OK);
    EXPECT_EQ(H::getHandlerCount(), 0u);
    EXPECT_EQ(H::findRegisterHandler(HANDLE, file), nullptr);

    ASSERT_EQ(initialize(0), ORVNEBU_OK);
    ASSERT_EQ(initialize(1), ORVNEBU_OK);
    poke(0, 2, 0x0BAD);
    ORV_HASHMAP_HANDLE fresh = makeMap({{"NEW", ""}});
    ASSERT_EQ(getRegs(0, fresh), ORVNEBU_OK);
    EXPECT_EQ(mapOf(fresh)["NEW"], "0BAD");
    // Ending the session removes its slaves, which give their references back.
    OrvSim::endSession(HANDLE);
    EXPECT_EQ(H::getHandlerCount(), 0u);
    EXPECT_EQ(H::findRegisterHandler(HANDLE, file), nullptr);
}

}  // namespace
