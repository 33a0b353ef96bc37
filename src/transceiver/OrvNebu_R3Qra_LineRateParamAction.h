// Line rate of an R3Qra dual, as a choice over its transmit PLL dividers, with the
// oversampling mode that runs the line at a fifth of the PLL rate.
#pragma once

#include "transceiver/OrvNebu_PllLineRateParamAction.h"

namespace OrvRT {

class OrvNebu_R3Qra_LineRateParamAction : public OrvNebu_PllLineRateParamAction {
public:
    static constexpr const char* PARAM_NAME = "line_rate";
    static constexpr uint32_t PARAM_COUNT = 1;
    static constexpr const char* IN_PARAM_NAME = "refclk_freq";
    static const char* const SUB_ACTION_PARAM_NAMES[];
    static constexpr uint32_t SUB_ACTION_PARAM_COUNT = 4;

    // Throws when the slave lacks one of the transmit divider choice parameters.
    OrvNebu_R3Qra_LineRateParamAction(OrvNebu_DefaultSlave* slave, uint32_t priority);

protected:
    uint64_t dividerFactor(Orv_HashMapCStr& params) override;
    uint64_t expectedFrequency(bool flag, uint64_t rate, uint64_t dataWidth) override;
    void dividerSettings(uint64_t fb, uint64_t ref, uint64_t divsel,
                         Orv_HashMapCStr& settings) override;
};

}  // namespace OrvRT
