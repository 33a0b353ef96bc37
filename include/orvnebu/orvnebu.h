/* The NEBU plug-in: the 27 functions through which a JTAG debug host reaches the NEBU debug
 * bus. Every function returns ORVNEBU_OK or ORVNEBU_FAILED; a failure has been reported on the
 * session's message channel. Maps are passed as the address of the caller's map handle. */
#ifndef ORVNEBU_ORVNEBU_H
#define ORVNEBU_ORVNEBU_H

#include <stdint.h>

#if defined(_WIN32)
#if defined(ORVNEBU_BUILD)
#define ORVNEBU_API __declspec(dllexport)
#else
#define ORVNEBU_API __declspec(dllimport)
#endif
#define ORVNEBU_CALL __cdecl
#else
#define ORVNEBU_API __attribute__((visibility("default")))
#define ORVNEBU_CALL
#endif

#define ORVNEBU_OK 0x00000000u
#define ORVNEBU_FAILED 0x80000000u

#ifndef ORV_SLAVE_REF_DEFINED
#define ORV_SLAVE_REF_DEFINED
/* Names a slave on a bus: device index, user chain number (the bus), slave index. */
typedef struct ORV_SLAVE_REF {
    uint32_t device;
    uint32_t userChain;
    uint32_t slaveIndex;
} ORV_SLAVE_REF;

/* The host's handle of a name-value map (text to text). */
typedef void* ORV_HASHMAP_HANDLE;
/* The host's handle of a list of strings. */
typedef void* ORV_STRINGLIST_HANDLE;
#endif

#ifdef __cplusplus
extern "C" {
#endif

/* Slave enumeration and information */
ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_initialize(uint32_t handle, ORV_SLAVE_REF slaveRef);
ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_terminate(uint32_t handle, ORV_SLAVE_REF slaveRef);
ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_getBusInfo(uint32_t handle, uint32_t device,
                                                     uint32_t userChain,
                                                     ORV_HASHMAP_HANDLE* busInfoHash);
ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_getSlaveCount(uint32_t handle, uint32_t device,
                                                        uint32_t userChain, uint32_t* count);
ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_getSlaveHandles(uint32_t handle, uint32_t device,
                                                          uint32_t userChain,
                                                          uint32_t* slaveHandles, uint32_t count);
ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_getSlaveInfo(uint32_t handle, ORV_SLAVE_REF slaveRef,
                                                       ORV_HASHMAP_HANDLE* slaveInfoHash);

/* Registers, parameters and raw data */
ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_getRegisters(uint32_t handle, ORV_SLAVE_REF slaveRef,
                                                       ORV_HASHMAP_HANDLE* registers);
ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_setRegisters(uint32_t handle, ORV_SLAVE_REF slaveRef,
                                                       ORV_HASHMAP_HANDLE* registers);
ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_getParameters(uint32_t handle, ORV_SLAVE_REF slaveRef,
                                                        ORV_HASHMAP_HANDLE* params);
ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_setParameters(uint32_t handle, ORV_SLAVE_REF slaveRef,
                                                        ORV_HASHMAP_HANDLE* params);
ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_getParameterChoices(uint32_t handle,
                                                              ORV_SLAVE_REF slaveRef,
                                                              ORV_HASHMAP_HANDLE* params,
                                                              ORV_STRINGLIST_HANDLE* choices);
/* data receives 4*size hex digits (word at address+size-1 first) and a terminating zero. */
ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_read(uint32_t handle, ORV_SLAVE_REF slaveRef,
                                               uint32_t address, uint32_t size, char* data);
/* data holds exactly 4*size hex digits, the word at address last. */
ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_write(uint32_t handle, ORV_SLAVE_REF slaveRef,
                                                uint32_t address, uint32_t size, const char* data);

/* Bus-level calls. status may be null. */
ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_getBusErrorStatus(uint32_t handle, uint32_t device,
                                                            uint32_t userChain,
                                                            uint32_t* errorStatus,
                                                            uint32_t errorStatusLen);
ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_clearBusErrorStatus(uint32_t handle, uint32_t device,
                                                              uint32_t userChain);
ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_resetBus(uint32_t handle, uint32_t device,
                                                   uint32_t userChain);
ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_testSlaveInterface(uint32_t handle,
                                                             ORV_SLAVE_REF slaveRef,
                                                             uint32_t* result);
ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_resetSlave(uint32_t handle, ORV_SLAVE_REF slaveRef);
ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_disableSlave(uint32_t handle, ORV_SLAVE_REF slaveRef);
ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_enableSlave(uint32_t handle, ORV_SLAVE_REF slaveRef);
ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_singleSlaveRead(uint32_t handle, ORV_SLAVE_REF slaveRef,
                                                          uint32_t address, uint32_t* buffer,
                                                          uint32_t* status);
ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_singleSlaveWrite(uint32_t handle,
                                                           ORV_SLAVE_REF slaveRef,
                                                           uint32_t address, uint32_t value,
                                                           uint32_t* status);
ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_singleSlaveReadModifyWrite(
    uint32_t handle, ORV_SLAVE_REF slaveRef, uint32_t address, uint32_t value, uint32_t mask,
    uint32_t* status);
ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_singleSlaveWriteAndInspect(
    uint32_t handle, ORV_SLAVE_REF slaveRef, uint32_t address, uint32_t value, uint32_t* rdBuf,
    uint32_t* status);
ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_burstSlaveRead(uint32_t handle, ORV_SLAVE_REF slaveRef,
                                                         uint32_t address, uint32_t incrAddress,
                                                         uint32_t* buffer, uint32_t numRead,
                                                         uint32_t* status);
ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_burstSlaveWrite(uint32_t handle, ORV_SLAVE_REF slaveRef,
                                                          uint32_t address, uint32_t incrAddress,
                                                          const uint32_t* buffer,
                                                          uint32_t numWrite, uint32_t* status);
ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_broadcastSingleWrite(uint32_t handle, uint32_t device,
                                                               uint32_t userChain,
                                                               uint32_t address, uint32_t value,
                                                               uint32_t* status);

#ifdef __cplusplus
}
#endif

#endif /* ORVNEBU_ORVNEBU_H */
