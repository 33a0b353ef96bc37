// Common frame of the PLL line-rate actions: one choice parameter whose value is a line rate
// with its feedback, reference and output dividers ("2500.000 FB=2, REF=1, DIVSEL=1"), read
// from, listed for and written to the divider choice parameters of the slave, together with
// the clock-measurement windows the rate needs.
#pragma once

#include <cstdint>
#include <string>
#include <utility>
#include <vector>

#include "params/OrvNebu_ParamAction.h"

namespace OrvRT {

class OrvNebu_DefaultSlave;

class OrvNebu_PllLineRateParamAction : public OrvNebu_ParamAction {
public:
    // The dividers are printed as unsigned long values of their low 32 bits.
    static constexpr const char* LINE_RATE_CHOICE_WRITE_FORMAT =
        "%4.3lf FB=%lu, REF=%lu, DIVSEL=%lu";
    // Read after every "," and "=" became a blank; the parser follows this format.
    static constexpr const char* LINE_RATE_CHOICE_READ_FORMAT = "%lf %*s %lu %*s %lu %*s %lu";

    bool isChoiceParam() override { return true; }
    const std::string& getParamName() override { return names_.front(); }
    const std::vector<std::string>* getParamNames() override { return &names_; }
    uint32_t getPriority() override { return priority_; }
    void getRegsToRead(Orv_HashMapCStr& registers) override;
    // Stores the current choice string; throws when asked without the reference clock.
    void readRegsAndUpdateParams(bool allParams, Orv_HashMapCStr& registers,
                                 Orv_HashMapCStr& params) override;
    // Sets every divider and window from the choice string under getParamName().
    void setParams(Orv_HashMapCStr& params, Orv_HashMapCStr& registers) override;
    // Every line rate the dividers reach within the PLL's range, in divider order.
    void getChoices(Orv_HashMapCStr* params, std::vector<std::string>& choices) override;

    static std::string& makeLineRateChoiceString(double lineRate, uint64_t fb, uint64_t ref,
                                                 uint64_t divsel, std::string& out);
    // All four outputs are 0 unless the text yields all four values; returns whether it did.
    static bool readLineRateChoiceString(uint64_t& fb, uint64_t& ref, uint64_t& divsel,
                                         double& lineRate, const std::string& text);
    // Stores the measurement window of every clock for the line rate into registers. Throws
    // without "sysclk_freq" in params or with a data width of 0; then registers is unchanged.
    void calcTuneValues(double lineRate, uint64_t dataWidth, Orv_HashMapCStr& params,
                        Orv_HashMapCStr& registers);

protected:
    struct TuneEntry {
        std::string regName;
        bool flag;
    };

    OrvNebu_PllLineRateParamAction(OrvNebu_DefaultSlave* slave, uint32_t priority);

    // What the choices are built from, read from the slave: the divider factor, the choices of
    // the feedback, reference and output dividers, the highest line rate register and whether
    // the oversampling flag is set.
    struct DividerChoices {
        uint64_t factor = 0;
        std::vector<std::string> lists[3];
        uint64_t maxRegister = 0;
        bool oversampled = false;
    };

    // Fills the sub-action list from subActionNames_; throws for a name the slave lacks.
    void findSubActions();
    DividerChoices readDividerChoices();
    // Appends every rate the dividers reach within the PLL's range and below the maximum.
    void addRates(double refclk, const DividerChoices& d, std::vector<std::string>& choices) const;

    // The divider factor from a map holding the names of factorParams_.
    virtual uint64_t dividerFactor(Orv_HashMapCStr& params) = 0;
    // The expected frequency of one measured clock.
    virtual uint64_t expectedFrequency(bool flag, uint64_t rate, uint64_t dataWidth) = 0;
    // The divider choice values a setting of the line rate writes.
    virtual void dividerSettings(uint64_t fb, uint64_t ref, uint64_t divsel,
                                 Orv_HashMapCStr& settings) = 0;

    OrvNebu_DefaultSlave* slave_;
    uint32_t priority_;
    // line rate name first, then the reference clock input.
    std::vector<std::string> names_;
    std::vector<std::string> subActionNames_;
    std::vector<OrvNebu_ParamAction*> subActions_;
    // The feedback, reference and output dividers the choices are built from.
    std::string fbName_, refName_, divselName_;
    // Parameters the divider factor comes from; the data width parameter.
    std::vector<std::string> factorParams_;
    std::string widthName_;
    std::vector<TuneEntry> tuneEntries_;
    double vcoMin_ = 0.0;
    double vcoMax_ = 0.0;
    // The TX_OVERSAMPLE_MODE register divides the rate by 5 when set.
    bool oversampling_ = false;
};

}  // namespace OrvRT
