// The default slave: registers through a shared register handler; parameters through the
// parameter actions of its actions map.
#include "slave/OrvNebu_DefaultSlave.h"

#include <algorithm>
#include <cstdlib>
#include <set>
#include <stdexcept>
#include <string>
#include <vector>

#include "base/OrvNebu_NameMaps.h"
#include "params/OrvNebu_DefaultParamReader.h"
#include "registers/OrvNebu_DefaultRegisterHandler.h"
#include "registers/OrvNebu_SingleRegisterHandler.h"

namespace OrvRT {

namespace {

typedef std::vector<OrvNebu_ParamAction*> ActionList;

bool byPriority(OrvNebu_ParamAction* a, OrvNebu_ParamAction* b) {
    return a->getPriority() < b->getPriority();
}

// The actions that serve the names of the map, each once, in ascending priority; actions of
// equal priority in the order of their smallest requested name.
ActionList requestedActions(OrvNebu_DefaultSlave& slave, const Orv_HashMapCStr& params) {
    std::set<std::string> pending;
    for (const auto& entry : params) pending.insert(entry.first);
    ActionList list;
    while (!pending.empty()) {
        const std::string name = *pending.begin();
        OrvNebu_ParamAction* action = slave.getParamAction(name);
        if (action == nullptr) {
            throw std::logic_error("OrvNebu_getParameter() - Unknown parameter name '" + name +
                                   "'");
        }
        // An action stored under a name its own list lacks must neither be taken twice nor
        // keep that name pending for ever.
        pending.erase(name);
        if (std::find(list.begin(), list.end(), action) != list.end()) continue;
        list.push_back(action);
        for (const std::string& served : *action->getParamNames()) pending.erase(served);
    }
    if (list.size() > 1) std::stable_sort(list.begin(), list.end(), byPriority);
    return list;
}

// Every entry of the map (an action under several names once per name), by priority.
ActionList allActions(const OrvNebu_ActionsMap& actions) {
    ActionList list;
    list.reserve(actions.size());
    for (const auto& entry : actions) list.push_back(entry.second);
    std::stable_sort(list.begin(), list.end(), byPriority);
    return list;
}

}  // namespace

OrvNebu_Slave* OrvNebu_DefaultSlave::create(uint32_t handle, const ORV_CORE_INFO& coreInfo,
                                            const ORV_SLAVE_REF& slaveRef,
                                            const Orv_HashMapCStr& slaveInfo,
                                            const std::string& registerFile,
                                            const std::string& parameterFile) {
    OrvNebu_DefaultSlave* slave = nullptr;
    try {
        slave = new OrvNebu_DefaultSlave(handle, slaveRef, coreInfo, slaveInfo);
        slave->init(handle, registerFile, parameterFile);
        return slave;
    } catch (...) {
        // The file readers have reported why.
        delete slave;
        return nullptr;
    }
}

OrvNebu_DefaultSlave::OrvNebu_DefaultSlave(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                                           const ORV_CORE_INFO& coreInfo,
                                           const Orv_HashMapCStr& slaveInfo)
    : OrvNebu_Slave(handle, slaveRef, coreInfo, slaveInfo), actions_(ORVNEBU_MAP_BUCKETS) {}

OrvNebu_DefaultSlave::~OrvNebu_DefaultSlave() {
    if (handlerCounted_) {
        if (singleRegisterHandler_) {
            OrvNebu_SingleRegisterHandler::releaseRegisterHandler(registerHandler_);
        } else {
            OrvNebu_DefaultRegisterHandler::releaseRegisterHandler(registerHandler_);
        }
    }
    registerHandler_ = nullptr;
    actions_.clear();
    std::sort(ownedActions_.begin(), ownedActions_.end());
    ownedActions_.erase(std::unique(ownedActions_.begin(), ownedActions_.end()),
                        ownedActions_.end());
    for (OrvNebu_ParamAction* action : ownedActions_) delete action;
}

void OrvNebu_DefaultSlave::init(uint32_t handle, const std::string& registerFile,
                                const std::string& parameterFile) {
    const char* single = std::getenv("ZAN_ORV_SWITCH_REG_HANDLER");
    singleRegisterHandler_ = single != nullptr && single[0] != '\0';
    // The cache counts the reference before it reads the file, so it is owed back even when
    // the reading throws.
    handlerCounted_ = true;
    registerHandler_ =
        singleRegisterHandler_
            ? OrvNebu_SingleRegisterHandler::getRegisterHandler(handle, registerFile)
            : OrvNebu_DefaultRegisterHandler::getRegisterHandler(handle, registerFile);
    if (!parameterFile.empty()) {
        OrvNebu_DefaultParamReader::addToHashMap(handle, parameterFile, actions_);
        addToActionsHashMap(handle, actions_);
    }
}

void OrvNebu_DefaultSlave::getRegisters(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                                        Orv_HashMapCStr* registers) {
    registerHandler_->getRegisters(handle, slaveRef, registers);
}

void OrvNebu_DefaultSlave::setRegisters(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                                        Orv_HashMapCStr* registers) {
    registerHandler_->setRegisters(handle, slaveRef, registers);
}

void OrvNebu_DefaultSlave::setParameters(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                                         Orv_HashMapCStr* params) {
    Orv_HashMapCStr registers(ORVNEBU_MAP_BUCKETS);
    setParametersInRegisterHashMap(handle, params, &registers);
    setRegisters(handle, slaveRef, &registers);
}

void OrvNebu_DefaultSlave::getParameters(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                                         Orv_HashMapCStr* params) {
    Orv_HashMapCStr registers(ORVNEBU_MAP_BUCKETS);
    const bool allParams = params->empty();
    const ActionList list = allParams ? allActions(actions_) : requestedActions(*this, *params);
    for (OrvNebu_ParamAction* action : list) action->getRegsToRead(registers);
    getRegisters(handle, slaveRef, &registers);
    for (OrvNebu_ParamAction* action : list) {
        action->readRegsAndUpdateParams(allParams, registers, *params);
    }
}

void OrvNebu_DefaultSlave::getParameterChoices(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                                               Orv_HashMapCStr* params,
                                               std::vector<std::string>* choices) {
    (void)handle;
    (void)slaveRef;
    if (params->empty()) {
        throw std::logic_error(
            "OrvNebu_getParameterChoices(): 'params' argument has no parameter name passed in.");
    }
    const std::string& name = params->begin()->first;
    OrvNebu_ParamAction* action = getParamAction(name);
    if (action == nullptr) {
        throw std::logic_error("OrvNebu_getParameterChoices(): param '" + name +
                               "' is not a valid parameter.");
    }
    if (!action->isChoiceParam()) {
        throw std::logic_error("OrvNebu_getParameterChoices(): param '" + name +
                               "' is not a choice parameter.");
    }
    action->getChoices(params, *choices);
}

OrvNebu_ParamAction* OrvNebu_DefaultSlave::getParamAction(const std::string& name) {
    auto it = actions_.find(name);
    return it == actions_.end() ? nullptr : it->second;
}

void OrvNebu_DefaultSlave::setParametersInRegisterHashMap(uint32_t handle, Orv_HashMapCStr* params,
                                                          Orv_HashMapCStr* registers) {
    (void)handle;
    for (OrvNebu_ParamAction* action : requestedActions(*this, *params)) {
        action->setParams(*params, *registers);
    }
}

void OrvNebu_DefaultSlave::addToActionsHashMap(uint32_t handle, OrvNebu_ActionsMap& actions) {
    (void)handle;
    (void)actions;
}

}  // namespace OrvRT
