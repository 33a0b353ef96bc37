// The slave base: identity, the parameter operations every slave class may lack, and the
// slave chain along the next_slave links.
#include "slave/OrvNebu_Slave.h"

#include <stdexcept>

#include "base/OrvNebu_CsvText.h"
#include "base/OrvNebu_NameMaps.h"

namespace OrvRT {

namespace {

ORV_CORE_REF coreRefOf(const ORV_SLAVE_REF& ref) {
    return ORV_CORE_REF{ref.device, ref.userChain, ref.slaveIndex};
}

// The bus slave registered under the reference, or null (a host core is no slave).
OrvNebu_Slave* slaveAt(uint32_t handle, uint32_t device, uint32_t userChain, uint32_t index) {
    ORV_SLAVE_REF ref{device, userChain, index};
    Orv_Core* core = Orv_CoreList::getSlave(handle, &ref);
    if (core == nullptr || !core->isOrvNebuSlave()) return nullptr;
    return dynamic_cast<OrvNebu_Slave*>(core);
}

}  // namespace

OrvNebu_Slave::OrvNebu_Slave(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                             const ORV_CORE_INFO& coreInfo, const Orv_HashMapCStr& slaveInfo)
    : Orv_Core(handle, coreRefOf(slaveRef), coreInfo, nullptr, 0),
      slaveInfo_(slaveInfo),
      previousSlaveOffset_(NOT_INITIALIZED_PREVIOUS_SLAVE_VALUE),
      ownerHandle_(handle) {}

OrvNebu_Slave::~OrvNebu_Slave() = default;

bool OrvNebu_Slave::initFromStatusWord(uint32_t statusWord) {
    (void)statusWord;
    return true;
}

bool OrvNebu_Slave::isOrvNebuSlave() { return true; }

void OrvNebu_Slave::setParameters(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                                  Orv_HashMapCStr* params) {
    (void)handle;
    (void)slaveRef;
    (void)params;
    throw std::logic_error("Parameter handling is not implemented for this OrvNebu Slave type");
}

void OrvNebu_Slave::getParameters(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                                  Orv_HashMapCStr* params) {
    (void)handle;
    (void)slaveRef;
    (void)params;
    throw std::logic_error("Parameter handling is not implemented for this OrvNebu Slave type");
}

void OrvNebu_Slave::getParameterChoices(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                                        Orv_HashMapCStr* params,
                                        std::vector<std::string>* choices) {
    (void)handle;
    (void)slaveRef;
    (void)params;
    (void)choices;
    throw std::logic_error("Parameter handling is not implemented for this OrvNebu Slave");
}

ORV_SLAVE_REF OrvNebu_Slave::getSlaveRef() const {
    const ORV_CORE_REF& ref = getCoreRef();
    return ORV_SLAVE_REF{ref.device, ref.userChain, ref.coreIndex};
}

OrvNebu_Slave* OrvNebu_Slave::getNextSlave() {
    auto it = slaveInfo_.find("next_slave");
    int32_t distance = it == slaveInfo_.end() ? 0 : OrvNebu_CsvText::decimalToInt32(it->second);
    if (distance == 0) return nullptr;
    return slaveAt(ownerHandle_, getDeviceIndex(), getUserRegNumber(),
                   getSlaveIndex() + static_cast<uint32_t>(distance));
}

void OrvNebu_Slave::initSlaveChain(uint32_t device, uint32_t userChain) {
    std::vector<Orv_Core*> cores;
    Orv_CoreList::getSlaves(ownerHandle_, device, userChain, cores);
    for (Orv_Core* core : cores) {
        auto* slave = dynamic_cast<OrvNebu_Slave*>(core);
        if (slave == nullptr) continue;
        OrvNebu_Slave* next = slave->getNextSlave();
        if (next != nullptr) {
            next->previousSlaveOffset_ =
                static_cast<int32_t>(slave->getSlaveIndex() - next->getSlaveIndex());
        }
    }
}

OrvNebu_Slave* OrvNebu_Slave::getPreviousSlave() {
    if (previousSlaveOffset_ == NOT_INITIALIZED_PREVIOUS_SLAVE_VALUE) {
        initSlaveChain(getDeviceIndex(), getUserRegNumber());
    }
    if (previousSlaveOffset_ == NOT_INITIALIZED_PREVIOUS_SLAVE_VALUE || previousSlaveOffset_ == 0) {
        return nullptr;
    }
    return slaveAt(ownerHandle_, getDeviceIndex(), getUserRegNumber(),
                   getSlaveIndex() + static_cast<uint32_t>(previousSlaveOffset_));
}

std::string OrvNebu_Slave::getParamFromOtherSlave(OrvNebu_Slave* other, const char* name,
                                                  const std::string& def) {
    if (other == nullptr) return def;
    Orv_HashMapCStr params(ORVNEBU_MAP_BUCKETS);
    const std::string key = name != nullptr ? name : "";
    params[key] = def;
    ORV_SLAVE_REF ref = other->getSlaveRef();
    other->getParameters(ownerHandle_, ref, &params);
    auto it = params.find(key);
    return it == params.end() ? def : it->second;
}

}  // namespace OrvRT
