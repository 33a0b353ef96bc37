// A parameter action: serves one or more named parameters of a slave, from and to registers.
#pragma once

#include <cstdint>
#include <string>
#include <unordered_map>
#include <vector>

#include "host/OrvTypes.h"

namespace OrvRT {

class OrvNebu_ParamAction;
// Parameter name to the action that serves it. Does not own the actions.
typedef std::unordered_map<std::string, OrvNebu_ParamAction*> OrvNebu_ActionsMap;

class OrvNebu_ParamAction {
public:
    virtual ~OrvNebu_ParamAction() = default;

    virtual bool isChoiceParam() { return false; }
    // The principal parameter name.
    virtual const std::string& getParamName() = 0;
    // Every name the action serves.
    virtual const std::vector<std::string>* getParamNames() = 0;
    // Lower runs first.
    virtual uint32_t getPriority() = 0;
    // Adds the names of the registers the action needs as keys.
    virtual void getRegsToRead(Orv_HashMapCStr& registers) = 0;
    // allParams: the caller asked for every parameter.
    virtual void readRegsAndUpdateParams(bool allParams, Orv_HashMapCStr& registers,
                                         Orv_HashMapCStr& params) = 0;
    // Turns requested parameter values into register values.
    virtual void setParams(Orv_HashMapCStr& params, Orv_HashMapCStr& registers) = 0;
    virtual void getChoices(Orv_HashMapCStr* params, std::vector<std::string>& choices) {
        (void)params;
        (void)choices;
    }

    // Stores the action under every one of its names, replacing what stood there.
    static void addActionToHashMap(OrvNebu_ActionsMap& actions, OrvNebu_ParamAction* action) {
        for (const std::string& name : *action->getParamNames()) actions[name] = action;
    }
};

}  // namespace OrvRT
