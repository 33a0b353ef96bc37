// CPU cost of the exported bus-level calls against the virtual board, and their JTAG cost
// per call (commands, bits, round trips) as benchmark counters.
#include <benchmark/benchmark.h>

#include <cstdint>
#include <functional>
#include <memory>
#include <vector>

#include "host/OrvCore.h"
#include "hostsim/Sim.h"
#include "hostsim/board/Board.h"
#include "orvnebu/orvnebu.h"

namespace {

constexpr uint32_t H = 1;
constexpr uint32_t FAILED = 0x80000000u;

const char* const BOARD = R"({ "devices": [ { "chains": {
    "1": { "cores": [ { "type": 3 }, { "type": 14, "master": { "slaveCount": 8,
           "periodInt": 10, "dclkHasReset": true,
           "slaves": { "0": { "memory": { "0x10": "0xABCD" } }, "1": {} } } } ] } } } ] })";

// A fresh host with the bus already discovered.
void bringUp() {
    OrvSim::resetHost();
    OrvSim::setBoard(OrvSim::Board::loadText(BOARD, "bench board"));
    uint32_t count = 0;
    OrvNebu_getSlaveCount(H, 0, 1, &count);
    OrvSim::takeStats(H);
}

void tearDown() {
    OrvSim::endSession(H);
    OrvSim::resetHost();
}

// Runs call once per iteration and reports its JTAG cost per call.
void runCall(benchmark::State& state, const std::function<uint32_t()>& call) {
    bringUp();
    for (auto _ : state) {
        if (call() == FAILED) {
            state.SkipWithError("call failed");
            break;
        }
    }
    const OrvSim::JtagStats stats = OrvSim::takeStats(H);
    const double n = static_cast<double>(state.iterations());
    if (n > 0) {
        state.counters["commands"] = static_cast<double>(stats.commands) / n;
        state.counters["bits"] = static_cast<double>(stats.writeBits + stats.readBits) / n;
        state.counters["flushes"] = static_cast<double>(stats.flushes) / n;
        state.counters["statusReads"] = static_cast<double>(stats.statusReads) / n;
        state.counters["roundTrips"] = static_cast<double>(stats.roundTrips) / n;
    }
    tearDown();
}

const ORV_SLAVE_REF SLAVE = {0, 1, 0};
uint32_t word = 0;
uint32_t status = 0;
uint32_t words[255];
std::vector<uint32_t> burst(64, 0x5A5A);

void singleSlaveRead(benchmark::State& s) {
    runCall(s, [] { return OrvNebu_singleSlaveRead(H, SLAVE, 0x10, &word, nullptr); });
}
void singleSlaveReadStatus(benchmark::State& s) {
    runCall(s, [] { return OrvNebu_singleSlaveRead(H, SLAVE, 0x10, &word, &status); });
}
void singleSlaveWrite(benchmark::State& s) {
    runCall(s, [] { return OrvNebu_singleSlaveWrite(H, SLAVE, 0x10, 0x1234, nullptr); });
}
void singleSlaveWriteStatus(benchmark::State& s) {
    runCall(s, [] { return OrvNebu_singleSlaveWrite(H, SLAVE, 0x10, 0x1234, &status); });
}
void singleSlaveReadModifyWrite(benchmark::State& s) {
    runCall(s, [] {
        return OrvNebu_singleSlaveReadModifyWrite(H, SLAVE, 0x10, 0x12, 0xFF00, nullptr);
    });
}
void singleSlaveWriteAndInspect(benchmark::State& s) {
    runCall(
        s, [] { return OrvNebu_singleSlaveWriteAndInspect(H, SLAVE, 0x10, 0x12, &word, nullptr); });
}
void burstSlaveRead64(benchmark::State& s) {
    runCall(s,
            [] { return OrvNebu_burstSlaveRead(H, SLAVE, 0x100, 1, burst.data(), 64, nullptr); });
}
void burstSlaveWrite64(benchmark::State& s) {
    runCall(s,
            [] { return OrvNebu_burstSlaveWrite(H, SLAVE, 0x100, 1, burst.data(), 64, nullptr); });
}
void burstSlaveRead64Status(benchmark::State& s) {
    runCall(s,
            [] { return OrvNebu_burstSlaveRead(H, SLAVE, 0x100, 1, burst.data(), 64, &status); });
}
void broadcastSingleWrite(benchmark::State& s) {
    runCall(s, [] { return OrvNebu_broadcastSingleWrite(H, 0, 1, 0x20, 1, nullptr); });
}
void broadcastSingleWriteStatus(benchmark::State& s) {
    runCall(s, [] { return OrvNebu_broadcastSingleWrite(H, 0, 1, 0x20, 1, &status); });
}
void getBusErrorStatus(benchmark::State& s) {
    runCall(s, [] { return OrvNebu_getBusErrorStatus(H, 0, 1, words, 8); });
}
void resetBus(benchmark::State& s) {
    runCall(s, [] { return OrvNebu_resetBus(H, 0, 1); });
}
void clearBusErrorStatus(benchmark::State& s) {
    runCall(s, [] { return OrvNebu_clearBusErrorStatus(H, 0, 1); });
}
void resetSlave(benchmark::State& s) {
    runCall(s, [] { return OrvNebu_resetSlave(H, SLAVE); });
}
void testSlaveInterface(benchmark::State& s) {
    runCall(s, [] { return OrvNebu_testSlaveInterface(H, SLAVE, &word); });
}
void enableSlave(benchmark::State& s) {
    runCall(s, [] { return OrvNebu_enableSlave(H, SLAVE); });
}
void disableSlave(benchmark::State& s) {
    runCall(s, [] { return OrvNebu_disableSlave(H, SLAVE); });
}
void getSlaveHandles(benchmark::State& s) {
    runCall(s, [] { return OrvNebu_getSlaveHandles(H, 0, 1, words, 8); });
}
void getSlaveCount(benchmark::State& s) {
    runCall(s, [] { return OrvNebu_getSlaveCount(H, 0, 1, &word); });
}
void getBusInfo(benchmark::State& s) {
    ORV_HASHMAP_HANDLE map = OrvContainer_hashmapCStr_new();
    runCall(s, [&map] { return OrvNebu_getBusInfo(H, 0, 1, &map); });
    OrvContainer_hashmapCStr_delete(map);
}

}  // namespace

BENCHMARK(singleSlaveRead);
BENCHMARK(singleSlaveReadStatus);
BENCHMARK(singleSlaveWrite);
BENCHMARK(singleSlaveWriteStatus);
BENCHMARK(singleSlaveReadModifyWrite);
BENCHMARK(singleSlaveWriteAndInspect);
BENCHMARK(burstSlaveRead64);
BENCHMARK(burstSlaveWrite64);
BENCHMARK(burstSlaveRead64Status);
BENCHMARK(broadcastSingleWrite);
BENCHMARK(broadcastSingleWriteStatus);
BENCHMARK(getBusErrorStatus);
BENCHMARK(resetBus);
BENCHMARK(clearBusErrorStatus);
BENCHMARK(resetSlave);
BENCHMARK(testSlaveInterface);
BENCHMARK(enableSlave);
BENCHMARK(disableSlave);
BENCHMARK(getSlaveHandles);
BENCHMARK(getSlaveCount);
BENCHMARK(getBusInfo);
