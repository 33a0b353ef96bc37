// Plain data types shared by the host runtime and its plug-ins.
#pragma once

#include <cstdint>
#include <string>
#include <unordered_map>

#ifndef ORV_SLAVE_REF_DEFINED
#define ORV_SLAVE_REF_DEFINED
// Names a slave on a bus: device index, user chain number (the bus), slave index.
typedef struct ORV_SLAVE_REF {
    uint32_t device;
    uint32_t userChain;
    uint32_t slaveIndex;
} ORV_SLAVE_REF;

// The host's handle of a name-value map (an Orv_HashMapCStr underneath).
typedef void* ORV_HASHMAP_HANDLE;
// The host's handle of a list of strings (a std::vector<std::string> underneath).
typedef void* ORV_STRINGLIST_HANDLE;
#endif

// Names a core behind the controller core of a user chain.
typedef struct ORV_CORE_REF {
    uint32_t device;
    uint32_t userChain;
    uint32_t coreIndex;
} ORV_CORE_REF;

// Five words the host keeps per core; word[1] is the core type (14: NEBU bus master).
typedef struct ORV_CORE_INFO {
    uint32_t word[5];
} ORV_CORE_INFO;

namespace OrvRT {
// The host's name-value map: name text to value text.
typedef std::unordered_map<std::string, std::string> Orv_HashMapCStr;
}  // namespace OrvRT
