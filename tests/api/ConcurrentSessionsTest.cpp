// Sessions on their own threads share the library's process-wide state (bus list, register
// handler caches, parameter file cache): calls of two sessions at once must not corrupt it.
#include <atomic>
#include <thread>

#include "api/CallHost.h"

using ConcurrentSessions = CallHost;

TEST_F(ConcurrentSessions, ThreeSessionsDiscoverInitializeReadAndEndAtOnce) {
    const std::string one = R"({ "chains": { "1": { "cores": [ { "type": 14, "master": {
        "slaveCount": 8, "slaves": { "0": { "slaveType": "0x11", "driverVersion": 1 } } } } ] } } })";
    loadBoard(R"({ "devices": [ )" + one + ", " + one + ", " + one + " ] }");
    std::atomic<uint32_t> failures(0);
    std::vector<std::thread> threads;
    // Each session works on a device of its own (one JTAG target each), as a host does, with
    // everything that creates or drops shared state.
    for (uint32_t device = 0; device < 3; ++device) {
        threads.emplace_back([device, &failures] {
            const uint32_t handle = 7001 + device;
            const ORV_SLAVE_REF slave{device, 1, 0};
            for (uint32_t i = 0; i < 120; ++i) {
                uint32_t count = 0;
                OrvRT::Orv_HashMapCStr regsMap, paramsMap;
                ORV_HASHMAP_HANDLE regs = &regsMap, params = &paramsMap;
                failures += OrvNebu_getSlaveCount(handle, device, 1, &count) != 0 || count != 8;
                failures += OrvNebu_initialize(handle, slave) ||
                            OrvNebu_getRegisters(handle, slave, &regs) ||
                            OrvNebu_getParameters(handle, slave, &params) ||
                            OrvNebu_terminate(handle, slave) || regsMap.empty();
                if (i % 4 == 3) OrvSim::endSession(handle);
            }
        });
    }
    for (std::thread& t : threads) t.join();
    EXPECT_EQ(failures.load(), 0u);
    EXPECT_EQ(said(), "");
}
