// The host's per-session core lists. Each list owns the cores added to it; a session's end
// takes them out and drops the list.
#include <map>
#include <memory>
#include <mutex>
#include <tuple>

#include "host/OrvCore.h"
#include "hostsim/core/CoreSessions.h"
#include "hostsim/jtag/JtagSession.h"
#include "hostsim/jtag/SessionRegistry.h"

namespace OrvRT {

namespace {

using CoreKey = std::tuple<uint32_t, uint32_t, uint32_t>;  // device, chain, core index

struct CoreList {
    explicit CoreList(uint32_t /*handle*/) {}
    // Cores added after the session ended, to a list the host no longer holds, go with it.
    ~CoreList() {
        for (auto& entry : cores) delete entry.second;
    }
    CoreList(const CoreList&) = delete;
    CoreList& operator=(const CoreList&) = delete;

    std::mutex mutex;
    std::map<CoreKey, Orv_Core*> cores;
};

// Never destroyed: plug-in code may still reach the host while the process ends.
OrvSim::SessionRegistry<CoreList>& registry() {
    static auto* lists = new OrvSim::SessionRegistry<CoreList>();
    return *lists;
}

// The session's list, for one host operation of the plug-in on it.
std::shared_ptr<CoreList> listOf(uint32_t handle) {
    OrvSim::JtagSession::get(handle)->noteHostCall();
    return registry().get(handle);
}

CoreKey keyOf(const ORV_CORE_REF& ref) { return CoreKey{ref.device, ref.userChain, ref.coreIndex}; }

}  // namespace

void Orv_CoreList::addCore(uint32_t handle, Orv_Core* core) {
    if (core == nullptr) return;
    const std::shared_ptr<CoreList> list = listOf(handle);
    Orv_Core* replaced = nullptr;
    {
        std::lock_guard<std::mutex> guard(list->mutex);
        Orv_Core*& slot = list->cores[keyOf(core->getCoreRef())];
        if (slot == core) return;
        replaced = slot;
        slot = core;
    }
    // Deleted outside the lock: a core's destructor may call back into the host.
    delete replaced;
}

void Orv_CoreList::removeCore(uint32_t handle, Orv_Core** core) {
    if (core == nullptr || *core == nullptr) return;
    const std::shared_ptr<CoreList> list = listOf(handle);
    {
        std::lock_guard<std::mutex> guard(list->mutex);
        auto it = list->cores.find(keyOf((*core)->getCoreRef()));
        if (it == list->cores.end() || it->second != *core) return;
        list->cores.erase(it);
    }
    delete *core;
    *core = nullptr;
}

Orv_Core* Orv_CoreList::getSlave(uint32_t handle, const ORV_SLAVE_REF* ref) {
    if (ref == nullptr) return nullptr;
    const std::shared_ptr<CoreList> list = listOf(handle);
    std::lock_guard<std::mutex> guard(list->mutex);
    auto it = list->cores.find(CoreKey{ref->device, ref->userChain, ref->slaveIndex});
    return it == list->cores.end() ? nullptr : it->second;
}

void Orv_CoreList::getSlaves(uint32_t handle, uint32_t device, uint32_t userChain,
                             std::vector<Orv_Core*>& cores) {
    const std::shared_ptr<CoreList> list = listOf(handle);
    std::lock_guard<std::mutex> guard(list->mutex);
    for (auto it = list->cores.lower_bound(CoreKey{device, userChain, 0});
         it != list->cores.end() && std::get<0>(it->first) == device &&
         std::get<1>(it->first) == userChain;
         ++it) {
        if (it->second->isOrvNebuSlave()) cores.push_back(it->second);
    }
}

}  // namespace OrvRT

namespace OrvSim {

std::vector<OrvRT::Orv_Core*> takeSessionCores(uint32_t handle) {
    const std::shared_ptr<OrvRT::CoreList> list = OrvRT::registry().drop(handle);
    std::vector<OrvRT::Orv_Core*> taken;
    if (list == nullptr) return taken;
    std::lock_guard<std::mutex> guard(list->mutex);
    taken.reserve(list->cores.size());
    for (auto& entry : list->cores) taken.push_back(entry.second);
    list->cores.clear();
    return taken;
}

}  // namespace OrvSim
