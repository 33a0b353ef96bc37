// Line rates of both channels of an R2Qra dual.
#include "transceiver/OrvNebu_LineRateParamAction.h"

#include <stdexcept>

#include "base/OrvNebu_NameMaps.h"
#include "slave/OrvNebu_DefaultSlave.h"
#include "transceiver/OrvNebu_XcvrNumber.h"

namespace OrvRT {

const char* const OrvNebu_LineRateParamAction::OUT_PARAM_NAMES[] = {"line_rate0", "line_rate1"};
const char* const OrvNebu_LineRateParamAction::SUB_ACTION_PARAM_NAMES[] = {
    "pll_divsel_fb", "pll_divsel_ref", "pll_rxdivsel_out_0", "pll_rxdivsel_out_1"};

OrvNebu_LineRateParamAction::OrvNebu_LineRateParamAction(OrvNebu_DefaultSlave* slave,
                                                         uint32_t priority)
    : slave_(slave), priority_(priority) {
    names_.assign(OUT_PARAM_NAMES, OUT_PARAM_NAMES + OUT_PARAM_COUNT);
    names_.emplace_back(IN_PARAM_NAME);
    for (uint32_t i = 0; i < SUB_ACTION_PARAM_COUNT; ++i) {
        OrvNebu_ParamAction* action = slave_->getParamAction(SUB_ACTION_PARAM_NAMES[i]);
        if (action == nullptr) {
            // The message text is the one hosts know, spelling included.
            throw std::logic_error(
                std::string("Intenal error: When calculating linerate, cannot find parameter") +
                SUB_ACTION_PARAM_NAMES[i]);
        }
        subActions_.push_back(action);
    }
}

void OrvNebu_LineRateParamAction::getRegsToRead(Orv_HashMapCStr& registers) {
    registers[INTERNAL_DATA_WIDTH_REG_NAME] = std::string();
    for (OrvNebu_ParamAction* action : subActions_) action->getRegsToRead(registers);
}

void OrvNebu_LineRateParamAction::readRegsAndUpdateParams(bool allParams,
                                                          Orv_HashMapCStr& registers,
                                                          Orv_HashMapCStr& params) {
    const std::string& width = registers[INTERNAL_DATA_WIDTH_REG_NAME];
    const uint64_t factor = !width.empty() && width[0] == '0' ? 4 : 5;

    auto found = params.find(IN_PARAM_NAME);
    if (found == params.end()) {
        if (allParams) return;
        throw std::logic_error(std::string("Cannot calculate line rate, since ") + IN_PARAM_NAME +
                               " has not been passed in to getParam() function.");
    }
    const int64_t refclk = OrvNebu_XcvrNumber::readLld(found->second);

    Orv_HashMapCStr current(ORVNEBU_MAP_BUCKETS);
    for (OrvNebu_ParamAction* action : subActions_) {
        action->readRegsAndUpdateParams(false, registers, current);
    }
    const int64_t fb = OrvNebu_XcvrNumber::readLld(current[SUB_ACTION_PARAM_NAMES[0]]);
    const int64_t ref = OrvNebu_XcvrNumber::readLld(current[SUB_ACTION_PARAM_NAMES[1]]);
    const int64_t out[2] = {OrvNebu_XcvrNumber::readLld(current[SUB_ACTION_PARAM_NAMES[2]]),
                            OrvNebu_XcvrNumber::readLld(current[SUB_ACTION_PARAM_NAMES[3]])};

    for (uint32_t i = 0; i < OUT_PARAM_COUNT; ++i) {
        const char* name = OUT_PARAM_NAMES[i];
        if (!allParams && params.find(name) == params.end()) continue;
        // The divisor is taken from the low halves, as the hardware counts them.
        const uint32_t divisor = static_cast<uint32_t>(ref) * static_cast<uint32_t>(out[i]);
        int64_t rate = 0;
        if (divisor != 0) {
            // (factor * FB) * refclk * 2 exactly, sign kept; a product past 64 bits would wrap
            // into a plausible but wrong rate.
            uint64_t product = 0;
            bool fits =
                OrvNebu_XcvrNumber::multiply(factor, OrvNebu_XcvrNumber::magnitude(fb), product) &&
                OrvNebu_XcvrNumber::multiply(product, OrvNebu_XcvrNumber::magnitude(refclk),
                                             product) &&
                OrvNebu_XcvrNumber::multiply(product, 2u, product);
            const uint64_t quotient = product / divisor;
            if (!fits || quotient > static_cast<uint64_t>(INT64_MAX)) {
                throw std::logic_error(std::string("Cannot calculate ") + name +
                                       ", since the result does not fit in 64 bits.");
            }
            rate = static_cast<int64_t>(quotient);
            if ((fb < 0) != (refclk < 0)) rate = -rate;
        }
        params[name] = OrvNebu_XcvrNumber::formatLld(rate);
    }
}

void OrvNebu_LineRateParamAction::setParams(Orv_HashMapCStr&, Orv_HashMapCStr&) {}

}  // namespace OrvRT
