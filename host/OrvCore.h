// Core-management library of the host: cores, the core list, core status and commands.
#pragma once

#include <cstdint>
#include <vector>

#include "host/OrvExport.h"
#include "host/OrvTypes.h"

namespace OrvRT {

class Orv_ByteBuffer;

// Base of every core object the host manages. Plug-in cores derive from it.
class ORV_CORE_API Orv_Core {
public:
    // data/dataSize: extra bytes kept with the core (plug-ins pass null and 0).
    Orv_Core(uint32_t handle, ORV_CORE_REF ref, ORV_CORE_INFO info, const uint8_t* data,
             uint32_t dataSize);
    virtual ~Orv_Core();
    virtual bool initFromStatusWord(uint32_t statusWord);
    // True only for cores that are NEBU bus slaves; host cores answer false.
    virtual bool isOrvNebuSlave();

    uint32_t getHandle() const { return handle_; }
    uint32_t getDeviceIndex() const { return ref_.device; }
    uint32_t getUserRegNumber() const { return ref_.userChain; }
    uint32_t getCoreIndex() const { return ref_.coreIndex; }
    const ORV_CORE_REF& getCoreRef() const { return ref_; }
    const ORV_CORE_INFO& getCoreInfo() const { return info_; }

    Orv_Core(const Orv_Core&) = delete;
    Orv_Core& operator=(const Orv_Core&) = delete;

private:
    uint32_t handle_;
    ORV_CORE_REF ref_;
    ORV_CORE_INFO info_;
    std::vector<uint8_t> data_;
};

// The per-session list of registered cores. It owns what is added to it.
class ORV_CORE_API Orv_CoreList {
public:
    // Takes ownership. A core already registered under the same reference is deleted first.
    static void addCore(uint32_t handle, Orv_Core* core);
    // Takes the core out of the list, deletes it and nulls *core. Unknown cores are left alone.
    static void removeCore(uint32_t handle, Orv_Core** core);
    // The core registered under the reference, or null.
    static Orv_Core* getSlave(uint32_t handle, const ORV_SLAVE_REF* ref);
    // Appends every core registered on (device, userChain) that is a NEBU slave, by core index.
    static void getSlaves(uint32_t handle, uint32_t device, uint32_t userChain,
                          std::vector<Orv_Core*>& cores);
};

// Status reads from the device.
class ORV_CORE_API Orv_CoreComm {
public:
    // Fills info (word[1] = core type) and the status bits (bit k = bit k%8 of byte k/8).
    // Throws std::logic_error when the core does not exist.
    static void getCoreStatus(uint32_t handle, ORV_CORE_REF ref, ORV_CORE_INFO* info,
                              Orv_ByteBuffer& status, uint32_t bitCount);
    // True for a configuration-controller device, which carries no bus.
    static bool isTrellomDevice(uint32_t handle, uint32_t device);
};

}  // namespace OrvRT

extern "C" {
// Number of cores behind the controller core of a chain; negative on failure.
ORV_CORE_API int32_t OrvCore_getCoreCount(uint32_t handle, uint32_t device, uint32_t userChain,
                                          uint32_t* count);
// Shifts bitCount bits of command cmd through a core. Exactly one of dataIn (a write) and
// dataOut (a read) is non-null; bits are least significant first. Writes may be queued until
// the next read or flush; a read returns with its bits in dataOut. flags is always 0.
ORV_CORE_API uint32_t OrvCore_runCoreCommand(uint32_t handle, uint32_t device, uint32_t userChain,
                                             uint32_t coreIndex, uint32_t cmd,
                                             const uint8_t* dataIn, uint8_t* dataOut,
                                             uint32_t bitCount, uint32_t flags);

// Name-value maps (Orv_HashMapCStr underneath).
ORV_CORE_API ORV_HASHMAP_HANDLE OrvContainer_hashmapCStr_new(void);
ORV_CORE_API void OrvContainer_hashmapCStr_delete(ORV_HASHMAP_HANDLE map);
// The value stored under key, or null when there is none. Valid until the map changes.
ORV_CORE_API const char* OrvContainer_hashmapCStr_getCStr(ORV_HASHMAP_HANDLE map, const char* key);
}
