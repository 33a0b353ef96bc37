// The bus list: discovery of the bus master on a user chain and the per-session registry of
// transaction objects.
#include "bus/OrvNebu_BusList.h"

#include <limits>
#include <memory>
#include <stdexcept>
#include <string>
#include <utility>
#include <vector>

#include "bus/OrvNebu_PivoTransaction.h"
#include "host/OrvCore.h"
#include "host/OrvUtil.h"

namespace OrvRT {

namespace {

constexpr uint32_t SLAVE_COUNT_FIRST_BIT = 60;
constexpr uint32_t SLAVE_COUNT_BITS = 8;

// The kinds of bus master the library can drive. A master found behind the controller core
// of a user chain is of the Pivo kind.
enum class BusKind { Pivo, Unknown };

std::string busMessage(const char* head, uint32_t device, uint32_t userChain) {
    return head + std::to_string(device) + ", user chain number/bus:" + std::to_string(userChain) +
           ".";
}

}  // namespace

OrvNebu_BusList* OrvNebu_BusList::getBusList() {
    // Deliberately never destroyed: the host may deliver session notices until the end.
    static OrvNebu_BusList* const list = new OrvNebu_BusList();
    return list;
}

void OrvNebu_BusList::sessionNotice(uint32_t) {}

void OrvNebu_BusList::sessionEnded(uint32_t handle) {
    constexpr uint32_t LAST = std::numeric_limits<uint32_t>::max();
    std::vector<OrvNebu_TransactionPtr> dropped;
    {
        std::lock_guard<std::mutex> guard(mutex_);
        auto it = buses_.lower_bound(Key(handle, 0, 0));
        const auto end = buses_.upper_bound(Key(handle, LAST, LAST));
        while (it != end) {
            dropped.push_back(std::move(it->second));
            it = buses_.erase(it);
        }
    }
    // Objects no call holds any more go here, outside the lock.
}

OrvNebu_TransactionPtr OrvNebu_BusList::findBus(uint32_t handle, uint32_t device,
                                                uint32_t userChain) {
    std::lock_guard<std::mutex> guard(mutex_);
    auto it = buses_.find(Key(handle, device, userChain));
    return it == buses_.end() ? nullptr : it->second;
}

void OrvNebu_BusList::addBus(uint32_t handle, uint32_t device, uint32_t userChain,
                             OrvNebu_TransactionPtr bus) {
    // The host may have forgotten the list with the last session; register again each time
    // the list starts afresh. Not under the lock: the host may tell of a session end, which
    // takes the lock, while it holds its own registry.
    bool empty;
    {
        std::lock_guard<std::mutex> guard(mutex_);
        empty = buses_.empty();
    }
    if (empty) addSessionMessageListener(this);
    OrvNebu_TransactionPtr replaced;
    {
        std::lock_guard<std::mutex> guard(mutex_);
        replaced = std::exchange(buses_[Key(handle, device, userChain)], std::move(bus));
    }
}

void OrvNebu_BusList::removeBus(uint32_t handle, uint32_t device, uint32_t userChain,
                                OrvNebu_TransactionPtr& bus) {
    {
        std::lock_guard<std::mutex> guard(mutex_);
        buses_.erase(Key(handle, device, userChain));
    }
    bus.reset();
}

uint32_t OrvNebu_BusList::discoverBus(uint32_t handle, uint32_t device, uint32_t userChain) {
    if (Orv_CoreComm::isTrellomDevice(handle, device)) return 0;

    uint32_t slaveCount = 0;
    uint32_t masterIndex = 0;
    BusKind kind = BusKind::Unknown;
    uint32_t coreCount = 0;
    if (OrvCore_getCoreCount(handle, device, userChain, &coreCount) >= 0) {
        for (uint32_t coreIndex = 0; coreIndex < coreCount; ++coreIndex) {
            Orv_ByteBuffer status(OrvNebu_PivoTransaction::STATUS_BUFFER_SIZE,
                                  OrvNebu_PivoTransaction::STATUS_BUFFER_GROW,
                                  OrvNebu_PivoTransaction::STATUS_BUFFER_RESERVE);
            ORV_CORE_INFO info{};
            Orv_CoreComm::getCoreStatus(handle, ORV_CORE_REF{device, userChain, coreIndex}, &info,
                                        status, status.getSize() * 8);
            if (info.word[1] == OrvNebu_PivoTransaction::MASTER_CORE_TYPE) {
                slaveCount =
                    static_cast<uint32_t>(status.getBits(SLAVE_COUNT_FIRST_BIT, SLAVE_COUNT_BITS));
                masterIndex = coreIndex;
                kind = BusKind::Pivo;
                break;
            }
        }
    }

    OrvNebu_TransactionPtr old = findBus(handle, device, userChain);
    if (old != nullptr) removeBus(handle, device, userChain, old);

    if (slaveCount == 0) return 0;
    if (kind != BusKind::Pivo)
        throw std::logic_error(
            busMessage("This NEBU Bus type is not supported Device:", device, userChain));

    const OrvNebu_TransactionPtr bus = std::make_shared<OrvNebu_PivoTransaction>(
        ORV_CORE_REF{device, userChain, masterIndex}, slaveCount);
    addBus(handle, device, userChain, bus);
    const uint32_t found = bus->getSlaveCount(handle, device, userChain);
    bus->resetBus(handle, device, userChain);
    return found;
}

OrvNebu_TransactionPtr OrvNebu_BusList::getBus(uint32_t handle, uint32_t device,
                                               uint32_t userChain) {
    if (OrvNebu_TransactionPtr bus = findBus(handle, device, userChain)) return bus;
    if (discoverBus(handle, device, userChain) != 0) {
        if (OrvNebu_TransactionPtr bus = findBus(handle, device, userChain)) return bus;
    }
    // No bus, or the session ended between its discovery and here.
    throw std::logic_error(busMessage("Invalid NEBU Bus Device:", device, userChain));
}

}  // namespace OrvRT
