// Measured clock frequencies of the clocks of an R3Qrb quad.
#include "transceiver/OrvNebu_R3Qrb_ClockFreqParamAction.h"

namespace OrvRT {

OrvNebu_R3Qrb_ClockFreqParamAction::OrvNebu_R3Qrb_ClockFreqParamAction(OrvNebu_DefaultSlave* slave,
                                                                       uint32_t priority)
    : OrvNebu_CounterFreqParamAction(slave, priority, OUT_PARAM_2_REG, OUT_PARAM_COUNT, false) {}

std::string OrvNebu_R3Qrb_ClockFreqParamAction::frequencyText(const Param2Reg&,
                                                              const std::string& sysclkText,
                                                              uint64_t count, uint64_t tune) {
    return floatFrequencyText(sysclkText, count, tune);
}

}  // namespace OrvRT
