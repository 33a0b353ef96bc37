// Measured clock frequencies of the clocks of an M3Qrc dual.
#include "transceiver/OrvNebu_M3Qrc_ClockFreqParamAction.h"

namespace OrvRT {

OrvNebu_M3Qrc_ClockFreqParamAction::OrvNebu_M3Qrc_ClockFreqParamAction(OrvNebu_DefaultSlave* slave,
                                                                       uint32_t priority)
    : OrvNebu_CounterFreqParamAction(slave, priority, OUT_PARAM_2_REG, OUT_PARAM_COUNT, false) {}

std::string OrvNebu_M3Qrc_ClockFreqParamAction::frequencyText(const Param2Reg&,
                                                              const std::string& sysclkText,
                                                              uint64_t count, uint64_t tune) {
    return floatFrequencyText(sysclkText, count, tune);
}

}  // namespace OrvRT
