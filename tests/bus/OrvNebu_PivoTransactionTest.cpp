// The bus master protocol as it appears on the wire: resets and their handshakes, transfers,
// bursts, error status and its delivery, driven through the exported bus calls.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <functional>
#include <string>
#include <vector>

#include "bus/BusFixture.h"
#include "host/OrvCore.h"
#include "orvnebu/orvnebu.h"

namespace OrvNebuBusTest {
namespace {

using ::testing::ElementsAre;
using ::testing::ElementsAreArray;

// Chain 1: a 4-slave master behind a foreign core, with a clock to reset. Chain 2: a 2-slave
// master without one. Chains 6 and 7: masters whose handshakes never complete.
const char* const BOARD = R"({
  "devices": [ { "chains": {
    "1": { "cores": [ { "type": 3 },
      { "type": 14, "master": { "slaveCount": 4, "periodInt": 10, "periodFrc": 5,
        "dclkHasReset": true,
        "slaves": {
          "0": { "slaveType": "0x44", "memory": { "0x10": "0xABCD", "0x20": [1, 2, 3] } },
          "1": { "faulty": true },
          "3": { "memory": { "0x1FFFF": "0x5555" } } } } } ] },
    "2": { "cores": [ { "type": 14, "master": { "slaveCount": 2, "dclkHasReset": false,
        "slaves": { "0": {}, "1": {} } } } ] },
    "6": { "cores": [ { "type": 14, "master": { "slaveCount": 2, "resetPolls": -1,
        "busErrors": 2, "slaves": { "0": { "faulty": true }, "1": {} } } } ] },
    "7": { "cores": [ { "type": 14, "master": { "slaveCount": 1, "dclkHasReset": true,
        "clockPolls": -1, "clockRunning": false, "slaves": { "0": {} } } } ] },
    "8": { "cores": [ { "type": 14, "master": { "slaveCount": 1, "dclkHasReset": true,
        "clockPolls": -1, "clockRunning": true, "slaves": { "0": {} } } } ] },
    "9": { "cores": [ { "type": 14, "master": { "slaveCount": 1, "dclkHasReset": true,
        "clockPolls": 3, "clockRunning": false, "slaves": { "0": {} } } } ] }
  } } ] })";

constexpr uint32_t H = 1;
const std::string TIMED_OUT = "NEBU Master timed out.\n";
const std::string BAD_INDEX = "Invalid slave index (Slave Index >= Maximum Slaves Supported).\n";

class PivoTransactionTest : public BusFixture {
protected:
    void SetUp() override {
        BusFixture::SetUp();
        loadBoard(BOARD);
    }

    // Discovers the bus and forgets what that cost.
    void discover(uint32_t userChain) {
        uint32_t count = 0;
        ASSERT_EQ(OrvNebu_getSlaveCount(H, 0, userChain, &count), 0u) << joined();
        OrvSim::takeStats(H);
        clearLog();
    }

    static ORV_SLAVE_REF slave(uint32_t userChain, uint32_t index) { return {0, userChain, index}; }

    // Transfer control word as the master expects it.
    static uint32_t control(uint32_t count, bool burst, bool incr, bool broadcast, uint32_t index) {
        return count | (uint32_t(burst) << 17) | (uint32_t(incr) << 18) |
               (uint32_t(broadcast) << 19) | (index << 20);
    }
};

