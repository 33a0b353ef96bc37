// The exported bus calls where the console cannot reach them: null pointers, a command channel
// the host refuses, a master replaced under a known bus, and bursts past the console's limits.
#include <gtest/gtest.h>

#include <functional>
#include <iterator>
#include <string>
#include <vector>

#include "bus/BusFixture.h"
#include "host/OrvCore.h"
#include "orvnebu/orvnebu.h"

namespace OrvNebuBusTest {
namespace {

const char* const BOARD = R"({ "devices": [ { "chains": {
    "1": { "cores": [ { "type": 14, "master": { "slaveCount": 2,
           "slaves": { "0": { "memory": { "0x10": "0xABCD" } }, "1": {} } } } ] } } } ] })";

constexpr uint32_t H = 1;
ORV_SLAVE_REF at(uint32_t chain) { return {0, chain, 0}; }

class BusCallsTest : public BusFixture {
protected:
    void SetUp() override {
        BusFixture::SetUp();
        loadBoard(BOARD);
    }
};

// On a known bus each check fails with its own message and sends nothing; on an unknown
// bus the bus is reported first (resetBus in the transcripts).
TEST_F(BusCallsTest, EachCheckFailsWithItsOwnMessageAfterTheBusLookup) {
    static ORV_HASHMAP_HANDLE nullMap = nullptr;
    static uint32_t w[4];
    const std::string pair = "argument checking failed:(buffer != 0) && (num";
    const struct {
        std::function<uint32_t(uint32_t userChain)> run;
        std::string message;
    } calls[] = {
        {[](uint32_t c) { return OrvNebu_getBusInfo(H, 0, c, nullptr); },
         "OrvNebu_getBusInfo() argument checking failed:busInfoHash != 0"},
        {[](uint32_t c) { return OrvNebu_getBusInfo(H, 0, c, &nullMap); },
         "OrvNebu_getBusInfo() argument checking failed:busInfoHash != 0"},
        {[](uint32_t c) { return OrvNebu_getSlaveHandles(H, 0, c, nullptr, 3); },
         "OrvNebu_getSlaveHandles() argument checking failed:(slaveHandles != 0) && (count != 0)"},
        {[](uint32_t c) { return OrvNebu_getBusErrorStatus(H, 0, c, nullptr, 2); },
         "OrvNebu_getBusErrorStatus() argument checking failed:(errorStatus != 0) && "
         "(errorStatusLen != 0)"},
        {[](uint32_t c) { return OrvNebu_testSlaveInterface(H, at(c), nullptr); },
         "OrvNebu_testSlaveInterface() argument checking failed:result != 0"},
        {[](uint32_t c) { return OrvNebu_singleSlaveRead(H, at(c), 0x10, nullptr, w); },
         "OrvNebu_singleSlaveRead() argument checking failed:buffer != 0"},
        {[](uint32_t c) { return OrvNebu_singleSlaveWriteAndInspect(H, at(c), 0, 1, nullptr, w); },
         "OrvNebu_singleSlaveWriteAndInspect() argument checking failed:rdBuf != 0"},
        {[](uint32_t c) { return OrvNebu_burstSlaveRead(H, at(c), 0, 1, nullptr, 2, nullptr); },
         "OrvNebu_burstSlaveRead() " + pair + "Read != 0)"},
        {[](uint32_t c) { return OrvNebu_burstSlaveRead(H, at(c), 0, 1, w, 0, nullptr); },
         "OrvNebu_burstSlaveRead() " + pair + "Read != 0)"},
        {[](uint32_t c) { return OrvNebu_burstSlaveWrite(H, at(c), 0, 1, nullptr, 2, nullptr); },
         "OrvNebu_burstSlaveWrite() " + pair + "Write != 0)"},
        {[](uint32_t c) { return OrvNebu_burstSlaveWrite(H, at(c), 0, 1, w, 0, nullptr); },
         "OrvNebu_burstSlaveWrite() " + pair + "Write != 0)"},
        // Calls without checks of their own.
        {[](uint32_t c) { return OrvNebu_clearBusErrorStatus(H, 0, c); }, ""},
        {[](uint32_t c) { return OrvNebu_resetSlave(H, at(c)); }, ""},
        {[](uint32_t c) { return OrvNebu_disableSlave(H, at(c)); }, ""},
        {[](uint32_t c) { return OrvNebu_enableSlave(H, at(c)); }, ""},
        {[](uint32_t c) { return OrvNebu_singleSlaveWrite(H, at(c), 0, 0, nullptr); }, ""},
        {[](uint32_t c) { return OrvNebu_singleSlaveReadModifyWrite(H, at(c), 0, 0, 0, w); }, ""},
        {[](uint32_t c) { return OrvNebu_broadcastSingleWrite(H, 0, c, 0, 0, nullptr); }, ""},
    };
    uint32_t count = 0;
    ASSERT_EQ(OrvNebu_getSlaveCount(H, 0, 1, &count), 0u);
    for (const auto& call : calls) {
        SCOPED_TRACE(call.message);
        clearLog();
        if (!call.message.empty()) {
            EXPECT_EQ(call.run(1), FAILED);
            expectOnlyMessage(256, call.message);
            EXPECT_TRUE(jtag().empty()) << joined();
            clearLog();
        }
        EXPECT_EQ(call.run(9), FAILED);
        expectOnlyMessage(256, "Invalid NEBU Bus Device:0, user chain number/bus:9.");
    }
    // The slave count checks its pointer before it looks for the bus.
    clearLog();
    OrvSim::takeStats(H);
    EXPECT_EQ(OrvNebu_getSlaveCount(H, 0, 9, nullptr), FAILED);
    expectOnlyMessage(256, "OrvNebu_getSlaveCount() argument checking failed:count != 0");
    EXPECT_EQ(OrvNebu_getSlaveCount(H, 0, 1, nullptr), FAILED);
    EXPECT_EQ(OrvSim::takeStats(H).statusReads, 0u) << "no discovery happened";
}

