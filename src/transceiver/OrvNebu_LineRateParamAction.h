// Line rates of both channels of an R2Qra dual, as whole numbers, from the reference clock
// the host passes in and the PLL divider choice parameters.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "params/OrvNebu_ParamAction.h"

namespace OrvRT {

class OrvNebu_DefaultSlave;

class OrvNebu_LineRateParamAction : public OrvNebu_ParamAction {
public:
    static constexpr const char* IN_PARAM_NAME = "refclk_freq";
    static const char* const OUT_PARAM_NAMES[];
    static constexpr uint32_t OUT_PARAM_COUNT = 2;
    static const char* const SUB_ACTION_PARAM_NAMES[];
    static constexpr uint32_t SUB_ACTION_PARAM_COUNT = 4;
    static constexpr const char* INTERNAL_DATA_WIDTH_REG_NAME = "INTDATAWIDTH";

    // Throws when the slave lacks one of the divider choice parameters.
    OrvNebu_LineRateParamAction(OrvNebu_DefaultSlave* slave, uint32_t priority);

    const std::string& getParamName() override { return names_.front(); }
    const std::vector<std::string>* getParamNames() override { return &names_; }
    uint32_t getPriority() override { return priority_; }
    void getRegsToRead(Orv_HashMapCStr& registers) override;
    // Throws when line rates are asked for without refclk_freq, or when one does not fit in
    // 64 bits.
    void readRegsAndUpdateParams(bool allParams, Orv_HashMapCStr& registers,
                                 Orv_HashMapCStr& params) override;
    void setParams(Orv_HashMapCStr& params, Orv_HashMapCStr& registers) override;

private:
    OrvNebu_DefaultSlave* slave_;
    uint32_t priority_;
    std::vector<std::string> names_;
    std::vector<OrvNebu_ParamAction*> subActions_;
};

}  // namespace OrvRT
