// The transceiver test slaves end to end: the exported calls on a virtual board whose bus
// holds a slave of each family and a chain of three first-family duals, with the demo
// register and parameter files.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "orvnebu/orvnebu.h"
#include "support/TestHost.h"

namespace {

const uint32_t FAILED = 0x80000000u;

const char* const BOARD = R"({
  "devices": [ { "chains": { "2": { "cores": [
    { "type": 3 },
    { "type": 14, "master": { "slaveCount": 8, "dclkHasReset": true, "slaves": {
      "0": { "slaveType": "0x44", "driverVersion": 1 },
      "1": { "slaveType": "0x42", "driverVersion": 1, "nextSlave": 1 },
      "2": { "slaveType": "0x42", "driverVersion": 1, "nextSlave": 1 },
      "3": { "slaveType": "0x42", "driverVersion": 1 },
      "4": { "slaveType": "0x43", "driverVersion": 1 },
      "5": { "slaveType": "0x45", "driverVersion": 1 } } } } ] } } } ] })";

// Word addresses in the demo register files.
const uint32_t M3_PLL0 = 0x04, M3_MAX_LOW = 0x02, M3_MAX_HIGH = 0x03;
const uint32_t M3_TXOUTCLK_TUNE0 = 0x11, M3_RXRECCLK_TUNE0 = 0x15, M3_TXUSRCLK_CNT0 = 0x18,
               M3_TXUSRCLK_TUNE0 = 0x19, M3_TXUSRCLK2_TUNE0 = 0x1D, M3_RXUSRCLK_TUNE0 = 0x21,
               M3_RXUSRCLK2_TUNE0 = 0x25;
const uint32_t R2_SELECT = 0x02, R2_PLL = 0x03, R2_TXUSRCLK2_CNT0 = 0x14, R2_TXUSRCLK2_TUNE0 = 0x15;

class VanduBoard : public TestHost {
protected:
    void SetUp() override {
        TestHost::SetUp();
        loadBoard(BOARD);
    }
    static ORV_SLAVE_REF ref(uint32_t slave) { return ORV_SLAVE_REF{0, 2, slave}; }
    void poke(uint32_t slave, uint32_t address, uint16_t value) {
        board()->poke(0, 2, slave, address, value);
    }
    uint16_t peek(uint32_t slave, uint32_t address) { return board()->peek(0, 2, slave, address); }
    uint32_t get(uint32_t slave, ORV_HASHMAP_HANDLE& map) {
        return OrvNebu_getParameters(HANDLE, ref(slave), &map);
    }
    uint32_t set(uint32_t slave, ORV_HASHMAP_HANDLE map) {
        return OrvNebu_setParameters(HANDLE, ref(slave), &map);
    }
    std::vector<std::string> choices(uint32_t slave, ORV_HASHMAP_HANDLE map,
                                     uint32_t expectRc = 0) {
        std::vector<std::string> list;
        ORV_STRINGLIST_HANDLE handle = &list;
        EXPECT_EQ(expectRc, OrvNebu_getParameterChoices(HANDLE, ref(slave), &map, &handle));
        return list;
    }
    std::string refclkSource(uint32_t slave) {
        ORV_HASHMAP_HANDLE map = makeMap({{"refclk_source", ""}});
        EXPECT_EQ(0u, get(slave, map));
        return mapOf(map)["refclk_source"];
    }
};

}  // namespace

TEST_F(VanduBoard, M3QrcClockFrequenciesNeedTheSystemClock) {
    ASSERT_EQ(0u, OrvNebu_initialize(HANDLE, ref(0)));
    poke(0, M3_TXUSRCLK_CNT0, 55998);
    poke(0, M3_TXUSRCLK_TUNE0, 16000);
    ORV_HASHMAP_HANDLE map = makeMap({{"txusrclk0_freq", ""}, {"sysclk_freq", "50"}});
    ASSERT_EQ(0u, get(0, map));
    EXPECT_EQ((OrvRT::Orv_HashMapCStr{{"txusrclk0_freq", "700.000000"}, {"sysclk_freq", "50"}}),
              mapOf(map));

    ORV_HASHMAP_HANDLE missing = makeMap({{"txusrclk0_freq", ""}});
    EXPECT_EQ(FAILED, get(0, missing));
    EXPECT_LAST_MESSAGE(SEVERITY_ERROR,
                        "Cannot calculate clock frequencies, since sysclk_freq has not been "
                        "passed in to getParam() function.");

    // Everything: the choice parameters, but no frequency and no line rate without inputs.
    clearMessages();
    ORV_HASHMAP_HANDLE all = makeMap();
    ASSERT_EQ(0u, get(0, all));
    EXPECT_EQ("8", mapOf(all)["tx_data_width0"]);
    for (const auto& entry : mapOf(all)) {
        EXPECT_EQ(std::string::npos, entry.first.find("_freq")) << entry.first;
        EXPECT_EQ(std::string::npos, entry.first.find("line_rate")) << entry.first;
    }
    EXPECT_NO_MESSAGES();
}

