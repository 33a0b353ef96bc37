// PLL line-rate actions of the M3Qrc, R3Qrb and R3Qra families: current rate, the choice list
// in its order, setting with the measurement windows, and the choice-string format.
#include <gtest/gtest.h>

#include <functional>
#include <stdexcept>
#include <string>
#include <vector>

#include "transceiver/OrvNebu_M3Qrc_LineRateParamAction.h"
#include "transceiver/OrvNebu_M3Qrc_SysclockFreqParamAction.h"
#include "transceiver/OrvNebu_R3Qra_LineRateParamAction.h"
#include "transceiver/OrvNebu_R3Qra_SysclockFreqParamAction.h"
#include "transceiver/OrvNebu_R3Qrb_LineRateParamAction.h"
#include "transceiver/XcvrTestSlave.h"

using namespace OrvRT;
using xcvrtest::MemorySlave;

namespace {

std::string message(const std::function<void()>& f) {
    try {
        f();
    } catch (const std::logic_error& e) {
        return e.what();
    }
    return "(no error)";
}

// An M3Qrc channel n with FB 1..5, REF 1 and 2, DIVSEL 1, 2 and 4 and data widths.
void addM3QrcDividers(MemorySlave& slave, const std::string& n) {
    slave.addChoice("pll_divsel_fb_" + n, "FB" + n).numbers({1, 2, 3, 4, 5});
    slave.addChoice("pll_divsel_ref_" + n, "REF" + n).numbers({1, 2});
    slave.addChoice("pll_txdivsel_out_" + n, "TXOUT" + n).numbers({1, 2, 4});
    slave.addChoice("pll_rxdivsel_out_" + n, "RXOUT" + n).numbers({1, 2, 4});
    slave.addChoice("tx_data_width" + n, "WIDTH" + n).numbers({16, 20, 32, 40});
    for (const char* clock :
         {"TXUSRCLK", "RXUSRCLK", "TXUSRCLK2", "RXUSRCLK2", "TXOUTCLK", "RXRECCLK"}) {
        slave.memory[std::string(clock) + "_FREQ_TUNE" + n] = "0";
    }
}

struct M3QrcChannel : ::testing::Test {
    M3QrcChannel() : slave(1, 4) {
        addM3QrcDividers(slave, "0");
        slave.memory["MAX_LINERATE"] = "0";
        slave.memory["WIDTH0"] = "14";  // 20 bits: factor 5
        action = &slave.addComputed<OrvNebu_M3Qrc_LineRateParamAction>(0u, 5001u);
        slave.addComputed<OrvNebu_M3Qrc_SysclockFreqParamAction>(5003u);
    }
    std::vector<std::string> choices(const std::string& refclk) {
        Orv_HashMapCStr params{{"line_rate0", ""}, {"refclk_freq0", refclk}};
        std::vector<std::string> list{"stale"};
        action->getChoices(&params, list);
        return list;
    }
    std::string current(Orv_HashMapCStr params) {
        Orv_HashMapCStr registers;
        action->getRegsToRead(registers);
        slave.getRegisters(1, slave.getSlaveRef(), &registers);
        action->readRegsAndUpdateParams(false, registers, params);
        return params["line_rate0"];
    }
    MemorySlave slave;
    OrvNebu_M3Qrc_LineRateParamAction* action = nullptr;
};

}  // namespace

TEST_F(M3QrcChannel, NineChoicesInDividerOrderAndTheMaximumLineRate) {
    const std::vector<std::string> nine{
        "2500.000 FB=2, REF=1, DIVSEL=1", "1250.000 FB=2, REF=1, DIVSEL=2",
        "625.000 FB=2, REF=1, DIVSEL=4",  "2500.000 FB=4, REF=2, DIVSEL=1",
        "1250.000 FB=4, REF=2, DIVSEL=2", "625.000 FB=4, REF=2, DIVSEL=4",
        "3125.000 FB=5, REF=2, DIVSEL=1", "1562.500 FB=5, REF=2, DIVSEL=2",
        "781.250 FB=5, REF=2, DIVSEL=4"};
    EXPECT_EQ(nine, choices("125"));

    slave.memory["MAX_LINERATE"] = "77359400";  // 2000000000: 2000.0 Mb/s
    EXPECT_EQ((std::vector<std::string>{
                  "1250.000 FB=2, REF=1, DIVSEL=2", "625.000 FB=2, REF=1, DIVSEL=4",
                  "1250.000 FB=4, REF=2, DIVSEL=2", "625.000 FB=4, REF=2, DIVSEL=4",
                  "1562.500 FB=5, REF=2, DIVSEL=2", "781.250 FB=5, REF=2, DIVSEL=4"}),
              choices("125"));

    // Up to one above the maximum still counts: 2500.0 against a maximum of 2499.0.
    slave.memory["MAX_LINERATE"] = "94F3B6C0";  // 2499000000
    EXPECT_EQ(8u, choices("125").size());
}