TEST_F(PivoTransactionTest, EachCallOnTheWire) {
    uint32_t word = 0, back = 0, in[3] = {0, 0, 0};
    struct Row {
        const char* name;
        uint32_t chain;
        std::function<uint32_t()> call;
        std::vector<std::string> jtag;
        std::function<void()> after;
    };
    // clang-format off
    const Row rows[] = {
        {"clearing the error status pulses the clock, then resets the bus", 1,
         [] { return OrvNebu_clearBusErrorStatus(H, 0, 1); },
         {"jtag status device=0 chain=1 core=1 type=14", jtagWrite(7, 4, 1), jtagWrite(7, 4, 0),
          jtagRead(7, 3, 0x2), jtagWrite(1, 6, 0x3F), jtagWrite(1, 6, 0x3E), jtagRead(2, 4, 0x2),
          jtagWrite(1, 6, 0x00)}, [] {}},
        {"no clock command without a clock reset", 2, [] { return OrvNebu_resetBus(H, 0, 2); },
         {"jtag status device=0 chain=2 core=0 type=14", jtagWrite(1, 4, 0xF), jtagWrite(1, 4, 0xE),
          jtagRead(2, 4, 0x2), jtagWrite(1, 4, 0x0)}, [] {}},
        {"slave reset strobes one slave bit", 1, [] { return OrvNebu_resetSlave(H, slave(1, 2)); },
         {jtagWrite(1, 6, 0x09), jtagWrite(1, 6, 0x08), jtagRead(2, 4, 0x2), jtagWrite(1, 6, 0x00)},
         [] {}},
        {"single write", 1,
         [] { return OrvNebu_singleSlaveWrite(H, slave(1, 3), 0x1FFFF, 0xFFFF1234u, nullptr); },
         {jtagWrite(4, 29, control(0, false, false, false, 3)), jtagWrite(5, 19, 0x3FFFF),
          jtagWrite(6, 18, 0x1234), "jtag flush"},
         [&] {
             EXPECT_EQ(board()->peek(0, 1, 3, 0x1FFFF), 0x1234);
             EXPECT_EQ(OrvSim::takeStats(H).flushes, 1u);
         }},
        {"read-modify-write keeps the masked bits", 1,
         [] { return OrvNebu_singleSlaveReadModifyWrite(H, slave(1, 0), 0x10, 0x12, 0xFF00, nullptr); },
         {jtagWrite(4, 29, 0), jtagWrite(5, 19, 0x00010), jtagRead(6, 16, 0xABCD), jtagWrite(4, 29, 0),
          jtagWrite(5, 19, 0x20010), jtagWrite(6, 18, 0xAB12), "jtag flush"},
         [&] { EXPECT_EQ(board()->peek(0, 1, 0, 0x10), 0xAB12); }},
        {"write and inspect reads the same address back", 1,
         [&] { return OrvNebu_singleSlaveWriteAndInspect(H, slave(1, 0), 0x11, 0x7777, &back, nullptr); },
         {jtagWrite(4, 29, 0), jtagWrite(5, 19, 0x20011), jtagWrite(6, 18, 0x7777), "jtag flush",
          jtagWrite(4, 29, 0), jtagWrite(5, 19, 0x00011), jtagRead(6, 16, 0x7777)},
         [&] { EXPECT_EQ(back, 0x7777u); }},
        {"burst read: 16 bits per word", 1,
         [&] { return OrvNebu_burstSlaveRead(H, slave(1, 0), 0x20, 1, in, 3, nullptr); },
         {jtagWrite(4, 29, control(3, true, true, false, 0)), jtagWrite(5, 19, 0x00020),
          jtagRead(6, 48, 0x000300020001ull)},
         [&] { EXPECT_THAT(in, ElementsAre(1u, 2u, 3u)); }},
        {"a position past the bus is sent without a status", 2,
         [&] { return OrvNebu_singleSlaveRead(H, slave(2, 5), 0, &word, nullptr); },
         {jtagWrite(4, 29, control(0, false, false, false, 5)), jtagWrite(5, 19, 0), jtagRead(6, 16, 0)},
         [&] { EXPECT_EQ(word, 0u); }},
        {"broadcast", 1, [] { return OrvNebu_broadcastSingleWrite(H, 0, 1, 0x30, 0x4242, nullptr); },
         {jtagWrite(4, 29, control(0, false, false, true, 0)), jtagWrite(5, 19, 0x20030),
          jtagWrite(6, 18, 0x4242), "jtag flush"},
         [&] { EXPECT_EQ(board()->peek(0, 1, 3, 0x30), 0x4242); }},
    };
    // clang-format on
    for (const Row& row : rows) {
        SCOPED_TRACE(row.name);
        discover(row.chain);
        EXPECT_EQ(row.call(), 0u);
        EXPECT_EQ(jtag(), row.jtag);
        EXPECT_TRUE(messages().empty()) << joined();
        row.after();
    }
}

