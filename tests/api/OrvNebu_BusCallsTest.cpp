// The exported bus calls in their frame: bus lookup before the argument checks, every check
// message word for word, optional status pointers, and results left in place on failure.
#include <gmock/gmock.h>
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

using ::testing::ElementsAre;

const char* const BOARD = R"({ "devices": [ { "chains": {
    "1": { "cores": [ { "type": 14, "master": { "slaveCount": 2,
           "slaves": { "0": { "memory": { "0x10": "0xABCD" } }, "1": {} } } } ] } } } ] })";

constexpr uint32_t H = 1;
ORV_SLAVE_REF at(uint32_t chain) { return {0, chain, 0}; }

struct Call {
    const char* name;
    std::function<uint32_t(uint32_t userChain)> run;
    const char* checkMessage;  // what the call reports on a known bus
};

std::vector<Call> badArgumentCalls() {
    static ORV_HASHMAP_HANDLE nullMap = nullptr;
    static uint32_t words[4];
    return {
        {"getBusInfo (null address)",
         [](uint32_t c) { return OrvNebu_getBusInfo(H, 0, c, nullptr); },
         "OrvNebu_getBusInfo() argument checking failed:busInfoHash != 0"},
        {"getBusInfo (null map)", [](uint32_t c) { return OrvNebu_getBusInfo(H, 0, c, &nullMap); },
         "OrvNebu_getBusInfo() argument checking failed:busInfoHash != 0"},
        {"getSlaveHandles (null)",
         [](uint32_t c) { return OrvNebu_getSlaveHandles(H, 0, c, nullptr, 3); },
         "OrvNebu_getSlaveHandles() argument checking failed:(slaveHandles != 0) && (count != 0)"},
        {"getSlaveHandles (0)",
         [](uint32_t c) { return OrvNebu_getSlaveHandles(H, 0, c, words, 0); },
         "OrvNebu_getSlaveHandles() argument checking failed:(slaveHandles != 0) && (count != 0)"},
        {"getBusErrorStatus (null)",
         [](uint32_t c) { return OrvNebu_getBusErrorStatus(H, 0, c, nullptr, 2); },
         "OrvNebu_getBusErrorStatus() argument checking failed:(errorStatus != 0) && "
         "(errorStatusLen != 0)"},
        {"getBusErrorStatus (0)",
         [](uint32_t c) { return OrvNebu_getBusErrorStatus(H, 0, c, words, 0); },
         "OrvNebu_getBusErrorStatus() argument checking failed:(errorStatus != 0) && "
         "(errorStatusLen != 0)"},
        {"testSlaveInterface",
         [](uint32_t c) { return OrvNebu_testSlaveInterface(H, at(c), nullptr); },
         "OrvNebu_testSlaveInterface() argument checking failed:result != 0"},
        {"singleSlaveRead",
         [](uint32_t c) { return OrvNebu_singleSlaveRead(H, at(c), 0x10, nullptr, words); },
         "OrvNebu_singleSlaveRead() argument checking failed:buffer != 0"},
        {"singleSlaveWriteAndInspect",
         [](uint32_t c) {
             return OrvNebu_singleSlaveWriteAndInspect(H, at(c), 0x10, 1, nullptr, words);
         },
         "OrvNebu_singleSlaveWriteAndInspect() argument checking failed:rdBuf != 0"},
        {"burstSlaveRead (null)",
         [](uint32_t c) { return OrvNebu_burstSlaveRead(H, at(c), 0, 1, nullptr, 2, nullptr); },
         "OrvNebu_burstSlaveRead() argument checking failed:(buffer != 0) && (numRead != 0)"},
        {"burstSlaveRead (0)",
         [](uint32_t c) { return OrvNebu_burstSlaveRead(H, at(c), 0, 1, words, 0, nullptr); },
         "OrvNebu_burstSlaveRead() argument checking failed:(buffer != 0) && (numRead != 0)"},
        {"burstSlaveRead (null, 0)",
         [](uint32_t c) { return OrvNebu_burstSlaveRead(H, at(c), 0, 1, nullptr, 0, nullptr); },
         "OrvNebu_burstSlaveRead() argument checking failed:(buffer != 0) && (numRead != 0)"},
        {"burstSlaveWrite (null)",
         [](uint32_t c) { return OrvNebu_burstSlaveWrite(H, at(c), 0, 1, nullptr, 2, nullptr); },
         "OrvNebu_burstSlaveWrite() argument checking failed:(buffer != 0) && (numWrite != 0)"},
        {"burstSlaveWrite (0)",
         [](uint32_t c) { return OrvNebu_burstSlaveWrite(H, at(c), 0, 1, words, 0, nullptr); },
         "OrvNebu_burstSlaveWrite() argument checking failed:(buffer != 0) && (numWrite != 0)"},
    };
}