TEST_F(BusCallsTest, ACommandChannelThatFailsFailsTheCallWithTheHostsMessage) {
    static uint32_t w[2];
    static char text[9] = "00000000";
    const struct {
        uint32_t cmd;  // the command the host refuses to carry to the master
        std::function<uint32_t()> run;
    } cases[] = {
        {1, [] { return OrvNebu_getSlaveCount(H, 0, 1, w); }},  // discovery's bus reset
        {7, [] { return OrvNebu_clearBusErrorStatus(H, 0, 1); }},
        {2, [] { return OrvNebu_resetBus(H, 0, 1); }},
        {1, [] { return OrvNebu_resetSlave(H, at(1)); }},
        {3, [] { return OrvNebu_getBusErrorStatus(H, 0, 1, w, 2); }},
        {4, [] { return OrvNebu_singleSlaveRead(H, at(1), 0x10, w, nullptr); }},
        {5, [] { return OrvNebu_singleSlaveReadModifyWrite(H, at(1), 0x10, 1, 0, nullptr); }},
        {6, [] { return OrvNebu_read(H, at(1), 0x10, 2, text); }},
        {5, [] { return OrvNebu_write(H, at(1), 0x10, 1, "1234"); }},
    };
    for (size_t i = 0; i < std::size(cases); ++i) {
        SCOPED_TRACE(i);
        loadBoard(R"({ "devices": [ { "chains": { "1": { "cores": [ { "type": 14,
            "failingCommands": [)" +
                  std::to_string(cases[i].cmd) + R"(], "master": {
            "slaveCount": 2, "dclkHasReset": true, "slaves": { "0": {}, "1": {} } } } ] } } } ] })");
        clearLog();
        EXPECT_EQ(cases[i].run(), FAILED);
        expectOnlyMessage(256, "Command " + std::to_string(cases[i].cmd) +
                                   " to core 0 on user chain 1 of device 0 failed.");
    }
}

