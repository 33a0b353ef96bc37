// The bus master of the virtual board driven with raw commands: bit counts and orders,
// handshakes, transfers, error bits.
#include <gtest/gtest.h>

#include "board/BoardBus.h"

using boardtest::bitAt;
using boardtest::BoardBus;
using boardtest::valueOf;

namespace {

// Three slaves at 0, 1 and 3 of four positions; slave 3 is faulty.
const char* const FOUR_POSITIONS = R"(
    "slaveCount": 4, "resetPolls": 1, "clockPolls": 1,
    "slaves": {
      "0": { "slaveType": "0x11", "driverVersion": 2, "coreType": 3, "cgVersion": "0x0203",
             "cgAlphaVersion": 4, "edaVersion": "0x0A01", "word6": "0xBEEF", "nextSlave": 1,
             "memory": { "0x10": "0x1234", "0x20": [1, 2, "0x3"] } },
      "1": { "memory": { "0x10": "0x5678" } },
      "3": { "faulty": true, "memory": { "0x10": "0x9ABC" } } })";

class BusMasterTest : public BoardBus {};

TEST_F(BusMasterTest, TransferWordsAndDataBitOrder) {
    loadMaster(FOUR_POSITIONS);
    EXPECT_EQ(singleRead(0, 0x22), 0x0003);
    EXPECT_EQ(singleRead(0, 0x99), 0x0000) << "absent addresses read 0";

    // Raw words: count bits 0..16, burst 17, increment 18, slave index 20..27; a read of
    // 2 words delivers word 0 in bits 0..15, each least significant bit first.
    write(4, 2u | (1u << 17) | (1u << 18) | (1u << 20), 29);
    write(5, 0x10, 19);
    board->poke(DEV, CHAIN, 1, 0x11, 0x4321);
    EXPECT_EQ(readBytes(6, 32), (std::vector<uint8_t>{0x78, 0x56, 0x21, 0x43}));

    // Address bit 17 makes a write; the two trailing data bits are not data.
    write(4, 0u, 29);
    write(5, 0x1FFFF | (1u << 17), 19);
    write(6, 0x2BEEFu, 18);
    EXPECT_EQ(board->peek(DEV, CHAIN, 0, 0x1FFFF), 0xBEEF);
    EXPECT_EQ(board->peek(DEV, CHAIN, 1, 0x1FFFF), 0) << "the write reached only slave 0";
    EXPECT_EQ(board->lastAddressWord(DEV, CHAIN), 0x1FFFFu | (1u << 17));
    singleWrite(1, 0x10, 0xC0DE);
    EXPECT_EQ(board->lastTransferControl(DEV, CHAIN), 1u << 20);
    EXPECT_EQ(singleRead(1, 0x10), 0xC0DE);
    EXPECT_EQ(busErrors(), 0u);
}

