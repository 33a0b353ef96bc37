// The exported calls that reach a bus without a slave object: bus enumeration and
// information, error status, resets, single, burst and broadcast transfers.
#include "api/OrvNebu_Frame.h"
#include "bus/OrvNebu_BusList.h"
#include "host/OrvTypes.h"
#include "orvnebu/orvnebu.h"

using namespace OrvRT;

namespace {

// The frame of a bus call: the lock, then the bus's transaction object (an unknown bus is
// reported before any argument check), then op with it.
template <class Op>
uint32_t onBus(uint32_t handle, uint32_t device, uint32_t userChain, Op&& op) noexcept {
    return lockedFrame(handle, [&] { op(*busOf(handle, device, userChain)); });
}

}  // namespace

extern "C" {

ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_getBusInfo(uint32_t handle, uint32_t device,
                                                     uint32_t userChain,
                                                     ORV_HASHMAP_HANDLE* busInfoHash) {
    return onBus(handle, device, userChain, [&](OrvNebu_Transaction& bus) {
        // A null handle behind the address would be written through just the same.
        checkArgument(busInfoHash != nullptr && *busInfoHash != nullptr,
                      "OrvNebu_getBusInfo() argument checking failed:busInfoHash != 0");
        bus.getBusInfo(handle, device, userChain, *busInfoHash);
    });
}

ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_getSlaveCount(uint32_t handle, uint32_t device,
                                                        uint32_t userChain, uint32_t* count) {
    return lockedFrame(handle, [&] {
        checkArgument(count != nullptr,
                      "OrvNebu_getSlaveCount() argument checking failed:count != 0");
        *count = OrvNebu_BusList::getBusList()->discoverBus(handle, device, userChain);
    });
}

ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_getSlaveHandles(uint32_t handle, uint32_t device,
                                                          uint32_t userChain,
                                                          uint32_t* slaveHandles, uint32_t count) {
    return onBus(handle, device, userChain, [&](OrvNebu_Transaction& bus) {
        checkArgument(slaveHandles != nullptr && count != 0,
                      "OrvNebu_getSlaveHandles() argument checking failed:"
                      "(slaveHandles != 0) && (count != 0)");
        bus.getSlaveHandles(handle, device, userChain, slaveHandles, count);
    });
}

ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_getBusErrorStatus(uint32_t handle, uint32_t device,
                                                            uint32_t userChain,
                                                            uint32_t* errorStatus,
                                                            uint32_t errorStatusLen) {
    return onBus(handle, device, userChain, [&](OrvNebu_Transaction& bus) {
        checkArgument(errorStatus != nullptr && errorStatusLen != 0,
                      "OrvNebu_getBusErrorStatus() argument checking failed:"
                      "(errorStatus != 0) && (errorStatusLen != 0)");
        bus.getBusErrorStatus(handle, device, userChain, errorStatus, errorStatusLen);
    });
}

ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_clearBusErrorStatus(uint32_t handle, uint32_t device,
                                                              uint32_t userChain) {
    return onBus(handle, device, userChain, [&](OrvNebu_Transaction& bus) {
        bus.clearBusErrorStatus(handle, device, userChain);
    });
}

ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_resetBus(uint32_t handle, uint32_t device,
                                                   uint32_t userChain) {
    return onBus(handle, device, userChain,
                 [&](OrvNebu_Transaction& bus) { bus.resetBus(handle, device, userChain); });
}

ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_testSlaveInterface(uint32_t handle,
                                                             ORV_SLAVE_REF slaveRef,
                                                             uint32_t* result) {
    return onBus(handle, slaveRef.device, slaveRef.userChain, [&](OrvNebu_Transaction& bus) {
        checkArgument(result != nullptr,
                      "OrvNebu_testSlaveInterface() argument checking failed:result != 0");
        bus.testSlaveInterface(handle, slaveRef, result);
    });
}

ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_resetSlave(uint32_t handle, ORV_SLAVE_REF slaveRef) {
    return onBus(handle, slaveRef.device, slaveRef.userChain,
                 [&](OrvNebu_Transaction& bus) { bus.resetSlave(handle, slaveRef); });
}

ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_disableSlave(uint32_t handle, ORV_SLAVE_REF slaveRef) {
    return onBus(handle, slaveRef.device, slaveRef.userChain,
                 [&](OrvNebu_Transaction& bus) { bus.disableSlave(handle, slaveRef); });
}

ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_enableSlave(uint32_t handle, ORV_SLAVE_REF slaveRef) {
    return onBus(handle, slaveRef.device, slaveRef.userChain,
                 [&](OrvNebu_Transaction& bus) { bus.enableSlave(handle, slaveRef); });
}

ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_singleSlaveRead(uint32_t handle, ORV_SLAVE_REF slaveRef,
                                                          uint32_t address, uint32_t* buffer,
                                                          uint32_t* status) {
    return onBus(handle, slaveRef.device, slaveRef.userChain, [&](OrvNebu_Transaction& bus) {
        checkArgument(buffer != nullptr,
                      "OrvNebu_singleSlaveRead() argument checking failed:buffer != 0");
        bus.singleSlaveRead(handle, slaveRef, address, buffer, status);
    });
}

ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_singleSlaveWrite(uint32_t handle, ORV_SLAVE_REF slaveRef,
                                                           uint32_t address, uint32_t value,
                                                           uint32_t* status) {
    return onBus(handle, slaveRef.device, slaveRef.userChain, [&](OrvNebu_Transaction& bus) {
        bus.singleSlaveWrite(handle, slaveRef, address, value, status);
    });
}

ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_singleSlaveReadModifyWrite(uint32_t handle,
                                                                     ORV_SLAVE_REF slaveRef,
                                                                     uint32_t address,
                                                                     uint32_t value, uint32_t mask,
                                                                     uint32_t* status) {
    return onBus(handle, slaveRef.device, slaveRef.userChain, [&](OrvNebu_Transaction& bus) {
        bus.singleSlaveReadModifyWrite(handle, slaveRef, address, value, mask, status);
    });
}

ORVNEBU_API uint32_t ORVNEBU_CALL
OrvNebu_singleSlaveWriteAndInspect(uint32_t handle, ORV_SLAVE_REF slaveRef, uint32_t address,
                                   uint32_t value, uint32_t* rdBuf, uint32_t* status) {
    return onBus(handle, slaveRef.device, slaveRef.userChain, [&](OrvNebu_Transaction& bus) {
        checkArgument(rdBuf != nullptr,
                      "OrvNebu_singleSlaveWriteAndInspect() argument checking failed:rdBuf != 0");
        bus.singleSlaveWriteAndInspect(handle, slaveRef, address, value, rdBuf, status);
    });
}

ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_burstSlaveRead(uint32_t handle, ORV_SLAVE_REF slaveRef,
                                                         uint32_t address, uint32_t incrAddress,
                                                         uint32_t* buffer, uint32_t numRead,
                                                         uint32_t* status) {
    return onBus(handle, slaveRef.device, slaveRef.userChain, [&](OrvNebu_Transaction& bus) {
        checkArgument(buffer != nullptr && numRead != 0,
                      "OrvNebu_burstSlaveRead() argument checking failed:"
                      "(buffer != 0) && (numRead != 0)");
        bus.burstSlaveRead(handle, slaveRef, address, incrAddress, buffer, numRead, status);
    });
}

ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_burstSlaveWrite(uint32_t handle, ORV_SLAVE_REF slaveRef,
                                                          uint32_t address, uint32_t incrAddress,
                                                          const uint32_t* buffer, uint32_t numWrite,
                                                          uint32_t* status) {
    return onBus(handle, slaveRef.device, slaveRef.userChain, [&](OrvNebu_Transaction& bus) {
        checkArgument(buffer != nullptr && numWrite != 0,
                      "OrvNebu_burstSlaveWrite() argument checking failed:"
                      "(buffer != 0) && (numWrite != 0)");
        bus.burstSlaveWrite(handle, slaveRef, address, incrAddress, buffer, numWrite, status);
    });
}

ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_broadcastSingleWrite(uint32_t handle, uint32_t device,
                                                               uint32_t userChain, uint32_t address,
                                                               uint32_t value, uint32_t* status) {
    return onBus(handle, device, userChain, [&](OrvNebu_Transaction& bus) {
        bus.broadcastSingleWrite(handle, device, userChain, address, value, status);
    });
}

}  // extern "C"
