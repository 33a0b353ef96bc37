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
    EXPECT_EQ(burstRead(1, 0xFFD, true, 6), (std::vector<uint16_t>{0, 0x0A, 0, 0x0C, 0x0D, 0}));
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