TEST_F(PivoTransactionTest, ResetTimeoutZeroesTheControlWordAfterElevenPolls) {
    // Discovery resets too: the first call fails with the timeout, the bus stays listed.
    uint32_t count = 77;
    EXPECT_EQ(OrvNebu_getSlaveCount(H, 0, 6, &count), FAILED);
    EXPECT_EQ(count, 77u);
    expectOnlyMessage(256, TIMED_OUT);
    // The bus reset and the slave reset have the same handshake and the same failure.
    for (bool bus : {true, false}) {
        clearLog();
        EXPECT_EQ(bus ? OrvNebu_resetBus(H, 0, 6) : OrvNebu_resetSlave(H, slave(6, 1)), FAILED);
        std::vector<std::string> expected = {jtagWrite(1, 4, bus ? 0xF : 0x5),
                                             jtagWrite(1, 4, bus ? 0xE : 0x4)};
        if (bus) expected.insert(expected.begin(), "jtag status device=0 chain=6 core=0 type=14");
        for (int i = 0; i < 11; ++i) expected.push_back(jtagRead(2, 4, 0));
        // The cleared word goes out before the failure is reported.
        expected.push_back(jtagWrite(1, 4, 0));
        expected.push_back("jtag flush");
        EXPECT_EQ(jtag(), expected);
        expectOnlyMessage(256, TIMED_OUT);
    }
}

TEST_F(PivoTransactionTest, ClockPollStopsAtRunningOrLockedOrAfterElevenReads) {
    struct Row {
        uint32_t chain;
        std::vector<uint64_t> reads;  // of the clock status
    };
    const Row rows[] = {{8, {0x0}},                            // running but never locked
                        {9, {0x4, 0x4, 0x6}},                  // not running until it locks
                        {7, std::vector<uint64_t>(11, 0x4)}};  // neither: eleven reads, a failure
    for (const Row& row : rows) {
        SCOPED_TRACE(row.chain);
        uint32_t count = 0;
        OrvNebu_getSlaveCount(H, 0, row.chain, &count);
        clearLog();
        EXPECT_EQ(OrvNebu_resetBus(H, 0, row.chain), row.chain == 7 ? FAILED : 0u);
        std::vector<std::string> expected = {jtagWrite(7, 4, 1), jtagWrite(7, 4, 0)};
        for (uint64_t r : row.reads) expected.push_back(jtagRead(7, 3, r));
        std::vector<std::string> clock;
        for (const auto& line : jtag())
            if (line.find("cmd=7") != std::string::npos) clock.push_back(line);
        EXPECT_EQ(clock, expected);
    }
    // No bus reset at all after the failure.
    EXPECT_EQ(jtag().back(), jtagRead(7, 3, 0x4));
    expectOnlyMessage(256,
                      "NEBU Master could not reset the System Clock.\n"
                      "The System Clock is not locked.\nThe System Clock is not running.\n");
}

TEST_F(PivoTransactionTest, LongBurstsUseTheWholeCountField) {
    discover(1);
    std::vector<uint32_t> words(1000);
    for (uint32_t i = 0; i < words.size(); ++i) words[i] = (i * 37u) & 0xFFFF;
    ASSERT_EQ(OrvNebu_burstSlaveWrite(H, slave(1, 0), 0x1000, 1, words.data(), 1000, nullptr), 0u);
    std::vector<uint32_t> back(1000, 0xDEAD);
    ASSERT_EQ(OrvNebu_burstSlaveRead(H, slave(1, 0), 0x1000, 1, back.data(), 1000, nullptr), 0u);
    EXPECT_EQ(back, words);
    EXPECT_EQ(board()->peek(0, 1, 0, 0x1000 + 999), words[999]);
    const OrvSim::JtagStats stats = OrvSim::takeStats(H);
    EXPECT_EQ(stats.commands, 6u);
    EXPECT_EQ(stats.readBits, 16000u);
}