TEST_F(M3QrcChannel, VcoBoundsAreInclusiveAndDataWidthSetsTheFactor) {
    slave.memory["WIDTH0"] = "10";  // 16 bits, a multiple of 8: factor 4
    // 4 * 153.6 * 2 = 1228.8, the lowest VCO frequency; 4 * 153.6 * 5 / 2 = 1536.
    std::vector<std::string> list = choices("153.6");
    ASSERT_EQ(9u, list.size());
    EXPECT_EQ("2457.600 FB=2, REF=1, DIVSEL=1", list[0]);
    EXPECT_EQ("2457.600 FB=4, REF=2, DIVSEL=1", list[3]);
    EXPECT_EQ("3072.000 FB=5, REF=2, DIVSEL=1", list[6]);
}

TEST_F(M3QrcChannel, CurrentRateWithItsDividers) {
    slave.memory["FB0"] = "2";
    slave.memory["REF0"] = "1";
    slave.memory["TXOUT0"] = "2";
    slave.memory["RXOUT0"] = "4";   // the receive divider does not count
    slave.memory["WIDTH0"] = "20";  // 32 bits: factor 4
    EXPECT_EQ("1000.000 FB=2, REF=1, DIVSEL=2", current({{"refclk_freq0", "125"}}));
    slave.memory["REF0"] = "7";  // no choice: REF reads 0
    EXPECT_EQ("0.000 FB=2, REF=0, DIVSEL=2", current({{"refclk_freq0", "125"}}));
    EXPECT_EQ(
        "Cannot calculate line rate choice, since refclk_freq0 has not been passed in to "
        "getParam() function.",
        message([&] {
            current({{"line_rate0", ""}});
        }));
    Orv_HashMapCStr registers, all;
    action->readRegsAndUpdateParams(true, registers, all);
    EXPECT_TRUE(all.empty());
    addM3QrcDividers(slave, "1");
    OrvNebu_M3Qrc_LineRateParamAction channel7(&slave, 7, 5002);
    EXPECT_EQ("line_rate1", channel7.getParamName()) << "any non-zero index is channel 1";
}

TEST_F(M3QrcChannel, SettingWritesWindowsAndBothOutputDividers) {
    // Data width 16 (not a multiple of 10): the flagged clocks run at rate / 8.
    slave.memory["WIDTH0"] = "10";
    slave.memory["RXOUT0"] = "4";
    Orv_HashMapCStr params{{"line_rate0", "1250.000 FB=2, REF=1, DIVSEL=2 and more"},
                           {"sysclk_freq", "10"}};
    slave.setParameters(1, slave.getSlaveRef(), &params);
    EXPECT_EQ("3816", slave.memory["TXUSRCLK_FREQ_TUNE0"]);  // 10 * 224000 / 156
    EXPECT_EQ("3816", slave.memory["RXRECCLK_FREQ_TUNE0"]);
    EXPECT_EQ("3816", slave.memory["RXUSRCLK_FREQ_TUNE0"]);
    EXPECT_EQ("3816", slave.memory["TXOUTCLK_FREQ_TUNE0"]);
    EXPECT_EQ("702D", slave.memory["TXUSRCLK2_FREQ_TUNE0"]);  // 10 * 224000 / 78
    EXPECT_EQ("702D", slave.memory["RXUSRCLK2_FREQ_TUNE0"]);
    EXPECT_EQ("2", slave.memory["TXOUT0"]);
    EXPECT_EQ("2", slave.memory["RXOUT0"]);
    EXPECT_EQ("10", slave.memory["WIDTH0"]) << "the data width is not set";
}

