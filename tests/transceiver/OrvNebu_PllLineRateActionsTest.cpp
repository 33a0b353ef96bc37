// The line-rate choice string of the PLL families: its format and how it is read back.
#include <gtest/gtest.h>

#include <cstdint>
#include <string>

#include "transceiver/OrvNebu_PllLineRateParamAction.h"

using Action = OrvRT::OrvNebu_PllLineRateParamAction;

TEST(PllLineRateChoiceString, FormatAndReading) {
    std::string text;
    // Dividers print as their low 32 bits.
    EXPECT_EQ(
        "0.500 FB=1, REF=0, DIVSEL=4294967295",
        Action::makeLineRateChoiceString(0.5, 0x100000001ull, 0x100000000ull, 0xFFFFFFFFull, text));
    const struct {
        const char* text;
        bool read;
        double rate;
        uint64_t fb, ref, divsel;
    } rows[] = {
        {"781.250 FB=5, REF=2, DIVSEL=4 trailing words", true, 781.25, 5, 2, 4},
        {"10,a=3 b=4 c=5", true, 10.0, 3, 4, 5},
        {"9.5e+2 FB=1, REF=1, DIVSEL=1", true, 950.0, 1, 1, 1},
        // A divider past 64 bits saturates instead of overflowing the scan.
        {"1 FB=99999999999999999999999, REF=1, DIVSEL=1", true, 1.0, UINT64_MAX, 1, 1},
        {"foo", false, 0, 0, 0, 0},
        {"100 FB=1, REF=2, DIVSEL=", false, 0, 0, 0, 0},
        {"100 FB=1, REF=2", false, 0, 0, 0, 0},
        {"100 FB=a, REF=2, DIVSEL=3", false, 0, 0, 0, 0},
        {"FB=1, REF=2, DIVSEL=3", false, 0, 0, 0, 0},
        {".e1 FB=1, REF=2, DIVSEL=3", false, 0, 0, 0, 0},
        {"1e FB=1, REF=2, DIVSEL=3", false, 0, 0, 0, 0},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.text);
        uint64_t fb = 9, ref = 9, divsel = 9;
        double rate = 9.0;
        EXPECT_EQ(row.read, Action::readLineRateChoiceString(fb, ref, divsel, rate, row.text));
        EXPECT_EQ(row.rate, rate);
        EXPECT_EQ(row.fb, fb);
        EXPECT_EQ(row.ref, ref);
        EXPECT_EQ(row.divsel, divsel);
    }
}
