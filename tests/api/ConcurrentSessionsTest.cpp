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

// One session's work, repeated: everything that creates or drops shared state.
uint32_t sessionWork(uint32_t handle, uint32_t rounds) {
    uint32_t failures = 0;
    const ORV_SLAVE_REF slave{0, 1, 0};
    for (uint32_t i = 0; i < rounds; ++i) {
        uint32_t count = 0;
        failures += OrvNebu_getSlaveCount(handle, 0, 1, &count) != 0 || count != 8;
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

TEST_F(ConcurrentSessions, TwoSessionsDiscoverInitializeReadAndEndAtOnce) {
    loadBoardFile(std::string(NEBU_TEST_BOARDS_DIR) + "/demo.json");
    constexpr uint32_t ROUNDS = 120;
    std::atomic<uint32_t> failures(0);
    std::vector<std::thread> threads;
    for (uint32_t handle : {7001u, 7002u, 7003u}) {
        threads.emplace_back([handle, &failures] { failures += sessionWork(handle, ROUNDS); });
    }
    for (std::thread& t : threads) t.join();
    EXPECT_EQ(0u, failures.load());
    EXPECT_NO_MESSAGES();
    for (uint32_t handle : {7001u, 7002u, 7003u}) OrvSim::endSession(handle);
}

}  // namespace
