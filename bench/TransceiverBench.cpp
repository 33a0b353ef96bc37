// CPU cost of the transceiver test slaves' computed parameters through the exported calls,
// on the demo board's transceiver bus with the demo data; the JTAG work of each call is
// reported as counters (commands, bits and round trips per call).
#include <benchmark/benchmark.h>

#include <cstdint>
#include <string>
#include <vector>

#include "host/OrvCore.h"
#include "hostsim/Sim.h"
#include "hostsim/board/Board.h"
#include "orvnebu/orvnebu.h"

namespace {

const uint32_t HANDLE = 1;
const ORV_SLAVE_REF M3QRC{0, 2, 0};

// The demo board and data; the M3Qrc dual at slave 0 set up for the nine-choice example
// (data width 20, no maximum line rate).
bool bringUp(benchmark::State& state) {
    OrvSim::resetHost();
    OrvSim::setBoard(OrvSim::Board::loadFile(std::string(NEBU_TEST_BOARDS_DIR) + "/demo.json"));
    OrvSim::setDataDir(NEBU_TEST_DATA_DIR);
    OrvSim::getBoard()->poke(0, 2, 0, 0x02, 0);
    OrvSim::getBoard()->poke(0, 2, 0, 0x03, 0);
    OrvSim::getBoard()->poke(0, 2, 0, 0x04, 0x0300);
    if (OrvNebu_initialize(HANDLE, M3QRC) != 0) {
        state.SkipWithError("the demo M3Qrc slave cannot be initialised");
        return false;
    }
    OrvSim::takeStats(HANDLE);
    return true;
}

void report(benchmark::State& state) {
    const OrvSim::JtagStats stats = OrvSim::takeStats(HANDLE);
    const double calls = static_cast<double>(state.iterations());
    state.counters["commands"] = static_cast<double>(stats.commands) / calls;
    state.counters["readBits"] = static_cast<double>(stats.readBits) / calls;
    state.counters["writeBits"] = static_cast<double>(stats.writeBits) / calls;
    state.counters["roundTrips"] = static_cast<double>(stats.roundTrips) / calls;
    OrvSim::resetHost();
}

void BM_LineRateChoices(benchmark::State& state) {
    if (!bringUp(state)) return;
    ORV_HASHMAP_HANDLE params = OrvContainer_hashmapCStr_new();
    std::vector<std::string> choices;
    for (auto _ : state) {
        auto& map = *static_cast<OrvRT::Orv_HashMapCStr*>(params);
        map.clear();
        map["line_rate0"] = "";
        map["refclk_freq0"] = "125";
        ORV_STRINGLIST_HANDLE list = &choices;
        if (OrvNebu_getParameterChoices(HANDLE, M3QRC, &params, &list) != 0 ||
            choices.size() != 9) {
            state.SkipWithError("the nine line rates were not listed");
            break;
        }
        benchmark::DoNotOptimize(choices.data());
    }
    OrvContainer_hashmapCStr_delete(params);
    report(state);
}
BENCHMARK(BM_LineRateChoices)->Unit(benchmark::kMicrosecond);

// The system clock alone, and with all twelve clock frequencies of the dual.
void BM_ClockFrequencies(benchmark::State& state) {
    if (!bringUp(state)) return;
    const bool allClocks = state.range(0) != 0;
    const char* const clocks[] = {"txoutclk0_freq",  "txoutclk1_freq",  "rxrecclk0_freq",
                                  "rxrecclk1_freq",  "txusrclk0_freq",  "txusrclk1_freq",
                                  "txusrclk20_freq", "txusrclk21_freq", "rxusrclk0_freq",
                                  "rxusrclk1_freq",  "rxusrclk20_freq", "rxusrclk21_freq"};
    ORV_HASHMAP_HANDLE params = OrvContainer_hashmapCStr_new();
    for (auto _ : state) {
        auto& map = *static_cast<OrvRT::Orv_HashMapCStr*>(params);
        map.clear();
        map["sysclk_freq"] = "50";
        if (allClocks) {
            for (const char* clock : clocks) map[clock] = "";
        }
        if (OrvNebu_getParameters(HANDLE, M3QRC, &params) != 0) {
            state.SkipWithError("getParameters failed");
            break;
        }
        benchmark::DoNotOptimize(map.size());
    }
    OrvContainer_hashmapCStr_delete(params);
    report(state);
}
BENCHMARK(BM_ClockFrequencies)->Arg(0)->Arg(1)->Unit(benchmark::kMicrosecond);

}  // namespace
