// Measured clock frequencies of the clocks of an M3Qrc dual.
#include "transceiver/OrvNebu_M3Qrc_ClockFreqParamAction.h"

namespace OrvRT {

const OrvNebu_M3Qrc_ClockFreqParamAction::Param2Reg
    OrvNebu_M3Qrc_ClockFreqParamAction::OUT_PARAM_2_REG[] = {
        {"txoutclk0_freq", "TXOUTCLK_FREQ_CNT0", "TXOUTCLK_FREQ_TUNE0"},
        {"txoutclk1_freq", "TXOUTCLK_FREQ_CNT1", "TXOUTCLK_FREQ_TUNE1"},
        {"rxrecclk0_freq", "RXRECCLK_FREQ_CNT0", "RXRECCLK_FREQ_TUNE0"},
        {"rxrecclk1_freq", "RXRECCLK_FREQ_CNT1", "RXRECCLK_FREQ_TUNE1"},
        {"txusrclk0_freq", "TXUSRCLK_FREQ_CNT0", "TXUSRCLK_FREQ_TUNE0"},
        {"txusrclk1_freq", "TXUSRCLK_FREQ_CNT1", "TXUSRCLK_FREQ_TUNE1"},
        {"txusrclk20_freq", "TXUSRCLK2_FREQ_CNT0", "TXUSRCLK2_FREQ_TUNE0"},
        {"txusrclk21_freq", "TXUSRCLK2_FREQ_CNT1", "TXUSRCLK2_FREQ_TUNE1"},
        {"rxusrclk0_freq", "RXUSRCLK_FREQ_CNT0", "RXUSRCLK_FREQ_TUNE0"},
        {"rxusrclk1_freq", "RXUSRCLK_FREQ_CNT1", "RXUSRCLK_FREQ_TUNE1"},
        {"rxusrclk20_freq", "RXUSRCLK2_FREQ_CNT0", "RXUSRCLK2_FREQ_TUNE0"},
        {"rxusrclk21_freq", "RXUSRCLK2_FREQ_CNT1", "RXUSRCLK2_FREQ_TUNE1"},
};

OrvNebu_M3Qrc_ClockFreqParamAction::OrvNebu_M3Qrc_ClockFreqParamAction(OrvNebu_DefaultSlave* slave,
                                                                       uint32_t priority)
    : OrvNebu_CounterFreqParamAction(slave, priority, OUT_PARAM_2_REG, OUT_PARAM_COUNT, false) {}

std::string OrvNebu_M3Qrc_ClockFreqParamAction::frequencyText(const Param2Reg&,
                                                              const std::string& sysclkText,
                                                              uint64_t count, uint64_t tune) {
    return floatFrequencyText(sysclkText, count, tune);
}

}  // namespace OrvRT
