// Common frame of the clock-frequency actions.
#include "transceiver/OrvNebu_CounterFreqParamAction.h"

#include <stdexcept>

#include "host/OrvUtil.h"
#include "transceiver/OrvNebu_XcvrNumber.h"

namespace OrvRT {

OrvNebu_CounterFreqParamAction::OrvNebu_CounterFreqParamAction(OrvNebu_DefaultSlave* slave,
                                                               uint32_t priority,
                                                               const Param2Reg* table,
                                                               uint32_t count, bool answersSysclk)
    : slave_(slave), priority_(priority), table_(table), count_(count) {
    names_.reserve(count + 1u);
    for (uint32_t i = 0; i < count; ++i) names_.emplace_back(table[i].paramName);
    if (answersSysclk) names_.emplace_back(IN_PARAM_NAME);
}

void OrvNebu_CounterFreqParamAction::getRegsToRead(Orv_HashMapCStr& registers) {
    for (uint32_t i = 0; i < count_; ++i) {
        registers[table_[i].countRegName];
        registers[table_[i].tuneRegName];
    }
}

void OrvNebu_CounterFreqParamAction::readRegsAndUpdateParams(bool allParams,
                                                             Orv_HashMapCStr& registers,
                                                             Orv_HashMapCStr& params) {
    auto sysclk = params.find(IN_PARAM_NAME);
    if (sysclk == params.end()) {
        if (allParams) return;
        throw std::logic_error(std::string("Cannot calculate clock frequencies, since ") +
                               IN_PARAM_NAME + " has not been passed in to getParam() function.");
    }
    const std::string sysclkText = sysclk->second;
    for (uint32_t i = 0; i < count_; ++i) {
        const Param2Reg& row = table_[i];
        if (!allParams && params.find(row.paramName) == params.end()) continue;
        uint64_t count = Orv_NumberUtil::hexStr2ULL(registers[row.countRegName]);
        uint64_t tune = Orv_NumberUtil::hexStr2ULL(registers[row.tuneRegName]);
        params[row.paramName] = frequencyText(row, sysclkText, count, tune);
    }
}

std::string OrvNebu_CounterFreqParamAction::floatFrequencyText(const std::string& sysclkText,
                                                               uint64_t count, uint64_t tune) {
    double frequency = 0.0;
    if (tune != 0) {
        double sysclk = OrvNebu_XcvrNumber::readDouble(sysclkText);
        // A counter within 2 of the top would wrap to a tiny sum in 64 bits.
        double sum = count <= UINT64_MAX - 2u ? static_cast<double>(count + 2u)
                                              : static_cast<double>(count) + 2.0;
        frequency = sum * 4.0 * sysclk / static_cast<double>(tune);
    }
    return OrvNebu_XcvrNumber::formatF(frequency);
}

void OrvNebu_CounterFreqParamAction::setParams(Orv_HashMapCStr&, Orv_HashMapCStr&) {}

}  // namespace OrvRT
