// An action that only answers to a name the host passes in as an input of other actions, so
// that the parameter engine accepts the name; it reads and writes nothing.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "params/OrvNebu_ParamAction.h"

namespace OrvRT {

class OrvNebu_DefaultSlave;

class OrvNebu_InputParamAction : public OrvNebu_ParamAction {
public:
    const std::string& getParamName() override { return names_.front(); }
    const std::vector<std::string>* getParamNames() override { return &names_; }
    uint32_t getPriority() override { return priority_; }
    void getRegsToRead(Orv_HashMapCStr&) override {}
    void readRegsAndUpdateParams(bool, Orv_HashMapCStr&, Orv_HashMapCStr&) override {}
    void setParams(Orv_HashMapCStr&, Orv_HashMapCStr&) override {}

protected:
    OrvNebu_InputParamAction(OrvNebu_DefaultSlave* slave, uint32_t priority, const char* name)
        : slave_(slave), priority_(priority), names_{name} {}

    OrvNebu_DefaultSlave* slave_;

private:
    uint32_t priority_;
    std::vector<std::string> names_;
};

}  // namespace OrvRT
