// The process-wide registry of discovered NEBU buses, keyed by (session, device, user chain).
#pragma once

#include <cstdint>
#include <map>
#include <memory>
#include <mutex>
#include <tuple>

#include "bus/OrvNebu_Transaction.h"
#include "host/OrvJtag.h"

namespace OrvRT {

// A transaction object stays alive while a call holds it, even when its session ends or its
// bus is rediscovered meanwhile; the list drops only its own reference.
using OrvNebu_TransactionPtr = std::shared_ptr<OrvNebu_Transaction>;

class OrvNebu_BusList : public SessionMessageListener {
public:
    // The single list, created on first use and never destroyed.
    static OrvNebu_BusList* getBusList();

    void sessionNotice(uint32_t handle) override;
    // Drops every bus of the session.
    void sessionEnded(uint32_t handle) override;

    OrvNebu_TransactionPtr findBus(uint32_t handle, uint32_t device, uint32_t userChain);
    // Registers the list with the host first when it is empty (outside the list's own lock).
    void addBus(uint32_t handle, uint32_t device, uint32_t userChain, OrvNebu_TransactionPtr bus);
    // Erases the entry and nulls bus.
    void removeBus(uint32_t handle, uint32_t device, uint32_t userChain,
                   OrvNebu_TransactionPtr& bus);
    // Scans the chain for the bus master, replaces the entry and resets the bus. Returns the
    // slave count, 0 when there is no usable bus.
    uint32_t discoverBus(uint32_t handle, uint32_t device, uint32_t userChain);
    // Never null; throws std::logic_error when there is no bus.
    OrvNebu_TransactionPtr getBus(uint32_t handle, uint32_t device, uint32_t userChain);

private:
    OrvNebu_BusList() = default;
    ~OrvNebu_BusList() = default;
    using Key = std::tuple<uint32_t, uint32_t, uint32_t>;
    // Sessions are serialised only by their own target locks, and the host may end a session
    // from another thread: the map itself needs a guard. Never held while calling the host or
    // a transaction.
    std::mutex mutex_;
    std::map<Key, OrvNebu_TransactionPtr> buses_;
};

}  // namespace OrvRT
