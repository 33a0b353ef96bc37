// The stand-in host's JTAG channel against the virtual board: writes wait in the queue until
// a flush or a read, counters, trace lines, core status and core count reads.
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
    uint32_t read(uint32_t cmd, uint32_t bitCount, uint32_t handle = HANDLE) {
        uint8_t bytes[4] = {0xEE, 0xEE, 0xEE, 0xEE};
        const uint32_t rc =
            OrvCore_runCoreCommand(handle, DEVICE, CHAIN, MASTER, cmd, nullptr, bytes, bitCount, 0);
        EXPECT_EQ(rc, 0u);
        uint32_t value = 0;
        for (uint32_t i = 0; i < 4; ++i) {
            if (i * 8 < bitCount) {
                value |= static_cast<uint32_t>(bytes[i]) << (8 * i);
            } else {
                EXPECT_EQ(bytes[i], 0xEEu) << "byte " << i << " is past the bits read";
            }
        }
        return value;
    }
    // The three commands of a single transfer; a write leaves all three in the queue.
    void singleWrite(uint32_t slave, uint32_t address, uint16_t value, uint32_t handle = HANDLE) {
        write(4, slave << 20, 29, handle);
        write(5, address | 1u << 17, 19, handle);
        write(6, value, 18, handle);
    }
    uint32_t singleRead(uint32_t slave, uint32_t address) {
        write(4, slave << 20, 29);
        write(5, address, 19);
        return read(6, 16);
    }
    uint16_t memory(uint32_t slave, uint32_t address) {
        return board()->peek(DEVICE, CHAIN, slave, address);
    }
};

TEST_F(OrvCoreCommandsTest, WritesWaitForAFlushAndFlushesAreCounted) {
    stats();
    singleWrite(1, 0x10, 0xBEEF);
    EXPECT_EQ(memory(1, 0x10), 0x1234u);  // still in the queue
    OrvJtag_target_flush(HANDLE);
    EXPECT_EQ(memory(1, 0x10), 0xBEEFu);
    OrvJtag_target_flush(HANDLE);  // nothing queued: no round trip
    const OrvSim::JtagStats s = stats();
    EXPECT_EQ(s.commands, 3u);
    EXPECT_EQ(s.writeBits, 29u + 19u + 18u);
    EXPECT_EQ(s.readBits, 0u);
    EXPECT_EQ(s.flushes, 2u);
    EXPECT_EQ(s.roundTrips, 1u);
    EXPECT_EQ(s.statusReads, 0u);
    const OrvSim::JtagStats again = stats();  // taken: back to zero
    EXPECT_EQ(again.commands + again.flushes + again.roundTrips + again.writeBits, 0u);
}

TEST_F(OrvCoreCommandsTest, AReadSendsTheQueueFirstInOneRoundTrip) {
    stats();
    singleWrite(1, 0x20, 0x5555);
    EXPECT_EQ(singleRead(1, 0x20), 0x5555u);
    EXPECT_EQ(singleRead(1, 0x10), 0x1234u);
    const OrvSim::JtagStats s = stats();
    EXPECT_EQ(s.commands, 9u);
    EXPECT_EQ(s.writeBits, 29u + 19u + 18u + 2 * (29u + 19u));
    EXPECT_EQ(s.readBits, 32u);
    EXPECT_EQ(s.flushes, 0u);
    EXPECT_EQ(s.roundTrips, 2u);
}

TEST_F(OrvCoreCommandsTest, StatusAndCountReadsSendTheQueueAndAreCounted) {
    stats();
    singleWrite(1, 0x30, 0x0042);
    uint32_t count = 99;
    EXPECT_EQ(OrvCore_getCoreCount(HANDLE, DEVICE, CHAIN, &count), 0);
    EXPECT_EQ(count, 2u);
    EXPECT_EQ(memory(1, 0x30), 0x0042u);
    singleWrite(1, 0x31, 0x0043);
    OrvRT::Orv_ByteBuffer status(154, 10, 10);
    ORV_CORE_INFO info{};
    OrvRT::Orv_CoreComm::getCoreStatus(HANDLE, ORV_CORE_REF{DEVICE, CHAIN, MASTER}, &info, status,
                                       status.getSize() * 8);
    EXPECT_EQ(memory(1, 0x31), 0x0043u);
    EXPECT_EQ(info.word[1], 14u);
    EXPECT_EQ(status.getBits(60, 8), 4u);
    const OrvSim::JtagStats s = stats();
    EXPECT_EQ(s.statusReads, 2u);
    EXPECT_EQ(s.roundTrips, 2u);
    EXPECT_EQ(s.commands, 6u);
}

TEST_F(OrvCoreCommandsTest, TraceLinesShowEachOperationAsItHappens) {
    enableTrace();
    singleWrite(1, 0x10, 0xBEEF);
    EXPECT_EQ(trace().size(), 3u);  // write lines when issued, before any flush
    OrvJtag_target_flush(HANDLE);
    write(4, 0xFFFFFFFF, 29);  // bits above the count are not part of the word
    write(7, 1, 4);
    EXPECT_EQ(singleRead(1, 0x10), 0xBEEFu);
    OrvRT::Orv_ByteBuffer status(154, 10, 10);
    OrvRT::Orv_CoreComm::getCoreStatus(HANDLE, ORV_CORE_REF{DEVICE, CHAIN, 0}, nullptr, status,
                                       1232);
    uint32_t count = 0;
    OrvCore_getCoreCount(HANDLE, DEVICE, CHAIN, &count);  // counted, not traced
    EXPECT_EQ(trace(), (std::vector<std::string>{
                           "jtag write cmd=4 bits=29 data=0x00100000",
                           "jtag write cmd=5 bits=19 data=0x20010",
                           "jtag write cmd=6 bits=18 data=0x0BEEF",
                           "jtag flush",
                           "jtag write cmd=4 bits=29 data=0x1FFFFFFF",
                           "jtag write cmd=7 bits=4 data=0x1",
                           "jtag write cmd=4 bits=29 data=0x00100000",
                           "jtag write cmd=5 bits=19 data=0x00010",
                           "jtag read cmd=6 bits=16 data=0xBEEF",
                           "jtag status device=0 chain=1 core=0 type=3",
                       }));
    OrvSim::setTraceSink(nullptr);
    OrvJtag_target_flush(HANDLE);
    EXPECT_EQ(traceStartingWith("jtag flush").size(), 1u);
}

TEST_F(OrvCoreCommandsTest, TraceShowsWideWordsWithAllTheirDigits) {
    enableTrace();
    // A three-word burst as sent: 50 bits, word 0 first, two trailing zero bits.
    const uint8_t burst[7] = {0x01, 0x00, 0x02, 0x00, 0xCD, 0xAB, 0x00};
    OrvCore_runCoreCommand(HANDLE, DEVICE, CHAIN, MASTER, 6, burst, nullptr, 50, 0);
    EXPECT_EQ(trace(), (std::vector<std::string>{"jtag write cmd=6 bits=50 data=0x0ABCD00020001"}));
    EXPECT_EQ(stats().writeBits, 50u);
}

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
