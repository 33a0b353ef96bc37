// Measured clock frequencies of the clocks of an R3Qra dual.
#include "transceiver/OrvNebu_R3Qra_ClockFreqParamAction.h"

namespace OrvRT {

const OrvNebu_R3Qra_ClockFreqParamAction::Param2Reg
    OrvNebu_R3Qra_ClockFreqParamAction::OUT_PARAM_2_REG[] = {
        {"txusrclk_freq", "TXUSRCLK_FREQ_CNT", "TXUSRCLK_FREQ_TUNE"},
        {"txusrclk2_freq", "TXUSRCLK2_FREQ_CNT", "TXUSRCLK2_FREQ_TUNE"},
        {"rxusrclk_freq", "RXUSRCLK_FREQ_CNT", "RXUSRCLK_FREQ_TUNE"},
        {"rxusrclk2_freq", "RXUSRCLK2_FREQ_CNT", "RXUSRCLK2_FREQ_TUNE"},
        {"txoutclk_freq", "TXOUTCLK_FREQ_CNT", "TXOUTCLK_FREQ_TUNE"},
        {"rxrecclk_freq", "RXRECCLK_FREQ_CNT", "RXRECCLK_FREQ_TUNE"},
};

OrvNebu_R3Qra_ClockFreqParamAction::OrvNebu_R3Qra_ClockFreqParamAction(OrvNebu_DefaultSlave* slave,
                                                                       uint32_t priority)
    : OrvNebu_CounterFreqParamAction(slave, priority, OUT_PARAM_2_REG, OUT_PARAM_COUNT, false) {}

std::string OrvNebu_R3Qra_ClockFreqParamAction::frequencyText(const Param2Reg&,
                                                              const std::string& sysclkText,
                                                              uint64_t count, uint64_t tune) {
    return floatFrequencyText(sysclkText, count, tune);
}

}  // namespace OrvRT