class BusCallsTest : public BusFixture {
protected:
    void SetUp() override {
        BusFixture::SetUp();
        loadBoard(BOARD);
    }
};

// On a known bus each check fails with its own message and sends nothing; on an unknown
// bus the bus is reported first.
TEST_F(BusCallsTest, EachCheckFailsWithItsOwnMessageAfterTheBusLookup) {
    uint32_t count = 0;
    ASSERT_EQ(OrvNebu_getSlaveCount(H, 0, 1, &count), 0u);
    for (const Call& call : badArgumentCalls()) {
        SCOPED_TRACE(call.name);
        clearLog();
        EXPECT_EQ(call.run(1), FAILED);
        expectOnlyMessage(256, call.checkMessage);
        EXPECT_TRUE(jtag().empty()) << joined();
        clearLog();
        EXPECT_EQ(call.run(9), FAILED);
        expectOnlyMessage(256, "Invalid NEBU Bus Device:0, user chain number/bus:9.");
    }
}

TEST_F(BusCallsTest, SlaveCountChecksItsPointerBeforeLookingForTheBus) {
    EXPECT_EQ(OrvNebu_getSlaveCount(H, 0, 9, nullptr), FAILED);
    expectOnlyMessage(256, "OrvNebu_getSlaveCount() argument checking failed:count != 0");
    EXPECT_EQ(OrvNebu_getSlaveCount(H, 0, 1, nullptr), FAILED);
    EXPECT_EQ(OrvSim::takeStats(H).statusReads, 0u) << "no discovery happened";
}

TEST_F(BusCallsTest, CallsWithoutChecksReportOnlyTheUnknownBus) {
    const std::vector<std::function<uint32_t()>> calls = {
        [] { return OrvNebu_clearBusErrorStatus(H, 0, 9); },
        [] { return OrvNebu_resetBus(H, 0, 9); },
        [] { return OrvNebu_resetSlave(H, at(9)); },
        [] { return OrvNebu_disableSlave(H, at(9)); },
        [] { return OrvNebu_enableSlave(H, at(9)); },
        [] { return OrvNebu_singleSlaveWrite(H, at(9), 0, 0, nullptr); },
        [] { return OrvNebu_singleSlaveReadModifyWrite(H, at(9), 0, 0, 0, nullptr); },
        [] { return OrvNebu_broadcastSingleWrite(H, 0, 9, 0, 0, nullptr); },
    };
    for (size_t i = 0; i < calls.size(); ++i) {
        SCOPED_TRACE(i);
        clearLog();
        EXPECT_EQ(calls[i](), FAILED);
        expectOnlyMessage(256, "Invalid NEBU Bus Device:0, user chain number/bus:9.");
    }
}

TEST_F(BusCallsTest, StatusPointersMayBeNull) {
    ASSERT_EQ(OrvNebu_singleSlaveWrite(H, {0, 1, 1}, 0x20, 0x1111, nullptr), 0u);
    ASSERT_EQ(OrvNebu_singleSlaveReadModifyWrite(H, {0, 1, 1}, 0x20, 0x0022, 0xFF00, nullptr), 0u);
    ASSERT_EQ(OrvNebu_broadcastSingleWrite(H, 0, 1, 0x21, 0x3333, nullptr), 0u);
    uint32_t word = 0;
    ASSERT_EQ(OrvNebu_singleSlaveWriteAndInspect(H, at(1), 0x22, 0x4444, &word, nullptr), 0u);
    EXPECT_EQ(word, 0x4444u);
    EXPECT_EQ(board()->peek(0, 1, 1, 0x20), 0x1122);
    EXPECT_EQ(board()->peek(0, 1, 0, 0x21), 0x3333);
    EXPECT_EQ(board()->peek(0, 1, 1, 0x21), 0x3333);
    EXPECT_TRUE(messages().empty()) << joined();
}

