// A tiny host built against an installed OrvNebu: it brings up the stand-in host with a board,
// asks the plug-in how many slaves a bus has and prints the count.
#include <cstdint>
#include <cstdio>
#include <exception>
#include <string>

#include <orvnebu/orvnebu.h>

#include "hostsim/Sim.h"
#include "hostsim/board/Board.h"

int main(int argc, char** argv) {
    if (argc < 2 || argc > 5) {
        std::fprintf(stderr, "usage: %s BOARD [DATA_DIR] [DEVICE] [CHAIN]\n", argv[0]);
        return 2;
    }
    try {
        OrvSim::setBoard(OrvSim::Board::loadFile(argv[1]));
    } catch (const std::exception& e) {
        std::fprintf(stderr, "%s\n", e.what());
        return 2;
    }
    if (argc > 2) OrvSim::setDataDir(argv[2]);
    OrvSim::setMessageSink([](uint32_t, uint32_t severity, const std::string& text) {
        std::printf("message %u: %s\n", static_cast<unsigned>(severity), text.c_str());
    });
    const uint32_t device = argc > 3 ? static_cast<uint32_t>(std::stoul(argv[3])) : 0;
    const uint32_t chain = argc > 4 ? static_cast<uint32_t>(std::stoul(argv[4])) : 1;

    const uint32_t session = 1;
    uint32_t count = 0;
    const uint32_t rc = OrvNebu_getSlaveCount(session, device, chain, &count);
    std::printf("getSlaveCount rc=0x%08X count=%u\n", static_cast<unsigned>(rc),
                static_cast<unsigned>(count));
    // The plug-in drops its bus objects while it is still loaded.
    OrvSim::endSession(session);
    OrvSim::setMessageSink(nullptr);
    OrvSim::setBoard(nullptr);
    return rc == ORVNEBU_OK ? 0 : 1;
}
