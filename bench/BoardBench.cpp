// Cost of the virtual board itself: one single-word transfer (three commands) and a 64-word
// burst read, as the host delivers them, without the host's queue around them.
#include <benchmark/benchmark.h>

#include <cstdint>
#include <vector>

#include "hostsim/board/Board.h"

namespace {

std::shared_ptr<OrvSim::Board> benchBoard() {
    return OrvSim::Board::loadText(R"({"devices":[{"chains":{"1":{"cores":[{"type":3},
        {"type":14,"master":{"slaveCount":8,"slaves":{"2":{"memory":{"0x100":[1,2,3,4]}}}}}]}}}]})",
                                   "bench.json");
}

std::vector<uint8_t> word(uint32_t value, uint32_t bits) {
    std::vector<uint8_t> bytes((bits + 7) / 8);
    for (uint32_t k = 0; k < bits; ++k) {
        if ((value >> k) & 1u) bytes[k / 8] = uint8_t(bytes[k / 8] | (1u << (k % 8)));
    }
    return bytes;
}

void BM_BoardSingleRead(benchmark::State& state) {
    auto board = benchBoard();
    const auto control = word(2u << 20, 29);
    const auto address = word(0x100, 19);
    uint8_t out[2];
    for (auto _ : state) {
        board->runCommand(0, 1, 1, 4, control.data(), nullptr, 29);
        board->runCommand(0, 1, 1, 5, address.data(), nullptr, 19);
        board->runCommand(0, 1, 1, 6, nullptr, out, 16);
        benchmark::DoNotOptimize(out);
    }
}
BENCHMARK(BM_BoardSingleRead);

void BM_BoardBurstRead64(benchmark::State& state) {
    auto board = benchBoard();
    const auto control = word(64u | (1u << 17) | (1u << 18) | (2u << 20), 29);
    const auto address = word(0x100, 19);
    std::vector<uint8_t> out(128);
    for (auto _ : state) {
        board->runCommand(0, 1, 1, 4, control.data(), nullptr, 29);
        board->runCommand(0, 1, 1, 5, address.data(), nullptr, 19);
        board->runCommand(0, 1, 1, 6, nullptr, out.data(), 64 * 16);
        benchmark::DoNotOptimize(out.data());
    }
}
BENCHMARK(BM_BoardBurstRead64);

}  // namespace
