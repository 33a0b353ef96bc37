// Common frame of the clock-frequency actions: a table of (output parameter, counter register,
// window register) rows turned into clock frequencies with the system clock the host passes in.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "base/OrvNebu_SlaveClassTable.h"
#include "params/OrvNebu_ParamAction.h"

namespace OrvRT {

class OrvNebu_DefaultSlave;

class OrvNebu_CounterFreqParamAction : public OrvNebu_ParamAction {
public:
    typedef OrvNebu_SlaveClassTable::ClockCounter Param2Reg;
    static constexpr const char* IN_PARAM_NAME = "sysclk_freq";

    const std::string& getParamName() override { return names_.front(); }
    const std::vector<std::string>* getParamNames() override { return &names_; }
    uint32_t getPriority() override { return priority_; }
    // Every counter and window register, whichever outputs are asked for.
    void getRegsToRead(Orv_HashMapCStr& registers) override;
    // Throws when outputs are asked for without sysclk_freq.
    void readRegsAndUpdateParams(bool allParams, Orv_HashMapCStr& registers,
                                 Orv_HashMapCStr& params) override;
    void setParams(Orv_HashMapCStr& params, Orv_HashMapCStr& registers) override;

protected:
    // table: count rows of static storage. answersSysclk: the input name joins the name list.
    OrvNebu_CounterFreqParamAction(OrvNebu_DefaultSlave* slave, uint32_t priority,
                                   const Param2Reg* table, uint32_t count, bool answersSysclk);

    // The frequency text of one row; sysclkText is the text the host passed in.
    virtual std::string frequencyText(const Param2Reg& row, const std::string& sysclkText,
                                      uint64_t count, uint64_t tune) = 0;

    // (count + 2) * 4.0 * sysclk / tune in double precision, "%f"; 0 when tune is 0.
    static std::string floatFrequencyText(const std::string& sysclkText, uint64_t count,
                                          uint64_t tune);

    OrvNebu_DefaultSlave* slave_;

private:
    uint32_t priority_;
    const Param2Reg* table_;
    uint32_t count_;
    std::vector<std::string> names_;
};

}  // namespace OrvRT