TEST_F(BusMasterTest, BurstsWithAndWithoutIncrementAndAddressWrap) {
    loadMaster(FOUR_POSITIONS);
    burstWrite(0, 0x100, true, {0x1111, 0x2222, 0x3333});
    EXPECT_EQ(board->peek(DEV, CHAIN, 0, 0x100), 0x1111);
    EXPECT_EQ(board->peek(DEV, CHAIN, 0, 0x101), 0x2222);
    EXPECT_EQ(board->peek(DEV, CHAIN, 0, 0x102), 0x3333);
    EXPECT_EQ(burstRead(0, 0x100, true, 4), (std::vector<uint16_t>{0x1111, 0x2222, 0x3333, 0}));

    // Without increment every word goes to the one address; the last one stays.
    burstWrite(0, 0x200, false, {0xAAAA, 0xBBBB, 0xCCCC});
    EXPECT_EQ(board->peek(DEV, CHAIN, 0, 0x200), 0xCCCC);
    EXPECT_EQ(board->peek(DEV, CHAIN, 0, 0x201), 0);
    EXPECT_EQ(burstRead(0, 0x200, false, 3), (std::vector<uint16_t>{0xCCCC, 0xCCCC, 0xCCCC}));

    // Addresses wrap from 0x1FFFF to 0.
    burstWrite(1, 0x1FFFE, true, {0xE0, 0xE1, 0xE2, 0xE3});
    EXPECT_EQ(board->peek(DEV, CHAIN, 1, 0x1FFFE), 0xE0);
    EXPECT_EQ(board->peek(DEV, CHAIN, 1, 0x1FFFF), 0xE1);
    EXPECT_EQ(board->peek(DEV, CHAIN, 1, 0x00000), 0xE2);
    EXPECT_EQ(board->peek(DEV, CHAIN, 1, 0x00001), 0xE3);
    EXPECT_EQ(burstRead(1, 0x1FFFF, true, 2), (std::vector<uint16_t>{0xE1, 0xE2}));

    // Across the board's storage pages (0x1000 starts one); a zero overwrites like any value.
    burstWrite(1, 0xFFE, true, {0x0A, 0x0B, 0x0C, 0x0D});
    burstWrite(1, 0xFFF, true, {0x0000});
    EXPECT_EQ(burstRead(1, 0xFFD, true, 6),
              (std::vector<uint16_t>{0, 0x0A, 0, 0x0C, 0x0D, 0}));
    EXPECT_EQ(burstRead(0, 0xFFE, true, 4), (std::vector<uint16_t>{0, 0, 0, 0}));

    // An empty burst moves nothing and is no error.
    burstWrite(0, 0x100, true, {});
    EXPECT_EQ(burstRead(0, 0x100, true, 0), std::vector<uint16_t>{});
    EXPECT_EQ(board->peek(DEV, CHAIN, 0, 0x100), 0x1111);
    EXPECT_EQ(busErrors(), 0u);
}

TEST_F(BusMasterTest, BurstCountMismatchAndBadDataLayoutsSetBusErrorBitOne) {
    loadMaster(FOUR_POSITIONS);
    // Count 3 announced, 2 words carried: the 2 words move, bit 1 flags the mismatch.
    transferControl(3, true, true, false, 0);
    address(true, 0x300);
    std::vector<uint8_t> two = {0x01, 0x00, 0x02, 0x00, 0x00};
    write(6, two, 34);
    EXPECT_EQ(board->peek(DEV, CHAIN, 0, 0x300), 1);
    EXPECT_EQ(board->peek(DEV, CHAIN, 0, 0x301), 2);
    EXPECT_EQ(busErrors(), 2u);

    // Each of these is ignored (a read gets zeros) and sets bit 1 alone.
    auto flagged = [&](auto&& command) {
        board->setBusErrorBits(DEV, CHAIN, 0);
        command();
        return busErrors();
    };
    transferControl(0, false, false, false, 0);
    address(false, 0x10);
    EXPECT_EQ(flagged([&] { EXPECT_EQ(read(6, 17), 0u) << "fits no layout"; }), 2u);
    EXPECT_EQ(flagged([&] { write(6, 0xFFFF, 18); }), 2u) << "a write against a read address";
    address(true, 0x10);
    EXPECT_EQ(flagged([&] { write(6, 0xFFFF, 16); }), 2u) << "trailing bits missing";
    EXPECT_EQ(flagged([&] { EXPECT_EQ(read(6, 16), 0u); }), 2u) << "a read against a write address";
    EXPECT_EQ(board->peek(DEV, CHAIN, 0, 0x10), 0x1234);
    EXPECT_EQ(flagged([&] { write(4, 0x7, 28); }), 2u);
    EXPECT_EQ(board->lastTransferControl(DEV, CHAIN), 0u);
    EXPECT_EQ(flagged([&] { write(5, 0x7, 20); }), 2u);
    EXPECT_EQ(board->lastAddressWord(DEV, CHAIN), 0x10u | (1u << 17));
    EXPECT_EQ(flagged([&] { write(1, 0x3F, 7); }), 2u);
    EXPECT_TRUE(board->lastResetControl(DEV, CHAIN).empty());
    EXPECT_EQ(flagged([&] { write(9, 1, 8); }), 2u) << "unknown command";
}

