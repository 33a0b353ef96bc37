// The exported calls where the console cannot reach them: exceptions turned into messages, the
// target lock, null arguments, host cores under a slave reference, and sizes past the limits.
#include <stdexcept>

#include "api/CallHost.h"

namespace {

constexpr uint32_t FAILED = ORVNEBU_FAILED;

class CallsTest : public CallHost {
protected:
    // A plain host core (no bus slave) under the slave reference.
    void addHostCore(uint32_t index) {
        OrvRT::Orv_CoreList::addCore(
            H, new OrvRT::Orv_Core(H, ORV_CORE_REF{0, 1, index}, ORV_CORE_INFO{{1, 3, 0, 0, 0}},
                                   nullptr, 0));
    }
};

TEST_F(CallsTest, ExceptionsBecomeOneMessageSentWithoutTheTargetLock) {
    // What the call's body throws, and what the frame makes of it.
    const std::pair<std::function<void()>, std::string> rows[] = {
        {[] { throw std::logic_error("Orv abort command"); }, "failed|32768 Orv abort command|"},
        {[] { throw std::out_of_range("Orv abort command."); }, "failed|256 Orv abort command.|"},
        {[] { throw 42; }, "failed|256 Orv internal error.|"},
    };
    for (const auto& row : rows) {
        EXPECT_EQ(after(OrvRT::lockedFrame(3, row.first)), row.second);
        EXPECT_EQ(after(OrvRT::unlockedFrame(4, row.first)), row.second);
    }
    // A message sink that throws does not take the caller down.
    OrvSim::setMessageSink([](uint32_t, uint32_t, const std::string&) { throw 1; });
    EXPECT_EQ(OrvRT::lockedFrame(3, [] { throw std::logic_error("x"); }), FAILED);
    // A host call in the body and one from the message sink: only the first holds the lock.
    OrvSim::setMessageSink([](uint32_t, uint32_t, const std::string&) { OrvJtag_target_flush(H); });
    OrvSim::takeTargetLockUse(H);
    EXPECT_EQ(OrvRT::lockedFrame(H, [] { OrvJtag_target_flush(H), throw 1; }), FAILED);
    OrvSim::TargetLockUse use = OrvSim::takeTargetLockUse(H);
    EXPECT_EQ(use.callsHeld, 1u);
    EXPECT_EQ(use.callsUnheld, 1u);
    // Every call takes it with 60 s and no other timeout (nested calls take it again), and makes
    // no host call without it; terminate does without.
    ASSERT_EQ(OrvNebu_initialize(H, at(1)), 0u);
    use = OrvSim::takeTargetLockUse(H);
    EXPECT_EQ(use.takesByTimeout.size() + use.callsUnheld, 1u);
    EXPECT_EQ(use.takesByTimeout.count(60000), 1u);
    ASSERT_EQ(OrvNebu_terminate(H, at(1)), 0u);
    use = OrvSim::takeTargetLockUse(H);
    EXPECT_TRUE(use.takesByTimeout.empty());
    EXPECT_GT(use.callsUnheld, 0u);
}

// A check fails with its own message; on an unknown bus the bus is reported first. The console
// always passes these pointers valid.
TEST_F(CallsTest, EachCheckFailsWithItsOwnMessageAfterTheBusLookup) {
    static ORV_HASHMAP_HANDLE none = nullptr;
    // A call on a user chain, and its check's message after "OrvNebu_" (or none).
    const std::pair<std::function<uint32_t(uint32_t)>, const char*> rows[] = {
        {[](uint32_t c) { return OrvNebu_getBusInfo(H, 0, c, &none); },
         "getBusInfo() argument checking failed:busInfoHash != 0"},
        {[](uint32_t c) { return OrvNebu_testSlaveInterface(H, at(c), nullptr); },
         "testSlaveInterface() argument checking failed:result != 0"},
        {[](uint32_t c) { return OrvNebu_singleSlaveRead(H, at(c), 0x10, nullptr, nullptr); },
         "singleSlaveRead() argument checking failed:buffer != 0"},
        {[](uint32_t c) {
             return OrvNebu_singleSlaveWriteAndInspect(H, at(c), 0, 1, nullptr, nullptr);
         },
         "singleSlaveWriteAndInspect() argument checking failed:rdBuf != 0"},
        {[](uint32_t c) { return OrvNebu_disableSlave(H, at(c)); }, nullptr},
        {[](uint32_t c) { return OrvNebu_enableSlave(H, at(c)); }, nullptr},
    };
    uint32_t result = 99, handles[3] = {9, 9, 9};
    ASSERT_EQ(OrvNebu_testSlaveInterface(H, at(1), &result), 0u);
    EXPECT_EQ(result, 0u);
    ASSERT_EQ(OrvNebu_getSlaveHandles(H, 0, 1, handles, 2), 0u);
    EXPECT_EQ(handles[2], 9u);
    for (const auto& row : rows) {
        if (row.second != nullptr) {
            EXPECT_EQ(after(row.first(1)), "failed|256 OrvNebu_" + std::string(row.second) + "|");
        }
        EXPECT_EQ(after(row.first(9)),
                  "failed|256 Invalid NEBU Bus Device:0, user chain number/bus:9.|");
    }
    EXPECT_EQ(after(OrvNebu_getSlaveCount(H, 0, 1, nullptr)),
              "failed|256 OrvNebu_getSlaveCount() argument checking failed:count != 0|");
}

TEST_F(CallsTest, SlaveCallsCheckTheirArgumentsOnceTheSlaveIsResolved) {
    ORV_HASHMAP_HANDLE none = nullptr;
    EXPECT_EQ(after(OrvNebu_getSlaveInfo(H, at(1), &none)),
              "failed|256 OrvNebu_getSlaveInfo() argument checking failed:slaveInfoHash != 0|");
    ASSERT_EQ(OrvNebu_initialize(H, at(1)), 0u) << said();
    EXPECT_EQ(after(OrvNebu_getRegisters(H, at(1), &none)),
              "failed|256 OrvNebu_getRegisters() argument checking failed:(registers != 0)|");
    EXPECT_EQ(after(OrvNebu_setRegisters(H, at(1), nullptr)),
              "failed|256 OrvNebu_setRegisters() argument checking failed:(registers != 0)|");
    // A size whose character count (4 per word and the terminator) does not fit 32 bits is
    // refused; the largest that fits goes on to the text check.
    char text[8];
    EXPECT_EQ(after(OrvNebu_write(H, at(1), 0, 2, nullptr)),
              "failed|256 OrvNebu_write() argument checking failed:(data != 0) && (size != 0)|");
    EXPECT_EQ(after(OrvNebu_read(H, at(1), 0, 0x40000000u, text)),
              "failed|256 OrvNebu_read() argument checking failed:size*4+1 overflows 32 bits|");
    EXPECT_EQ(after(OrvNebu_write(H, at(1), 0, 0x3FFFFFFFu, "0000")),
              "failed|256 OrvNebu_write() argument checking failed:strlen(data) == (size*4)|");
    EXPECT_EQ(after(OrvNebu_write(H, at(1), 0, 0x40000000u, "")),
              "failed|256 OrvNebu_write() argument checking failed:size*4+1 overflows 32 bits|");
}

TEST_F(CallsTest, OneSlaveObjectPerReferenceAndHostCoresLeftToTheHost) {
    ASSERT_EQ(OrvNebu_initialize(H, at(1)) | OrvNebu_initialize(H, at(1)), 0u) << said();
    EXPECT_EQ(OrvRT::OrvNebu_DefaultRegisterHandler::getHandlerCount(), 1u);
    ASSERT_EQ(OrvNebu_terminate(H, at(1)), 0u);
    // A core that is no bus slave: terminate leaves it, initialize of a bad index too.
    addHostCore(0);
    addHostCore(8);
    EXPECT_EQ(OrvNebu_terminate(H, at(1, 0)), 0u);
    EXPECT_EQ(OrvNebu_initialize(H, at(1, 8)), FAILED);
    EXPECT_NE(coreAt(0), nullptr);
    EXPECT_NE(coreAt(8), nullptr);
    // Under a valid reference initialize replaces it, even when it then fails.
    ASSERT_EQ(OrvNebu_initialize(H, at(1, 0)), 0u) << said();
    EXPECT_TRUE(registered());
    addHostCore(1);
    EXPECT_EQ(OrvNebu_initialize(H, at(1, 1)), FAILED);
    EXPECT_EQ(coreAt(1), nullptr);
}

TEST_F(CallsTest, LongBurstsUseTheWholeCountFieldAndNoMore) {
    ASSERT_EQ(OrvNebu_resetBus(H, 0, 1), 0u);
    stats();
    std::vector<uint32_t> words(1000), back(1000, 0xDEAD);
    for (uint32_t i = 0; i < words.size(); ++i) words[i] = (i * 37u) & 0xFFFF;
    ASSERT_EQ(OrvNebu_burstSlaveWrite(H, at(1), 0x1000, 1, words.data(), 1000, nullptr), 0u);
    ASSERT_EQ(OrvNebu_burstSlaveRead(H, at(1), 0x1000, 1, back.data(), 1000, nullptr), 0u);
    EXPECT_EQ(back, words);
    const OrvSim::JtagStats moved = stats();
    EXPECT_EQ(moved.commands, 6u);
    EXPECT_EQ(moved.readBits, 16000u);
    // 131072 words do not fit the 17-bit count: the master would be told 0.
    std::vector<uint32_t> many(131072, 0x5A5A);
    const std::string refused =
        "failed|256 Invalid burst length (Word Count > Maximum Burst Length 131071).\n|";
    EXPECT_EQ(after(OrvNebu_burstSlaveWrite(H, at(1), 0, 0, many.data(), 131072, nullptr)),
              refused);
    EXPECT_EQ(after(OrvNebu_burstSlaveRead(H, at(1), 0, 0, many.data(), 131072, nullptr)), refused);
    EXPECT_EQ(stats().commands, 0u) << "refused before anything is sent";
    EXPECT_EQ(OrvNebu_burstSlaveRead(H, at(1), 0, 0, many.data(), 131071, nullptr), 0u);
    EXPECT_EQ(many[131070], 0x1203u);
}

}  // namespace
