// The bus list where the console cannot reach it: a board that changes under a known bus, the
// listener registration, and sessions ending on other threads.
#include <gtest/gtest.h>

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <functional>
#include <future>
#include <string>
#include <thread>
#include <vector>

#include "bus/BusFixture.h"
#include "orvnebu/orvnebu.h"

namespace OrvNebuBusTest {
namespace {

// Chain 1: a 4-slave master behind a foreign core; chain 2: a 2-slave master. Device 1 is a
// configuration controller.
const char* const BOARD = R"({ "devices": [ { "chains": {
    "1": { "cores": [ { "type": 3 }, { "type": 14, "master": { "slaveCount": 4 } } ] },
    "2": { "cores": [ { "type": 14, "master": { "slaveCount": 2 } } ] } } },
  { "trellom": true, "chains": {
    "1": { "cores": [ { "type": 14, "master": { "slaveCount": 2 } } ] } } } ] })";

// Chain 1 has a 2-slave master and device 1 is an ordinary device.
const char* const BOARD_CHANGED = R"({ "devices": [
  { "chains": { "1": { "cores": [ { "type": 14, "master": { "slaveCount": 2 } } ] } } },
  { "chains": { "1": { "cores": [ { "type": 14, "master": { "slaveCount": 2 } } ] } } } ] })";

// A listener that runs what it is given at the next session end it hears of.
class OnEnd : public OrvRT::SessionMessageListener {
public:
    void sessionNotice(uint32_t) override {}
    void sessionEnded(uint32_t) override {
        std::function<void()> run;
        std::swap(run, next);
        if (run) run();
    }
    std::function<void()> next;
};

class BusListTest : public BusFixture {
protected:
    OnEnd onEnd_;  // outlives the fresh host of TearDown

    void SetUp() override {
        BusFixture::SetUp();
        loadBoard(BOARD);
    }

    uint32_t slaveCount(uint32_t handle, uint32_t device, uint32_t userChain) {
        uint32_t count = 0xFFFFFFFFu;
        EXPECT_EQ(OrvNebu_getSlaveCount(handle, device, userChain, &count), 0u) << joined();
        return count;
    }

    // A call that needs the bus but no device access of its own: JTAG traffic means discovery.
    uint32_t touch(uint32_t handle, uint32_t device, uint32_t userChain) {
        uint32_t handles[1] = {0};
        return OrvNebu_getSlaveHandles(handle, device, userChain, handles, 1);
    }

    size_t countLines(const std::string& prefix) const {
        const auto lines = jtag();
        return static_cast<size_t>(std::count_if(
            lines.begin(), lines.end(), [&](const auto& l) { return l.rfind(prefix, 0) == 0; }));
    }
};

TEST_F(BusListTest, SlaveCountRediscoversAndFollowsTheBoard) {
    EXPECT_EQ(slaveCount(1, 0, 1), 4u);
    clearLog();
    EXPECT_EQ(slaveCount(1, 0, 1), 4u);
    EXPECT_EQ(countLines("jtag status device=0 chain=1 core=0"), 1u);
    EXPECT_EQ(countLines("jtag write cmd=1 bits=6 data=0x3F"), 1u) << "the new bus is reset";
    loadBoard(BOARD_CHANGED);
    EXPECT_EQ(slaveCount(1, 0, 1), 2u);
    clearLog();
    ASSERT_EQ(OrvNebu_resetBus(1, 0, 1), 0u);
    EXPECT_EQ(countLines("jtag write cmd=1 bits=4 data=0xF"), 1u) << joined();
}

// A board swap that leaves no master is in the fault table.
TEST_F(BusListTest, ABusWithoutPositionsReplacesAnEarlierOneAndCannotBeUsed) {
    EXPECT_EQ(slaveCount(1, 0, 1), 4u);
    loadBoard(R"({ "devices": [ { "chains": {
        "1": { "cores": [ { "type": 14, "master": { "slaveCount": 0 } } ] } } } ] })");
    EXPECT_EQ(slaveCount(1, 0, 1), 0u);
    clearLog();
    EXPECT_EQ(touch(1, 0, 1), FAILED);
    expectOnlyMessage(256, "Invalid NEBU Bus Device:0, user chain number/bus:1.");
}

