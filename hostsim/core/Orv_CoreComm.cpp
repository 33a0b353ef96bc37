// The host's core status reads, answered by the board behind every session.
#include <stdexcept>
#include <string>

#include "host/OrvCore.h"
#include "host/OrvUtil.h"
#include "hostsim/Sim.h"
#include "hostsim/board/Board.h"
#include "hostsim/jtag/JtagSession.h"

namespace OrvRT {

void Orv_CoreComm::getCoreStatus(uint32_t handle, ORV_CORE_REF ref, ORV_CORE_INFO* info,
                                 Orv_ByteBuffer& status, uint32_t bitCount) {
    const std::shared_ptr<OrvSim::JtagSession> session = OrvSim::JtagSession::get(handle);
    session->noteHostCall();
    session->sendQueued();
    // Never more bits than the buffer holds.
    const uint64_t capacity = static_cast<uint64_t>(status.getSize()) * 8u;
    const auto bits = static_cast<uint32_t>(bitCount < capacity ? bitCount : capacity);
    ORV_CORE_INFO filled{};
    const std::shared_ptr<OrvSim::Board> board = OrvSim::getBoard();
    const bool found =
        board != nullptr && board->coreStatus(ref.device, ref.userChain, ref.coreIndex, filled.word,
                                              status.uPtr(), bits);
    session->coreStatusRead(ref.device, ref.userChain, ref.coreIndex, filled.word[1], found);
    if (!found) {
        throw std::logic_error("No core " + std::to_string(ref.coreIndex) + " on user chain " +
                               std::to_string(ref.userChain) + " of device " +
                               std::to_string(ref.device) + ".");
    }
    if (info != nullptr) *info = filled;
}

bool Orv_CoreComm::isTrellomDevice(uint32_t /*handle*/, uint32_t device) {
    const std::shared_ptr<OrvSim::Board> board = OrvSim::getBoard();
    return board != nullptr && board->isTrellom(device);
}

}  // namespace OrvRT