TEST_F(PivoTransactionTest, WhatTheMasterCannotCarryIsRefusedBeforeAnythingIsSent) {
    discover(1);
    // 131072 words do not fit the 17-bit count: the master would be told 0.
    std::vector<uint32_t> words(131072, 0x5A5A);
    EXPECT_EQ(OrvNebu_burstSlaveWrite(H, slave(1, 0), 0, 1, words.data(), 131072, nullptr), FAILED);
    EXPECT_EQ(OrvNebu_burstSlaveRead(H, slave(1, 0), 0, 1, words.data(), 131072, nullptr), FAILED);
    // Slave index 256 would reach slave 0, address 0x20010 would reach 0x00010.
    uint32_t word = 0x9999;
    EXPECT_EQ(OrvNebu_singleSlaveRead(H, slave(1, 256), 0x10, &word, nullptr), FAILED);
    EXPECT_EQ(OrvNebu_singleSlaveWrite(H, slave(1, 256), 0x10, 1, nullptr), FAILED);
    EXPECT_EQ(OrvNebu_singleSlaveWrite(H, slave(1, 0), 0x20010, 1, nullptr), FAILED);
    EXPECT_EQ(OrvNebu_singleSlaveReadModifyWrite(H, slave(1, 0), 0x20010, 1, 0, nullptr), FAILED);
    EXPECT_EQ(OrvNebu_broadcastSingleWrite(H, 0, 1, 0x20010, 1, nullptr), FAILED);
    // A position past the bus has no bit in the reset control word.
    EXPECT_EQ(OrvNebu_resetSlave(H, slave(1, 4)), FAILED);
    EXPECT_EQ(OrvNebu_resetSlave(H, slave(1, 300)), FAILED);

    EXPECT_TRUE(jtag().empty()) << joined();
    EXPECT_EQ(OrvSim::takeStats(H).commands, 0u);
    EXPECT_EQ(word, 0x9999u);
    EXPECT_EQ(board()->peek(0, 1, 0, 0x10), 0xABCD);
    const auto sent = messages();
    ASSERT_EQ(sent.size(), 9u);
    const std::string burst = "Invalid burst length (Word Count > Maximum Burst Length 131071).\n";
    const std::string address = "Invalid bus address (Address > Maximum Address 0x1FFFF).\n";
    const std::vector<std::string> expected = {burst,   burst,   BAD_INDEX, BAD_INDEX, address,
                                               address, address, BAD_INDEX, BAD_INDEX};
    for (size_t i = 0; i < sent.size(); ++i) {
        EXPECT_EQ(sent[i].text, expected[i]) << i;
        EXPECT_EQ(sent[i].severity, 256u);
    }
}

TEST_F(PivoTransactionTest, ErrorStatusCombinesBusBitsWithEachSlaveBit) {
    // The reset of chain 6 never completes, so its bus error bits survive discovery.
    uint32_t count = 0;
    EXPECT_EQ(OrvNebu_getSlaveCount(H, 0, 6, &count), FAILED);
    uint32_t word = 0;
    ASSERT_EQ(OrvNebu_singleSlaveRead(H, slave(6, 0), 0, &word, nullptr), 0u);  // faulty slave
    clearLog();

    uint32_t status[7] = {0xFFFFFFFFu, 0xFFFFFFFFu, 0xFFFFFFFFu, 0xFFFFFFFFu,
                          0xFFFFFFFFu, 0xFFFFFFFFu, 0xFFFFFFFFu};
    ASSERT_EQ(OrvNebu_getBusErrorStatus(H, 0, 6, status, 2), 0u);
    EXPECT_THAT(jtag(), ElementsAre(jtagRead(3, 4, 0x6)));
    EXPECT_EQ(status[0], 6u);
    EXPECT_EQ(status[1], 2u);

    // A longer array: only the first slaveCount entries are written.
    ASSERT_EQ(OrvNebu_getBusErrorStatus(H, 0, 6, status + 2, 5), 0u);
    EXPECT_THAT(status, ElementsAre(6u, 2u, 6u, 2u, 0xFFFFFFFFu, 0xFFFFFFFFu, 0xFFFFFFFFu));

    // A shorter one fails before any command.
    clearLog();
    EXPECT_EQ(OrvNebu_getBusErrorStatus(H, 0, 6, status, 1), FAILED);
    expectOnlyMessage(256, "errorStatusLen must equal to maximum slaves supported.\n");
    EXPECT_TRUE(jtag().empty());
}

