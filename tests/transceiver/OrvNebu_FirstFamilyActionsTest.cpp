// Reference-clock source questions of the first family (R2Qra) along next_slave links that no
// board gives (links back to a dual already asked, drivers several duals away), and a host's
// choice list that is not empty.
#include <gtest/gtest.h>

#include <map>
#include <string>
#include <vector>

#include "host/OrvCore.h"
#include "orvnebu/orvnebu.h"
#include "slave/OrvNebu_DefaultSlave.h"
#include "support/TestHost.h"
#include "transceiver/OrvNebu_RefClockParamAction.h"

using namespace OrvRT;

namespace {

uint32_t questions = 0;

// A dual on device 0, user chain 2, in the host's core list, its registers in memory.
class Dual : public OrvNebu_DefaultSlave {
public:
    Dual(uint32_t index, const std::string& next)
        : OrvNebu_DefaultSlave(TestHost::HANDLE, ORV_SLAVE_REF{0, 2, index},
                               ORV_CORE_INFO{{1, 0x42, 0, 0, 0}},
                               Orv_HashMapCStr{{"next_slave", next}}),
          memory{{"CLKSOUTH_SEL", "0"},
                 {"CLKNORTH_SEL", "0"},
                 {"REFCLKSEL", "0"},
                 {"DUAL_NUMBER", std::to_string(index)},
                 {"DUAL_COORDINATE", "0"}} {}
    void getParameters(uint32_t, const ORV_SLAVE_REF&, Orv_HashMapCStr* params) override {
        ++questions;
        Orv_HashMapCStr registers(memory.begin(), memory.end());
        action.readRegsAndUpdateParams(false, registers, *params);
    }
    std::string ask(const char* name = "refclk_source") {
        Orv_HashMapCStr params{{name, ""}};
        getParameters(TestHost::HANDLE, getSlaveRef(), &params);
        return params[name];
    }
    std::map<std::string, std::string> memory;
    OrvNebu_RefClockParamAction action{this, 5002};
};

class TransceiverHost : public TestHost {
protected:
    Dual& dual(uint32_t index, const std::string& next) {
        auto* slave = new Dual(index, next);
        Orv_CoreList::addCore(HANDLE, slave);
        return *slave;
    }
};

}  // namespace

TEST_F(TransceiverHost, RefClockLoopsEndWithTheUnknownSourceAndFarDriversAreFound) {
    // 4 -> 5 -> 6 -> 4: no dual drives, so every question would go round for ever.
    Dual& a = dual(4, "1");
    Dual& b = dual(5, "1");
    dual(6, "-2");
    a.memory["REFCLKSEL"] = "5";
    questions = 0;
    EXPECT_EQ("Unknown ref clock source", a.ask());
    EXPECT_LE(questions, 5u) << "once round the loop, not until the walk's step limit";
    a.memory["REFCLKSEL"] = "1";
    EXPECT_EQ("Unknown ref clock source", a.ask());
    EXPECT_EQ("Unknown ref clock source", b.ask("internal_param_NORTH_DRIVER"));

    // Two duals pointing at each other; a driver in the loop is still found.
    Dual& p = dual(8, "1");
    Dual& q = dual(9, "-1");
    p.memory["REFCLKSEL"] = "5";
    EXPECT_EQ("Unknown ref clock source", p.ask());
    q.memory["CLKSOUTH_SEL"] = "1";
    EXPECT_EQ("dual_9:0", p.ask());

    // 10 -> 11 -> 12 -> 13: the question passes two duals on to the driver, either way.
    Dual& first = dual(10, "1");
    dual(11, "1");
    dual(12, "1");
    Dual& last = dual(13, "0");
    first.memory["REFCLKSEL"] = "7";
    last.memory["CLKSOUTH_SEL"] = "1";
    EXPECT_EQ("dual_13:0", first.ask());
    last.memory["REFCLKSEL"] = "1";
    first.memory["CLKNORTH_SEL"] = "1";
    EXPECT_EQ("dual_10:0", last.ask());
    EXPECT_NO_MESSAGES();
}

TEST_F(TransceiverHost, LineRateChoicesReplaceTheCallersList) {
    loadBoard(R"({"devices": [{"chains": {"2": {"cores": [{"type": 14, "master": {"slaveCount": 1,
        "slaves": {"0": {"slaveType": "0x44", "driverVersion": 1}}}}]}}}]})");
    const ORV_SLAVE_REF ref{0, 2, 0};
    ASSERT_EQ(ORVNEBU_OK, OrvNebu_initialize(HANDLE, ref));
    ORV_HASHMAP_HANDLE params = makeMap({{"line_rate0", ""}, {"refclk_freq0", "0"}});
    std::vector<std::string> list{"stale"};
    void* listHandle = &list;
    EXPECT_EQ(ORVNEBU_OK, OrvNebu_getParameterChoices(HANDLE, ref, &params, &listHandle));
    EXPECT_TRUE(list.empty());
}