TEST_F(BusListTest, AConfigurationControllerLeavesTheListAlone) {
    // Discovered while device 1 still was an ordinary device.
    loadBoard(BOARD_CHANGED);
    EXPECT_EQ(slaveCount(1, 1, 1), 2u);
    loadBoard(BOARD);
    EXPECT_EQ(slaveCount(1, 1, 1), 0u);
    clearLog();
    EXPECT_EQ(touch(1, 1, 1), 0u) << "the earlier bus is still listed";
    EXPECT_TRUE(jtag().empty());
}

TEST_F(BusListTest, ANoticeIsNoEndAndTheListRegistersAgainOnceEmptied) {
    EXPECT_EQ(slaveCount(3, 0, 1), 4u);
    const uint64_t registrations = OrvSim::listenerRegistrations();
    EXPECT_EQ(slaveCount(3, 0, 2), 2u);  // a list not empty stays registered once
    EXPECT_EQ(OrvSim::listenerRegistrations(), registrations);
    OrvRT::OrvNebu_BusList::getBusList()->sessionNotice(3);
    clearLog();
    EXPECT_EQ(touch(3, 0, 1), 0u);
    EXPECT_TRUE(jtag().empty());
    OrvSim::endSession(3);  // the list is empty now
    // A host that no longer knows the list: it must register again with its next bus.
    TestHost::SetUp();
    loadBoard(BOARD);
    enableTrace();
    EXPECT_EQ(slaveCount(4, 0, 2), 2u);
    OrvSim::endSession(4);
    clearLog();
    EXPECT_EQ(touch(4, 0, 2), 0u);
    EXPECT_EQ(countLines("jtag status device=0 chain=2 core=0"), 2u) << joined();
}

TEST_F(BusListTest, RegistersWithTheHostOutsideItsOwnLock) {
    // The host tells onEnd_ of an end first, then the list; the list is registered and empty.
    OrvRT::addSessionMessageListener(&onEnd_);
    EXPECT_EQ(slaveCount(1, 0, 1), 4u);
    OrvSim::endSession(1);
    const uint64_t registrations = OrvSim::listenerRegistrations();
    std::thread other;
    uint32_t otherRc = FAILED;
    uint32_t otherCount = 0;
    onEnd_.next = [&] {
        // While the host holds its registry, another session finds the list's first bus.
        other = std::thread([&] { otherRc = OrvNebu_getSlaveCount(2, 0, 2, &otherCount); });
        for (int i = 0; i < 20000 && OrvSim::listenerRegistrations() == registrations; ++i)
            std::this_thread::sleep_for(std::chrono::milliseconds(1));
        EXPECT_GT(OrvSim::listenerRegistrations(), registrations);
    };
    auto ending = std::async(std::launch::async, [] { OrvSim::endSession(3); });
    if (ending.wait_for(std::chrono::seconds(20)) != std::future_status::ready) {
        ADD_FAILURE() << "the session end and the registration wait for each other";
        std::fflush(stdout);
        std::_Exit(1);  // both threads wait for good
    }
    other.join();
    EXPECT_EQ(otherRc, 0u);
    EXPECT_EQ(otherCount, 2u);
}

TEST_F(BusListTest, ACallKeepsItsBusWhileItsSessionEnds) {
    EXPECT_EQ(slaveCount(1, 0, 1), 4u);
    OrvRT::addSessionMessageListener(&onEnd_);  // told after the list
    board()->setResetPolls(0, 1, 3);
    std::promise<void> told;
    onEnd_.next = [&] { told.set_value(); };
    // The host ends the session from another thread while resetBus polls the master; the
    // call goes on only once the list has dropped the bus.
    std::thread ending;
    OrvSim::setTraceSink([&](const std::string& line) {
        if (line.rfind("jtag read cmd=2", 0) != 0 || ending.joinable()) return;
        ending = std::thread([] { OrvSim::endSession(1); });
        EXPECT_EQ(told.get_future().wait_for(std::chrono::seconds(20)), std::future_status::ready);
    });
    EXPECT_EQ(OrvNebu_resetBus(1, 0, 1), 0u) << joined();
    ASSERT_TRUE(ending.joinable());
    ending.join();
    EXPECT_EQ(board()->lastResetControl(0, 1), std::vector<uint8_t>{0}) << "the reset completed";
}

}  // namespace
}  // namespace OrvNebuBusTest
