// The cost of each exported call on the demo board with the demo data, as the README's cost
// table gives it: CPU time per call (stand-in host and virtual board included) and, as
// counters, the JTAG work per call (commands, bits written and read, round trips). Slave calls
// go to slave 0 of chain 1 (the control block), the transceiver ones to slave 0 of chain 2.
#include <benchmark/benchmark.h>

#include <cstdint>
#include <functional>
#include <string>
#include <utility>
#include <vector>

#include "host/OrvCore.h"
#include "host/OrvTypes.h"
#include "hostsim/Sim.h"
#include "hostsim/board/Board.h"
#include "orvnebu/orvnebu.h"

namespace {

constexpr uint32_t H = 1;
const ORV_SLAVE_REF CTRL{0, 1, 0};
const ORV_SLAVE_REF XCVR{0, 2, 0};

using Entries = std::vector<std::pair<std::string, std::string>>;

// A host map handle whose entries are set anew before every call, as a host fills its map.
class Map {
public:
    explicit Map(Entries entries)
        : handle_(OrvContainer_hashmapCStr_new()), entries_(std::move(entries)) {}
    ~Map() { OrvContainer_hashmapCStr_delete(handle_); }
    Map(const Map&) = delete;
    Map& operator=(const Map&) = delete;
    ORV_HASHMAP_HANDLE* fill() {
        auto& map = *static_cast<OrvRT::Orv_HashMapCStr*>(handle_);
        map.clear();
        for (const auto& entry : entries_) map.insert(entry);
        return &handle_;
    }

private:
    ORV_HASHMAP_HANDLE handle_;
    Entries entries_;
};

bool bringUp(benchmark::State& state) {
    OrvSim::resetHost();
    OrvSim::setBoard(OrvSim::Board::loadFile(std::string(NEBU_TEST_BOARDS_DIR) + "/demo.json"));
    OrvSim::setDataDir(NEBU_TEST_DATA_DIR);
    uint32_t count = 0;
    if (OrvNebu_getSlaveCount(H, 0, 1, &count) != ORVNEBU_OK || count == 0 ||
        OrvNebu_initialize(H, CTRL) != ORVNEBU_OK || OrvNebu_initialize(H, XCVR) != ORVNEBU_OK) {
        state.SkipWithError("the demo board's slaves cannot be initialised");
        return false;
    }
    return true;
}

void addCounters(OrvSim::JtagStats& sum, const OrvSim::JtagStats& s) {
    sum.commands += s.commands;
    sum.writeBits += s.writeBits;
    sum.readBits += s.readBits;
    sum.roundTrips += s.roundTrips;
}

// Times call; prepare, when given, runs untimed before each call and its JTAG work is left
// out of the counters.
void runCall(benchmark::State& state, const std::function<uint32_t()>& call,
             const std::function<void()>& prepare = nullptr) {
    if (!bringUp(state)) return;
    OrvSim::JtagStats sum;
    OrvSim::takeStats(H);
    for (auto _ : state) {
        if (prepare) {
            state.PauseTiming();
            addCounters(sum, OrvSim::takeStats(H));
            prepare();
            OrvSim::takeStats(H);
            state.ResumeTiming();
        }
        if (call() != ORVNEBU_OK) {
            state.SkipWithError("the call failed");
            break;
        }
    }
    addCounters(sum, OrvSim::takeStats(H));
    const double n = static_cast<double>(state.iterations());
    if (n > 0) {
        state.counters["commands"] = static_cast<double>(sum.commands) / n;
        state.counters["writeBits"] = static_cast<double>(sum.writeBits) / n;
        state.counters["readBits"] = static_cast<double>(sum.readBits) / n;
        state.counters["roundTrips"] = static_cast<double>(sum.roundTrips) / n;
    }
    OrvSim::endSession(H);
    OrvSim::resetHost();
}

uint32_t word = 0;
uint32_t status = 0;
uint32_t words[64];
char text[4 * 4 + 1];

void registerAll() {
    auto add = [](const std::string& name, std::function<void(benchmark::State&)> run) {
        benchmark::RegisterBenchmark(("Cost/" + name).c_str(), std::move(run))
            ->Unit(benchmark::kMicrosecond);
    };
    add("initialize", [](benchmark::State& s) {
        runCall(
            s, [] { return OrvNebu_initialize(H, CTRL); }, [] { OrvNebu_terminate(H, CTRL); });
    });
    add("terminate", [](benchmark::State& s) {
        runCall(
            s, [] { return OrvNebu_terminate(H, CTRL); }, [] { OrvNebu_initialize(H, CTRL); });
    });
    add("getBusInfo", [](benchmark::State& s) {
        Map map(Entries{});
        runCall(s, [&] { return OrvNebu_getBusInfo(H, 0, 1, map.fill()); });
    });
    add("getSlaveCount", [](benchmark::State& s) {
        runCall(s, [] { return OrvNebu_getSlaveCount(H, 0, 1, &word); });
    });
    add("getSlaveHandles", [](benchmark::State& s) {
        runCall(s, [] { return OrvNebu_getSlaveHandles(H, 0, 1, words, 8); });
    });
    add("getSlaveInfo", [](benchmark::State& s) {
        Map map(Entries{});
        runCall(s, [&] { return OrvNebu_getSlaveInfo(H, CTRL, map.fill()); });
    });
    add("getRegisters/all", [](benchmark::State& s) {
        Map map(Entries{});
        runCall(s, [&] { return OrvNebu_getRegisters(H, CTRL, map.fill()); });
    });
    add("getRegisters/one", [](benchmark::State& s) {
        Map map(Entries{{"SCRATCH", ""}});
        runCall(s, [&] { return OrvNebu_getRegisters(H, CTRL, map.fill()); });
    });
    add("setRegisters", [](benchmark::State& s) {
        Map map(Entries{{"SCRATCH", "1234"}});
        runCall(s, [&] { return OrvNebu_setRegisters(H, CTRL, map.fill()); });
    });
    add("getParameters", [](benchmark::State& s) {
        Map map(Entries{{"mode", ""}});
        runCall(s, [&] { return OrvNebu_getParameters(H, CTRL, map.fill()); });
    });
    add("setParameters", [](benchmark::State& s) {
        Map map(Entries{{"mode", "run"}});
        runCall(s, [&] { return OrvNebu_setParameters(H, CTRL, map.fill()); });
    });
    add("getParameterChoices", [](benchmark::State& s) {
        Map map(Entries{{"mode", ""}});
        std::vector<std::string> choices;
        runCall(s, [&] {
            ORV_STRINGLIST_HANDLE list = &choices;
            return OrvNebu_getParameterChoices(H, CTRL, map.fill(), &list);
        });
    });
    add("read", [](benchmark::State& s) {
        runCall(s, [] { return OrvNebu_read(H, CTRL, 0x0000, 4, text); });
    });
    add("write", [](benchmark::State& s) {
        runCall(s, [] { return OrvNebu_write(H, CTRL, 0x0020, 2, "11112222"); });
    });
    add("getBusErrorStatus", [](benchmark::State& s) {
        runCall(s, [] { return OrvNebu_getBusErrorStatus(H, 0, 1, words, 8); });
    });
    add("clearBusErrorStatus", [](benchmark::State& s) {
        runCall(s, [] { return OrvNebu_clearBusErrorStatus(H, 0, 1); });
    });
    add("resetBus",
        [](benchmark::State& s) { runCall(s, [] { return OrvNebu_resetBus(H, 0, 1); }); });
    add("testSlaveInterface", [](benchmark::State& s) {
        runCall(s, [] { return OrvNebu_testSlaveInterface(H, CTRL, &word); });
    });
    add("resetSlave",
        [](benchmark::State& s) { runCall(s, [] { return OrvNebu_resetSlave(H, CTRL); }); });
    add("disableSlave",
        [](benchmark::State& s) { runCall(s, [] { return OrvNebu_disableSlave(H, CTRL); }); });
    add("enableSlave",
        [](benchmark::State& s) { runCall(s, [] { return OrvNebu_enableSlave(H, CTRL); }); });
    add("singleSlaveRead", [](benchmark::State& s) {
        runCall(s, [] { return OrvNebu_singleSlaveRead(H, CTRL, 0x0003, &word, &status); });
    });
    add("singleSlaveWrite", [](benchmark::State& s) {
        runCall(s, [] { return OrvNebu_singleSlaveWrite(H, CTRL, 0x0020, 0x5555, &status); });
    });
    add("singleSlaveReadModifyWrite", [](benchmark::State& s) {
        runCall(s, [] {
            return OrvNebu_singleSlaveReadModifyWrite(H, CTRL, 0x0020, 0x0012, 0xFF00, &status);
        });
    });
    add("singleSlaveWriteAndInspect", [](benchmark::State& s) {
        runCall(s, [] {
            return OrvNebu_singleSlaveWriteAndInspect(H, CTRL, 0x0020, 0x1234, &word, &status);
        });
    });
    add("burstSlaveRead/64", [](benchmark::State& s) {
        runCall(s, [] { return OrvNebu_burstSlaveRead(H, CTRL, 0x0000, 1, words, 64, &status); });
    });
    add("burstSlaveWrite/64", [](benchmark::State& s) {
        runCall(s, [] { return OrvNebu_burstSlaveWrite(H, CTRL, 0x0100, 1, words, 64, &status); });
    });
    add("broadcastSingleWrite", [](benchmark::State& s) {
        runCall(s, [] { return OrvNebu_broadcastSingleWrite(H, 0, 1, 0x0020, 1, &status); });
    });

    // The transceiver dual's computed parameters.
    add("xcvr/getParameterChoices/line_rate0", [](benchmark::State& s) {
        Map map(Entries{{"line_rate0", ""}, {"refclk_freq0", "125"}});
        std::vector<std::string> choices;
        runCall(s, [&] {
            ORV_STRINGLIST_HANDLE list = &choices;
            return OrvNebu_getParameterChoices(H, XCVR, map.fill(), &list);
        });
    });
    add("xcvr/getParameters/line_rate0", [](benchmark::State& s) {
        Map map(Entries{{"line_rate0", ""}, {"refclk_freq0", "125"}});
        runCall(s, [&] { return OrvNebu_getParameters(H, XCVR, map.fill()); });
    });
    add("xcvr/setParameters/line_rate0", [](benchmark::State& s) {
        Map map(Entries{{"line_rate0", "2500.000 FB=2, REF=1, DIVSEL=1"}, {"sysclk_freq", "50"}});
        runCall(s, [&] { return OrvNebu_setParameters(H, XCVR, map.fill()); });
    });
    add("xcvr/getParameters/txusrclk0_freq", [](benchmark::State& s) {
        Map map(Entries{{"txusrclk0_freq", ""}, {"sysclk_freq", "50"}});
        runCall(s, [&] { return OrvNebu_getParameters(H, XCVR, map.fill()); });
    });
    add("xcvr/getRegisters/all", [](benchmark::State& s) {
        Map map(Entries{});
        runCall(s, [&] { return OrvNebu_getRegisters(H, XCVR, map.fill()); });
    });
}

const bool registered = (registerAll(), true);

}  // namespace