TEST_F(VanduBoard, M3QrcLineRateChoicesCurrentRateAndSetting) {
    ASSERT_EQ(0u, OrvNebu_initialize(HANDLE, ref(0)));
    poke(0, M3_PLL0, 0x0300);  // data width 20, every divider 1
    const std::vector<std::string> list =
        choices(0, makeMap({{"line_rate0", ""}, {"refclk_freq0", "125"}}));
    ASSERT_EQ(9u, list.size());
    EXPECT_EQ("2500.000 FB=2, REF=1, DIVSEL=1", list[0]);
    EXPECT_EQ("2500.000 FB=4, REF=2, DIVSEL=1", list[3]);
    EXPECT_EQ("781.250 FB=5, REF=2, DIVSEL=4", list[8]);
    poke(0, M3_MAX_LOW, 0x9400);
    poke(0, M3_MAX_HIGH, 0x7735);
    EXPECT_EQ(6u, choices(0, makeMap({{"line_rate0", ""}, {"refclk_freq0", "125"}})).size());
    choices(0, makeMap({{"line_rate0", ""}}), FAILED);
    EXPECT_LAST_MESSAGE(SEVERITY_ERROR,
                        "Cannot calculate line rate choices, since refclk_freq0 has not been "
                        "passed in to getParamChoices() function.");

    ORV_HASHMAP_HANDLE setting =
        makeMap({{"line_rate0", "2500.000 FB=2, REF=1, DIVSEL=1"}, {"sysclk_freq", "50"}});
    ASSERT_EQ(0u, set(0, setting));
    EXPECT_EQ(0x0301, peek(0, M3_PLL0)) << "FB 2 and both output dividers 1, width kept";
    for (uint32_t address :
         {M3_TXUSRCLK_TUNE0, M3_RXUSRCLK_TUNE0, M3_TXOUTCLK_TUNE0, M3_RXRECCLK_TUNE0}) {
        EXPECT_EQ(0xAF00, peek(0, address)) << address;
    }
    EXPECT_EQ(0xFFFF, peek(0, M3_TXUSRCLK2_TUNE0));
    EXPECT_EQ(0xFFFF, peek(0, M3_RXUSRCLK2_TUNE0));

    ORV_HASHMAP_HANDLE current = makeMap({{"line_rate0", ""}, {"refclk_freq0", "125"}});
    ASSERT_EQ(0u, get(0, current));
    EXPECT_EQ("2500.000 FB=2, REF=1, DIVSEL=1", mapOf(current)["line_rate0"]);

    for (const char* bad : {"foo", "-625.000 FB=2, REF=1, DIVSEL=4"}) {
        poke(0, M3_PLL0, 0x0300);
        ASSERT_EQ(FAILED, set(0, makeMap({{"line_rate0", bad}, {"sysclk_freq", "50"}})));
        EXPECT_LAST_MESSAGE(SEVERITY_ERROR,
                            std::string("Unable to set line rate from string '") + bad + "'");
        EXPECT_EQ(0x0300, peek(0, M3_PLL0));
        EXPECT_EQ(0xAF00, peek(0, M3_TXUSRCLK_TUNE0));
    }
}

TEST_F(VanduBoard, FirstFamilyLineRatesAndWholeNumberClocks) {
    ASSERT_EQ(0u, OrvNebu_initialize(HANDLE, ref(3)));
    poke(3, R2_PLL, 0x1004);  // FB 5, REF 1, OUT0 1, OUT1 2
    ORV_HASHMAP_HANDLE rates =
        makeMap({{"line_rate0", ""}, {"line_rate1", ""}, {"refclk_freq", "125"}});
    ASSERT_EQ(0u, get(3, rates));
    EXPECT_EQ("5000", mapOf(rates)["line_rate0"]);
    EXPECT_EQ("2500", mapOf(rates)["line_rate1"]);
    poke(3, R2_SELECT, 0x0100);  // INTDATAWIDTH 1
    ASSERT_EQ(0u, get(3, rates));
    EXPECT_EQ("6250", mapOf(rates)["line_rate0"]);
    EXPECT_EQ("3125", mapOf(rates)["line_rate1"]);

    poke(3, R2_TXUSRCLK2_CNT0, 100);
    poke(3, R2_TXUSRCLK2_TUNE0, 3);
    ORV_HASHMAP_HANDLE clock = makeMap({{"txusrclk20_freq", ""}, {"sysclk_freq", "50.9"}});
    ASSERT_EQ(0u, get(3, clock));
    EXPECT_EQ("6666", mapOf(clock)["txusrclk20_freq"]);

    ORV_HASHMAP_HANDLE noInput = makeMap({{"line_rate1", ""}});
    ASSERT_EQ(FAILED, get(3, noInput));
    EXPECT_LAST_MESSAGE(SEVERITY_ERROR,
                        "Cannot calculate line rate, since refclk_freq has not been passed in "
                        "to getParam() function.");
    // A computed parameter is no choice.
    choices(3, makeMap({{"line_rate0", ""}}), FAILED);
    EXPECT_LAST_MESSAGE(SEVERITY_ERROR,
                        "OrvNebu_getParameterChoices(): param 'line_rate0' is not a choice "
                        "parameter.");
}

