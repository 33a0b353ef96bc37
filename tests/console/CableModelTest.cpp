// The cable-time estimate of the console's stats command.
#include <gtest/gtest.h>

#include <cstdint>
#include <limits>

#include "CableModel.h"

namespace nebu {
namespace {

OrvSim::JtagStats counters(uint64_t writeBits, uint64_t readBits, uint64_t roundTrips) {
    OrvSim::JtagStats s;
    s.writeBits = writeBits;
    s.readBits = readBits;
    s.roundTrips = roundTrips;
    s.commands = 99;  // neither commands nor flushes cost time of their own
    s.flushes = 99;
    s.statusReads = 99;
    return s;
}

TEST(CableModelTest, BitsAtTheTestClockPlusRoundTrips) {
    const CableModel standard;
    EXPECT_EQ(cableMicroseconds(counters(0, 0, 0), standard), "0");
    // 96 + 48 bits at 30 MHz is 4.8 us, two round trips 250 us.
    EXPECT_EQ(cableMicroseconds(counters(96, 48, 2), standard), "255");
    EXPECT_EQ(cableMicroseconds(counters(3000, 0, 0), standard), "100");
    EXPECT_EQ(cableMicroseconds(counters(0, 0, 7), standard), "875");

    const CableModel fast{1000.0, 0.5};
    EXPECT_EQ(cableMicroseconds(counters(0, 0, 3), fast), "2");  // 1.5 rounds up
    EXPECT_EQ(cableMicroseconds(counters(0, 0, 5), fast), "3");  // 2.5 too
    EXPECT_EQ(cableMicroseconds(counters(499, 0, 0), fast), "0");
    EXPECT_EQ(cableMicroseconds(counters(250, 250, 0), fast), "1");
}

TEST(CableModelTest, HugeCountersDoNotOverflow) {
    const uint64_t most = std::numeric_limits<uint64_t>::max();
    // The two bit counts add up past 2^64.
    EXPECT_EQ(cableMicroseconds(counters(most, most, 0), CableModel{1.0, 0.0}),
              "36893488147419103230");
    const std::string big = cableMicroseconds(counters(0, 0, most), CableModel{1.0, 1e300});
    EXPECT_EQ(big.size(), 320u);
    EXPECT_EQ(big.substr(0, 4), "1844");
    EXPECT_EQ(cableMicroseconds(counters(0, most, 0), CableModel{0.25, 0.0}),
              "73786976294838206460");
}

}  // namespace
}  // namespace nebu