TEST_F(BusMasterTest, EmptyPositionsReadZerosDropWritesAndSetBusErrorBitZero) {
    loadMaster(FOUR_POSITIONS);
    EXPECT_EQ(singleRead(2, 0x10), 0);
    EXPECT_EQ(busErrors(), 1u);
    EXPECT_THROW(board->peek(DEV, CHAIN, 2, 0x10), std::out_of_range);

    // Beyond slaveCount: position 4 and the highest index 255 are empty too.
    board->setBusErrorBits(DEV, CHAIN, 0);
    singleWrite(4, 0x10, 0x7777);
    EXPECT_EQ(busErrors(), 1u);
    board->setBusErrorBits(DEV, CHAIN, 0);
    EXPECT_EQ(burstRead(255, 0x10, true, 2), (std::vector<uint16_t>{0, 0}));
    EXPECT_EQ(busErrors(), 1u);
    for (uint32_t s : {0u, 1u, 3u}) EXPECT_NE(board->peek(DEV, CHAIN, s, 0x10), 0x7777);
    for (uint32_t s = 0; s < 4; ++s) EXPECT_FALSE(slaveError(s));
}

TEST_F(BusMasterTest, FaultySlaveSetsItsOwnErrorBitOnEveryTransfer) {
    loadMaster(FOUR_POSITIONS);
    EXPECT_EQ(singleRead(3, 0x10), 0x9ABC) << "a faulty slave still moves its data";
    EXPECT_TRUE(slaveError(3));
    EXPECT_FALSE(slaveError(0));
    EXPECT_FALSE(slaveError(1));
    EXPECT_EQ(busErrors(), 0u);
    EXPECT_TRUE(board->slaveErrorBit(DEV, CHAIN, 3));

    // Cleared by a slave reset, set again by the next transfer of any kind.
    strobeReset({4});
    EXPECT_EQ(masterStatus(), 2u);
    EXPECT_FALSE(slaveError(3));
    burstWrite(3, 0x40, true, {5, 6});
    EXPECT_TRUE(slaveError(3));
    EXPECT_EQ(board->peek(DEV, CHAIN, 3, 0x41), 6);

    // A slave can be made faulty (and healthy again) while the board runs.
    board->setSlaveFaulty(DEV, CHAIN, 0, true);
    singleWrite(0, 0x50, 1);
    EXPECT_TRUE(slaveError(0));
    board->setSlaveFaulty(DEV, CHAIN, 3, false);
    busReset();
    EXPECT_EQ(masterStatus(), 2u);
    singleRead(3, 0x10);
    EXPECT_FALSE(slaveError(3));
}

TEST_F(BusMasterTest, BroadcastWritesEverySlaveOfTheBus) {
    loadMaster(FOUR_POSITIONS);
    transferControl(0, false, false, true, 0);
    address(true, 0x60);
    write(6, 0x0F0F, 18);
    for (uint32_t s : {0u, 1u, 3u}) EXPECT_EQ(board->peek(DEV, CHAIN, s, 0x60), 0x0F0F) << s;
    EXPECT_EQ(busErrors(), 0u) << "empty positions are not addressed by a broadcast";
    EXPECT_TRUE(slaveError(3)) << "the faulty slave took part";
    EXPECT_FALSE(slaveError(0));

    // A broadcast burst, and a broadcast read, which has no meaning.
    burstWrite(0, 0x70, true, {1, 2}, true);
    for (uint32_t s : {0u, 1u, 3u}) EXPECT_EQ(board->peek(DEV, CHAIN, s, 0x71), 2) << s;
    transferControl(0, false, false, true, 0);
    address(false, 0x60);
    EXPECT_EQ(read(6, 16), 0u);
    EXPECT_EQ(busErrors(), 2u);
}

