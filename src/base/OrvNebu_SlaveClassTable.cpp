// The creation records and what each slave class adds.
#include "base/OrvNebu_SlaveClassTable.h"

#include <algorithm>

namespace OrvRT {

typedef OrvNebu_SlaveClassTable Table;

const Table::ClockCounter Table::M3QRC_CLOCKS[] = {
    {"txoutclk0_freq", "TXOUTCLK_FREQ_CNT0", "TXOUTCLK_FREQ_TUNE0"},
    {"txoutclk1_freq", "TXOUTCLK_FREQ_CNT1", "TXOUTCLK_FREQ_TUNE1"},
    {"rxrecclk0_freq", "RXRECCLK_FREQ_CNT0", "RXRECCLK_FREQ_TUNE0"},
    {"rxrecclk1_freq", "RXRECCLK_FREQ_CNT1", "RXRECCLK_FREQ_TUNE1"},
    {"txusrclk0_freq", "TXUSRCLK_FREQ_CNT0", "TXUSRCLK_FREQ_TUNE0"},
    {"txusrclk1_freq", "TXUSRCLK_FREQ_CNT1", "TXUSRCLK_FREQ_TUNE1"},
    {"txusrclk20_freq", "TXUSRCLK2_FREQ_CNT0", "TXUSRCLK2_FREQ_TUNE0"},
    {"txusrclk21_freq", "TXUSRCLK2_FREQ_CNT1", "TXUSRCLK2_FREQ_TUNE1"},
    {"rxusrclk0_freq", "RXUSRCLK_FREQ_CNT0", "RXUSRCLK_FREQ_TUNE0"},
    {"rxusrclk1_freq", "RXUSRCLK_FREQ_CNT1", "RXUSRCLK_FREQ_TUNE1"},
    {"rxusrclk20_freq", "RXUSRCLK2_FREQ_CNT0", "RXUSRCLK2_FREQ_TUNE0"},
    {"rxusrclk21_freq", "RXUSRCLK2_FREQ_CNT1", "RXUSRCLK2_FREQ_TUNE1"},
};

const Table::ClockCounter Table::R2QRA_CLOCKS[] = {
    {"txusrclk0_freq", "TXUSRCLK_FREQ_CNT0", "TXUSRCLK_FREQ_TUNE0"},
    {"txusrclk1_freq", "TXUSRCLK_FREQ_CNT1", "TXUSRCLK_FREQ_TUNE1"},
    {"txusrclk20_freq", "TXUSRCLK2_FREQ_CNT0", "TXUSRCLK2_FREQ_TUNE0"},
    {"txusrclk21_freq", "TXUSRCLK2_FREQ_CNT1", "TXUSRCLK2_FREQ_TUNE1"},
    {"rxusrclk0_freq", "RXUSRCLK_FREQ_CNT0", "RXUSRCLK_FREQ_TUNE0"},
    {"rxusrclk1_freq", "RXUSRCLK_FREQ_CNT1", "RXUSRCLK_FREQ_TUNE1"},
    {"rxusrclk20_freq", "RXUSRCLK2_FREQ_CNT0", "RXUSRCLK2_FREQ_TUNE0"},
    {"rxusrclk21_freq", "RXUSRCLK2_FREQ_CNT1", "RXUSRCLK2_FREQ_TUNE1"},
};

const Table::ClockCounter Table::R3QRA_CLOCKS[] = {
    {"txusrclk_freq", "TXUSRCLK_FREQ_CNT", "TXUSRCLK_FREQ_TUNE"},
    {"txusrclk2_freq", "TXUSRCLK2_FREQ_CNT", "TXUSRCLK2_FREQ_TUNE"},
    {"rxusrclk_freq", "RXUSRCLK_FREQ_CNT", "RXUSRCLK_FREQ_TUNE"},
    {"rxusrclk2_freq", "RXUSRCLK2_FREQ_CNT", "RXUSRCLK2_FREQ_TUNE"},
    {"txoutclk_freq", "TXOUTCLK_FREQ_CNT", "TXOUTCLK_FREQ_TUNE"},
    {"rxrecclk_freq", "RXRECCLK_FREQ_CNT", "RXRECCLK_FREQ_TUNE"},
};

const Table::ClockCounter Table::R3QRB_CLOCKS[] = {
    {"txuserclkout_freq", "TXUSERCLKOUT_FREQ_CNT", "TXUSERCLKOUT_FREQ_TUNE"},
    {"rxuserclkout_freq0", "RXUSERCLKOUT_FREQ_CNT0", "RXUSERCLKOUT_FREQ_TUNE0"},
    {"rxuserclkout_freq1", "RXUSERCLKOUT_FREQ_CNT1", "RXUSERCLKOUT_FREQ_TUNE1"},
    {"rxuserclkout_freq2", "RXUSERCLKOUT_FREQ_CNT2", "RXUSERCLKOUT_FREQ_TUNE2"},
    {"rxuserclkout_freq3", "RXUSERCLKOUT_FREQ_CNT3", "RXUSERCLKOUT_FREQ_TUNE3"},
};

namespace {

const char* const SYSCLK = "sysclk_freq";

Table::ComputedAction clockAction(const char* className, const Table::ClockCounter* rows,
                                  size_t count, bool answersSysclk) {
    Table::ComputedAction action{className, {}, {}, {}};
    for (size_t i = 0; i < count; ++i) {
        action.parameters.push_back(rows[i].paramName);
        action.registers.push_back(rows[i].countRegName);
        action.registers.push_back(rows[i].tuneRegName);
    }
    if (answersSysclk) action.parameters.push_back(SYSCLK);
    return action;
}

Table::ComputedAction sysclockAction(const char* className) {
    return Table::ComputedAction{className, {SYSCLK}, {}, {}};
}

// The window registers a PLL line rate writes: those of its clock action, of one channel.
std::vector<std::string> tuneRegisters(const Table::ClockCounter* rows, size_t count,
                                       const std::string& suffix) {
    std::vector<std::string> names;
    for (size_t i = 0; i < count; ++i) {
        const std::string tune = rows[i].tuneRegName;
        if (tune.size() >= suffix.size() &&
            tune.compare(tune.size() - suffix.size(), suffix.size(), suffix) == 0) {
            names.push_back(tune);
        }
    }
    return names;
}

Table::ComputedAction m3QrcLineRate(const std::string& n) {
    Table::ComputedAction action{
        "OrvNebu_M3Qrc_LineRateParamAction",
        {"line_rate" + n, "refclk_freq" + n},
        {"MAX_LINERATE"},
        {"pll_divsel_fb_" + n, "pll_divsel_ref_" + n, "pll_txdivsel_out_" + n, "tx_data_width" + n,
         "pll_rxdivsel_out_" + n}};
    const std::vector<std::string> tunes =
        tuneRegisters(Table::M3QRC_CLOCKS, Table::M3QRC_CLOCK_COUNT, n);
    action.registers.insert(action.registers.end(), tunes.begin(), tunes.end());
    return action;
}

std::vector<Table::ClassInfo> makeClasses() {
    std::vector<Table::ClassInfo> classes;
    classes.push_back({Table::DEFAULT_SLAVE, "OrvNebu_DefaultSlave", "", {}});
    classes.push_back({Table::VANDU_M3QRC,
                       "OrvNebu_VanduM3Qrc",
                       "M3Qrc",
                       {clockAction("OrvNebu_M3Qrc_ClockFreqParamAction", Table::M3QRC_CLOCKS,
                                    Table::M3QRC_CLOCK_COUNT, false),
                        m3QrcLineRate("0"), m3QrcLineRate("1"),
                        sysclockAction("OrvNebu_M3Qrc_SysclockFreqParamAction")}});
    classes.push_back(
        {Table::VANDU_R2QRA,
         "OrvNebu_VanduR2Qra",
         "R2Qra",
         {clockAction("OrvNebu_ClockFreqParamAction", Table::R2QRA_CLOCKS, Table::R2QRA_CLOCK_COUNT,
                      true),
          {"OrvNebu_LineRateParamAction",
           {"line_rate0", "line_rate1", "refclk_freq"},
           {"INTDATAWIDTH"},
           {"pll_divsel_fb", "pll_divsel_ref", "pll_rxdivsel_out_0", "pll_rxdivsel_out_1"}},
          {"OrvNebu_RefClockParamAction",
           {"refclk_source", "internal_param_SOUTH_DRIVER", "internal_param_NORTH_DRIVER"},
           {"CLKSOUTH_SEL", "CLKNORTH_SEL", "REFCLKSEL", "DUAL_NUMBER", "DUAL_COORDINATE"},
           {}}}});
    Table::ComputedAction r3QraLineRate{
        "OrvNebu_R3Qra_LineRateParamAction",
        {"line_rate", "refclk_freq"},
        {"MAX_LINERATE", "TX_OVERSAMPLE_MODE"},
        {"txpll_divsel_fb", "txpll_divsel45_fb", "txpll_divsel_ref", "txpll_divsel_out",
         "tx_data_width", "rxpll_divsel_fb", "rxpll_divsel_ref", "rxpll_divsel_out"}};
    const std::vector<std::string> r3QraTunes =
        tuneRegisters(Table::R3QRA_CLOCKS, Table::R3QRA_CLOCK_COUNT, "TUNE");
    r3QraLineRate.registers.insert(r3QraLineRate.registers.end(), r3QraTunes.begin(),
                                   r3QraTunes.end());
    classes.push_back({Table::VANDU_R3QRA,
                       "OrvNebu_VanduR3Qra",
                       "R3Qra",
                       {clockAction("OrvNebu_R3Qra_ClockFreqParamAction", Table::R3QRA_CLOCKS,
                                    Table::R3QRA_CLOCK_COUNT, false),
                        r3QraLineRate, sysclockAction("OrvNebu_R3Qra_SysclockFreqParamAction")}});
    classes.push_back({Table::VANDU_R3QRB,
                       "OrvNebu_VanduR3Qrb",
                       "R3Qrb",
                       {clockAction("OrvNebu_R3Qrb_ClockFreqParamAction", Table::R3QRB_CLOCKS,
                                    Table::R3QRB_CLOCK_COUNT, false),
                        sysclockAction("OrvNebu_R3Qrb_SysclockFreqParamAction")}});
    return classes;
}

}  // namespace

const std::vector<Table::Record>& Table::records() {
    static const std::vector<Record> table = {
        {0x00, 0, 0xFFFF, DEFAULT_SLAVE}, {0x01, 1, 1, VANDU_M3QRC},
        {0x11, 1, 0xFFFF, DEFAULT_SLAVE}, {0x12, 1, 0xFFFF, DEFAULT_SLAVE},
        {0x13, 1, 0xFFFF, DEFAULT_SLAVE}, {0x14, 1, 0xFFFF, DEFAULT_SLAVE},
        {0x15, 1, 0xFFFF, VANDU_R3QRA},   {0x21, 1, 0xFFFF, DEFAULT_SLAVE},
        {0x31, 1, 0xFFFF, DEFAULT_SLAVE}, {0x41, 1, 1, DEFAULT_SLAVE},
        {0x42, 1, 1, VANDU_R2QRA},        {0x43, 1, 1, VANDU_R3QRA},
        {0x44, 1, 1, VANDU_M3QRC},        {0x45, 1, 1, VANDU_R3QRB},
    };
    return table;
}

Table::SlaveClass Table::find(int32_t slaveType, int32_t driverVersion) {
    const std::vector<Record>& table = records();
    // The first record past the type, or of the type with a maximum version reaching V.
    auto it = std::lower_bound(table.begin(), table.end(), 0, [&](const Record& r, int) {
        return r.slaveType < slaveType ||
               (r.slaveType == slaveType && r.maxDriverVersion < driverVersion);
    });
    if (it != table.end() && it->slaveType == slaveType && it->minDriverVersion <= driverVersion &&
        it->maxDriverVersion >= driverVersion) {
        return it->slaveClass;
    }
    return DEFAULT_SLAVE;
}

const Table::ClassInfo& Table::info(SlaveClass slaveClass) {
    static const std::vector<ClassInfo> classes = makeClasses();
    return classes.at(slaveClass < SLAVE_CLASS_COUNT ? slaveClass : DEFAULT_SLAVE);
}

}  // namespace OrvRT
