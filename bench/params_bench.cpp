// CPU cost of the exported parameter calls against the demo board (slave 0 of device 0, user
// chain 1: the control block with its choice parameters).
#include <benchmark/benchmark.h>

#include <cstdio>
#include <memory>
#include <string>

#include "host/OrvCore.h"
#include "host/OrvTypes.h"
#include "hostsim/Sim.h"
#include "hostsim/board/Board.h"
#include "orvnebu/orvnebu.h"

namespace {

constexpr uint32_t SESSION = 1;
const ORV_SLAVE_REF CTRL = {0, 1, 0};

// Brings up a fresh host with the demo board and an initialised control slave (other
// benchmarks of the program reset the host too).
void bringUp(benchmark::State& state) {
    OrvSim::resetHost();
    OrvSim::setBoard(OrvSim::Board::loadFile(NEBU_TEST_BOARDS_DIR "/demo.json"));
    OrvSim::setDataDir(NEBU_TEST_DATA_DIR);
    OrvSim::setMessageSink([](uint32_t, uint32_t severity, const std::string& text) {
        std::fprintf(stderr, "message %u: %s\n", severity, text.c_str());
    });
    if (OrvNebu_initialize(SESSION, CTRL) != ORVNEBU_OK) state.SkipWithError("initialize failed");
    OrvSim::takeStats(SESSION);
}

struct HostMap {
    HostMap() : handle(OrvContainer_hashmapCStr_new()) {}
    ~HostMap() { OrvContainer_hashmapCStr_delete(handle); }
    OrvRT::Orv_HashMapCStr& map() { return *static_cast<OrvRT::Orv_HashMapCStr*>(handle); }
    ORV_HASHMAP_HANDLE handle;
};

void BM_getParameters_oneChoice(benchmark::State& state) {
    bringUp(state);
    HostMap params;
    for (auto _ : state) {
        params.map().clear();
        params.map()["mode"];
        if (OrvNebu_getParameters(SESSION, CTRL, &params.handle) != ORVNEBU_OK) {
            state.SkipWithError("getParameters failed");
            break;
        }
        benchmark::DoNotOptimize(params.map());
    }
    OrvSim::JtagStats stats = OrvSim::takeStats(SESSION);
    state.counters["roundTrips/call"] = benchmark::Counter(static_cast<double>(stats.roundTrips),
                                                           benchmark::Counter::kAvgIterations);
}
BENCHMARK(BM_getParameters_oneChoice);

void BM_getParameters_all(benchmark::State& state) {
    bringUp(state);
    HostMap params;
    for (auto _ : state) {
        params.map().clear();
        if (OrvNebu_getParameters(SESSION, CTRL, &params.handle) != ORVNEBU_OK) {
            state.SkipWithError("getParameters failed");
            break;
        }
        benchmark::DoNotOptimize(params.map());
    }
    OrvSim::JtagStats stats = OrvSim::takeStats(SESSION);
    state.counters["roundTrips/call"] = benchmark::Counter(static_cast<double>(stats.roundTrips),
                                                           benchmark::Counter::kAvgIterations);
}
BENCHMARK(BM_getParameters_all);

void BM_setParameters_oneChoice(benchmark::State& state) {
    bringUp(state);
    HostMap params;
    for (auto _ : state) {
        params.map().clear();
        params.map()["mode"] = "run";
        if (OrvNebu_setParameters(SESSION, CTRL, &params.handle) != ORVNEBU_OK) {
            state.SkipWithError("setParameters failed");
            break;
        }
    }
    OrvSim::JtagStats stats = OrvSim::takeStats(SESSION);
    state.counters["roundTrips/call"] = benchmark::Counter(static_cast<double>(stats.roundTrips),
                                                           benchmark::Counter::kAvgIterations);
}
BENCHMARK(BM_setParameters_oneChoice);

}  // namespace