TEST_F(M3QrcChannel, UnreadableNegativeOrEndlessRatesAreRefusedAndWriteNothing) {
    for (const char* text : {"foo", "-2500.000 FB=2, REF=1, DIVSEL=1", "", "2500.000 FB=2",
                             "inf FB=2, REF=1, DIVSEL=1", "1e300 FB=2, REF=1, DIVSEL=1"}) {
        Orv_HashMapCStr params{{"line_rate0", text}, {"sysclk_freq", "50"}}, registers;
        EXPECT_EQ(std::string("Unable to set line rate from string '") + text + "'",
                  message([&] { action->setParams(params, registers); }));
        EXPECT_TRUE(registers.empty()) << text;
    }
}

TEST_F(M3QrcChannel, SettingNeedsSysclkAndANonZeroDataWidth) {
    Orv_HashMapCStr params{{"line_rate0", "2500.000 FB=2, REF=1, DIVSEL=1"}}, registers;
    EXPECT_EQ(
        "Cannot calculate new line rate tune values, since sysclk_freq has not been "
        "passed in to setParam() function.",
        message([&] { action->setParams(params, registers); }));
    EXPECT_TRUE(registers.empty());

    slave.memory["WIDTH0"] = "FF";  // matches no width choice: reads 0
    params["sysclk_freq"] = "50";
    EXPECT_EQ("Cannot calculate new line rate tune values, since tx_data_width0 is 0.",
              message([&] { action->setParams(params, registers); }));
    EXPECT_TRUE(registers.empty());

    // A divider that is no choice fails in the choice action; nothing reaches the device.
    slave.memory["WIDTH0"] = "14";
    params["line_rate0"] = "2500.000 FB=9, REF=1, DIVSEL=1";
    slave.writeLog.clear();
    EXPECT_EQ("Setting Parameter 'pll_divsel_fb_0' to value '9' is not a valid choice.",
              message([&] { slave.setParameters(1, slave.getSlaveRef(), &params); }));
    EXPECT_TRUE(slave.writeLog.empty());
}

TEST(PllLineRateChoiceString, FormatAndReading) {
    std::string text;
    EXPECT_EQ("2500.000 FB=2, REF=1, DIVSEL=1",
              OrvNebu_PllLineRateParamAction::makeLineRateChoiceString(2500.0, 2, 1, 1, text));
    // Dividers print as their low 32 bits.
    EXPECT_EQ("0.500 FB=1, REF=0, DIVSEL=4294967295",
              OrvNebu_PllLineRateParamAction::makeLineRateChoiceString(
                  0.5, 0x100000001ull, 0x100000000ull, 0xFFFFFFFFull, text));
    std::string huge;
    OrvNebu_PllLineRateParamAction::makeLineRateChoiceString(1e300, 1, 1, 1, huge);
    EXPECT_EQ(301u + 4u + 22u, huge.size()) << huge;
    // Every digit of the double, not 17 and zeros (the C runtime of old Windows).
    EXPECT_EQ("1000000000000000052504760255204420248704", huge.substr(0, 40));
    EXPECT_EQ(" FB=1, REF=1, DIVSEL=1", huge.substr(305));

    uint64_t fb = 9, ref = 9, divsel = 9;
    double rate = 9.0;
    EXPECT_TRUE(OrvNebu_PllLineRateParamAction::readLineRateChoiceString(
        fb, ref, divsel, rate, "781.250 FB=5, REF=2, DIVSEL=4 trailing words"));
    EXPECT_EQ(781.25, rate);
    EXPECT_EQ(5u, fb);
    EXPECT_EQ(2u, ref);
    EXPECT_EQ(4u, divsel);
    EXPECT_TRUE(OrvNebu_PllLineRateParamAction::readLineRateChoiceString(fb, ref, divsel, rate,
                                                                         "10,a=3 b=4 c=5"));
    EXPECT_EQ(5u, divsel);
    EXPECT_TRUE(OrvNebu_PllLineRateParamAction::readLineRateChoiceString(
        fb, ref, divsel, rate, "9.5e+2 FB=1, REF=1, DIVSEL=1"));
    EXPECT_EQ(950.0, rate);
    for (const char* bad : {"foo", "100 FB=1, REF=2, DIVSEL=", "100 FB=a, REF=2, DIVSEL=3", "",
                            "FB=1, REF=2, DIVSEL=3", ".e1 FB=1, REF=2, DIVSEL=3"}) {
        EXPECT_FALSE(
            OrvNebu_PllLineRateParamAction::readLineRateChoiceString(fb, ref, divsel, rate, bad));
        EXPECT_EQ(0u, fb + ref + divsel) << bad;
        EXPECT_EQ(0.0, rate) << bad;
    }
    // A divider past 64 bits saturates instead of overflowing the scan.
    EXPECT_TRUE(OrvNebu_PllLineRateParamAction::readLineRateChoiceString(
        fb, ref, divsel, rate, "1 FB=99999999999999999999999, REF=1, DIVSEL=1"));
    EXPECT_EQ(UINT64_MAX, fb);
}

