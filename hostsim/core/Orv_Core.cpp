// The host's core base class.
#include "host/OrvCore.h"

namespace OrvRT {

Orv_Core::Orv_Core(uint32_t handle, ORV_CORE_REF ref, ORV_CORE_INFO info, const uint8_t* data,
                   uint32_t dataSize)
    : handle_(handle), ref_(ref), info_(info) {
    if (data != nullptr && dataSize > 0) data_.assign(data, data + dataSize);
}

Orv_Core::~Orv_Core() = default;

bool Orv_Core::initFromStatusWord(uint32_t /*statusWord*/) { return true; }

bool Orv_Core::isOrvNebuSlave() { return false; }

}  // namespace OrvRT
