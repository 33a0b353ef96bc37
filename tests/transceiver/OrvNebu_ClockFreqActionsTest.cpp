// Clock-frequency and system-clock actions of the four transceiver families, driven through
// the parameter action interface with register and parameter maps.
#include <gtest/gtest.h>

#include <stdexcept>
#include <string>

#include "transceiver/OrvNebu_ClockFreqParamAction.h"
#include "transceiver/OrvNebu_M3Qrc_ClockFreqParamAction.h"
#include "transceiver/OrvNebu_M3Qrc_SysclockFreqParamAction.h"
#include "transceiver/OrvNebu_R3Qra_ClockFreqParamAction.h"
#include "transceiver/OrvNebu_R3Qra_SysclockFreqParamAction.h"
#include "transceiver/OrvNebu_R3Qrb_ClockFreqParamAction.h"
#include "transceiver/OrvNebu_R3Qrb_SysclockFreqParamAction.h"

using namespace OrvRT;

namespace {

const char* const MISSING_SYSCLK =
    "Cannot calculate clock frequencies, since sysclk_freq has not been passed in to "
    "getParam() function.";

// What the engine does: collect the registers, fill them from values, then compute.
void run(OrvNebu_ParamAction& action, bool all, const Orv_HashMapCStr& values,
         Orv_HashMapCStr& params) {
    Orv_HashMapCStr registers;
    action.getRegsToRead(registers);
    for (auto& entry : registers) {
        auto it = values.find(entry.first);
        entry.second = it == values.end() ? "0" : it->second;
    }
    action.readRegsAndUpdateParams(all, registers, params);
}

std::string message(const std::function<void()>& f) {
    try {
        f();
    } catch (const std::logic_error& e) {
        return e.what();
    }
    return "(no error)";
}

}  // namespace

TEST(ClockFreqActions, M3QrcWorkedExampleOnlyRequestedOutputsAndAllRegistersRead) {
    OrvNebu_M3Qrc_ClockFreqParamAction action(nullptr, 5000);
    EXPECT_FALSE(action.isChoiceParam());
    EXPECT_EQ(5000u, action.getPriority());
    EXPECT_EQ("txoutclk0_freq", action.getParamName());
    ASSERT_EQ(12u, action.getParamNames()->size());
    EXPECT_EQ("rxusrclk21_freq", action.getParamNames()->back());

    Orv_HashMapCStr registers;
    action.getRegsToRead(registers);
    EXPECT_EQ(24u, registers.size());
    EXPECT_EQ(1u, registers.count("RXUSRCLK2_FREQ_TUNE1"));
    EXPECT_EQ(1u, registers.count("TXOUTCLK_FREQ_CNT0"));

    // 55998 + 2 = 56000 counts in a window of 16000 cycles of a 50 MHz clock.
    Orv_HashMapCStr params{{"txusrclk0_freq", ""}, {"sysclk_freq", "50"}};
    run(action, false, {{"TXUSRCLK_FREQ_CNT0", "DABE"}, {"TXUSRCLK_FREQ_TUNE0", "3E80"}}, params);
    EXPECT_EQ("700.000000", params["txusrclk0_freq"]);
    EXPECT_EQ(2u, params.size());

    Orv_HashMapCStr one{{"rxrecclk1_freq", ""}, {"sysclk_freq", "50"}};
    run(action, false, {{"RXRECCLK_FREQ_CNT1", "DABE"}, {"RXRECCLK_FREQ_TUNE1", "7D00"}}, one);
    EXPECT_EQ("350.000000", one["rxrecclk1_freq"]);
    EXPECT_EQ(2u, one.size()) << "only the requested output is stored";
}

TEST(ClockFreqActions, MissingSysclkFailsForRequestsButNotForEverything) {
    OrvNebu_M3Qrc_ClockFreqParamAction m3(nullptr, 5000);
    Orv_HashMapCStr params{{"txusrclk0_freq", "kept"}};
    EXPECT_EQ(MISSING_SYSCLK, message([&] { run(m3, false, {}, params); }));
    EXPECT_EQ("kept", params["txusrclk0_freq"]);

    Orv_HashMapCStr all;
    run(m3, true, {{"TXUSRCLK_FREQ_TUNE0", "1"}}, all);
    EXPECT_TRUE(all.empty());

    OrvNebu_ClockFreqParamAction r2(nullptr, 5000);
    Orv_HashMapCStr r2params{{"rxusrclk1_freq", ""}};
    EXPECT_EQ(MISSING_SYSCLK, message([&] { run(r2, false, {}, r2params); }));
}

TEST(ClockFreqActions, AllParametersWithSysclkFillsEveryOutput) {
    OrvNebu_R3Qrb_ClockFreqParamAction action(nullptr, 5000);
    Orv_HashMapCStr params{{"sysclk_freq", "100"}};
    run(action, true, {{"RXUSERCLKOUT_FREQ_CNT2", "8"}, {"RXUSERCLKOUT_FREQ_TUNE2", "A"}}, params);
    EXPECT_EQ(6u, params.size());
    EXPECT_EQ("400.000000", params["rxuserclkout_freq2"]);  // (8 + 2) * 4 * 100 / 10
    EXPECT_EQ("0.000000", params["txuserclkout_freq"]) << "a window of 0 gives 0";
}

