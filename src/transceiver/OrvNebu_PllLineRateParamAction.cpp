// Common frame of the PLL line-rate actions.
#include "transceiver/OrvNebu_PllLineRateParamAction.h"

#include <cctype>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <stdexcept>

#include "base/OrvNebu_NameMaps.h"
#include "host/OrvUtil.h"
#include "slave/OrvNebu_DefaultSlave.h"
#include "transceiver/OrvNebu_XcvrNumber.h"

namespace OrvRT {

namespace {

const char* const SYSCLK_NAME = "sysclk_freq";
const char* const MAX_LINERATE = "MAX_LINERATE";
const char* const TX_OVERSAMPLE_MODE = "TX_OVERSAMPLE_MODE";
const double OVERSAMPLE_DIVISOR = 5.0;
const double OVERSAMPLE_MAX = 480.0 + 1.0;
// 2^64: rates at or above it have no 64-bit integer part.
const double RATE_LIMIT = 18446744073709551616.0;

const char* skipBlanks(const char* p) {
    while (*p != '\0' && std::isspace(static_cast<unsigned char>(*p))) ++p;
    return p;
}

// A window value: truncated toward zero, at most 65535, 0 for anything not positive (NaN too).
uint64_t clampTune(double tune) {
    if (!(tune > 0.0)) return 0;
    if (tune > 65535.0) return 65535;
    return static_cast<uint64_t>(tune);
}

}  // namespace

OrvNebu_PllLineRateParamAction::OrvNebu_PllLineRateParamAction(OrvNebu_DefaultSlave* slave,
                                                               uint32_t priority)
    : slave_(slave), priority_(priority) {}

void OrvNebu_PllLineRateParamAction::findSubActions() {
    for (const std::string& name : subActionNames_) {
        OrvNebu_ParamAction* action = slave_->getParamAction(name);
        if (action == nullptr) {
            throw std::logic_error(
                "Internal error: During init linerate choice, cannot find parameter: " + name);
        }
        subActions_.push_back(action);
    }
}

void OrvNebu_PllLineRateParamAction::getRegsToRead(Orv_HashMapCStr& registers) {
    if (oversampling_) registers[TX_OVERSAMPLE_MODE] = std::string();
    for (OrvNebu_ParamAction* action : subActions_) action->getRegsToRead(registers);
}

void OrvNebu_PllLineRateParamAction::readRegsAndUpdateParams(bool allParams,
                                                             Orv_HashMapCStr& registers,
                                                             Orv_HashMapCStr& params) {
    const std::string& refclkName = names_[1];
    auto found = params.find(refclkName);
    if (found == params.end()) {
        if (allParams) return;
        throw std::logic_error("Cannot calculate line rate choice, since " + refclkName +
                               " has not been passed in to getParam() function.");
    }
    const double refclk = OrvNebu_XcvrNumber::readDouble(found->second);

    Orv_HashMapCStr current(ORVNEBU_MAP_BUCKETS);
    for (OrvNebu_ParamAction* action : subActions_) {
        action->readRegsAndUpdateParams(false, registers, current);
    }
    const bool oversampled =
        oversampling_ && Orv_NumberUtil::hexStr2ULL(registers[TX_OVERSAMPLE_MODE]) != 0;
    const uint64_t factor = dividerFactor(current);
    const uint64_t fb = Orv_NumberUtil::decStr2ULL(current[fbName_]);
    const uint64_t ref = Orv_NumberUtil::decStr2ULL(current[refName_]);
    const uint64_t divsel = Orv_NumberUtil::decStr2ULL(current[divselName_]);

    double rate = 0.0;
    const uint64_t divisor = ref * divsel;
    if (ref != 0 && divsel != 0 && divisor != 0) {
        rate = static_cast<double>(factor * fb) * refclk * 2.0 / static_cast<double>(divisor);
    }
    if (oversampled) rate /= OVERSAMPLE_DIVISOR;
    std::string text;
    params[getParamName()] = makeLineRateChoiceString(rate, fb, ref, divsel, text);
}

void OrvNebu_PllLineRateParamAction::getChoices(Orv_HashMapCStr* params,
                                                std::vector<std::string>& choices) {
    const std::string& refclkName = names_[1];
    auto found = params->find(refclkName);
    if (found == params->end()) {
        throw std::logic_error("Cannot calculate line rate choices, since " + refclkName +
                               " has not been passed in to getParamChoices() function.");
    }
    const double refclk = OrvNebu_XcvrNumber::readDouble(found->second);
    choices.clear();
    addRates(refclk, readDividerChoices(), choices);
}

OrvNebu_PllLineRateParamAction::DividerChoices
OrvNebu_PllLineRateParamAction::readDividerChoices() {
    const uint32_t handle = slave_->getOwnerHandle();
    const ORV_SLAVE_REF slaveRef = slave_->getSlaveRef();
    Orv_HashMapCStr registers(ORVNEBU_MAP_BUCKETS);
    registers[MAX_LINERATE];
    if (oversampling_) registers[TX_OVERSAMPLE_MODE];
    slave_->getRegisters(handle, slaveRef, &registers);

    Orv_HashMapCStr factorValues(ORVNEBU_MAP_BUCKETS);
    for (const std::string& name : factorParams_) factorValues[name];
    slave_->getParameters(handle, slaveRef, &factorValues);

    DividerChoices d;
    d.factor = dividerFactor(factorValues);
    const std::string* dividerNames[3] = {&fbName_, &refName_, &divselName_};
    for (int i = 0; i < 3; ++i) {
        Orv_HashMapCStr request(ORVNEBU_MAP_BUCKETS);
        request[*dividerNames[i]];
        slave_->getParameterChoices(handle, slaveRef, &request, &d.lists[i]);
    }
    d.maxRegister = Orv_NumberUtil::hexStr2ULL(registers[MAX_LINERATE]);
    d.oversampled = oversampling_ && Orv_NumberUtil::hexStr2ULL(registers[TX_OVERSAMPLE_MODE]) != 0;
    return d;
}

void OrvNebu_PllLineRateParamAction::addRates(double refclk, const DividerChoices& d,
                                              std::vector<std::string>& choices) const {
    const double maximum = static_cast<double>(d.maxRegister) / 1000000.0;
    std::string text;
    for (const std::string& fbText : d.lists[0]) {
        const uint64_t fb = Orv_NumberUtil::decStr2ULL(fbText);
        for (const std::string& refText : d.lists[1]) {
            const uint64_t ref = Orv_NumberUtil::decStr2ULL(refText);
            // A divider of 0 divides nothing: it reaches no rate.
            if (ref == 0) continue;
            const double vco = static_cast<double>(d.factor) * refclk * static_cast<double>(fb) /
                               static_cast<double>(ref);
            if (!(vco >= vcoMin_ && vco <= vcoMax_)) continue;
            for (const std::string& divText : d.lists[2]) {
                const uint64_t divsel = Orv_NumberUtil::decStr2ULL(divText);
                if (divsel == 0) continue;
                const double rate = (vco + vco) / static_cast<double>(divsel);
                if (d.maxRegister == 0 || !(rate > maximum + 1.0)) {
                    choices.push_back(makeLineRateChoiceString(rate, fb, ref, divsel, text));
                }
                const double slow = rate / OVERSAMPLE_DIVISOR;
                if (d.oversampled && !(slow > OVERSAMPLE_MAX)) {
                    choices.push_back(makeLineRateChoiceString(slow, fb, ref, divsel, text));
                }
            }
        }
    }
}

void OrvNebu_PllLineRateParamAction::setParams(Orv_HashMapCStr& params,
                                               Orv_HashMapCStr& registers) {
    auto found = params.find(getParamName());
    const std::string text = found == params.end() ? std::string() : found->second;

    const uint32_t handle = slave_->getOwnerHandle();
    const ORV_SLAVE_REF slaveRef = slave_->getSlaveRef();
    Orv_HashMapCStr widthValue(ORVNEBU_MAP_BUCKETS);
    widthValue[widthName_];
    slave_->getParameters(handle, slaveRef, &widthValue);
    const uint64_t dataWidth = Orv_NumberUtil::decStr2ULL(widthValue[widthName_]);

    uint64_t fb = 0, ref = 0, divsel = 0;
    double rate = 0.0;
    readLineRateChoiceString(fb, ref, divsel, rate, text);
    // Infinite or enormous rates have no whole-number part to derive windows from.
    if (!(rate > 0.0) || !(rate < RATE_LIMIT)) {
        throw std::logic_error("Unable to set line rate from string '" + text + "'");
    }
    calcTuneValues(rate, dataWidth, params, registers);

    Orv_HashMapCStr settings(ORVNEBU_MAP_BUCKETS);
    dividerSettings(fb, ref, divsel, settings);
    slave_->setParametersInRegisterHashMap(handle, &settings, &registers);
}

void OrvNebu_PllLineRateParamAction::calcTuneValues(double lineRate, uint64_t dataWidth,
                                                    Orv_HashMapCStr& params,
                                                    Orv_HashMapCStr& registers) {
    auto found = params.find(SYSCLK_NAME);
    if (found == params.end()) {
        throw std::logic_error(std::string("Cannot calculate new line rate tune values, since ") +
                               SYSCLK_NAME + " has not been passed in to setParam() function.");
    }
    // Every window divides by the data width.
    if (dataWidth == 0) {
        throw std::logic_error("Cannot calculate new line rate tune values, since " + widthName_ +
                               " is 0.");
    }
    const double sysclk = OrvNebu_XcvrNumber::readDouble(found->second);
    // Windows of a clock that is no positive number would stop every measurement.
    if (!(sysclk > 0.0) || std::isinf(sysclk)) {
        throw std::logic_error(std::string("Cannot calculate new line rate tune values, since ") +
                               SYSCLK_NAME + " '" + found->second + "' is not a positive number.");
    }
    uint64_t rate = 0;
    if (lineRate >= RATE_LIMIT) {
        rate = UINT64_MAX;
    } else if (lineRate > 0.0) {
        rate = static_cast<uint64_t>(lineRate);
    }
    std::string hex;
    for (const TuneEntry& entry : tuneEntries_) {
        const uint64_t frequency = expectedFrequency(entry.flag, rate, dataWidth);
        const uint64_t tune =
            frequency == 0 ? 0 : clampTune(sysclk * 224000.0 / static_cast<double>(frequency));
        registers[entry.regName] = Orv_NumberUtil::uLL2HexStr(tune, hex);
    }
}

std::string& OrvNebu_PllLineRateParamAction::makeLineRateChoiceString(double lineRate, uint64_t fb,
                                                                      uint64_t ref, uint64_t divsel,
                                                                      std::string& out) {
    const unsigned long f = static_cast<uint32_t>(fb);
    const unsigned long r = static_cast<uint32_t>(ref);
    const unsigned long d = static_cast<uint32_t>(divsel);
    char small[96];
    int n = std::snprintf(small, sizeof small, LINE_RATE_CHOICE_WRITE_FORMAT, lineRate, f, r, d);
    if (n < 0) {
        out.clear();
    } else if (static_cast<size_t>(n) < sizeof small) {
        out.assign(small, static_cast<size_t>(n));
    } else {
        // Huge rates print hundreds of digits.
        out.assign(static_cast<size_t>(n) + 1, '\0');
        std::snprintf(&out[0], out.size(), LINE_RATE_CHOICE_WRITE_FORMAT, lineRate, f, r, d);
        out.resize(static_cast<size_t>(n));
    }
    return out;
}

bool OrvNebu_PllLineRateParamAction::readLineRateChoiceString(uint64_t& fb, uint64_t& ref,
                                                              uint64_t& divsel, double& lineRate,
                                                              const std::string& text) {
    fb = ref = divsel = 0;
    lineRate = 0.0;
    std::string copy = text;
    for (char& c : copy) {
        if (c == ',' || c == '=') c = ' ';
    }
    // The scan of LINE_RATE_CHOICE_READ_FORMAT: a number (decimal, as every number text of
    // these parameters), then three times a skipped word and an unsigned number; strtoull
    // saturates where the scan's overflow is undefined.
    const char* p = copy.c_str();
    const char* rateEnd = nullptr;
    const double rate = OrvNebu_XcvrNumber::readDecimal(p, &rateEnd);
    if (rateEnd == p) return false;
    p = rateEnd;
    char* end = nullptr;
    uint64_t values[3] = {0, 0, 0};
    for (uint64_t& value : values) {
        p = skipBlanks(p);
        if (*p == '\0') return false;
        while (*p != '\0' && !std::isspace(static_cast<unsigned char>(*p))) ++p;
        p = skipBlanks(p);
        value = std::strtoull(p, &end, 10);
        if (end == p) return false;
        p = end;
    }
    lineRate = rate;
    fb = values[0];
    ref = values[1];
    divsel = values[2];
    return true;
}

}  // namespace OrvRT
