// The default slave: registers through a shared register handler; parameters through the
// parameter actions of its actions map.
#include "slave/OrvNebu_DefaultSlave.h"

#include <algorithm>
#include <cstdlib>

#include "registers/OrvNebu_DefaultRegisterHandler.h"
#include "registers/OrvNebu_SingleRegisterHandler.h"

namespace OrvRT {

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
    : OrvNebu_Slave(handle, slaveRef, coreInfo, slaveInfo), actions_(100) {}

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
    // Parameter side: this slave class serves no parameters yet, so the parameter file is
    // not read and the actions map stays empty.
    (void)parameterFile;
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
    OrvNebu_Slave::setParameters(handle, slaveRef, params);
}

void OrvNebu_DefaultSlave::getParameters(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                                         Orv_HashMapCStr* params) {
    OrvNebu_Slave::getParameters(handle, slaveRef, params);
}

void OrvNebu_DefaultSlave::getParameterChoices(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                                               Orv_HashMapCStr* params,
                                               std::vector<std::string>* choices) {
    OrvNebu_Slave::getParameterChoices(handle, slaveRef, params, choices);
}

OrvNebu_ParamAction* OrvNebu_DefaultSlave::getParamAction(const std::string& name) {
    auto it = actions_.find(name);
    return it == actions_.end() ? nullptr : it->second;
}

void OrvNebu_DefaultSlave::setParametersInRegisterHashMap(uint32_t handle, Orv_HashMapCStr* params,
                                                          Orv_HashMapCStr* registers) {
    (void)registers;
    OrvNebu_Slave::setParameters(handle, getSlaveRef(), params);
}

void OrvNebu_DefaultSlave::addToActionsHashMap(uint32_t handle, OrvNebu_ActionsMap& actions) {
    (void)handle;
    (void)actions;
}

}  // namespace OrvRT
