// The virtual board as the host sees it: devices, chains, core counts, Trellom devices, plain
// cores, direct memory access and copies.
#include <gtest/gtest.h>

#include "board/BoardBus.h"

using boardtest::bitsOf;
using boardtest::valueOf;
using OrvSim::Board;

namespace {

const char* const TWO_DEVICES = R"({"devices": [
    {"chains": {
        "7": {"cores": [{"type": 3}, {"type": 14, "master": {"slaveCount": 2,
                        "slaves": {"1": {"memory": {"0x5": "0x55"}}}}}]},
        "0x2": {"cores": [{"type": 3}, {"type": 9}, {"type": 14, "master": {"slaveCount": 1,
                          "slaves": {"0": {"memory": {"0x5": "0x22"}}}}},
                          {"type": 14, "master": {"slaveCount": 1, "slaves": {"0": {}}}}]},
        "4": {}}},
    {"trellom": true, "chains": {"1": {"cores": [{"type": 14, "master": {"slaveCount": 1}}]}}},
    {}
]})";

TEST(BoardTest, DevicesChainsAndCoreCounts) {
    auto board = Board::loadText(TWO_DEVICES, "two.json");
    EXPECT_EQ(board->deviceCount(), 3u);
    EXPECT_EQ(board->chains(0), (std::vector<uint32_t>{2, 4, 7}));
    EXPECT_EQ(board->chains(2), std::vector<uint32_t>{});
    EXPECT_EQ(board->chains(3), std::vector<uint32_t>{});

    uint32_t count = 99;
    ASSERT_TRUE(board->coreCount(0, 7, count));
    EXPECT_EQ(count, 2u);
    ASSERT_TRUE(board->coreCount(0, 2, count));
    EXPECT_EQ(count, 4u);
    ASSERT_TRUE(board->coreCount(0, 4, count));
    EXPECT_EQ(count, 0u) << "a chain without cores";
    count = 99;
    ASSERT_TRUE(board->coreCount(0, 5, count));
    EXPECT_EQ(count, 0u) << "an absent chain";
    ASSERT_TRUE(board->coreCount(2, 1, count));
    EXPECT_EQ(count, 0u);
    EXPECT_FALSE(board->coreCount(3, 1, count)) << "no such device";

    EXPECT_FALSE(board->isTrellom(0));
    EXPECT_TRUE(board->isTrellom(1));
    EXPECT_FALSE(board->isTrellom(3));

    uint32_t info[5];
    std::vector<uint8_t> bits(20);
    ASSERT_TRUE(board->coreStatus(0, 2, 1, info, bits.data(), 160));
    EXPECT_EQ(info[1], 9u);
    EXPECT_FALSE(board->coreStatus(0, 2, 4, info, bits.data(), 160));
    EXPECT_FALSE(board->coreStatus(0, 4, 0, info, bits.data(), 160));
    EXPECT_FALSE(board->coreStatus(5, 2, 0, info, bits.data(), 160));

    // A Trellom device still answers as hardware; the plug-in is what ignores it.
    ASSERT_TRUE(board->coreStatus(1, 1, 0, info, bits.data(), 160));
    EXPECT_EQ(info[1], 14u);
}

TEST(BoardTest, PlainCoresIgnoreCommandsAndReadZeros) {
    auto board = Board::loadText(TWO_DEVICES, "two.json");
    std::vector<uint8_t> out(4, 0xFF);
    const std::vector<uint8_t> control = bitsOf((1u << 20), 29);
    // Core 1 of chain 2 is no master: writes vanish, reads are zero.
    EXPECT_TRUE(board->runCommand(0, 2, 1, 4, control.data(), nullptr, 29));
    EXPECT_TRUE(board->runCommand(0, 2, 1, 3, nullptr, out.data(), 32));
    EXPECT_EQ(valueOf(out, 32), 0u);
    EXPECT_EQ(board->lastTransferControl(0, 2), 0u) << "the master saw nothing";

    out.assign(4, 0xFF);
    EXPECT_FALSE(board->runCommand(0, 2, 9, 3, nullptr, out.data(), 8)) << "no such core";
    EXPECT_FALSE(board->runCommand(0, 9, 0, 3, nullptr, out.data(), 8));
    EXPECT_FALSE(board->runCommand(4, 7, 0, 3, nullptr, out.data(), 8));
}