TEST_F(BusCallsTest, BusInfoNeedsTheMasterItWasFoundAs) {
    uint32_t count = 0, result = 99;
    ASSERT_EQ(OrvNebu_getSlaveCount(H, 0, 1, &count), 0u);
    ASSERT_EQ(OrvNebu_testSlaveInterface(H, at(1), &result), 0u);
    EXPECT_EQ(result, 0u);
    loadBoard(R"({ "devices": [ { "chains": { "1": { "cores": [ { "type": 5 } ] } } } ] })");
    ORV_HASHMAP_HANDLE map = makeMap();
    clearLog();
    EXPECT_EQ(OrvNebu_getBusInfo(H, 0, 1, &map), FAILED);
    expectOnlyMessage(256, "Invalid NEBU Bus.\n");
    EXPECT_TRUE(mapOf(map).empty());
    clearLog();
    EXPECT_EQ(OrvNebu_resetBus(H, 0, 1), FAILED);
    expectOnlyMessage(256, "Invalid NEBU Bus.\n");
}

TEST_F(BusCallsTest, LongBurstsUseTheWholeCountFieldAndNoMore) {
    uint32_t count = 0;
    ASSERT_EQ(OrvNebu_getSlaveCount(H, 0, 1, &count), 0u);
    OrvSim::takeStats(H);
    std::vector<uint32_t> words(1000);
    for (uint32_t i = 0; i < words.size(); ++i) words[i] = (i * 37u) & 0xFFFF;
    ASSERT_EQ(OrvNebu_burstSlaveWrite(H, at(1), 0x1000, 1, words.data(), 1000, nullptr), 0u);
    std::vector<uint32_t> back(1000, 0xDEAD);
    ASSERT_EQ(OrvNebu_burstSlaveRead(H, at(1), 0x1000, 1, back.data(), 1000, nullptr), 0u);
    EXPECT_EQ(back, words);
    EXPECT_EQ(board()->peek(0, 1, 0, 0x1000 + 999), words[999]);
    const OrvSim::JtagStats stats = OrvSim::takeStats(H);
    EXPECT_EQ(stats.commands, 6u);
    EXPECT_EQ(stats.readBits, 16000u);
    // 131072 words do not fit the 17-bit count: the master would be told 0.
    std::vector<uint32_t> many(131072, 0x5A5A);
    const std::string refused =
        "Invalid burst length (Word Count > Maximum Burst Length 131071).\n";
    clearLog();
    EXPECT_EQ(OrvNebu_burstSlaveWrite(H, at(1), 0, 0, many.data(), 131072, nullptr), FAILED);
    expectOnlyMessage(256, refused);
    clearLog();
    EXPECT_EQ(OrvNebu_burstSlaveRead(H, at(1), 0, 0, many.data(), 131072, nullptr), FAILED);
    expectOnlyMessage(256, refused);
    EXPECT_EQ(OrvSim::takeStats(H).commands, 0u);
    EXPECT_EQ(many[0], 0x5A5Au);
    EXPECT_EQ(OrvNebu_burstSlaveRead(H, at(1), 0x10, 0, many.data(), 131071, nullptr), 0u);
    EXPECT_EQ(many[131070], 0xABCDu);
    // A burst past the bus reads zeros; its status then fails and is left alone.
    uint32_t pair[2] = {0x1234, 0x5678}, status = 5;
    EXPECT_EQ(OrvNebu_burstSlaveRead(H, {0, 1, 7}, 0x10, 1, pair, 2, &status), FAILED);
    EXPECT_EQ(status, 5u);
    EXPECT_EQ(pair[0] + pair[1], 0u);
}

}  // namespace
}  // namespace OrvNebuBusTest
