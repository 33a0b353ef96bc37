// The bus list: discovery of the master, one bus per (session, device, chain), rediscovery,
// the end of a session and the listener registration.
#include <gmock/gmock.h>
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

using ::testing::ElementsAre;

// Device 0: chain 1 a 4-slave bus behind a foreign core, chain 2 a 2-slave bus, chain 3 a
// master without slave positions, chain 4 two masters. Device 1 is a configuration
// controller.
const char* const BOARD = R"({ "devices": [
  { "chains": {
    "1": { "cores": [ { "type": 3 }, { "type": 14, "master": { "slaveCount": 4,
           "slaves": { "0": { "memory": { "0x10": "0x0101" } } } } } ] },
    "2": { "cores": [ { "type": 14, "master": { "slaveCount": 2,
           "slaves": { "0": { "memory": { "0x10": "0x0202" } } } } } ] },
    "3": { "cores": [ { "type": 14, "master": { "slaveCount": 0 } } ] },
    "4": { "cores": [ { "type": 3 }, { "type": 14, "master": { "slaveCount": 3 } },
                      { "type": 14, "master": { "slaveCount": 7 } } ] } } },
  { "trellom": true, "chains": {
    "1": { "cores": [ { "type": 14, "master": { "slaveCount": 2 } } ] } } } ] })";

// The same board where chain 1 has a 2-slave master and device 1 is an ordinary device.
const char* const BOARD_CHANGED = R"({ "devices": [
  { "chains": {
    "1": { "cores": [ { "type": 14, "master": { "slaveCount": 2 } } ] } } },
  { "chains": {
    "1": { "cores": [ { "type": 14, "master": { "slaveCount": 2 } } ] } } } ] })";

// Chain 1 without a master.
const char* const BOARD_NO_MASTER = R"({ "devices": [
  { "chains": { "1": { "cores": [ { "type": 3 } ] } } } ] })";

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

// Waits (at most 20 s) until done; whether it is.
bool waitUntil(const std::function<bool()>& done) {
    for (int i = 0; i < 20000 && !done(); ++i)
        std::this_thread::sleep_for(std::chrono::milliseconds(1));
    return done();
}

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
        return static_cast<size_t>(
            std::count_if(lines.begin(), lines.end(),
                          [&](const std::string& l) { return l.rfind(prefix, 0) == 0; }));
    }
};

TEST_F(BusListTest, DiscoveryFindsTheFirstMasterResetsItsBusAndKeepsItPerChain) {
    EXPECT_EQ(slaveCount(1, 0, 1), 4u);
    EXPECT_THAT(jtag(),
                ElementsAre("jtag status device=0 chain=1 core=0 type=3",
                            "jtag status device=0 chain=1 core=1 type=14",
                            "jtag status device=0 chain=1 core=1 type=14", jtagWrite(1, 6, 0x3F),
                            jtagWrite(1, 6, 0x3E), jtagRead(2, 4, 0x2), jtagWrite(1, 6, 0x00)));
    EXPECT_TRUE(messages().empty());
    // Of two masters the lower-indexed one wins: the scan stops, its commands carry 3 + 2 bits.
    EXPECT_EQ(slaveCount(1, 0, 4), 3u);
    EXPECT_EQ(countLines("jtag status device=0 chain=4 core=2"), 0u);
    EXPECT_EQ(countLines(jtagWrite(1, 5, 0x1F)), 1u) << joined();
    EXPECT_EQ(slaveCount(1, 0, 2), 2u);

    // Known buses need no more device access to be found; two chains are two buses.
    clearLog();
    EXPECT_EQ(touch(1, 0, 1), 0u);
    EXPECT_TRUE(jtag().empty());
    uint32_t word = 0;
    ASSERT_EQ(OrvNebu_singleSlaveRead(1, {0, 1, 0}, 0x10, &word, nullptr), 0u);
    EXPECT_EQ(word, 0x0101u);
    ASSERT_EQ(OrvNebu_singleSlaveRead(1, {0, 2, 0}, 0x10, &word, nullptr), 0u);
    EXPECT_EQ(word, 0x0202u);
    ASSERT_EQ(OrvNebu_resetBus(1, 0, 2), 0u);
    EXPECT_EQ(countLines(jtagWrite(1, 4, 0xF)), 1u);
    EXPECT_EQ(countLines("jtag status device=0 chain=2"), 1u) << "no rediscovery";
}