TEST_F(PivoTransactionTest, StatusDeliveryCostsOneErrorReadAndShowsTheBusBits) {
    discover(1);
    uint32_t word = 0, status = 0xFFFF;
    // An empty position sets bus error bit 0, which every slave's status shows; slave 1 is
    // faulty and adds its own bit 2.
    ASSERT_EQ(OrvNebu_singleSlaveWrite(H, slave(1, 2), 0, 1, &status), 0u);
    EXPECT_EQ(status, 1u);
    ASSERT_EQ(OrvNebu_singleSlaveRead(H, slave(1, 0), 0x10, &word, &status), 0u);
    EXPECT_EQ(status, 1u);
    const uint32_t burst[2] = {1, 2};
    ASSERT_EQ(OrvNebu_burstSlaveWrite(H, slave(1, 1), 0, 1, burst, 2, &status), 0u);
    EXPECT_EQ(status, 5u);
    ASSERT_EQ(OrvNebu_singleSlaveReadModifyWrite(H, slave(1, 0), 0x10, 0, 0xFFFF, &status), 0u);
    EXPECT_EQ(status, 1u);
    ASSERT_EQ(OrvNebu_singleSlaveWriteAndInspect(H, slave(1, 1), 0, 9, &word, &status), 0u);
    EXPECT_EQ(status, 5u);
    // A broadcast reports the bus bits only.
    clearLog();
    ASSERT_EQ(OrvNebu_broadcastSingleWrite(H, 0, 1, 0x30, 0x4242, &status), 0u);
    EXPECT_EQ(status, 1u);
    EXPECT_EQ(jtag().back(), jtagRead(3, 6, 0x9));
    // A slave reset clears its own bit, a bus reset every bit.
    uint32_t all[4] = {0, 0, 0, 0};
    ASSERT_EQ(OrvNebu_getBusErrorStatus(H, 0, 1, all, 4), 0u);
    EXPECT_THAT(all, ElementsAre(1u, 5u, 1u, 1u));
    ASSERT_EQ(OrvNebu_resetSlave(H, slave(1, 1)), 0u);
    ASSERT_EQ(OrvNebu_getBusErrorStatus(H, 0, 1, all, 4), 0u);
    EXPECT_THAT(all, ElementsAre(1u, 1u, 1u, 1u));
    ASSERT_EQ(OrvNebu_clearBusErrorStatus(H, 0, 1), 0u);
    ASSERT_EQ(OrvNebu_singleSlaveRead(H, slave(1, 0), 0x10, &word, &status), 0u);
    EXPECT_EQ(status, 0u);

    // The first slave's own error bit stays out of the broadcast status: chain 6 keeps bus
    // error bit 1 (its reset never completes) and its faulty slave 0 flags every transfer.
    uint32_t count = 0;
    EXPECT_EQ(OrvNebu_getSlaveCount(H, 0, 6, &count), FAILED);
    ASSERT_EQ(OrvNebu_singleSlaveRead(H, slave(6, 0), 0, &word, &status), 0u);
    EXPECT_EQ(status, 6u);
    ASSERT_EQ(OrvNebu_broadcastSingleWrite(H, 0, 6, 0x31, 1, &status), 0u);
    EXPECT_EQ(status, 2u);

    // A status for a position past the bus fails after the transfer.
    discover(2);
    status = 77;
    EXPECT_EQ(OrvNebu_singleSlaveRead(H, slave(2, 5), 0, &word, &status), FAILED);
    expectOnlyMessage(256, BAD_INDEX);
    EXPECT_EQ(status, 77u);
    EXPECT_EQ(jtag().size(), 3u);
}

TEST_F(PivoTransactionTest, CallsWithoutBusTrafficSendNothing) {
    discover(1);
    uint32_t result = 99;
    ASSERT_EQ(OrvNebu_testSlaveInterface(H, slave(1, 0), &result), 0u);
    EXPECT_EQ(result, 0u);
    ASSERT_EQ(OrvNebu_disableSlave(H, slave(1, 0)), 0u);
    ASSERT_EQ(OrvNebu_enableSlave(H, slave(1, 200)), 0u);
    uint32_t handles[5] = {9, 9, 9, 9, 9};
    ASSERT_EQ(OrvNebu_getSlaveHandles(H, 0, 1, handles, 3), 0u);
    EXPECT_THAT(handles, ElementsAre(0u, 1u, 2u, 9u, 9u));
    ASSERT_EQ(OrvNebu_getSlaveHandles(H, 0, 1, handles, 5), 0u);  // more than the bus holds
    EXPECT_THAT(handles, ElementsAreArray({0u, 1u, 2u, 3u, 4u}));
    EXPECT_TRUE(jtag().empty());
    EXPECT_TRUE(messages().empty());

    // Bus information comes from the master status alone and leaves other entries.
    ORV_HASHMAP_HANDLE handle = OrvContainer_hashmapCStr_new();
    auto* info = static_cast<OrvRT::Orv_HashMapCStr*>(handle);
    *info = {{"period_int", "old"}, {"mine", "kept"}};
    ASSERT_EQ(OrvNebu_getBusInfo(H, 0, 1, &handle), 0u);
    EXPECT_EQ(
        *info,
        (OrvRT::Orv_HashMapCStr{
            {"period_int", "10"}, {"period_frc", "5"}, {"dclk_has_reset", "1"}, {"mine", "kept"}}));
    EXPECT_THAT(jtag(), ElementsAre("jtag status device=0 chain=1 core=1 type=14"));
    OrvContainer_hashmapCStr_delete(handle);
}

}  // namespace
}  // namespace OrvNebuBusTest
