// The host's command channel to the cores of a chain and its core count read. Writes wait in
// the session's JTAG queue; reads, status and count reads send it first.
#include <cstring>
#include <memory>
#include <stdexcept>
#include <string>

#include "host/OrvCore.h"
#include "hostsim/Sim.h"
#include "hostsim/board/Board.h"
#include "hostsim/core/CoreSessions.h"
#include "hostsim/jtag/JtagSession.h"

namespace {

constexpr uint32_t RESULT_OK = 0;
constexpr uint32_t RESULT_FAILED = 1;

void runQueuedWrite(void* /*context*/, const OrvSim::JtagCommand& command, const uint8_t* bits) {
    // The board of the moment the queue is sent, as on a cable.
    const std::shared_ptr<OrvSim::Board> board = OrvSim::getBoard();
    if (board != nullptr) {
        board->runCommand(command.device, command.chain, command.core, command.cmd, bits, nullptr,
                          command.bitCount);
    }
}

}  // namespace

extern "C" {

int32_t OrvCore_getCoreCount(uint32_t handle, uint32_t device, uint32_t userChain,
                             uint32_t* count) {
    if (count == nullptr) return -1;
    const std::shared_ptr<OrvSim::JtagSession> session = OrvSim::JtagSession::get(handle);
    session->noteHostCall();
    session->sendQueued();
    session->coreCountRead();
    const std::shared_ptr<OrvSim::Board> board = OrvSim::getBoard();
    uint32_t found = 0;
    if (board == nullptr || !board->coreCount(device, userChain, found)) return -1;
    *count = found;
    return 0;
}

uint32_t OrvCore_runCoreCommand(uint32_t handle, uint32_t device, uint32_t userChain,
                                uint32_t coreIndex, uint32_t cmd, const uint8_t* dataIn,
                                uint8_t* dataOut, uint32_t bitCount, uint32_t /*flags*/) {
    // Exactly one direction.
    if ((dataIn == nullptr) == (dataOut == nullptr)) return RESULT_FAILED;
    const std::shared_ptr<OrvSim::JtagSession> session = OrvSim::JtagSession::get(handle);
    session->noteHostCall();
    // A channel the board says is broken refuses before anything is shifted.
    if (OrvSim::boardMayRefuseCommands()) {
        const std::shared_ptr<OrvSim::Board> board = OrvSim::getBoard();
        if (board != nullptr && board->commandFails(device, userChain, coreIndex, cmd)) {
            throw std::runtime_error("Command " + std::to_string(cmd) + " to core " +
                                     std::to_string(coreIndex) + " on user chain " +
                                     std::to_string(userChain) + " of device " +
                                     std::to_string(device) + " failed.");
        }
    }
    const OrvSim::JtagCommand command{device, userChain, coreIndex, cmd, bitCount};
    if (dataIn != nullptr) {
        session->queueWrite(&runQueuedWrite, nullptr, command, dataIn);
        return RESULT_OK;
    }
    session->sendQueued();
    const std::shared_ptr<OrvSim::Board> board = OrvSim::getBoard();
    const bool ok = board != nullptr && board->runCommand(device, userChain, coreIndex, cmd,
                                                          nullptr, dataOut, bitCount);
    // Nothing answered: the caller reads zeros.
    if (!ok) std::memset(dataOut, 0, bitCount / 8u + (bitCount % 8u != 0 ? 1u : 0u));
    session->readDone(command, dataOut);
    return ok ? RESULT_OK : RESULT_FAILED;
}

}  // extern "C"