TEST_F(BusListTest, SlaveCountRediscoversEveryTime) {
    EXPECT_EQ(slaveCount(1, 0, 1), 4u);
    clearLog();
    EXPECT_EQ(slaveCount(1, 0, 1), 4u);
    EXPECT_EQ(countLines("jtag status device=0 chain=1 core=0"), 1u);
    EXPECT_EQ(countLines(jtagWrite(1, 6, 0x3F)), 1u) << "the new bus is reset again";

    // The new object follows the board: chain 1 now has two slave positions.
    loadBoard(BOARD_CHANGED);
    EXPECT_EQ(slaveCount(1, 0, 1), 2u);
    clearLog();
    ASSERT_EQ(OrvNebu_resetBus(1, 0, 1), 0u);
    EXPECT_EQ(countLines(jtagWrite(1, 4, 0xF)), 1u) << joined();
}

TEST_F(BusListTest, NoUsableBusCountsZeroAndCannotBeUsed) {
    const char* zero = R"({ "devices": [ { "chains": {
        "1": { "cores": [ { "type": 14, "master": { "slaveCount": 0 } } ] } } } ] })";
    struct Case {
        uint32_t device, userChain;
        const char* board;  // after a first discovery on BOARD, if any
    };
    const Case cases[] = {
        {0, 3, nullptr},                      // 0 slave positions
        {0, 5, nullptr},                      // no cores
        {1, 1, nullptr},                      // configuration controller, never probed
        {4294967295u, 4000000000u, nullptr},  // no device
        {0, 1, BOARD_NO_MASTER},              // a bus that disappears is forgotten
        {0, 1, zero},                         // one without positions replaces an earlier one
    };
    for (const Case& c : cases) {
        const std::string message = "Invalid NEBU Bus Device:" + std::to_string(c.device) +
                                    ", user chain number/bus:" + std::to_string(c.userChain) + ".";
        SCOPED_TRACE(message);
        loadBoard(BOARD);
        if (c.board != nullptr) {
            EXPECT_EQ(slaveCount(1, c.device, c.userChain), 4u);
            loadBoard(c.board);
        }
        clearLog();
        EXPECT_EQ(slaveCount(1, c.device, c.userChain), 0u);
        EXPECT_TRUE(messages().empty());
        if (c.device == 1) {
            EXPECT_TRUE(jtag().empty());
        }
        EXPECT_EQ(OrvNebu_resetBus(1, c.device, c.userChain), FAILED);
        expectOnlyMessage(256, message);
        clearLog();
        EXPECT_EQ(touch(1, c.device, c.userChain), FAILED);
        expectOnlyMessage(256, message);
    }
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

TEST_F(BusListTest, SessionsHaveTheirOwnBusesAndEndAlone) {
    EXPECT_EQ(slaveCount(1, 0, 1), 4u);
    EXPECT_EQ(slaveCount(2, 0, 1), 4u);
    clearLog();
    EXPECT_EQ(touch(1, 0, 1), 0u);
    EXPECT_EQ(touch(2, 0, 1), 0u);
    EXPECT_TRUE(jtag().empty());

    // A notice is not an end.
    OrvRT::OrvNebu_BusList::getBusList()->sessionNotice(1);
    EXPECT_EQ(touch(1, 0, 1), 0u);
    EXPECT_TRUE(jtag().empty());

    OrvSim::endSession(1);
    EXPECT_EQ(touch(2, 0, 1), 0u);
    EXPECT_TRUE(jtag().empty()) << "session 2 keeps its bus";
    EXPECT_EQ(touch(1, 0, 1), 0u);
    EXPECT_EQ(countLines("jtag status device=0 chain=1 core=0"), 1u) << "session 1 discovers anew";
}

TEST_F(BusListTest, TheListRegistersAgainOnceItHasBeenEmptied) {
    EXPECT_EQ(slaveCount(3, 0, 1), 4u);
    OrvSim::endSession(3);  // the list is empty now
    // A host that no longer knows the list: it must register again with its next bus.
    freshHost(BOARD);
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
        EXPECT_TRUE(waitUntil([&] { return OrvSim::listenerRegistrations() > registrations; }));
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
