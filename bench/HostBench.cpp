// Cost of the stand-in host's hot calls: the target lock, queued writes with their flush, and
// a read transfer against the virtual board, tracing off.
#include <benchmark/benchmark.h>

#include <cstdint>

#include "host/OrvCore.h"
#include "host/OrvJtag.h"
#include "hostsim/Sim.h"
#include "hostsim/board/Board.h"

namespace {

const char* const BOARD = R"({ "devices": [ { "chains": { "1": { "cores": [
  { "type": 3 },
  { "type": 14, "master": { "slaveCount": 2, "slaves": { "0": { "memory": { "0x10": "0x1234" } } } } }
] } } } ] })";

constexpr uint32_t HANDLE = 1;

void setUpHost() {
    OrvSim::resetHost();
    OrvSim::setBoard(OrvSim::Board::loadText(BOARD, "bench board"));
}

void writeWord(uint32_t cmd, uint32_t value, uint32_t bits) {
    const uint8_t bytes[4] = {static_cast<uint8_t>(value), static_cast<uint8_t>(value >> 8),
                              static_cast<uint8_t>(value >> 16), static_cast<uint8_t>(value >> 24)};
    OrvCore_runCoreCommand(HANDLE, 0, 1, 1, cmd, bytes, nullptr, bits, 0);
}

void BM_NestedTargetLock(benchmark::State& state) {
    setUpHost();
    for (auto _ : state) {
        OrvRT::OrvJtagTargetLock outer(HANDLE, 60000);
        OrvRT::OrvJtagTargetLock inner(HANDLE, 60000);
        benchmark::ClobberMemory();
    }
    OrvSim::resetHost();
}
BENCHMARK(BM_NestedTargetLock);

// A single-word bus write as the plug-in sends it: three queued commands and a flush.
void BM_SingleWriteTransfer(benchmark::State& state) {
    setUpHost();
    for (auto _ : state) {
        writeWord(4, 0, 29);
        writeWord(5, 0x10 | 1u << 17, 19);
        writeWord(6, 0xBEEF, 18);
        OrvJtag_target_flush(HANDLE);
    }
    state.SetItemsProcessed(static_cast<int64_t>(state.iterations()) * 4);
    OrvSim::resetHost();
}
BENCHMARK(BM_SingleWriteTransfer);

// A single-word bus read: two queued commands and a read that sends them.
void BM_SingleReadTransfer(benchmark::State& state) {
    setUpHost();
    uint8_t out[4] = {};
    for (auto _ : state) {
        writeWord(4, 0, 29);
        writeWord(5, 0x10, 19);
        OrvCore_runCoreCommand(HANDLE, 0, 1, 1, 6, nullptr, out, 16, 0);
        benchmark::DoNotOptimize(out);
    }
    state.SetItemsProcessed(static_cast<int64_t>(state.iterations()) * 3);
    OrvSim::resetHost();
}
BENCHMARK(BM_SingleReadTransfer);

void BM_CoreListLookup(benchmark::State& state) {
    setUpHost();
    OrvRT::Orv_CoreList::addCore(
        HANDLE, new OrvRT::Orv_Core(HANDLE, ORV_CORE_REF{0, 1, 0}, ORV_CORE_INFO{}, nullptr, 0));
    const ORV_SLAVE_REF ref{0, 1, 0};
    for (auto _ : state) benchmark::DoNotOptimize(OrvRT::Orv_CoreList::getSlave(HANDLE, &ref));
    OrvSim::resetHost();
}
BENCHMARK(BM_CoreListLookup);

}  // namespace

BENCHMARK_MAIN();