TEST_F(VanduBoard, ReferenceClockSourceAlongTheChainOfDuals) {
    for (uint32_t slave : {1u, 2u, 3u}) ASSERT_EQ(0u, OrvNebu_initialize(HANDLE, ref(slave)));
    poke(2, 0x00, 2);  // DUAL_NUMBER 2, DUAL_COORDINATE 0
    poke(2, R2_SELECT, 3);
    EXPECT_EQ("dual_02:0000", refclkSource(2)) << "register texts as the handler gives them";
    for (uint16_t select : {uint16_t{0}, uint16_t{2}, uint16_t{4}, uint16_t{6}}) {
        poke(2, R2_SELECT, select);
        EXPECT_EQ("GREFCLK", refclkSource(2)) << select;
    }
    poke(3, R2_SELECT, 5);
    EXPECT_EQ("Unknown ref clock source", refclkSource(3)) << "last of the chain";
    poke(1, R2_SELECT, 1);
    EXPECT_EQ("Unknown ref clock source", refclkSource(1)) << "first of the chain";

    // The third dual takes the north line; the second passes it on; the first drives it.
    poke(1, 0x00, 0x11);
    poke(1, 0x01, 0x0A03);
    poke(1, R2_SELECT, 0x20);
    poke(3, R2_SELECT, 1);
    EXPECT_EQ("dual_11:0A03", refclkSource(3));
    poke(2, R2_SELECT, 1);
    EXPECT_EQ("dual_11:0A03", refclkSource(2));

    // The other way: the first dual takes the south line that the third drives.
    poke(3, 0x00, 0x33);
    poke(3, R2_SELECT, 0x10);
    poke(1, R2_SELECT, 7);
    EXPECT_EQ("dual_33:0000", refclkSource(1));
    EXPECT_NO_MESSAGES();
}

TEST_F(VanduBoard, OtherFamiliesAnswerTheirOwnNames) {
    ASSERT_EQ(0u, OrvNebu_initialize(HANDLE, ref(4)));
    ASSERT_EQ(0u, OrvNebu_initialize(HANDLE, ref(5)));
    ORV_HASHMAP_HANDLE quad = makeMap({{"rxuserclkout_freq3", ""}, {"sysclk_freq", "50"}});
    ASSERT_EQ(0u, get(5, quad));
    EXPECT_EQ("0.000000", mapOf(quad)["rxuserclkout_freq3"]);
    ORV_HASHMAP_HANDLE lineRate = makeMap({{"line_rate0", ""}});
    ASSERT_EQ(FAILED, get(5, lineRate));
    EXPECT_LAST_MESSAGE(SEVERITY_ERROR,
                        "OrvNebu_getParameter() - Unknown parameter name 'line_rate0'");

    // R3Qra: prescaler 5, FB 4, REF 1, DIVSEL 2, width 20; setting copies to the receive PLL.
    poke(4, 0x04, 0x302B);
    ORV_HASHMAP_HANDLE rate = makeMap({{"line_rate", ""}, {"refclk_freq", "125"}});
    ASSERT_EQ(0u, get(4, rate));
    EXPECT_EQ("2500.000 FB=4, REF=1, DIVSEL=2", mapOf(rate)["line_rate"]);
    ASSERT_EQ(
        0u,
        set(4, makeMap({{"line_rate", "2500.000 FB=2, REF=1, DIVSEL=1"}, {"sysclk_freq", "50"}})));
    EXPECT_EQ(0x3009, peek(4, 0x04));
    EXPECT_EQ(0x0001, peek(4, 0x05) & 0x0077);
}

TEST_F(VanduBoard, MissingDividerParameterKeepsTheSlaveOut) {
    setDataDir(NEBU_TEST_FILES_DIR "/transceiver");
    EXPECT_EQ(FAILED, OrvNebu_initialize(HANDLE, ref(0)));
    EXPECT_MESSAGE(SEVERITY_ERROR,
                   "Internal error: During init linerate choice, cannot find parameter: "
                   "pll_divsel_fb_0");
    EXPECT_EQ(FAILED, OrvNebu_initialize(HANDLE, ref(1)));
    EXPECT_MESSAGE(SEVERITY_ERROR,
                   "Intenal error: When calculating linerate, cannot find parameterpll_divsel_fb");
    // Neither was registered.
    ORV_HASHMAP_HANDLE map = makeMap({{"sysclk_freq", "50"}});
    EXPECT_EQ(FAILED, get(0, map));

    // Without a parameter file a transceiver slave has no parameters at all.
    clearMessages();
    ASSERT_EQ(0u, OrvNebu_initialize(HANDLE, ref(5)));
    EXPECT_EQ(FAILED, get(5, map));
    EXPECT_LAST_MESSAGE(SEVERITY_ERROR,
                        "OrvNebu_getParameter() - Unknown parameter name 'sysclk_freq'");
}
