// The exported frame's out-of-line parts.
#include "api/OrvNebu_Frame.h"

#include <cstring>
#include <stdexcept>
#include <string>

#include "base/Orv_AbortException.h"
#include "bus/OrvNebu_BusList.h"
#include "host/OrvCore.h"
#include "slave/OrvNebu_Slave.h"

namespace OrvRT {

namespace {
// A message sink that throws must not take the host down with it.
void send(uint32_t handle, uint32_t severity, const char* text) noexcept {
    try {
        OrvJtag_session_sendMessage(handle, severity, text);
    } catch (...) {
    }
}
}  // namespace

uint32_t reportCurrentException(uint32_t handle) noexcept {
    try {
        throw;
    } catch (const std::exception& e) {
        const char* text = e.what();
        uint32_t severity = (text != nullptr && std::strcmp(text, Orv_AbortException::MESSAGE) == 0)
                                ? ORVNEBU_SEVERITY_ABORT
                                : ORVNEBU_SEVERITY_ERROR;
        send(handle, severity, text != nullptr ? text : "");
    } catch (...) {
        send(handle, ORVNEBU_SEVERITY_ERROR, "Orv internal error.");
    }
    return ORVNEBU_RC_FAILED;
}

void checkArgument(bool ok, const char* message) {
    if (!ok) throw std::logic_error(message);
}

OrvNebu_Slave& resolveSlave(uint32_t handle, const ORV_SLAVE_REF& slaveRef) {
    Orv_Core* core = Orv_CoreList::getSlave(handle, &slaveRef);
    if (core != nullptr && core->isOrvNebuSlave()) {
        if (auto* slave = dynamic_cast<OrvNebu_Slave*>(core)) return *slave;
    }
    throw std::logic_error("Data structures not initialized for OrvNebu slave Device:" +
                           std::to_string(slaveRef.device) + ", user chain number/bus:" +
                           std::to_string(slaveRef.userChain) + ", slave index:" +
                           std::to_string(slaveRef.slaveIndex) + ".");
}

OrvNebu_TransactionPtr busOf(uint32_t handle, uint32_t device, uint32_t userChain) {
    return OrvNebu_BusList::getBusList()->getBus(handle, device, userChain);
}

}  // namespace OrvRT
