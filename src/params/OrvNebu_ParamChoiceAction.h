// A choice parameter: a named parameter whose value is one of a fixed list of choices, each
// standing for a set of register values.
#pragma once

#include <cstdint>
#include <map>
#include <ostream>
#include <string>
#include <vector>

#include "base/OrvNebu_ParamFile.h"
#include "params/OrvNebu_ParamAction.h"
#include "params/OrvNebu_ParamChoice.h"

namespace OrvRT {

class OrvNebu_ParamChoiceAction : public OrvNebu_ParamAction {
public:
    // Choice actions of a parameter file get this plus the file line that starts them.
    static constexpr uint32_t START_PRIORITY = OrvNebu_ParamFile::START_PRIORITY;

    OrvNebu_ParamChoiceAction(const std::string& paramName, uint32_t priority);

    // Appends a choice without settings. index must equal the number of choices present;
    // otherwise throws std::logic_error("choice_index out-of-order") and changes nothing.
    void addChoice(const std::string& choiceName, uint32_t index);
    // Adds a setting to the last choice added, which index must name; otherwise throws
    // std::logic_error("choice_index corrupt") and changes nothing. The first width given for
    // a register is kept.
    void addChoiceRegSetting(uint32_t index, uint32_t width, const std::string& regName,
                             const std::string& value);
    // The width stored for the register; 0 for a register no choice sets (which is not
    // entered, so that asking cannot add a register to read).
    uint32_t getRegWidth(const std::string& regName) const;

    const std::vector<OrvNebu_ParamChoice>& getChoiceList() const { return choiceList_; }

    bool isChoiceParam() override { return true; }
    const std::string& getParamName() override { return paramNames_.front(); }
    const std::vector<std::string>* getParamNames() override { return &paramNames_; }
    uint32_t getPriority() override { return priority_; }
    // Enters every register any choice sets, with an empty value.
    void getRegsToRead(Orv_HashMapCStr& registers) override;
    // Stores the name of the first choice (index order) whose settings all match the register
    // values, or the empty text when none does.
    void readRegsAndUpdateParams(bool allParams, Orv_HashMapCStr& registers,
                                 Orv_HashMapCStr& params) override;
    // Stores the settings of the requested choice (named in any letter case); an empty value
    // sets nothing. Throws std::logic_error, leaving registers alone, for a name that is no
    // choice.
    void setParams(Orv_HashMapCStr& params, Orv_HashMapCStr& registers) override;
    void getChoices(Orv_HashMapCStr* params, std::vector<std::string>& choices) override;

    // One line "param,index,choice[,REG=bits]..." per choice, each flushed.
    void toCSVFile(std::ostream& out);

    // Hexadecimal value texts equal after dropping a 0x prefix and leading zeros, ignoring
    // case: 0x001F, 1f and 001F are equal; so are 0, 0x0 and the empty text.
    static bool hexValuesEqual(const std::string& a, const std::string& b);

private:
    uint32_t priority_;
    std::map<std::string, uint32_t> regWidths_;
    std::vector<std::string> paramNames_;
    std::vector<OrvNebu_ParamChoice> choiceList_;
};

}  // namespace OrvRT
