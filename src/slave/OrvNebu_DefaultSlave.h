// The slave class for every slave type that needs nothing special, and the base of the
// transceiver test slaves: named registers through a register handler, named parameters
// through parameter actions run in priority order around one register read or write.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "params/OrvNebu_ParamAction.h"
#include "slave/OrvNebu_Slave.h"

namespace OrvRT {

class OrvNebu_RegisterHandler;

class OrvNebu_DefaultSlave : public OrvNebu_Slave {
public:
    // The creation function of the slave factory. Returns null when init fails (the file
    // readers have reported why).
    static OrvNebu_Slave* create(uint32_t handle, const ORV_CORE_INFO& coreInfo,
                                 const ORV_SLAVE_REF& slaveRef, const Orv_HashMapCStr& slaveInfo,
                                 const std::string& registerFile, const std::string& parameterFile);

    ~OrvNebu_DefaultSlave() override;

    void init(uint32_t handle, const std::string& registerFile,
              const std::string& parameterFile) override;
    void getRegisters(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                      Orv_HashMapCStr* registers) override;
    void setRegisters(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                      Orv_HashMapCStr* registers) override;
    void setParameters(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                       Orv_HashMapCStr* params) override;
    void getParameters(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                       Orv_HashMapCStr* params) override;
    void getParameterChoices(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                             Orv_HashMapCStr* params, std::vector<std::string>* choices) override;

    // The action stored under the name, or null.
    virtual OrvNebu_ParamAction* getParamAction(const std::string& name);
    virtual void setParametersInRegisterHashMap(uint32_t handle, Orv_HashMapCStr* params,
                                                Orv_HashMapCStr* registers);
    // Subclasses add their computed actions here; the default slave adds nothing.
    virtual void addToActionsHashMap(uint32_t handle, OrvNebu_ActionsMap& actions);

protected:
    OrvNebu_DefaultSlave(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                         const ORV_CORE_INFO& coreInfo, const Orv_HashMapCStr& slaveInfo);

    OrvNebu_RegisterHandler* registerHandler_ = nullptr;
    // Whether registerHandler_ came from the single-register handler's cache.
    bool singleRegisterHandler_ = false;
    // A handler cache counted a reference for this slave (also when reading the file failed);
    // the destructor gives it back.
    bool handlerCounted_ = false;
    OrvNebu_ActionsMap actions_;
    // Computed actions added by subclasses; owned by this slave (each once).
    std::vector<OrvNebu_ParamAction*> ownedActions_;
};

}  // namespace OrvRT
