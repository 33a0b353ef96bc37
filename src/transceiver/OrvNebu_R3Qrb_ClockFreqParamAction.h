// Measured clock frequencies of the clocks of an R3Qrb quad, from counter and window registers.
#pragma once

#include "transceiver/OrvNebu_CounterFreqParamAction.h"

namespace OrvRT {

class OrvNebu_R3Qrb_ClockFreqParamAction : public OrvNebu_CounterFreqParamAction {
public:
    using Param2Reg = OrvNebu_CounterFreqParamAction::Param2Reg;
    // The rows are the slave class table's, which the file tools read too.
    static constexpr const Param2Reg* OUT_PARAM_2_REG = OrvNebu_SlaveClassTable::R3QRB_CLOCKS;
    static constexpr uint32_t OUT_PARAM_COUNT = OrvNebu_SlaveClassTable::R3QRB_CLOCK_COUNT;

    OrvNebu_R3Qrb_ClockFreqParamAction(OrvNebu_DefaultSlave* slave, uint32_t priority);

protected:
    std::string frequencyText(const Param2Reg& row, const std::string& sysclkText, uint64_t count,
                              uint64_t tune) override;
};

}  // namespace OrvRT
