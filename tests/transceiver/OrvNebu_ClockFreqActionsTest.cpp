// Clock-frequency actions of the four transceiver families through the parameter action
// interface, with counters and products no board register holds; the demo board's worked
// examples are in the transceiver transcripts.
#include <gtest/gtest.h>

#include <memory>
#include <stdexcept>
#include <string>

#include "transceiver/OrvNebu_ClockFreqParamAction.h"
#include "transceiver/OrvNebu_M3Qrc_ClockFreqParamAction.h"
#include "transceiver/OrvNebu_R3Qra_ClockFreqParamAction.h"
#include "transceiver/OrvNebu_R3Qrb_ClockFreqParamAction.h"

using namespace OrvRT;

namespace {
template <class A>
OrvNebu_ParamAction* make() {
    return new A(nullptr, 5000);
}
}  // namespace

TEST(ClockFreqActions, OutputsFromCounterWindowAndSystemClock) {
    const auto R2 = &make<OrvNebu_ClockFreqParamAction>;
    const auto M3 = &make<OrvNebu_M3Qrc_ClockFreqParamAction>;
    const auto R3A = &make<OrvNebu_R3Qra_ClockFreqParamAction>;
    const auto R3B = &make<OrvNebu_R3Qrb_ClockFreqParamAction>;
    const std::string noSysclk =
        "!Cannot calculate clock frequencies, since sysclk_freq has not been passed in to "
        "getParam() function.";
    const struct {
        OrvNebu_ParamAction* (*make)();
        bool all;
        const char *name, *stem, *channel, *count, *window, *sysclk;
        const char* expected;  // a value, or the error with a leading '!'
        size_t size;           // of the parameters after the call
    } rows[] = {
        // 55998 + 2 counts in a window of 32000 cycles of 50 MHz; only the request is stored.
        {M3, false, "rxrecclk1_freq", "RXRECCLK", "1", "DABE", "7D00", "50", "350.000000", 2},
        {R2, false, "rxusrclk1_freq", "RXUSRCLK", "1", "1", "1", nullptr, noSysclk.c_str(), 1},
        {M3, true, "txusrclk0_freq", "TXUSRCLK", "0", "1", "1", nullptr, nullptr, 0},
        {R2, true, "txusrclk0_freq", "TXUSRCLK", "0", "1", "1", nullptr, nullptr, 0},
        // (8 + 2) * 4 * 100 / 10; a window of 0 gives 0.
        {R3B, true, "rxuserclkout_freq2", "RXUSERCLKOUT", "2", "8", "A", "100", "400.000000", 6},
        {R3A, false, "rxrecclk_freq", "RXRECCLK", "", "10", "0", "50", "0.000000", 2},
        {R3A, false, "txoutclk_freq", "TXOUTCLK", "", "10", "4", "fast", "0.000000", 2},
        {R2, false, "txusrclk0_freq", "TXUSRCLK", "0", "64", "", "50", "0", 2},
        // Whole numbers, no added two, the sign kept: (100 * -50 * 4) / 3.
        {R2, false, "rxusrclk21_freq", "RXUSRCLK2", "1", "64", "3", "-50", "-6666", 2},
        {R2, false, "txusrclk0_freq", "TXUSRCLK", "0", "2", "1", "4611686018427387904",
         "!Cannot calculate txusrclk0_freq, since the result does not fit in 64 bits.", 2},
        {R2, false, "txusrclk0_freq", "TXUSRCLK", "0", "1", "1", "3000000000000000000",
         "!Cannot calculate txusrclk0_freq, since the result does not fit in 64 bits.", 2},
        {R2, false, "txusrclk0_freq", "TXUSRCLK", "0", "1", "2", "4611686018427387903",
         "9223372036854775806", 2},
        // A counter at the top of 64 bits must not wrap to 0 when 2 is added.
        {M3, false, "txoutclk1_freq", "TXOUTCLK", "1", "FFFFFFFFFFFFFFFE", "4", "1",
         "18446744073709551616.000000", 2},
        // 2^53 + 1 + 2 rounds to 2^53 + 4, but 2^53 + 1 as a double is 2^53 first.
        {R3A, false, "rxrecclk_freq", "RXRECCLK", "", "20000000000001", "1", "1",
         "36028797018963984.000000", 2},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(std::string(row.name) + " " + std::to_string(&row - rows));
        std::unique_ptr<OrvNebu_ParamAction> action(row.make());
        Orv_HashMapCStr registers, params;
        if (!row.all) params[row.name] = "kept";
        if (row.sysclk != nullptr) params["sysclk_freq"] = row.sysclk;
        action->getRegsToRead(registers);
        const std::string stem = std::string(row.stem) + "_FREQ_";
        for (auto& entry : registers) {
            entry.second = entry.first == stem + "CNT" + row.channel    ? row.count
                           : entry.first == stem + "TUNE" + row.channel ? row.window
                                                                        : "0";
        }
        std::string result = "(none)";
        try {
            action->readRegsAndUpdateParams(row.all, registers, params);
            if (row.expected != nullptr) result = params[row.name];
        } catch (const std::logic_error& e) {
            result = std::string("!") + e.what();
            EXPECT_EQ("kept", params[row.name]);
        }
        EXPECT_EQ(row.expected == nullptr ? "(none)" : row.expected, result);
        EXPECT_EQ(row.size, params.size());
    }
}
