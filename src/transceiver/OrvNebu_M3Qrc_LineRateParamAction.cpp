// Line rate of one channel of an M3Qrc dual.
#include "transceiver/OrvNebu_M3Qrc_LineRateParamAction.h"

#include "host/OrvUtil.h"

namespace OrvRT {

OrvNebu_M3Qrc_LineRateParamAction::OrvNebu_M3Qrc_LineRateParamAction(OrvNebu_DefaultSlave* slave,
                                                                     uint32_t channel,
                                                                     uint32_t priority)
    : OrvNebu_PllLineRateParamAction(slave, priority) {
    const std::string n = channel == 0 ? "0" : "1";
    names_ = {"line_rate" + n, "refclk_freq" + n};
    fbName_ = "pll_divsel_fb_" + n;
    refName_ = "pll_divsel_ref_" + n;
    divselName_ = "pll_txdivsel_out_" + n;
    rxDivselName_ = "pll_rxdivsel_out_" + n;
    widthName_ = "tx_data_width" + n;
    factorParams_ = {widthName_};
    subActionNames_ = {fbName_, refName_, divselName_, widthName_};
    tuneEntries_ = {{"TXUSRCLK_FREQ_TUNE" + n, true},   {"RXUSRCLK_FREQ_TUNE" + n, true},
                    {"TXUSRCLK2_FREQ_TUNE" + n, false}, {"RXUSRCLK2_FREQ_TUNE" + n, false},
                    {"TXOUTCLK_FREQ_TUNE" + n, true},   {"RXRECCLK_FREQ_TUNE" + n, true}};
    vcoMin_ = 1228.8;
    vcoMax_ = 1562.5;
    findSubActions();
}

uint64_t OrvNebu_M3Qrc_LineRateParamAction::dividerFactor(Orv_HashMapCStr& params) {
    const uint64_t width = Orv_NumberUtil::decStr2ULL(params[widthName_]);
    return width % 8 == 0 ? 4 : 5;
}

uint64_t OrvNebu_M3Qrc_LineRateParamAction::expectedFrequency(bool flag, uint64_t rate,
                                                              uint64_t dataWidth) {
    if (flag) return rate / (dataWidth % 10 == 0 ? 10 : 8);
    return rate / dataWidth;
}

void OrvNebu_M3Qrc_LineRateParamAction::dividerSettings(uint64_t fb, uint64_t ref, uint64_t divsel,
                                                        Orv_HashMapCStr& settings) {
    std::string text;
    settings[fbName_] = Orv_NumberUtil::uLL2DecStr(fb, text);
    settings[refName_] = Orv_NumberUtil::uLL2DecStr(ref, text);
    settings[rxDivselName_] = Orv_NumberUtil::uLL2DecStr(divsel, text);
    settings[divselName_] = Orv_NumberUtil::uLL2DecStr(divsel, text);
}

}  // namespace OrvRT