TEST_F(BusMasterTest, IdentificationWordsAreReadOnlyOverTheBus) {
    loadMaster(FOUR_POSITIONS);
    EXPECT_EQ(burstRead(0, 0x1FFF0, true, 8),
              (std::vector<uint16_t>{0x11, 2, 3, 0x0203, 4, 0x0A01, 0xBEEF, 1}));
    EXPECT_EQ(burstRead(1, 0x1FFF0, true, 8), std::vector<uint16_t>(8, 0)) << "defaults are 0";

    singleWrite(0, 0x1FFF0, 0x99);
    EXPECT_EQ(singleRead(0, 0x1FFF0), 0x11);
    EXPECT_EQ(busErrors(), 0u);

    board->poke(DEV, CHAIN, 0, 0x1FFF0, 0x44);
    EXPECT_EQ(singleRead(0, 0x1FFF0), 0x44);
    EXPECT_EQ(board->peek(DEV, CHAIN, 0, 0x1FFF7), 1);
}

TEST_F(BusMasterTest, ResetHandshakeCompletesAtTheConfiguredMasterStatusRead) {
    for (int polls : {1, 3}) {
        SCOPED_TRACE(polls);
        loadMaster(R"("slaveCount": 2, "resetPolls": )" + std::to_string(polls));
        EXPECT_EQ(masterStatus(), 0u) << "no reset requested";
        // Bit 0 clear without a strobe before it starts nothing.
        write(1, resetWord({3}), 4);
        EXPECT_EQ(masterStatus(), 0u);

        write(1, resetWord({0, 1, 2, 3}), 4);
        EXPECT_EQ(masterStatus(), 0u) << "the strobe is still high";
        write(1, resetWord({1, 2, 3}), 4);
        for (int i = 1; i < polls; ++i) EXPECT_EQ(masterStatus(), 0u) << "read " << i;
        EXPECT_EQ(masterStatus(), 2u);
        EXPECT_EQ(masterStatus(), 2u) << "completion stays visible";
        write(1, resetWord({}), 4);
        EXPECT_EQ(masterStatus(), 2u);
        EXPECT_EQ(board->lastResetControl(DEV, CHAIN), resetWord({}));

        // The next strobe starts over.
        write(1, resetWord({0, 1}), 4);
        EXPECT_EQ(masterStatus(), 0u);
        write(1, resetWord({1}), 4);
        for (int i = 1; i < polls; ++i) EXPECT_EQ(masterStatus(), 0u);
        EXPECT_EQ(masterStatus(), 2u);
    }

    loadMaster(R"("slaveCount": 2, "resetPolls": -1)");
    busReset();
    for (int i = 0; i < 50; ++i) ASSERT_EQ(masterStatus(), 0u) << "read " << i;

    // After the handshake the master runs with new poll counts.
    board->setResetPolls(DEV, CHAIN, 2);
    busReset();
    EXPECT_EQ(masterStatus(), 0u);
    EXPECT_EQ(masterStatus(), 2u);
    EXPECT_THROW(board->setResetPolls(DEV, CHAIN, -2), std::out_of_range);
}

TEST_F(BusMasterTest, CompletedResetsClearErrorBits) {
    loadMaster(R"("slaveCount": 3, "resetPolls": 2, "busErrors": 3,
                  "slaves": {"0": {"faulty": true}, "1": {"faulty": true}, "2": {}})");
    EXPECT_EQ(busErrors(), 3u) << "busErrors sets the initial bits";
    singleRead(0, 0);
    singleRead(1, 0);
    EXPECT_EQ(valueOf(errorBits(), 5), 0x0Fu);

    // Slave reset of slave 1: only its bit, and only once completed.
    strobeReset({2});
    EXPECT_EQ(board->lastResetControl(DEV, CHAIN), resetWord({2}));
    EXPECT_EQ(masterStatus(), 0u);
    EXPECT_TRUE(slaveError(1)) << "not completed yet";
    EXPECT_EQ(masterStatus(), 2u);
    EXPECT_EQ(valueOf(errorBits(), 5), 0x07u);

    // Bus reset: every error bit. Bit slaveCount + 1 is the bus bit.
    strobeReset({1, 2, 3, 4});
    EXPECT_EQ(valueOf(errorBits(), 5), 0x07u);
    masterStatus();
    EXPECT_EQ(masterStatus(), 2u);
    EXPECT_EQ(valueOf(errorBits(), 5), 0u);

    // Slave bits alone leave the bus bits.
    board->setBusErrorBits(DEV, CHAIN, 2);
    singleRead(0, 0);
    strobeReset({1, 2, 3});
    masterStatus();
    masterStatus();
    EXPECT_EQ(valueOf(errorBits(), 5), 0x02u);

    // resetPolls 0 completes at the end of the strobe.
    loadMaster(R"("slaveCount": 1, "resetPolls": 0, "busErrors": 1)");
    busReset();
    EXPECT_EQ(busErrors(), 0u);
    EXPECT_EQ(masterStatus(), 2u);
}

