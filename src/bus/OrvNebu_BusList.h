// The process-wide registry of discovered NEBU buses, keyed by (session, device, user chain).
#pragma once

#include <cstdint>
#include <map>
#include <mutex>
#include <tuple>

#include "bus/OrvNebu_Transaction.h"
#include "host/OrvJtag.h"

namespace OrvRT {

class OrvNebu_BusList : public SessionMessageListener {
public:
    // The single list, created on first use and never destroyed.
    static OrvNebu_BusList* getBusList();

    void sessionNotice(uint32_t handle) override;
    // Drops every bus of the session.
    void sessionEnded(uint32_t handle) override;

    OrvNebu_Transaction* findBus(uint32_t handle, uint32_t device, uint32_t userChain);
    // Takes ownership.
    void addBus(uint32_t handle, uint32_t device, uint32_t userChain, OrvNebu_Transaction* bus);
    // Erases the entry, deletes *bus and nulls it.
    void removeBus(uint32_t handle, uint32_t device, uint32_t userChain, OrvNebu_Transaction*& bus);
    // Scans the chain for the bus master, replaces the entry and resets the bus. Returns the
    // slave count, 0 when there is no usable bus.
    uint32_t discoverBus(uint32_t handle, uint32_t device, uint32_t userChain);
    // Never null; throws std::logic_error when there is no bus.
    OrvNebu_Transaction* getBus(uint32_t handle, uint32_t device, uint32_t userChain);

private:
    OrvNebu_BusList() = default;
    ~OrvNebu_BusList() = default;
    using Key = std::tuple<uint32_t, uint32_t, uint32_t>;
    // Sessions are serialised only by their own target locks, and the host may end a session
    // from another thread: the map itself needs a guard.
    std::mutex mutex_;
    std::map<Key, OrvNebu_Transaction*> buses_;
};

}  // namespace OrvRT