TEST(BoardTest, PeekAndPokeUseTheChainsFirstMaster) {
    auto board = Board::loadText(TWO_DEVICES, "two.json");
    EXPECT_EQ(board->peek(0, 7, 1, 0x5), 0x55);
    EXPECT_EQ(board->peek(0, 2, 0, 0x5), 0x22) << "core 2, not core 3";
    board->poke(0, 2, 0, 0x1FFFF, 0xFFFF);
    EXPECT_EQ(board->peek(0, 2, 0, 0x1FFFF), 0xFFFF);

    // The poked word is what a bus read of core 2 delivers.
    std::vector<uint8_t> w4 = bitsOf(0, 29), w5 = bitsOf(0x1FFFF, 19), out(2);
    ASSERT_TRUE(board->runCommand(0, 2, 2, 4, w4.data(), nullptr, 29));
    ASSERT_TRUE(board->runCommand(0, 2, 2, 5, w5.data(), nullptr, 19));
    ASSERT_TRUE(board->runCommand(0, 2, 2, 6, nullptr, out.data(), 16));
    EXPECT_EQ(valueOf(out, 16), 0xFFFFu);
    ASSERT_TRUE(board->runCommand(0, 2, 3, 6, nullptr, out.data(), 16));
    EXPECT_EQ(valueOf(out, 16), 0u) << "the second master has its own slave";

    EXPECT_THROW(board->peek(0, 7, 0, 0x5), std::out_of_range) << "empty position";
    EXPECT_THROW(board->peek(0, 7, 2, 0x5), std::out_of_range) << "beyond slaveCount";
    EXPECT_THROW(board->peek(0, 7, 1, 0x20000), std::out_of_range);
    EXPECT_THROW(board->poke(0, 7, 1, 0x20000, 1), std::out_of_range);
    EXPECT_THROW(board->peek(0, 4, 0, 0), std::out_of_range) << "no master on the chain";
    EXPECT_THROW(board->peek(0, 8, 0, 0), std::out_of_range) << "no such chain";
    EXPECT_THROW(board->peek(3, 7, 0, 0), std::out_of_range) << "no such device";
}

TEST(BoardTest, ACopyStartsInTheSameStateAndGoesItsOwnWay) {
    auto board = Board::loadText(TWO_DEVICES, "two.json");
    board->poke(0, 2, 0, 0x10, 0x1234);
    board->setSlaveFaulty(0, 7, 1, true);
    board->setBusErrorBits(0, 7, 2);
    // A transfer half set up: control and address written, data not yet moved.
    std::vector<uint8_t> w4 = bitsOf(0, 29), w5 = bitsOf(0x10, 19), out(2);
    ASSERT_TRUE(board->runCommand(0, 2, 2, 4, w4.data(), nullptr, 29));
    ASSERT_TRUE(board->runCommand(0, 2, 2, 5, w5.data(), nullptr, 19));

    auto copy = board->copy();
    EXPECT_EQ(copy->deviceCount(), 3u);
    EXPECT_EQ(copy->chains(0), (std::vector<uint32_t>{2, 4, 7}));
    EXPECT_TRUE(copy->isTrellom(1));
    uint32_t count = 0;
    ASSERT_TRUE(copy->coreCount(0, 2, count));
    EXPECT_EQ(count, 4u);
    EXPECT_EQ(copy->peek(0, 7, 1, 0x5), 0x55);
    EXPECT_EQ(copy->busErrorBits(0, 7), 2u);
    EXPECT_EQ(copy->lastAddressWord(0, 2), 0x10u);

    // The copy finishes the transfer the original set up.
    ASSERT_TRUE(copy->runCommand(0, 2, 2, 6, nullptr, out.data(), 16));
    EXPECT_EQ(valueOf(out, 16), 0x1234u);

    copy->poke(0, 2, 0, 0x10, 0xBEEF);
    copy->setBusErrorBits(0, 7, 0);
    EXPECT_EQ(board->peek(0, 2, 0, 0x10), 0x1234) << "the original keeps its memory";
    EXPECT_EQ(board->busErrorBits(0, 7), 2u);
    board->poke(0, 7, 1, 0x5, 0x66);
    EXPECT_EQ(copy->peek(0, 7, 1, 0x5), 0x55) << "and the copy its own";
    EXPECT_EQ(copy->peek(0, 2, 0, 0x10), 0xBEEF);

    // The faulty slave stays faulty in the copy: a transfer to it raises its error bit there
    // only.
    std::vector<uint8_t> toSlave1 = bitsOf(uint64_t(1) << 20, 29);
    ASSERT_TRUE(copy->runCommand(0, 7, 1, 4, toSlave1.data(), nullptr, 29));
    ASSERT_TRUE(copy->runCommand(0, 7, 1, 5, w5.data(), nullptr, 19));
    ASSERT_TRUE(copy->runCommand(0, 7, 1, 6, nullptr, out.data(), 16));
    EXPECT_TRUE(copy->slaveErrorBit(0, 7, 1));
    EXPECT_FALSE(board->slaveErrorBit(0, 7, 1));
}

}  // namespace
