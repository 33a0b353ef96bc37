// Line rate of an R3Qra dual.
#include "transceiver/OrvNebu_R3Qra_LineRateParamAction.h"

#include "host/OrvUtil.h"

namespace OrvRT {

namespace {
const char* const FACTOR_PARAM = "txpll_divsel45_fb";
}

const char* const OrvNebu_R3Qra_LineRateParamAction::SUB_ACTION_PARAM_NAMES[] = {
    "txpll_divsel_fb", "txpll_divsel45_fb", "txpll_divsel_ref", "txpll_divsel_out"};

OrvNebu_R3Qra_LineRateParamAction::OrvNebu_R3Qra_LineRateParamAction(OrvNebu_DefaultSlave* slave,
                                                                     uint32_t priority)
    : OrvNebu_PllLineRateParamAction(slave, priority) {
    names_ = {PARAM_NAME, IN_PARAM_NAME};
    fbName_ = SUB_ACTION_PARAM_NAMES[0];
    refName_ = SUB_ACTION_PARAM_NAMES[2];
    divselName_ = SUB_ACTION_PARAM_NAMES[3];
    widthName_ = "tx_data_width";
    factorParams_ = {widthName_, FACTOR_PARAM};
    subActionNames_.assign(SUB_ACTION_PARAM_NAMES, SUB_ACTION_PARAM_NAMES + SUB_ACTION_PARAM_COUNT);
    tuneEntries_ = {{"TXUSRCLK_FREQ_TUNE", true},   {"RXUSRCLK_FREQ_TUNE", true},
                    {"TXUSRCLK2_FREQ_TUNE", false}, {"RXUSRCLK2_FREQ_TUNE", false},
                    {"TXOUTCLK_FREQ_TUNE", false},  {"RXRECCLK_FREQ_TUNE", false}};
    vcoMin_ = 1200.0;
    vcoMax_ = 3250.0;
    oversampling_ = true;
    findSubActions();
}

uint64_t OrvNebu_R3Qra_LineRateParamAction::dividerFactor(Orv_HashMapCStr& params) {
    return Orv_NumberUtil::decStr2ULL(params[FACTOR_PARAM]);
}

uint64_t OrvNebu_R3Qra_LineRateParamAction::expectedFrequency(bool flag, uint64_t rate,
                                                              uint64_t dataWidth) {
    const uint64_t base = rate / dataWidth;
    return flag && dataWidth >= 32 ? base * 2 : base;
}

void OrvNebu_R3Qra_LineRateParamAction::dividerSettings(uint64_t fb, uint64_t ref, uint64_t divsel,
                                                        Orv_HashMapCStr& settings) {
    std::string text;
    settings["txpll_divsel_fb"] = Orv_NumberUtil::uLL2DecStr(fb, text);
    settings["txpll_divsel_ref"] = Orv_NumberUtil::uLL2DecStr(ref, text);
    settings["txpll_divsel_out"] = Orv_NumberUtil::uLL2DecStr(divsel, text);
    settings["rxpll_divsel_fb"] = settings["txpll_divsel_fb"];
    settings["rxpll_divsel_ref"] = settings["txpll_divsel_ref"];
    settings["rxpll_divsel_out"] = settings["txpll_divsel_out"];
}

}  // namespace OrvRT
