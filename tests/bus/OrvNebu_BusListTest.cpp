// The bus list where the console cannot reach it: boards that change under a known bus, and the
// list's registration as the host's session listener.
#include "api/CallHost.h"

namespace {

// Chain 1 has a 2-slave master and device 1 is an ordinary device.
const char* const BOARD_CHANGED = R"({ "devices": [
  { "chains": { "1": { "cores": [ { "type": 14, "master": { "slaveCount": 2 } } ] } } },
  { "chains": { "1": { "cores": [ { "type": 14, "master": { "slaveCount": 2 } } ] } } } ] })";

class BusListTest : public CallHost {
protected:
    void SetUp() override {
        CallHost::SetUp();
        // The list outlives every host; drop what an earlier test may have left in it.
        for (uint32_t h = 0; h < 256; ++h) OrvRT::OrvNebu_BusList::getBusList()->sessionEnded(h);
        enableTrace();
    }
    uint32_t slaveCount(uint32_t handle, uint32_t device, uint32_t userChain) {
        uint32_t count = 0xFFFFFFFFu;
        clearTrace();
        EXPECT_EQ(OrvNebu_getSlaveCount(handle, device, userChain, &count), 0u) << said();
        return count;
    }
    // A call that needs the bus but no device access: its JTAG lines are a discovery.
    std::string touch(uint32_t handle, uint32_t device, uint32_t userChain) {
        uint32_t handles[1] = {0};
        clearTrace();
        std::string lines = after(OrvNebu_getSlaveHandles(handle, device, userChain, handles, 1));
        for (const std::string& line : traceStartingWith("jtag status")) lines += line + "|";
        return lines;
    }
};

TEST_F(BusListTest, DiscoveryFollowsTheBoardAndReplacesTheEarlierBus) {
    EXPECT_EQ(slaveCount(1, 0, 1), 4u);
    EXPECT_EQ(slaveCount(1, 0, 1), 4u);  // found again
    EXPECT_EQ(traceStartingWith("jtag status device=0 chain=1 core=0").size(), 1u);
    loadBoard(BOARD_CHANGED);
    EXPECT_EQ(slaveCount(1, 0, 1), 2u);
    clearTrace();
    ASSERT_EQ(OrvNebu_resetBus(1, 0, 1), 0u);
    EXPECT_EQ(traceStartingWith("jtag write cmd=1 bits=4 data=0xF").size(), 1u);
    // A master without positions replaces it: no bus to use.
    loadBoard(R"({ "devices": [ { "chains": {
        "1": { "cores": [ { "type": 14, "master": { "slaveCount": 0 } } ] } } } ] })");
    EXPECT_EQ(slaveCount(1, 0, 1), 0u);
    EXPECT_EQ(touch(1, 0, 1),
              "failed|256 Invalid NEBU Bus Device:0, user chain number/bus:1.|"
              "jtag status device=0 chain=1 core=0 type=14|");
    // Found while device 1 was an ordinary device: as a controller it leaves the list alone.
    loadBoard(BOARD_CHANGED);
    EXPECT_EQ(slaveCount(1, 1, 1), 2u);
    loadBoard(CALLS_BOARD);
    EXPECT_EQ(slaveCount(1, 1, 1), 0u);
    EXPECT_EQ(touch(1, 1, 1), "ok|");
}

TEST_F(BusListTest, TheListRegistersOnceAndAgainOnceEmptied) {
    EXPECT_EQ(slaveCount(3, 0, 1), 4u);
    const uint64_t registrations = OrvSim::listenerRegistrations();
    EXPECT_EQ(slaveCount(3, 0, 0), 2u);  // a list not empty stays registered once
    EXPECT_EQ(OrvSim::listenerRegistrations(), registrations);
    OrvSim::endSession(3);  // the list is empty now
    // A host that no longer knows the list: it must register again with its next bus.
    freshHost();
    enableTrace();
    EXPECT_EQ(slaveCount(4, 0, 0), 2u);
    OrvSim::endSession(4);
    EXPECT_EQ(touch(4, 0, 0),
              "ok|jtag status device=0 chain=0 core=0 type=14|"
              "jtag status device=0 chain=0 core=0 type=14|");
}

}  // namespace
