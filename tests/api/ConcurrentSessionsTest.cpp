// Sessions on their own threads share the library's process-wide state (bus list, register
// handler caches, parameter file cache): calls of two sessions at once must not corrupt it.
#include <gtest/gtest.h>

#include <atomic>
#include <string>
#include <thread>
#include <vector>

#include "host/OrvCore.h"
#include "hostsim/Sim.h"
#include "orvnebu/orvnebu.h"
#include "support/TestHost.h"

namespace {

class ConcurrentSessions : public TestHost {};

// Each session drives a device of its own (one JTAG target each), as a host would.
std::string threeDevices() {
    const std::string device = R"({ "chains": { "1": { "cores": [ { "type": 14, "master": {
        "slaveCount": 8, "slaves": { "0": { "slaveType": "0x11", "driverVersion": 1 } } } } ] } } })";
    return R"({ "devices": [ )" + device + ", " + device + ", " + device + " ] }";
}

// One session's work, repeated: everything that creates or drops shared state (the bus
// list, the register handler cache, the parameter file cache).
uint32_t sessionWork(uint32_t handle, uint32_t device, uint32_t rounds) {
    uint32_t failures = 0;
    const ORV_SLAVE_REF slave{device, 1, 0};
    for (uint32_t i = 0; i < rounds; ++i) {
        uint32_t count = 0;
        failures += OrvNebu_getSlaveCount(handle, device, 1, &count) != 0 || count != 8;
        failures += OrvNebu_initialize(handle, slave) != 0;
        ORV_HASHMAP_HANDLE regs = OrvContainer_hashmapCStr_new();
        ORV_HASHMAP_HANDLE params = OrvContainer_hashmapCStr_new();
        failures += OrvNebu_getRegisters(handle, slave, &regs) != 0;
        failures += OrvNebu_getParameters(handle, slave, &params) != 0;
        failures += static_cast<OrvRT::Orv_HashMapCStr*>(regs)->empty();
        OrvContainer_hashmapCStr_delete(regs);
        OrvContainer_hashmapCStr_delete(params);
        failures += OrvNebu_terminate(handle, slave) != 0;
        if (i % 4 == 3) OrvSim::endSession(handle);
    }
    return failures;
}

TEST_F(ConcurrentSessions, ThreeSessionsDiscoverInitializeReadAndEndAtOnce) {
    loadBoard(threeDevices());
    constexpr uint32_t ROUNDS = 120;
    std::atomic<uint32_t> failures(0);
    std::vector<std::thread> threads;
    for (uint32_t device = 0; device < 3; ++device) {
        threads.emplace_back(
            [device, &failures] { failures += sessionWork(7001 + device, device, ROUNDS); });
    }
    for (std::thread& t : threads) t.join();
    EXPECT_EQ(0u, failures.load());
    EXPECT_NO_MESSAGES();
    for (uint32_t handle : {7001u, 7002u, 7003u}) OrvSim::endSession(handle);
}

}  // namespace