namespace {

struct R3QraDual : ::testing::Test {
    R3QraDual() : slave(1, 6) {
        slave.addChoice("txpll_divsel_fb", "TXFB").numbers({2, 4});
        slave.addChoice("txpll_divsel45_fb", "TXFB45").numbers({4, 5});
        slave.addChoice("txpll_divsel_ref", "TXREF").numbers({1});
        slave.addChoice("txpll_divsel_out", "TXOUT").numbers({1, 2});
        slave.addChoice("rxpll_divsel_fb", "RXFB").numbers({2, 4});
        slave.addChoice("rxpll_divsel_ref", "RXREF").numbers({1});
        slave.addChoice("rxpll_divsel_out", "RXOUT").numbers({1, 2});
        slave.addChoice("tx_data_width", "WIDTH").numbers({20, 40});
        slave.memory["TXFB45"] = "5";
        slave.memory["WIDTH"] = "14";
        slave.memory["MAX_LINERATE"] = "0";
        slave.memory["TX_OVERSAMPLE_MODE"] = "0";
        for (const char* clock :
             {"TXUSRCLK", "RXUSRCLK", "TXUSRCLK2", "RXUSRCLK2", "TXOUTCLK", "RXRECCLK"}) {
            slave.memory[std::string(clock) + "_FREQ_TUNE"] = "0";
        }
        action = &slave.addComputed<OrvNebu_R3Qra_LineRateParamAction>(5001u);
        slave.addComputed<OrvNebu_R3Qra_SysclockFreqParamAction>(5002u);
    }
    std::vector<std::string> choices(const std::string& refclk) {
        Orv_HashMapCStr params{{"line_rate", ""}, {"refclk_freq", refclk}};
        std::vector<std::string> list;
        action->getChoices(&params, list);
        return list;
    }
    MemorySlave slave;
    OrvNebu_R3Qra_LineRateParamAction* action = nullptr;
};

}  // namespace

TEST_F(R3QraDual, ChoicesWithAndWithoutOversampling) {
    EXPECT_EQ((std::vector<std::string>{"line_rate", "refclk_freq"}), *action->getParamNames());
    // 5 * 120 * 2 = 1200, the lowest VCO frequency; FB 4 gives 2400.
    EXPECT_EQ((std::vector<std::string>{
                  "2400.000 FB=2, REF=1, DIVSEL=1", "1200.000 FB=2, REF=1, DIVSEL=2",
                  "4800.000 FB=4, REF=1, DIVSEL=1", "2400.000 FB=4, REF=1, DIVSEL=2"}),
              choices("120"));

    // Maximum 2000.0; each rate's fifth is listed after it when at most 481.0, also when the
    // rate itself is over the maximum.
    slave.memory["MAX_LINERATE"] = "77359400";
    slave.memory["TX_OVERSAMPLE_MODE"] = "1";
    EXPECT_EQ((std::vector<std::string>{
                  "480.000 FB=2, REF=1, DIVSEL=1", "1200.000 FB=2, REF=1, DIVSEL=2",
                  "240.000 FB=2, REF=1, DIVSEL=2", "480.000 FB=4, REF=1, DIVSEL=2"}),
              choices("120"));
    // 481.0 itself is listed.
    slave.memory["MAX_LINERATE"] = "0";
    EXPECT_EQ("481.000 FB=2, REF=1, DIVSEL=1", choices("120.25").at(1));
    slave.memory["MAX_LINERATE"] = "77359400";
    // 2500.0 is over the maximum and its fifth, 500.0, over 481.0.
    std::vector<std::string> list = choices("125");
    EXPECT_EQ("1250.000 FB=2, REF=1, DIVSEL=2", list.at(0));
    EXPECT_EQ("250.000 FB=2, REF=1, DIVSEL=2", list.at(1));

    // 4 * 100 * 4 = 1600 is in range only with the factor the 45 divider gives.
    slave.memory["TXFB45"] = "4";
    slave.memory["MAX_LINERATE"] = "0";
    slave.memory["TX_OVERSAMPLE_MODE"] = "0";
    EXPECT_EQ("3200.000 FB=4, REF=1, DIVSEL=1", choices("100").at(0));
}

