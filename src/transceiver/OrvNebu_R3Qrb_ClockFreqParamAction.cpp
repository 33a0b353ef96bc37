// Measured clock frequencies of the clocks of an R3Qrb quad.
#include "transceiver/OrvNebu_R3Qrb_ClockFreqParamAction.h"

namespace OrvRT {

const OrvNebu_R3Qrb_ClockFreqParamAction::Param2Reg
    OrvNebu_R3Qrb_ClockFreqParamAction::OUT_PARAM_2_REG[] = {
        {"txuserclkout_freq", "TXUSERCLKOUT_FREQ_CNT", "TXUSERCLKOUT_FREQ_TUNE"},
        {"rxuserclkout_freq0", "RXUSERCLKOUT_FREQ_CNT0", "RXUSERCLKOUT_FREQ_TUNE0"},
        {"rxuserclkout_freq1", "RXUSERCLKOUT_FREQ_CNT1", "RXUSERCLKOUT_FREQ_TUNE1"},
        {"rxuserclkout_freq2", "RXUSERCLKOUT_FREQ_CNT2", "RXUSERCLKOUT_FREQ_TUNE2"},
        {"rxuserclkout_freq3", "RXUSERCLKOUT_FREQ_CNT3", "RXUSERCLKOUT_FREQ_TUNE3"},
};

OrvNebu_R3Qrb_ClockFreqParamAction::OrvNebu_R3Qrb_ClockFreqParamAction(OrvNebu_DefaultSlave* slave,
                                                                       uint32_t priority)
    : OrvNebu_CounterFreqParamAction(slave, priority, OUT_PARAM_2_REG, OUT_PARAM_COUNT, false) {}

std::string OrvNebu_R3Qrb_ClockFreqParamAction::frequencyText(const Param2Reg&,
                                                              const std::string& sysclkText,
                                                              uint64_t count, uint64_t tune) {
    return floatFrequencyText(sysclkText, count, tune);
}

}  // namespace OrvRT
