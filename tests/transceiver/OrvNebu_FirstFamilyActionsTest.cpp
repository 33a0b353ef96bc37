// Line rates and reference-clock source of the first family (R2Qra): whole-number line rates
// from the divider choices, and driver questions travelling along the slave chain of the host.
#include <gtest/gtest.h>

#include <functional>
#include <stdexcept>
#include <string>

#include "host/OrvCore.h"
#include "support/TestHost.h"
#include "transceiver/OrvNebu_LineRateParamAction.h"
#include "transceiver/OrvNebu_RefClockParamAction.h"
#include "transceiver/OrvNebu_VanduR2Qra.h"
#include "transceiver/OrvNebu_VanduR3Qrb.h"
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

struct R2QraLineRate : ::testing::Test {
    R2QraLineRate() : slave(1, 2) {
        slave.addChoice("pll_divsel_fb", "FB").numbers({1, 2, 4, 5});
        slave.addChoice("pll_divsel_ref", "REF").numbers({1, 2});
        slave.addChoice("pll_rxdivsel_out_0", "OUT0").numbers({1, 2, 4});
        slave.addChoice("pll_rxdivsel_out_1", "OUT1").numbers({1, 2, 4});
        slave.memory["INTDATAWIDTH"] = "0";
        slave.memory["FB"] = "5";
        slave.memory["REF"] = "1";
        slave.memory["OUT0"] = "1";
        slave.memory["OUT1"] = "2";
        action = &slave.addComputed<OrvNebu_LineRateParamAction>(5001u);
    }
    Orv_HashMapCStr read(Orv_HashMapCStr params, bool all = false) {
        Orv_HashMapCStr registers;
        action->getRegsToRead(registers);
        slave.getRegisters(1, slave.getSlaveRef(), &registers);
        action->readRegsAndUpdateParams(all, registers, params);
        return params;
    }
    MemorySlave slave;
    OrvNebu_LineRateParamAction* action = nullptr;
};

}  // namespace

TEST_F(R2QraLineRate, DividersInputsAndEverything) {
    // 5 * 5 * 156 * 2 / 2: 156.25 counts as 156; only the channel asked for is stored.
    slave.memory["INTDATAWIDTH"] = "1";
    Orv_HashMapCStr rates = read({{"line_rate1", ""}, {"refclk_freq", "156.25"}});
    EXPECT_EQ("3900", rates["line_rate1"]);
    EXPECT_EQ(0u, rates.count("line_rate0"));
    EXPECT_TRUE(read({}, true).empty());
    EXPECT_EQ(3u, read({{"refclk_freq", "100"}}, true).size());
    EXPECT_EQ("Cannot calculate line_rate0, since the result does not fit in 64 bits.",
              message([&] {
                  read({{"line_rate0", ""}, {"refclk_freq", "9223372036854775807"}});
              }));
    slave.memory["REF"] = "3";  // no choice: REF reads 0
    EXPECT_EQ("0", read({{"line_rate0", ""}, {"refclk_freq", "125"}})["line_rate0"]);
}

TEST(R2QraLineRateConstruction, MissingDividerKeepsTheKnownMessage) {
    MemorySlave slave(1, 2);
    slave.addChoice("pll_divsel_fb", "FB").numbers({1});
    slave.addChoice("pll_divsel_ref", "REF").numbers({1});
    slave.addChoice("pll_rxdivsel_out_0", "OUT0").numbers({1});
    EXPECT_EQ("Intenal error: When calculating linerate, cannot find parameterpll_rxdivsel_out_1",
              message([&] { OrvNebu_LineRateParamAction a(&slave, 5001); }));
}

TEST(VanduLocationName, NumberAndCoordinateOfTheUnit) {
    Orv_HashMapCStr empty;
    std::string name = "old";
    EXPECT_EQ("dual_:", OrvNebu_VanduR2Qra::makeLocationName(empty, name));
    EXPECT_EQ("dual_:", name);
    EXPECT_EQ((Orv_HashMapCStr{{"DUAL_NUMBER", ""}, {"DUAL_COORDINATE", ""}}), empty);
    Orv_HashMapCStr quad{{"QUAD_NUMBER", "2"}, {"QUAD_COORDINATE", "5"}};
    EXPECT_EQ("quad_2:5", OrvNebu_VanduR3Qrb::makeLocationName(quad, name));
}

namespace {

// R2Qra duals on device 0, user chain 2, registered in the host's core list.
class RefClockChain : public TestHost {
protected:
    MemorySlave& dual(uint32_t index, const std::string& next, const std::string& number) {
        auto* slave = new MemorySlave(HANDLE, index, next);
        slave->memory = {{"CLKSOUTH_SEL", "0"},
                         {"CLKNORTH_SEL", "0"},
                         {"REFCLKSEL", "0"},
                         {"DUAL_NUMBER", number},
                         {"DUAL_COORDINATE", "0"}};
        slave->addComputed<OrvNebu_RefClockParamAction>(5002u);
        Orv_CoreList::addCore(HANDLE, slave);
        return *slave;
    }
    static std::string ask(MemorySlave& slave, const char* name = "refclk_source") {
        Orv_HashMapCStr params{{name, ""}};
        slave.getParameters(HANDLE, slave.getSlaveRef(), &params);
        return params[name];
    }
};

}  // namespace

TEST_F(RefClockChain, LoopingNextSlaveLinksEndWithTheUnknownSource) {
    // 4 -> 5 -> 6 -> 4: no dual drives, so every question would go round for ever.
    MemorySlave& a = dual(4, "1", "4");
    MemorySlave& b = dual(5, "1", "5");
    dual(6, "-2", "6");
    a.memory["REFCLKSEL"] = "5";
    xcvrtest::registerReads = 0;
    EXPECT_EQ("Unknown ref clock source", ask(a));
    // Once round the loop, not until the walk's step limit.
    EXPECT_LE(xcvrtest::registerReads, 5u);
    a.memory["REFCLKSEL"] = "1";
    EXPECT_EQ("Unknown ref clock source", ask(a));
    EXPECT_EQ("Unknown ref clock source", ask(b, "internal_param_NORTH_DRIVER"));

    // Two duals pointing at each other; a driver in the loop is still found.
    MemorySlave& p = dual(8, "1", "8");
    MemorySlave& q = dual(9, "-1", "9");
    p.memory["REFCLKSEL"] = "5";
    EXPECT_EQ("Unknown ref clock source", ask(p));
    q.memory["CLKSOUTH_SEL"] = "1";
    EXPECT_EQ("dual_9:0", ask(p));
    EXPECT_NO_MESSAGES();
}

TEST_F(RefClockChain, NeighbourOfAnotherTypeFailsWithItsError) {
    MemorySlave& a = dual(0, "1", "0");
    auto* other = new MemorySlave(HANDLE, 1, "0");  // knows no driver question
    other->memory["X"] = "0";
    Orv_CoreList::addCore(HANDLE, other);
    a.memory["REFCLKSEL"] = "5";
    EXPECT_EQ("OrvNebu_getParameter() - Unknown parameter name 'internal_param_SOUTH_DRIVER'",
              message([&] { ask(a); }));
}