TEST_F(R3QraDual, CurrentRateIsAFifthWhenOversampling) {
    slave.memory["TXFB"] = "2";
    slave.memory["TXREF"] = "1";
    slave.memory["TXOUT"] = "1";
    Orv_HashMapCStr registers;
    action->getRegsToRead(registers);
    EXPECT_EQ(5u, registers.size());
    EXPECT_EQ(1u, registers.count("TX_OVERSAMPLE_MODE"));
    // The register text is hexadecimal, for the current rate as for the choices: A is on.
    for (const char* mode : {"1", "A", "0"}) {
        slave.memory["TX_OVERSAMPLE_MODE"] = mode;
        slave.getRegisters(1, slave.getSlaveRef(), &registers);
        Orv_HashMapCStr params{{"refclk_freq", "125"}};
        action->readRegsAndUpdateParams(false, registers, params);
        const bool on = mode[0] != '0';
        EXPECT_EQ(on ? "500.000 FB=2, REF=1, DIVSEL=1" : "2500.000 FB=2, REF=1, DIVSEL=1",
                  params["line_rate"])
            << mode;
        EXPECT_EQ(on ? "250.000 FB=2, REF=1, DIVSEL=2" : "1250.000 FB=2, REF=1, DIVSEL=2",
                  choices("125").at(on ? 2 : 1))
            << mode;
    }
}

TEST_F(R3QraDual, SettingCopiesTransmitDividersToReceiveAndDoublesWideWindows) {
    slave.memory["WIDTH"] = "28";  // 40 bits
    Orv_HashMapCStr params{{"line_rate", "4800.000 FB=4, REF=1, DIVSEL=1"}, {"sysclk_freq", "25"}};
    slave.setParameters(1, slave.getSlaveRef(), &params);
    EXPECT_EQ("4", slave.memory["TXFB"]);
    EXPECT_EQ("4", slave.memory["RXFB"]);
    EXPECT_EQ("1", slave.memory["RXREF"]);
    EXPECT_EQ("1", slave.memory["RXOUT"]);
    EXPECT_EQ("5", slave.memory["TXFB45"]) << "the factor divider is left alone";
    // 4800 / 40 = 120, doubled for the flagged clocks: 25 * 224000 / 240 and / 120.
    EXPECT_EQ("5B25", slave.memory["TXUSRCLK_FREQ_TUNE"]);
    EXPECT_EQ("5B25", slave.memory["RXUSRCLK_FREQ_TUNE"]);
    EXPECT_EQ("B64A", slave.memory["TXUSRCLK2_FREQ_TUNE"]);
    EXPECT_EQ("B64A", slave.memory["RXRECCLK_FREQ_TUNE"]);
}

TEST(PllLineRateConstruction, MissingChoiceParameterNamesIt) {
    MemorySlave slave(1, 3);
    auto fails = [&](const std::function<void()>& f) { return message(f); };
    EXPECT_EQ("Internal error: During init linerate choice, cannot find parameter: pll_divsel_fb_0",
              fails([&] { OrvNebu_M3Qrc_LineRateParamAction a(&slave, 0, 5001); }));
    slave.addChoice("pll_divsel_fb_1", "FB1").numbers({1});
    slave.addChoice("pll_divsel_ref_1", "REF1").numbers({1});
    EXPECT_EQ(
        "Internal error: During init linerate choice, cannot find parameter: "
        "pll_txdivsel_out_1",
        fails([&] { OrvNebu_R3Qrb_LineRateParamAction a(&slave, 1, 5001); }));
    slave.addChoice("txpll_divsel_fb", "TXFB").numbers({1});
    EXPECT_EQ(
        "Internal error: During init linerate choice, cannot find parameter: "
        "txpll_divsel45_fb",
        fails([&] { OrvNebu_R3Qra_LineRateParamAction a(&slave, 5001); }));
}