TEST(ClockFreqActions, ZeroWindowAndUnreadableSysclkGiveZero) {
    OrvNebu_R3Qra_ClockFreqParamAction r3(nullptr, 5000);
    ASSERT_EQ(6u, r3.getParamNames()->size());
    EXPECT_EQ("txusrclk_freq", r3.getParamName());
    Orv_HashMapCStr params{{"rxrecclk_freq", ""}, {"txoutclk_freq", ""}, {"sysclk_freq", "fast"}};
    run(r3, false,
        {{"RXRECCLK_FREQ_CNT", "10"},
         {"RXRECCLK_FREQ_TUNE", "0"},
         {"TXOUTCLK_FREQ_CNT", "10"},
         {"TXOUTCLK_FREQ_TUNE", "4"}},
        params);
    EXPECT_EQ("0.000000", params["rxrecclk_freq"]);
    EXPECT_EQ("0.000000", params["txoutclk_freq"]);

    OrvNebu_ClockFreqParamAction r2(nullptr, 5000);
    Orv_HashMapCStr r2params{{"txusrclk0_freq", ""}, {"sysclk_freq", "50"}};
    run(r2, false, {{"TXUSRCLK_FREQ_CNT0", "64"}, {"TXUSRCLK_FREQ_TUNE0", ""}}, r2params);
    EXPECT_EQ("0", r2params["txusrclk0_freq"]);
}

TEST(ClockFreqActions, FirstFamilyUsesWholeNumbersWithoutTheAddedTwo) {
    OrvNebu_ClockFreqParamAction action(nullptr, 5000);
    ASSERT_EQ(9u, action.getParamNames()->size());
    EXPECT_EQ("sysclk_freq", action.getParamNames()->back());
    EXPECT_EQ("txusrclk0_freq", action.getParamName());

    // 50.9 counts as 50: (100 * 50 * 4) / 3 = 6666.
    Orv_HashMapCStr params{{"rxusrclk20_freq", ""}, {"sysclk_freq", "50.9"}};
    run(action, false, {{"RXUSRCLK2_FREQ_CNT0", "64"}, {"RXUSRCLK2_FREQ_TUNE0", "3"}}, params);
    EXPECT_EQ("6666", params["rxusrclk20_freq"]);
    EXPECT_EQ(0u, params.count("txusrclk0_freq"));

    Orv_HashMapCStr negative{{"txusrclk1_freq", ""}, {"sysclk_freq", "-50"}};
    run(action, false, {{"TXUSRCLK_FREQ_CNT1", "64"}, {"TXUSRCLK_FREQ_TUNE1", "3"}}, negative);
    EXPECT_EQ("-6666", negative["txusrclk1_freq"]) << "the sign is kept, not wrapped";
}

TEST(ClockFreqActions, ProductsPast64BitsAreRefusedNotWrapped) {
    OrvNebu_ClockFreqParamAction r2(nullptr, 5000);
    Orv_HashMapCStr params{{"txusrclk0_freq", ""}, {"sysclk_freq", "4611686018427387904"}};
    EXPECT_EQ(
        "Cannot calculate txusrclk0_freq, since the result does not fit in 64 bits.", message([&] {
            run(r2, false, {{"TXUSRCLK_FREQ_CNT0", "2"}, {"TXUSRCLK_FREQ_TUNE0", "1"}}, params);
        }));

    // A counter at the top of 64 bits must not wrap to 1 when 2 is added.
    OrvNebu_M3Qrc_ClockFreqParamAction m3(nullptr, 5000);
    Orv_HashMapCStr top{{"txoutclk1_freq", ""}, {"sysclk_freq", "1"}};
    run(m3, false, {{"TXOUTCLK_FREQ_CNT1", "FFFFFFFFFFFFFFFF"}, {"TXOUTCLK_FREQ_TUNE1", "4"}}, top);
    EXPECT_EQ("18446744073709551616.000000", top["txoutclk1_freq"]);
}

TEST(ClockFreqActions, SystemClockActionsOnlyAnswerToTheirName) {
    OrvNebu_M3Qrc_SysclockFreqParamAction m3(nullptr, 5003);
    OrvNebu_R3Qrb_SysclockFreqParamAction r3b(nullptr, 5001);
    OrvNebu_R3Qra_SysclockFreqParamAction r3a(nullptr, 5002);
    OrvNebu_ParamAction* actions[] = {&m3, &r3b, &r3a};
    const uint32_t priorities[] = {5003, 5001, 5002};
    for (int i = 0; i < 3; ++i) {
        OrvNebu_ParamAction& a = *actions[i];
        EXPECT_EQ("sysclk_freq", a.getParamName());
        ASSERT_EQ(1u, a.getParamNames()->size());
        EXPECT_EQ(priorities[i], a.getPriority());
        EXPECT_FALSE(a.isChoiceParam());
        Orv_HashMapCStr registers, params{{"sysclk_freq", "50"}};
        a.getRegsToRead(registers);
        a.readRegsAndUpdateParams(false, registers, params);
        a.setParams(params, registers);
        std::vector<std::string> choices{"left"};
        a.getChoices(&params, choices);
        EXPECT_TRUE(registers.empty());
        EXPECT_EQ((Orv_HashMapCStr{{"sysclk_freq", "50"}}), params);
        EXPECT_EQ(1u, choices.size());
    }
}
