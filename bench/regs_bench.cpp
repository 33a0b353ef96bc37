// Register file parsing speed and the CPU cost of OrvNebu_getRegisters against the board.
#include <benchmark/benchmark.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <string>

#include "host/OrvCore.h"
#include "hostsim/Sim.h"
#include "hostsim/board/Board.h"
#include "orvnebu/orvnebu.h"
#include "registers/OrvNebu_DefaultRegisterHandler.h"

using OrvRT::OrvNebu_DefaultRegisterHandler;
using OrvRT::OrvNebu_RegisterHandler;

namespace {

std::string tempDir() {
    std::string pattern = (std::filesystem::temp_directory_path() / "nebu-bench-XXXXXX").string();
    if (mkdtemp(pattern.data()) == nullptr) std::abort();
    return pattern + "/";
}

// A register file of n registers, register i in word i (addresses from 0), in two slices.
std::string writeRegisterFile(const std::string& dir, const std::string& name, uint32_t n) {
    std::ofstream out(dir + name);
    out << "name,address,order,start_bit,end_bit,description,access,reset,include\n";
    for (uint32_t i = 0; i < n; ++i) {
        char line[160];
        std::snprintf(line, sizeof line,
                      "REG_%u,%x,0,0,7,low byte of register %u,rw,0,y\n"
                      "REG_%u,%x,1,8,15,high byte of register %u,rw,0,y\n",
                      i, i, i, i, i, i);
        out << line;
    }
    return dir + name;
}

void BM_ParseRegisterFile(benchmark::State& state) {
    const std::string dir = tempDir();
    // 50000 registers of two lines: 100000 register lines.
    const std::string file = writeRegisterFile(dir, "big.csv", 50000);
    for (auto _ : state) {
        OrvNebu_RegisterHandler* h = OrvNebu_DefaultRegisterHandler::getRegisterHandler(1, file);
        benchmark::DoNotOptimize(h);
        OrvNebu_DefaultRegisterHandler::releaseRegisterHandler(h);
    }
    state.SetItemsProcessed(state.iterations() * 100000);
    state.counters["lines"] = 100000;
    std::filesystem::remove_all(dir);
}
BENCHMARK(BM_ParseRegisterFile)->Unit(benchmark::kMillisecond);

// A host with one slave of a file of fileRegisters registers, and a map naming n of them.
class SlaveSetup {
public:
    SlaveSetup(uint32_t n, uint32_t fileRegisters) : dir_(tempDir()) {
        writeRegisterFile(dir_, "regs.csv", fileRegisters);
        std::ofstream(dir_ + "orvnebu_directory.csv")
            << "slave_type,orv_drv_ver_min,orv_drv_ver_max,registers,parameters\n"
               "0x11,1,0xFFFF,regs.csv,\n";
        OrvSim::resetHost();
        OrvSim::setBoard(OrvSim::Board::loadText(
            R"({ "devices": [ { "chains": { "1": { "cores": [ { "type": 3 }, { "type": 14,
                 "master": { "slaveCount": 2, "slaves": { "0": { "slaveType": "0x11",
                 "driverVersion": 1 } } } } ] } } } ] })",
            "bench board"));
        OrvSim::setDataDir(dir_);
        ok_ = OrvNebu_initialize(1, ref_) == ORVNEBU_OK;
        map_ = OrvContainer_hashmapCStr_new();
        auto& m = *static_cast<OrvRT::Orv_HashMapCStr*>(map_);
        for (uint32_t i = 0; i < n; ++i) m["REG_" + std::to_string(i)] = "5A";
        OrvSim::takeStats(1);
    }
    ~SlaveSetup() {
        OrvContainer_hashmapCStr_delete(map_);
        OrvNebu_terminate(1, ref_);
        OrvSim::resetHost();
        std::filesystem::remove_all(dir_);
    }
    bool ok() const { return ok_; }
    ORV_HASHMAP_HANDLE* map() { return &map_; }
    const ORV_SLAVE_REF& ref() const { return ref_; }

    // JTAG cost per call of the measured loop.
    void count(benchmark::State& state) {
        OrvSim::JtagStats s = OrvSim::takeStats(1);
        const double calls = static_cast<double>(state.iterations());
        state.counters["roundTrips/call"] = static_cast<double>(s.roundTrips) / calls;
        state.counters["flushes/call"] = static_cast<double>(s.flushes) / calls;
        state.counters["commands/call"] = static_cast<double>(s.commands) / calls;
        state.counters["readBits/call"] = static_cast<double>(s.readBits) / calls;
        state.counters["writeBits/call"] = static_cast<double>(s.writeBits) / calls;
    }

private:
    std::string dir_;
    ORV_SLAVE_REF ref_{0, 1, 0};
    ORV_HASHMAP_HANDLE map_ = nullptr;
    bool ok_ = false;
};

// getRegisters of n registers of a file of fileRegisters registers (args: n, fileRegisters).
void BM_GetRegisters(benchmark::State& state) {
    SlaveSetup setup(static_cast<uint32_t>(state.range(0)), static_cast<uint32_t>(state.range(1)));
    if (!setup.ok()) {
        state.SkipWithError("initialize failed");
        return;
    }
    for (auto _ : state) {
        if (OrvNebu_getRegisters(1, setup.ref(), setup.map()) != ORVNEBU_OK) {
            state.SkipWithError("getRegisters failed");
            break;
        }
    }
    setup.count(state);
}
BENCHMARK(BM_GetRegisters)
    ->Args({1, 100})
    ->Args({10, 100})
    ->Args({100, 100})
    ->Args({1, 5000})
    ->Args({10, 5000})
    ->Args({100, 5000})
    ->Unit(benchmark::kMicrosecond);

// setRegisters of n registers (args: n, fileRegisters).
void BM_SetRegisters(benchmark::State& state) {
    SlaveSetup setup(static_cast<uint32_t>(state.range(0)), static_cast<uint32_t>(state.range(1)));
    if (!setup.ok()) {
        state.SkipWithError("initialize failed");
        return;
    }
    for (auto _ : state) {
        if (OrvNebu_setRegisters(1, setup.ref(), setup.map()) != ORVNEBU_OK) {
            state.SkipWithError("setRegisters failed");
            break;
        }
    }
    setup.count(state);
}
BENCHMARK(BM_SetRegisters)
    ->Args({1, 100})
    ->Args({10, 100})
    ->Args({100, 100})
    ->Unit(benchmark::kMicrosecond);

}  // namespace
