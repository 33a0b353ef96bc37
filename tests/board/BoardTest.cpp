// A copy of the virtual board: same state, then its own way (what the console's sessions show
// of the board is in the board_devices transcript).
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
