// The operations of one NEBU bus, as the bus master offers them.
#pragma once

#include <cstdint>

#include "host/OrvTypes.h"

namespace OrvRT {

// One object per bus, owned by the bus list. All operations throw std::logic_error on failure.
// Slave data words are 16 bits wide, carried in the low half of 32-bit words. A null status
// pointer means no error status is delivered.
class OrvNebu_Transaction {
public:
    virtual ~OrvNebu_Transaction() = default;

    virtual uint32_t getSlaveCount(uint32_t handle, uint32_t device, uint32_t userChain) = 0;
    // Writes the handles 0..count-1; returns count.
    virtual uint32_t getSlaveHandles(uint32_t handle, uint32_t device, uint32_t userChain,
                                     uint32_t* slaveHandles, uint32_t count) = 0;
    // busInfoHash: the caller's map handle (an Orv_HashMapCStr).
    virtual void getBusInfo(uint32_t handle, uint32_t device, uint32_t userChain,
                            ORV_HASHMAP_HANDLE busInfoHash) = 0;
    virtual void getBusErrorStatus(uint32_t handle, uint32_t device, uint32_t userChain,
                                   uint32_t* errorStatus, uint32_t errorStatusLen) = 0;
    virtual void clearBusErrorStatus(uint32_t handle, uint32_t device, uint32_t userChain) = 0;
    virtual void resetBus(uint32_t handle, uint32_t device, uint32_t userChain) = 0;
    virtual void testSlaveInterface(uint32_t handle, ORV_SLAVE_REF slaveRef, uint32_t* result) = 0;
    virtual void resetSlave(uint32_t handle, ORV_SLAVE_REF slaveRef) = 0;
    virtual void disableSlave(uint32_t handle, ORV_SLAVE_REF slaveRef) = 0;
    virtual void enableSlave(uint32_t handle, ORV_SLAVE_REF slaveRef) = 0;
    virtual void singleSlaveRead(uint32_t handle, ORV_SLAVE_REF slaveRef, uint32_t address,
                                 uint32_t* buffer, uint32_t* status) = 0;
    virtual void singleSlaveWrite(uint32_t handle, ORV_SLAVE_REF slaveRef, uint32_t address,
                                  uint32_t value, uint32_t* status) = 0;
    virtual void singleSlaveReadModifyWrite(uint32_t handle, ORV_SLAVE_REF slaveRef,
                                            uint32_t address, uint32_t value, uint32_t mask,
                                            uint32_t* status) = 0;
    virtual void singleSlaveWriteAndInspect(uint32_t handle, ORV_SLAVE_REF slaveRef,
                                            uint32_t address, uint32_t value, uint32_t* rdBuf,
                                            uint32_t* status) = 0;
    virtual void burstSlaveRead(uint32_t handle, ORV_SLAVE_REF slaveRef, uint32_t address,
                                uint32_t incrAddress, uint32_t* buffer, uint32_t numRead,
                                uint32_t* status) = 0;
    virtual void burstSlaveWrite(uint32_t handle, ORV_SLAVE_REF slaveRef, uint32_t address,
                                 uint32_t incrAddress, const uint32_t* buffer, uint32_t numWrite,
                                 uint32_t* status) = 0;
    virtual void broadcastSingleWrite(uint32_t handle, uint32_t device, uint32_t userChain,
                                      uint32_t address, uint32_t value, uint32_t* status) = 0;
};

}  // namespace OrvRT
