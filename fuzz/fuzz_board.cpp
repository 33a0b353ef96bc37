// Fuzzes the board file loader: the input is a board file. A board that loads is then walked
// the way a host would: every bus of it discovered and each of its first slaves identified,
// initialised with the demo data and read, so a strange board is also strange hardware for
// the plug-in.
#include <sys/resource.h>

#include <algorithm>
#include <string>
#include <vector>

#include "FuzzSupport.h"
#include "host/OrvCore.h"
#include "orvnebu/orvnebu.h"

// A small stack (256 KB, a quarter of what a host thread gets on Windows) instead of a Linux
// main thread's 8 MB: a walk that recurses once per level of nesting then runs out within the
// inputs the fuzzer tries (a few thousand levels), while a sound loader needs a few KB.
extern "C" int LLVMFuzzerInitialize(int*, char***) {
    constexpr rlim_t SMALL_STACK = 256u << 10;
    struct rlimit stack;
    if (getrlimit(RLIMIT_STACK, &stack) == 0 && stack.rlim_cur > SMALL_STACK) {
        stack.rlim_cur = SMALL_STACK;
        setrlimit(RLIMIT_STACK, &stack);
    }
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    using namespace nebufuzz;
    std::shared_ptr<OrvSim::Board> board;
    try {
        board = OrvSim::Board::loadText(std::string(reinterpret_cast<const char*>(data), size),
                                        "fuzz board");
    } catch (const OrvSim::BoardError& e) {
        NEBU_FUZZ_CHECK(std::string(e.what()).rfind("fuzz board", 0) == 0);
        return 0;
    }
    NEBU_FUZZ_CHECK(board != nullptr);

    HostRun run(board, demoDataDir());
    const uint32_t devices = std::min<uint32_t>(board->deviceCount(), 4);
    for (uint32_t device = 0; device < devices; ++device) {
        std::vector<uint32_t> chains = board->chains(device);
        if (chains.size() > 4) chains.resize(4);
        for (uint32_t chain : chains) {
            uint32_t count = 0;
            if (!run.check(OrvNebu_getSlaveCount(1, device, chain, &count))) continue;
            ORV_HASHMAP_HANDLE info = OrvContainer_hashmapCStr_new();
            run.check(OrvNebu_getBusInfo(1, device, chain, &info));
            for (uint32_t slave = 0; slave < std::min<uint32_t>(count, 8); ++slave) {
                const ORV_SLAVE_REF ref{device, chain, slave};
                run.check(OrvNebu_getSlaveInfo(1, ref, &info));
                if (run.check(OrvNebu_initialize(1, ref))) {
                    ORV_HASHMAP_HANDLE regs = OrvContainer_hashmapCStr_new();
                    run.check(OrvNebu_getRegisters(1, ref, &regs));
                    run.check(OrvNebu_getParameters(1, ref, &regs));
                    OrvContainer_hashmapCStr_delete(regs);
                }
                // The identification words directly, next to what the plug-in made of them.
                try {
                    (void)board->peek(device, chain, slave, 0x1FFF0);
                } catch (const std::out_of_range&) {
                }
            }
            uint32_t errors[10] = {};
            run.check(OrvNebu_getBusErrorStatus(1, device, chain, errors, 10));
            OrvContainer_hashmapCStr_delete(info);
        }
    }
    return 0;
}
