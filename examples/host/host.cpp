// A tiny host built against an installed OrvNebu: it brings up the stand-in host with a board,
// asks the plug-in how many slaves a bus has and prints the count.
#include <orvnebu/orvnebu.h>

#include <cstdint>
#include <cstdio>
#include <exception>
#include <string>

#include "hostsim/Sim.h"
#include "hostsim/board/Board.h"

namespace {
bool parseIndex(const char* text, uint32_t& value) {
    const std::string word(text);
    if (word.empty() || word.size() > 10 ||
        word.find_first_not_of("0123456789") != std::string::npos)
        return false;
    const unsigned long long number = std::stoull(word);
    if (number > 0xFFFFFFFFull) return false;
    value = static_cast<uint32_t>(number);
    return true;
}
}  // namespace

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
    uint32_t device = 0;
    uint32_t chain = 1;
    if ((argc > 3 && !parseIndex(argv[3], device)) || (argc > 4 && !parseIndex(argv[4], chain))) {
        std::fprintf(stderr, "DEVICE and CHAIN are decimal numbers below 2^32\n");
        return 2;
    }

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
