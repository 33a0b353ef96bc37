// One choice of a choice parameter: its name and the register settings that stand for it.
#pragma once

#include <ostream>
#include <string>
#include <utility>
#include <vector>

namespace OrvRT {

class OrvNebu_ParamChoiceAction;

class OrvNebu_ParamChoice {
public:
    // (register name, value text as the parameter file gave it)
    typedef std::pair<std::string, std::string> RegValue;
    typedef std::vector<RegValue> RegValueList;

    explicit OrvNebu_ParamChoice(const std::string& choiceName) : choiceName_(choiceName) {}

    const std::string& getChoiceName() const { return choiceName_; }
    const RegValueList& getRegValueList() const { return regValueList_; }
    void addRegValue(const std::string& regName, const std::string& value) {
        regValueList_.emplace_back(regName, value);
    }

    // Writes the choice name and its settings as ",REG=bits", each value as binary digits of
    // the register width the action holds.
    void toCSVFile(std::ostream& out, const OrvNebu_ParamChoiceAction& action) const;

private:
    std::string choiceName_;
    RegValueList regValueList_;
};

}  // namespace OrvRT
