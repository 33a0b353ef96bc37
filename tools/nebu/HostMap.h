// A name-value map made the way the host makes them, for one command's map argument.
#pragma once

#include <string>
#include <utility>
#include <vector>

#include "host/OrvCore.h"
#include "host/OrvTypes.h"

namespace nebu {

class HostMap {
public:
    HostMap() : handle_(OrvContainer_hashmapCStr_new()), owned_(handle_) {}
    ~HostMap() { OrvContainer_hashmapCStr_delete(owned_); }
    HostMap(const HostMap&) = delete;
    HostMap& operator=(const HostMap&) = delete;

    // What the exported functions take: the address of the caller's handle.
    ORV_HASHMAP_HANDLE* address() { return &handle_; }
    OrvRT::Orv_HashMapCStr& map() { return *static_cast<OrvRT::Orv_HashMapCStr*>(owned_); }

    // Adds NAME or NAME=VALUE entries; a later entry of the same name wins.
    void addWords(const std::vector<std::string>& words, size_t first);

private:
    ORV_HASHMAP_HANDLE handle_;
    ORV_HASHMAP_HANDLE owned_;  // what we made, whatever happens to handle_
};

}  // namespace nebu
