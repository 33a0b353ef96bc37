// The exported frame: exception translation into one message with its severity and the
// failure code, and the lock released before the message goes out.
#include <gtest/gtest.h>

#include <functional>
#include <future>
#include <iterator>
#include <stdexcept>
#include <string>
#include <vector>

#include "api/OrvNebu_Frame.h"
#include "base/Orv_AbortException.h"
#include "bus/BusFixture.h"
#include "host/OrvJtag.h"
#include "orvnebu/orvnebu.h"

namespace OrvNebuBusTest {
namespace {

using OrvRT::lockedFrame;
using OrvRT::unlockedFrame;

class FrameTest : public BusFixture {};

TEST_F(FrameTest, ExceptionsBecomeOneMessageWithTheirSeverity) {
    const struct {
        std::function<void()> body;
        uint32_t severity;
        std::string text;
    } cases[] = {
        {[] { throw OrvRT::Orv_AbortException(); }, 32768, "Orv abort command"},
        {[] { throw std::logic_error("Orv abort command"); }, 32768, "Orv abort command"},
        {[] { throw std::logic_error("Orv abort command."); }, 256, "Orv abort command."},
        {[] { throw std::runtime_error("Orv abort"); }, 256, "Orv abort"},
        {[] { throw std::out_of_range("bad index"); }, 256, "bad index"},
        {[] { throw 42; }, 256, "Orv internal error."},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(c.text);
        for (uint32_t h : {3u, 4u}) {
            clearLog();
            EXPECT_EQ(h == 3 ? lockedFrame(h, c.body) : unlockedFrame(h, c.body), FAILED);
            auto sent = messages();
            ASSERT_EQ(sent.size(), 1u);
            EXPECT_EQ(sent[0].handle, h);
            EXPECT_EQ(sent[0].severity, c.severity);
            EXPECT_EQ(sent[0].text, c.text);
        }
    }
    clearLog();
    EXPECT_EQ(lockedFrame(3, [] {}), 0u);
    EXPECT_TRUE(messages().empty());
}

TEST_F(FrameTest, TheLockIsHeldForTheBodyAndReleasedBeforeTheMessage) {
    // Another thread trying the lock: it fails while this thread holds it.
    auto otherThreadGetsLock = [] {
        return std::async(std::launch::async,
                          [] {
                              try {
                                  OrvRT::OrvJtagTargetLock lock(5, 50);
                                  return true;
                              } catch (const std::exception&) {
                                  return false;
                              }
                          })
            .get();
    };
    bool duringBody = true;
    bool duringMessage = false;
    OrvSim::setMessageSink(
        [&](uint32_t, uint32_t, const std::string&) { duringMessage = otherThreadGetsLock(); });
    EXPECT_EQ(lockedFrame(5,
                          [&] {
                              duringBody = otherThreadGetsLock();
                              throw std::logic_error("failed");
                          }),
              FAILED);
    EXPECT_FALSE(duringBody);
    EXPECT_TRUE(duringMessage);
}

TEST_F(FrameTest, EveryCallButTerminateHoldsTheTargetWithTheSpecifiedTimeout) {
    loadBoard(R"({ "devices": [ { "chains": { "1": { "cores": [ { "type": 14, "master": {
        "slaveCount": 2, "slaves": { "0": { "slaveType": "0x11", "driverVersion": 1 } } } } ] } } } ] })");
    constexpr uint32_t H = 1;
    const ORV_SLAVE_REF s{0, 1, 0};
    ORV_HASHMAP_HANDLE regs = makeMap({{"CTRL_ENABLE", "1"}});
    ORV_HASHMAP_HANDLE mode = makeMap({{"mode", "run"}});
    ORV_HASHMAP_HANDLE map = nullptr;  // a fresh one for each call that fills it
    std::vector<std::string> choiceList;
    ORV_STRINGLIST_HANDLE choices = &choiceList;
    uint32_t w[2] = {1, 2};
    uint32_t n = 0;
    char text[9] = "00000000";
    ASSERT_EQ(OrvNebu_initialize(H, s), 0u) << joined();
    const std::function<uint32_t()> calls[] = {
        [&] { return OrvNebu_initialize(H, s); },
        [&] { return OrvNebu_getBusInfo(H, 0, 1, &(map = makeMap())); },
        [&] { return OrvNebu_getSlaveCount(H, 0, 1, &n); },
        [&] { return OrvNebu_getSlaveHandles(H, 0, 1, w, 2); },
        [&] { return OrvNebu_getSlaveInfo(H, s, &(map = makeMap())); },
        [&] { return OrvNebu_getRegisters(H, s, &(map = makeMap())); },
        [&] { return OrvNebu_setRegisters(H, s, &regs); },
        [&] { return OrvNebu_getParameters(H, s, &(map = makeMap())); },
        [&] { return OrvNebu_setParameters(H, s, &mode); },
        [&] { return OrvNebu_getParameterChoices(H, s, &mode, &choices); },
        [&] { return OrvNebu_read(H, s, 0, 2, text); },
        [&] { return OrvNebu_write(H, s, 0x20, 2, text); },
        [&] { return OrvNebu_getBusErrorStatus(H, 0, 1, w, 2); },
        [&] { return OrvNebu_clearBusErrorStatus(H, 0, 1); },
        [&] { return OrvNebu_resetBus(H, 0, 1); },
        [&] { return OrvNebu_testSlaveInterface(H, s, &n); },
        [&] { return OrvNebu_resetSlave(H, s); },
        [&] { return OrvNebu_disableSlave(H, s); },
        [&] { return OrvNebu_enableSlave(H, s); },
        [&] { return OrvNebu_singleSlaveRead(H, s, 0, w, &n); },
        [&] { return OrvNebu_singleSlaveWrite(H, s, 0x20, 1, &n); },
        [&] { return OrvNebu_singleSlaveReadModifyWrite(H, s, 0x20, 1, 0xFF00, &n); },
        [&] { return OrvNebu_singleSlaveWriteAndInspect(H, s, 0x20, 1, w, &n); },
        [&] { return OrvNebu_burstSlaveRead(H, s, 0, 1, w, 2, &n); },
        [&] { return OrvNebu_burstSlaveWrite(H, s, 0x20, 1, w, 2, &n); },
        [&] { return OrvNebu_broadcastSingleWrite(H, 0, 1, 0x20, 1, &n); },
        [&] { return OrvNebu_terminate(H, s); },
    };
    for (size_t i = 0; i < std::size(calls); ++i) {
        SCOPED_TRACE(i);
        OrvSim::takeTargetLockUse(H);
        EXPECT_EQ(calls[i](), 0u) << joined();
        const OrvSim::TargetLockUse use = OrvSim::takeTargetLockUse(H);
        if (i + 1 == std::size(calls)) {  // terminate
            EXPECT_TRUE(use.takesByTimeout.empty());
            EXPECT_GT(use.callsUnheld, 0u) << "the host saw it work without the lock";
            continue;
        }
        // Taken (nested calls take it again), always with 60000 ms, for every host operation.
        ASSERT_EQ(use.takesByTimeout.size(), 1u);
        EXPECT_EQ(use.takesByTimeout.begin()->first, 60000u);
        EXPECT_EQ(use.callsUnheld, 0u);
    }
}

TEST_F(FrameTest, ASinkThatThrowsDoesNotEscape) {
    OrvSim::setMessageSink([](uint32_t, uint32_t, const std::string&) { throw 1; });
    EXPECT_EQ(lockedFrame(3, [] { throw std::logic_error("x"); }), FAILED);
}

}  // namespace
}  // namespace OrvNebuBusTest