TEST_F(BusCallsTest, DataAlreadyReadStaysWhenTheStatusFails) {
    // Position 7 is past the bus: the burst runs (reading zeros), then the status fails.
    uint32_t words[2] = {0x1234, 0x5678};
    uint32_t status = 5;
    EXPECT_EQ(OrvNebu_burstSlaveRead(H, {0, 1, 7}, 0x10, 1, words, 2, &status), FAILED);
    expectOnlyMessage(256, "Invalid slave index (Slave Index >= Maximum Slaves Supported).\n");
    EXPECT_EQ(status, 5u);
    EXPECT_THAT(words, ElementsAre(0u, 0u));

    // A write lands before its status fails.
    clearLog();
    EXPECT_EQ(OrvNebu_broadcastSingleWrite(H, 0, 1, 0x40, 0x0F0F, nullptr), 0u);
    EXPECT_EQ(OrvNebu_singleSlaveWriteAndInspect(H, at(1), 0x40, 0x1234, words, nullptr), 0u);
    EXPECT_EQ(OrvNebu_singleSlaveWrite(H, {0, 1, 2}, 0x40, 0x9999, &status), FAILED);
    EXPECT_EQ(words[0], 0x1234u);
    EXPECT_EQ(board()->peek(0, 1, 1, 0x40), 0x0F0F) << "position 2 is not slave 1";
}

TEST_F(BusCallsTest, ACommandChannelThatFailsFailsTheCallWithTheHostsMessage) {
    struct Case {
        uint32_t cmd;  // the command the host refuses to carry to the master
        std::function<uint32_t()> run;
    };
    static uint32_t w[2];
    static uint32_t status;
    static char text[9] = "00000000";
    const Case cases[] = {
        {1, [] { return OrvNebu_getSlaveCount(H, 0, 1, w); }},  // discovery's bus reset
        {7, [] { return OrvNebu_clearBusErrorStatus(H, 0, 1); }},
        {2, [] { return OrvNebu_resetBus(H, 0, 1); }},
        {1, [] { return OrvNebu_resetSlave(H, at(1)); }},
        {3, [] { return OrvNebu_getBusErrorStatus(H, 0, 1, w, 2); }},
        {4, [] { return OrvNebu_singleSlaveRead(H, at(1), 0x10, w, nullptr); }},
        {3, [] { return OrvNebu_singleSlaveWrite(H, at(1), 0x10, 1, &status); }},
        {5, [] { return OrvNebu_singleSlaveReadModifyWrite(H, at(1), 0x10, 1, 0, nullptr); }},
        {6, [] { return OrvNebu_singleSlaveWriteAndInspect(H, at(1), 0x10, 1, w, nullptr); }},
        {6, [] { return OrvNebu_burstSlaveRead(H, at(1), 0x10, 1, w, 2, nullptr); }},
        {4, [] { return OrvNebu_burstSlaveWrite(H, at(1), 0x10, 1, w, 2, nullptr); }},
        {3, [] { return OrvNebu_broadcastSingleWrite(H, 0, 1, 0x10, 1, &status); }},
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
    uint32_t count = 0;
    ASSERT_EQ(OrvNebu_getSlaveCount(H, 0, 1, &count), 0u);
    // The core at the master's place is now something else.
    loadBoard(R"({ "devices": [ { "chains": {
        "1": { "cores": [ { "type": 5 } ] } } } ] })");
    ORV_HASHMAP_HANDLE map = OrvContainer_hashmapCStr_new();
    clearLog();
    EXPECT_EQ(OrvNebu_getBusInfo(H, 0, 1, &map), FAILED);
    expectOnlyMessage(256, "Invalid NEBU Bus.\n");
    EXPECT_TRUE(static_cast<OrvRT::Orv_HashMapCStr*>(map)->empty());
    clearLog();
    EXPECT_EQ(OrvNebu_resetBus(H, 0, 1), FAILED);
    expectOnlyMessage(256, "Invalid NEBU Bus.\n");
    OrvContainer_hashmapCStr_delete(map);
}

}  // namespace
}  // namespace OrvNebuBusTest
