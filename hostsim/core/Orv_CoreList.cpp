// The host's per-session core lists. Each list owns the cores added to it.
#include <map>
#include <memory>
#include <mutex>
#include <tuple>

#include "host/OrvCore.h"
#include "hostsim/core/CoreSessions.h"
#include "hostsim/jtag/JtagSession.h"

namespace OrvRT {

namespace {

using CoreKey = std::tuple<uint32_t, uint32_t, uint32_t>;  // device, chain, core index

struct CoreList {
    uint32_t handle;
    std::mutex mutex;
    std::map<CoreKey, Orv_Core*> cores;
};

std::mutex registryMutex;
std::map<uint32_t, std::unique_ptr<CoreList>>& registry() {
    // Lists live until the process ends (emptied at the end of their session), so the
    // per-thread cache below never points at a freed list.
    static auto* lists = new std::map<uint32_t, std::unique_ptr<CoreList>>();
    return *lists;
}

CoreList& listOf(uint32_t handle) {
    thread_local CoreList* last = nullptr;
    if (last != nullptr && last->handle == handle) return *last;
    {
        std::lock_guard<std::mutex> guard(registryMutex);
        auto& slot = registry()[handle];
        if (!slot) {
            slot = std::make_unique<CoreList>();
            slot->handle = handle;
        }
        last = slot.get();
    }
    OrvSim::JtagSession::get(handle);  // the session is known from its first use on
    return *last;
}

CoreKey keyOf(const ORV_CORE_REF& ref) { return CoreKey{ref.device, ref.userChain, ref.coreIndex}; }

}  // namespace

void Orv_CoreList::addCore(uint32_t handle, Orv_Core* core) {
    if (core == nullptr) return;
    CoreList& list = listOf(handle);
    Orv_Core* replaced = nullptr;
    {
        std::lock_guard<std::mutex> guard(list.mutex);
        Orv_Core*& slot = list.cores[keyOf(core->getCoreRef())];
        if (slot == core) return;
        replaced = slot;
        slot = core;
    }
    // Deleted outside the lock: a core's destructor may call back into the host.
    delete replaced;
}

void Orv_CoreList::removeCore(uint32_t handle, Orv_Core** core) {
    if (core == nullptr || *core == nullptr) return;
    CoreList& list = listOf(handle);
    {
        std::lock_guard<std::mutex> guard(list.mutex);
        auto it = list.cores.find(keyOf((*core)->getCoreRef()));
        if (it == list.cores.end() || it->second != *core) return;
        list.cores.erase(it);
    }
    delete *core;
    *core = nullptr;
}

Orv_Core* Orv_CoreList::getSlave(uint32_t handle, const ORV_SLAVE_REF* ref) {
    if (ref == nullptr) return nullptr;
    CoreList& list = listOf(handle);
    std::lock_guard<std::mutex> guard(list.mutex);
    auto it = list.cores.find(CoreKey{ref->device, ref->userChain, ref->slaveIndex});
    return it == list.cores.end() ? nullptr : it->second;
}

void Orv_CoreList::getSlaves(uint32_t handle, uint32_t device, uint32_t userChain,
                             std::vector<Orv_Core*>& cores) {
    CoreList& list = listOf(handle);
    std::lock_guard<std::mutex> guard(list.mutex);
    for (auto it = list.cores.lower_bound(CoreKey{device, userChain, 0});
         it != list.cores.end() && std::get<0>(it->first) == device &&
         std::get<1>(it->first) == userChain;
         ++it) {
        if (it->second->isOrvNebuSlave()) cores.push_back(it->second);
    }
}

}  // namespace OrvRT

namespace OrvSim {

std::vector<OrvRT::Orv_Core*> takeSessionCores(uint32_t handle) {
    OrvRT::CoreList& list = OrvRT::listOf(handle);
    std::vector<OrvRT::Orv_Core*> taken;
    std::lock_guard<std::mutex> guard(list.mutex);
    taken.reserve(list.cores.size());
    for (auto& entry : list.cores) taken.push_back(entry.second);
    list.cores.clear();
    return taken;
}

}  // namespace OrvSim
