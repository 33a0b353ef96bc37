// Test support for the transceiver actions: a choice action and a slave that keep their
// registers in memory, so that the actions run through the parameter action interface and
// the slave calls they make without a bus.
#pragma once

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <map>
#include <memory>
#include <set>
#include <stdexcept>
#include <string>
#include <utility>
#include <vector>

#include "host/OrvCore.h"
#include "params/OrvNebu_ParamChoiceAction.h"
#include "slave/OrvNebu_DefaultSlave.h"

namespace xcvrtest {

using OrvRT::Orv_HashMapCStr;
using OrvRT::OrvNebu_ActionsMap;
using OrvRT::OrvNebu_ParamAction;

// A choice parameter whose choices each set one register to their number.
struct Choices {
    OrvRT::OrvNebu_ParamChoiceAction& action;
    std::string reg;
    void numbers(std::initializer_list<unsigned> values) {
        uint32_t index = 0;
        for (unsigned v : values) {
            char hex[16];
            std::snprintf(hex, sizeof hex, "%X", v);
            action.addChoice(std::to_string(v), index);
            action.addChoiceRegSetting(index++, 32, reg, hex);
        }
    }
};

// Register reads of every memory slave, to see how far a question walks.
inline uint32_t registerReads = 0;

// A slave with registers in memory and a small parameter engine over its actions: requested
// actions once each in priority order, one register read, then the actions' reads.
class MemorySlave : public OrvRT::OrvNebu_DefaultSlave {
public:
    MemorySlave(uint32_t handle, uint32_t slaveIndex, const std::string& nextSlave = "0")
        : OrvNebu_DefaultSlave(handle, ORV_SLAVE_REF{0, 2, slaveIndex},
                               ORV_CORE_INFO{{1, 0x42, 0, 0, 0}},
                               Orv_HashMapCStr{{"next_slave", nextSlave}}) {}

    // Memory registers; reads of unknown names fail like an unknown register would.
    std::map<std::string, std::string> memory;
    // Every register name written, in order.
    std::vector<std::string> writeLog;

    Choices addChoice(const std::string& name, const std::string& reg) {
        owned_.push_back(std::make_unique<OrvRT::OrvNebu_ParamChoiceAction>(
            name, 10000u + static_cast<uint32_t>(owned_.size())));
        OrvNebu_ParamAction::addActionToHashMap(actions_, owned_.back().get());
        memory.emplace(reg, "0");
        return Choices{*owned_.back(), reg};
    }
    // Constructs a computed action on this slave (slave pointer first) and enters it.
    template <class Action, class... Args>
    Action& addComputed(Args&&... args) {
        auto action = std::make_unique<Action>(this, std::forward<Args>(args)...);
        Action* raw = action.get();
        ownedActions_.push_back(action.release());
        OrvNebu_ParamAction::addActionToHashMap(actions_, raw);
        return *raw;
    }
    OrvNebu_ActionsMap& actions() { return actions_; }

    void getRegisters(uint32_t, const ORV_SLAVE_REF&, Orv_HashMapCStr* registers) override {
        ++registerReads;
        for (auto& entry : *registers) {
            auto it = memory.find(entry.first);
            if (it == memory.end()) throw std::logic_error("no register " + entry.first);
            entry.second = it->second;
        }
    }
    void setRegisters(uint32_t, const ORV_SLAVE_REF&, Orv_HashMapCStr* registers) override {
        for (auto& entry : *registers) {
            memory[entry.first] = entry.second;
            writeLog.push_back(entry.first);
        }
    }
    void getParameters(uint32_t handle, const ORV_SLAVE_REF& ref,
                       Orv_HashMapCStr* params) override {
        std::vector<OrvNebu_ParamAction*> list = requested(*params);
        Orv_HashMapCStr registers;
        for (auto* a : list) a->getRegsToRead(registers);
        getRegisters(handle, ref, &registers);
        for (auto* a : list) a->readRegsAndUpdateParams(false, registers, *params);
    }
    void setParametersInRegisterHashMap(uint32_t, Orv_HashMapCStr* params,
                                        Orv_HashMapCStr* registers) override {
        for (auto* a : requested(*params)) a->setParams(*params, *registers);
    }
    void setParameters(uint32_t handle, const ORV_SLAVE_REF& ref,
                       Orv_HashMapCStr* params) override {
        Orv_HashMapCStr registers;
        setParametersInRegisterHashMap(handle, params, &registers);
        setRegisters(handle, ref, &registers);
    }
    void getParameterChoices(uint32_t, const ORV_SLAVE_REF&, Orv_HashMapCStr* params,
                             std::vector<std::string>* choices) override {
        OrvNebu_ParamAction* action = getParamAction(params->begin()->first);
        if (action == nullptr) throw std::logic_error("no parameter " + params->begin()->first);
        action->getChoices(params, *choices);
    }

private:
    std::vector<OrvNebu_ParamAction*> requested(Orv_HashMapCStr& params) {
        std::set<std::string> pending;
        for (auto& entry : params) pending.insert(entry.first);
        std::vector<OrvNebu_ParamAction*> list;
        while (!pending.empty()) {
            std::string name = *pending.begin();
            OrvNebu_ParamAction* action = getParamAction(name);
            if (action == nullptr) {
                throw std::logic_error("OrvNebu_getParameter() - Unknown parameter name '" + name +
                                       "'");
            }
            list.push_back(action);
            for (const std::string& n : *action->getParamNames()) pending.erase(n);
        }
        std::stable_sort(list.begin(), list.end(),
                         [](OrvNebu_ParamAction* a, OrvNebu_ParamAction* b) {
                             return a->getPriority() < b->getPriority();
                         });
        return list;
    }

    std::vector<std::unique_ptr<OrvRT::OrvNebu_ParamChoiceAction>> owned_;
};

}  // namespace xcvrtest