TEST_F(BusMasterTest, ErrorBitsLayoutAndWidth) {
    // Bus bit 1 and slave 0: 0b0110 as the plug-in reads it for two slaves.
    loadMaster(R"("slaveCount": 2, "busErrors": 2, "slaves": {"0": {"faulty": true}, "1": {}})");
    singleRead(0, 0);
    EXPECT_EQ(read(3, 4), 0x6u);
    EXPECT_EQ(read(3, 2), 0x2u) << "a shorter read gets the low bits";
    EXPECT_EQ(read(3, 12), 0x6u) << "a longer read gets zeros above";

    // 255 positions: the last slave's bit is bit 256 of a 257-bit word.
    loadMaster(R"("slaveCount": 255, "slaves": {"254": {"faulty": true}, "0": {}})");
    ASSERT_EQ(slaveCount, 255u);
    singleRead(254, 0);
    std::vector<uint8_t> bits = errorBits();
    ASSERT_EQ(bits.size(), 33u);
    EXPECT_TRUE(bitAt(bits, 256));
    for (uint32_t k = 0; k < 256; ++k) ASSERT_FALSE(bitAt(bits, k)) << k;
    busReset();
    EXPECT_EQ(masterStatus(), 2u);
    EXPECT_FALSE(bitAt(errorBits(), 256));
}

TEST_F(BusMasterTest, ClockResetPulseAndLockPolls) {
    const uint32_t LOCKED = 2;
    const uint32_t NOT_RUNNING = 4;
    for (int polls : {1, 3}) {
        SCOPED_TRACE(polls);
        loadMaster(R"("slaveCount": 1, "clockPolls": )" + std::to_string(polls));
        EXPECT_EQ(read(7, 3), LOCKED) << "a running board's clock starts locked";
        write(7, 1, 4);
        EXPECT_EQ(read(7, 3), 0u) << "held in reset";
        EXPECT_EQ(read(7, 3), 0u);
        write(7, 0, 4);
        for (int i = 1; i < polls; ++i) EXPECT_EQ(read(7, 3), 0u) << "read " << i;
        EXPECT_EQ(read(7, 3), LOCKED);
        EXPECT_EQ(read(7, 3), LOCKED);
        write(7, 0, 4);
        EXPECT_EQ(read(7, 3), LOCKED) << "no pulse, no relock";
    }

    loadMaster(R"("slaveCount": 1, "clockPolls": -1, "clockRunning": false)");
    EXPECT_EQ(read(7, 3), NOT_RUNNING);
    write(7, 1, 4);
    write(7, 0, 4);
    for (int i = 0; i < 20; ++i) ASSERT_EQ(read(7, 3), NOT_RUNNING) << "read " << i;

    // Only bit 0 of the written word drives the reset; a 3-bit write is no clock command.
    board->setClockPolls(DEV, CHAIN, 2);
    board->setClockRunning(DEV, CHAIN, true);
    write(7, 0xE, 4);
    EXPECT_EQ(read(7, 3), 0u);
    write(7, 0x1, 4);
    write(7, 0xE, 4);
    EXPECT_EQ(read(7, 3), 0u);
    EXPECT_EQ(read(7, 3), LOCKED);
    EXPECT_EQ(busErrors(), 0u);
    write(7, 0x1, 3);
    EXPECT_EQ(read(7, 3), LOCKED);
    EXPECT_EQ(busErrors(), 2u);
}

