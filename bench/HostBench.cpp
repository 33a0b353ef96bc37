// Cost of the stand-in host's hot calls: the target lock, queued writes with their flush, and
// a read transfer against the virtual board, tracing off.
#include <benchmark/benchmark.h>

#include <cstdint>
#if defined(__GLIBC__)
#include <malloc.h>
#endif

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

#if defined(__GLIBC__)
size_t heapInUse() { return mallinfo2().uordblks; }

// What the host keeps of a session after its end: each of state.range(0) sessions is used the
// way the plug-in uses one (target lock, core list, a queued write and its flush), then ended.
// bytesPerSession is the heap still in use afterwards, divided by the number of sessions.
void BM_EndedSessionsMemory(benchmark::State& state) {
    const auto sessions = static_cast<uint32_t>(state.range(0));
    const ORV_SLAVE_REF ref{0, 1, 0};
    double kept = 0;
    for (auto _ : state) {
        setUpHost();
        const size_t before = heapInUse();
        for (uint32_t handle = 1000; handle < 1000 + sessions; ++handle) {
            OrvRT::OrvJtagTargetLock lock(handle, 60000);
            benchmark::DoNotOptimize(OrvRT::Orv_CoreList::getSlave(handle, &ref));
            const uint8_t bits[4] = {};
            OrvCore_runCoreCommand(handle, 0, 1, 1, 4, bits, nullptr, 29, 0);
            OrvJtag_target_flush(handle);
        }
        for (uint32_t handle = 1000; handle < 1000 + sessions; ++handle) OrvSim::endSession(handle);
        kept = (static_cast<double>(heapInUse()) - static_cast<double>(before)) / sessions;
    }
    state.counters["bytesPerSession"] = kept;
    OrvSim::resetHost();
}
BENCHMARK(BM_EndedSessionsMemory)->Arg(40000)->Iterations(1)->Unit(benchmark::kMillisecond);
#endif

}  // namespace

BENCHMARK_MAIN();
