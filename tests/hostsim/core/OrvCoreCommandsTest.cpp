// The stand-in host's JTAG channel against the virtual board where the transcripts' stats and
// traces do not reach: sessions of their own, refused commands, core status and counts.
#include <stdexcept>
#include <string>
#include <vector>

#include "host/OrvCore.h"
#include "host/OrvJtag.h"
#include "host/OrvUtil.h"
#include "support/TestHost.h"

namespace {

constexpr uint32_t DEVICE = 0;
constexpr uint32_t CHAIN = 1;
constexpr uint32_t MASTER = 1;  // core index of the bus master on chain 1

class OrvCoreCommandsTest : public TestHost {
protected:
    void SetUp() override {
        TestHost::SetUp();
        loadBoard(BUS_BOARD);
    }
    // A write of the low bitCount bits of value, laid out as four bytes.
    uint32_t write(uint32_t cmd, uint32_t value, uint32_t bitCount, uint32_t handle = HANDLE) {
        const uint8_t bytes[4] = {static_cast<uint8_t>(value), static_cast<uint8_t>(value >> 8),
                                  static_cast<uint8_t>(value >> 16),
                                  static_cast<uint8_t>(value >> 24)};
        return OrvCore_runCoreCommand(handle, DEVICE, CHAIN, MASTER, cmd, bytes, nullptr, bitCount,
                                      0);
    }
    // The three commands of a single transfer; a write leaves all three in the queue.
    void singleWrite(uint32_t slave, uint32_t address, uint16_t value, uint32_t handle = HANDLE) {
        write(4, slave << 20, 29, handle);
        write(5, address | 1u << 17, 19, handle);
        write(6, value, 18, handle);
    }
    uint16_t memory(uint32_t slave, uint32_t address) {
        return board()->peek(DEVICE, CHAIN, slave, address);
    }
};

TEST_F(OrvCoreCommandsTest, CountersBelongToTheirSession) {
    stats(2);
    stats();
    singleWrite(1, 0x10, 0x1111, 2);
    OrvJtag_target_flush(2);
    EXPECT_EQ(memory(1, 0x10), 0x1111u);
    EXPECT_EQ(stats().commands, 0u);
    EXPECT_EQ(stats(2).commands, 3u);
    // A flush of one session does not send another session's queue.
    singleWrite(1, 0x10, 0x2222, 2);
    OrvJtag_target_flush(HANDLE);
    EXPECT_EQ(memory(1, 0x10), 0x1111u);
    OrvJtag_target_flush(2);
    EXPECT_EQ(memory(1, 0x10), 0x2222u);
}

TEST_F(OrvCoreCommandsTest, TheEndOfASessionSendsItsQueuedWrites) {
    singleWrite(1, 0x10, 0x7777);
    OrvSim::endSession(HANDLE);
    EXPECT_EQ(memory(1, 0x10), 0x7777u);
    // The host forgot the session, counters and all: the handle starts a new one.
    OrvJtag_target_flush(HANDLE);
    const OrvSim::JtagStats s = stats();
    EXPECT_EQ(s.flushes, 1u);
    EXPECT_EQ(s.roundTrips, 0u);  // nothing left to send
    EXPECT_EQ(s.commands, 0u);
}

TEST_F(OrvCoreCommandsTest, ABadDirectionIsRefusedAndNothingIsQueued) {
    stats();
    uint8_t bytes[4] = {};
    EXPECT_NE(OrvCore_runCoreCommand(HANDLE, DEVICE, CHAIN, MASTER, 6, nullptr, nullptr, 16, 0),
              0u);
    EXPECT_NE(OrvCore_runCoreCommand(HANDLE, DEVICE, CHAIN, MASTER, 6, bytes, bytes, 16, 0), 0u);
    EXPECT_EQ(stats().commands, 0u);
    // A read from a core that does not exist fails and reads zeros.
    bytes[0] = bytes[1] = 0xFF;
    EXPECT_NE(OrvCore_runCoreCommand(HANDLE, DEVICE, CHAIN, 9, 6, nullptr, bytes, 16, 0), 0u);
    EXPECT_EQ(bytes[0] | bytes[1], 0);
}

TEST_F(OrvCoreCommandsTest, CoreCountsAndStatusReadsAnswerForTheBoard) {
    uint32_t count = 77;
    EXPECT_EQ(OrvCore_getCoreCount(HANDLE, DEVICE, 2, &count), 0);
    EXPECT_EQ(count, 0u);
    count = 77;
    EXPECT_EQ(OrvCore_getCoreCount(HANDLE, DEVICE, 7, &count), 0);  // absent chain
    EXPECT_EQ(count, 0u);
    count = 77;
    EXPECT_LT(OrvCore_getCoreCount(HANDLE, 5, CHAIN, &count), 0);  // no such device
    EXPECT_EQ(count, 77u);
    EXPECT_LT(OrvCore_getCoreCount(HANDLE, DEVICE, CHAIN, nullptr), 0);
    EXPECT_TRUE(OrvRT::Orv_CoreComm::isTrellomDevice(HANDLE, 1));
    EXPECT_FALSE(OrvRT::Orv_CoreComm::isTrellomDevice(HANDLE, 0));
    EXPECT_FALSE(OrvRT::Orv_CoreComm::isTrellomDevice(HANDLE, 5));

    OrvRT::Orv_ByteBuffer status(154, 10, 10);
    ORV_CORE_INFO info{{9, 9, 9, 9, 9}};
    try {
        OrvRT::Orv_CoreComm::getCoreStatus(HANDLE, ORV_CORE_REF{DEVICE, CHAIN, 2}, &info, status,
                                           1232);
        ADD_FAILURE() << "no exception";
    } catch (const std::logic_error& e) {
        EXPECT_STREQ(e.what(), "No core 2 on user chain 1 of device 0.");
    }
    EXPECT_EQ(info.word[1], 9u);  // left alone
    // More bits asked than the buffer holds: only the buffer is filled.
    OrvRT::Orv_ByteBuffer small(9, 0, 0);
    OrvRT::Orv_CoreComm::getCoreStatus(HANDLE, ORV_CORE_REF{DEVICE, CHAIN, MASTER}, &info, small,
                                       1232);
    EXPECT_EQ(info.word[1], 14u);
    EXPECT_EQ(small.getBits(60, 8), 4u);
}

TEST_F(OrvCoreCommandsTest, WithoutABoardNothingAnswers) {
    OrvSim::setBoard(nullptr);
    uint32_t count = 5;
    EXPECT_LT(OrvCore_getCoreCount(HANDLE, DEVICE, CHAIN, &count), 0);
    EXPECT_FALSE(OrvRT::Orv_CoreComm::isTrellomDevice(HANDLE, 1));
    OrvRT::Orv_ByteBuffer status(154, 10, 10);
    EXPECT_THROW(OrvRT::Orv_CoreComm::getCoreStatus(HANDLE, ORV_CORE_REF{DEVICE, CHAIN, MASTER},
                                                    nullptr, status, 1232),
                 std::logic_error);
    uint8_t bytes[2] = {0xFF, 0xFF};
    EXPECT_NE(OrvCore_runCoreCommand(HANDLE, DEVICE, CHAIN, MASTER, 6, nullptr, bytes, 16, 0), 0u);
    EXPECT_EQ(bytes[0] | bytes[1], 0);
    singleWrite(1, 0x10, 0x1);
    OrvJtag_target_flush(HANDLE);  // sent to nothing, without harm
    EXPECT_EQ(stats().flushes, 1u);
}

}  // namespace
