// Matching register values against choices, and choices against register values.
#include "params/OrvNebu_ParamChoiceAction.h"

#include <cstring>
#include <stdexcept>

#include "host/OrvUtil.h"

namespace OrvRT {

namespace {
// The text without a 0x/0X prefix and without leading zeros, as a pointer into it.
const char* significantDigits(const std::string& text) {
    const char* p = text.c_str();
    if (p[0] == '0' && (p[1] == 'x' || p[1] == 'X')) p += 2;
    while (*p == '0') ++p;
    return p;
}
}  // namespace

OrvNebu_ParamChoiceAction::OrvNebu_ParamChoiceAction(const std::string& paramName,
                                                     uint32_t priority)
    : priority_(priority), paramNames_(1, paramName) {}

void OrvNebu_ParamChoiceAction::addChoice(const std::string& choiceName, uint32_t index) {
    if (static_cast<uint64_t>(index) != static_cast<uint64_t>(choiceList_.size())) {
        throw std::logic_error(OrvNebu_ParamFile::INDEX_OUT_OF_ORDER);
    }
    choiceList_.emplace_back(choiceName);
}

void OrvNebu_ParamChoiceAction::addChoiceRegSetting(uint32_t index, uint32_t width,
                                                    const std::string& regName,
                                                    const std::string& value) {
    // Without a choice there is no last one: "number of choices minus 1" must not wrap.
    if (choiceList_.empty() ||
        static_cast<uint64_t>(index) != static_cast<uint64_t>(choiceList_.size() - 1)) {
        throw std::logic_error("choice_index corrupt");
    }
    regWidths_.emplace(regName, width);
    choiceList_.back().addRegValue(regName, value);
}

uint32_t OrvNebu_ParamChoiceAction::getRegWidth(const std::string& regName) const {
    auto it = regWidths_.find(regName);
    return it == regWidths_.end() ? 0 : it->second;
}

bool OrvNebu_ParamChoiceAction::hexValuesEqual(const std::string& a, const std::string& b) {
    return Orv_Util::stricmp(significantDigits(a), significantDigits(b)) == 0;
}

void OrvNebu_ParamChoiceAction::getRegsToRead(Orv_HashMapCStr& registers) {
    for (const auto& reg : regWidths_) registers[reg.first].clear();
}

void OrvNebu_ParamChoiceAction::readRegsAndUpdateParams(bool allParams, Orv_HashMapCStr& registers,
                                                        Orv_HashMapCStr& params) {
    (void)allParams;
    std::string& value = params[getParamName()];
    value.clear();
    for (const OrvNebu_ParamChoice& choice : choiceList_) {
        bool matches = true;
        for (const OrvNebu_ParamChoice::RegValue& setting : choice.getRegValueList()) {
            if (!hexValuesEqual(registers[setting.first], setting.second)) {
                matches = false;
                break;
            }
        }
        if (matches) {
            value = choice.getChoiceName();
            return;
        }
    }
}

void OrvNebu_ParamChoiceAction::setParams(Orv_HashMapCStr& params, Orv_HashMapCStr& registers) {
    const std::string& value = params[getParamName()];
    if (value.empty()) return;
    for (const OrvNebu_ParamChoice& choice : choiceList_) {
        if (Orv_Util::stricmp(choice.getChoiceName(), value) != 0) continue;
        for (const OrvNebu_ParamChoice::RegValue& setting : choice.getRegValueList()) {
            registers[setting.first] = setting.second;
        }
        return;
    }
    throw std::logic_error("Setting Parameter '" + getParamName() + "' to value '" + value +
                           "' is not a valid choice.");
}

void OrvNebu_ParamChoiceAction::getChoices(Orv_HashMapCStr* params,
                                           std::vector<std::string>& choices) {
    (void)params;
    choices.clear();
    choices.reserve(choiceList_.size());
    for (const OrvNebu_ParamChoice& choice : choiceList_) choices.push_back(choice.getChoiceName());
}

void OrvNebu_ParamChoiceAction::toCSVFile(std::ostream& out) {
    for (size_t i = 0; i < choiceList_.size(); ++i) {
        out << getParamName() << ',' << i << ',';
        choiceList_[i].toCSVFile(out, *this);
        out << std::endl;
    }
}

}  // namespace OrvRT
