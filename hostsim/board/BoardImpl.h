// The virtual board's inside: devices, chains, cores and the masters behind them; and the
// board file reader that builds it.
#pragma once

#include <cstdint>
#include <map>
#include <memory>
#include <mutex>
#include <string>
#include <vector>

#include "hostsim/board/Board.h"
#include "hostsim/board/BusMaster.h"

namespace OrvSim {

struct BoardCore {
    uint32_t type = 0;
    // The `status` of the board file, replacing the computed status bits when present.
    bool hasRawStatus = false;
    std::vector<uint8_t> rawStatus;  // bit k = bit k%8 of byte k/8
    // The `failingCommands` of the board file: bit c set when command c to the core fails.
    uint32_t failingCommands = 0;
    std::unique_ptr<BusMaster> master;
};

struct BoardChain {
    std::vector<BoardCore> cores;
};

struct BoardDevice {
    bool trellom = false;
    std::map<uint32_t, BoardChain> chains;
};

struct Board::Impl {
    std::vector<BoardDevice> devices;
    // Sessions run on their own threads and share the board.
    mutable std::mutex mutex;
};

// Builds a board from board file text; name stands for the file in error messages.
// Throws BoardError.
std::unique_ptr<Board::Impl> readBoard(const std::string& text, const std::string& name);

}  // namespace OrvSim