TEST_F(BusMasterTest, MasterStatusFieldsAndRawStatus) {
    loadMaster(R"("slaveCount": 255, "periodInt": 1023, "periodFrc": 1023, "dclkHasReset": true)");
    std::vector<uint8_t> bits(20, 0xFF);
    uint32_t info[5] = {9, 9, 9, 9, 9};
    ASSERT_TRUE(board->coreStatus(DEV, CHAIN, 1, info, bits.data(), 160));
    EXPECT_EQ(info[1], 14u);
    EXPECT_EQ(info[0] | info[2] | info[3] | info[4], 0u);
    for (uint32_t k = 0; k < 160; ++k) EXPECT_EQ(bitAt(bits, k), k >= 60 && k <= 88) << "bit " << k;

    loadMaster(R"("slaveCount": 5, "periodInt": 10, "periodFrc": 3)");
    ASSERT_TRUE(board->coreStatus(DEV, CHAIN, 1, info, bits.data(), 160));
    EXPECT_EQ((valueOf(bits, 64) >> 60) | ((bits[8] & 0xFu) << 4), 5u);
    uint64_t high = 0;
    for (uint32_t k = 68; k < 89; ++k) high |= uint64_t(bitAt(bits, k)) << (k - 68);
    EXPECT_EQ(high, 10u | (3u << 10));

    // A short status read gets the low bits only, nothing past them.
    std::vector<uint8_t> shortBits(9, 0xFF);
    ASSERT_TRUE(board->coreStatus(DEV, CHAIN, 1, info, shortBits.data(), 62));
    EXPECT_EQ(shortBits[7], 0x10u);
    EXPECT_EQ(shortBits[8], 0xFFu) << "the byte after the bits is untouched";

    // A raw status replaces the computed bits; the master keeps its own slave count.
    board = OrvSim::Board::loadText(R"({"devices":[{"chains":{"1":{"cores":[
        {"type":3},
        {"type":14, "status":"1F000000000000000", "master":{"slaveCount":4}},
        {"type":7, "status":"0xF5"},
        {"type":8, "status":6}]}}}]})",
                                    "raw.json");
    ASSERT_TRUE(board->coreStatus(DEV, CHAIN, 1, info, bits.data(), 160));
    EXPECT_EQ(valueOf(bits, 64) >> 60, 0xFu);
    EXPECT_EQ(bits[8], 0x01u);
    for (size_t i = 9; i < bits.size(); ++i) EXPECT_EQ(bits[i], 0u);
    slaveCount = 4;
    write(1, resetWord({0, 5}), 6);
    write(1, resetWord({5}), 6);
    EXPECT_EQ(masterStatus(), 2u) << "reset control is slaveCount + 2 = 6 bits wide";

    std::vector<uint8_t> two(2, 0xFF);
    ASSERT_TRUE(board->coreStatus(DEV, CHAIN, 2, info, two.data(), 4));
    EXPECT_EQ(info[1], 7u);
    EXPECT_EQ(two[0], 0x05u);
    EXPECT_EQ(two[1], 0xFFu);
    ASSERT_TRUE(board->coreStatus(DEV, CHAIN, 3, info, two.data(), 16));
    EXPECT_EQ(two[0], 0x06u);
    EXPECT_EQ(two[1], 0x00u);
    ASSERT_TRUE(board->coreStatus(DEV, CHAIN, 0, info, two.data(), 16));
    EXPECT_EQ(info[1], 3u);
    EXPECT_EQ(two[0] | two[1], 0u) << "a plain core has no status bits";
    EXPECT_FALSE(board->coreStatus(DEV, CHAIN, 4, info, two.data(), 16));
}

}  // namespace
