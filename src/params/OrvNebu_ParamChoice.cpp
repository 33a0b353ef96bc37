// Printing of one choice.
#include "params/OrvNebu_ParamChoice.h"

#include "host/OrvUtil.h"
#include "params/OrvNebu_ParamChoiceAction.h"

namespace OrvRT {

void OrvNebu_ParamChoice::toCSVFile(std::ostream& out,
                                    const OrvNebu_ParamChoiceAction& action) const {
    out << choiceName_;
    std::string bits;
    for (const RegValue& setting : regValueList_) {
        // A setting of no bits has no digits to convert.
        const uint32_t width = action.getRegWidth(setting.first);
        bits.clear();
        if (width != 0) Orv_NumberUtil::hexStr2BinStr(setting.second, width, bits);
        out << ',' << setting.first << '=' << bits;
    }
}

}  // namespace OrvRT
