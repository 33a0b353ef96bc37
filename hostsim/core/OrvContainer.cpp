// The host's name-value maps, handed out as opaque handles.
#include "host/OrvCore.h"
#include "host/OrvTypes.h"

namespace {
constexpr size_t MAP_BUCKETS = 100;
}

extern "C" {

ORV_HASHMAP_HANDLE OrvContainer_hashmapCStr_new(void) {
    return new OrvRT::Orv_HashMapCStr(MAP_BUCKETS);
}

void OrvContainer_hashmapCStr_delete(ORV_HASHMAP_HANDLE map) {
    delete static_cast<OrvRT::Orv_HashMapCStr*>(map);
}

const char* OrvContainer_hashmapCStr_getCStr(ORV_HASHMAP_HANDLE map, const char* key) {
    if (map == nullptr || key == nullptr) return nullptr;
    const auto& entries = *static_cast<const OrvRT::Orv_HashMapCStr*>(map);
    auto it = entries.find(key);
    return it == entries.end() ? nullptr : it->second.c_str();
}

}  // extern "C"
