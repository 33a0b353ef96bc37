// The failures the plug-in must survive, one row each: what goes wrong on the board or in the
// data directory, the exported call that meets it, the exact messages with their severities,
// the return code, and what the board and the caller's data hold afterwards.
#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <functional>
#include <string>
#include <vector>

#include "host/OrvCore.h"
#include "orvnebu/orvnebu.h"
#include "slave/OrvNebu_Slave.h"
#include "slave/OrvNebu_SlaveFactory.h"
#include "support/TempDataDir.h"
#include "support/TestHost.h"
#include "transceiver/OrvNebu_TransceiverClasses.h"

namespace {

// Device 0, chain 1: a plain core, then a master with 4 positions: a control block at 0
// (word 0 = enable 1, mode 1 "run", clock divider 0x12).
// Device 0, chain 2: a transceiver bus: an M3Qrc dual at 0 (data width 20 on channel 0), two
// R2Qra duals at 1 and 2, the first pointing to the second.
const char* const BOARD = R"({ "devices": [ { "chains": {
  "1": { "cores": [ { "type": 3 },
         { "type": 14, "master": { "slaveCount": 4, "dclkHasReset": true, "slaves": {
             "0": { "slaveType": "0x11", "driverVersion": 1, "memory": { "0x0000": "0x1203" } }
         } } } ] },
  "2": { "cores": [
         { "type": 14, "master": { "slaveCount": 3, "slaves": {
             "0": { "slaveType": "0x44", "driverVersion": 1, "memory": { "0x0004": "0x0300" } },
             "1": { "slaveType": "0x42", "driverVersion": 1, "nextSlave": 1,
                    "memory": { "0x0002": "0x0005" } },
             "2": { "slaveType": "0x42", "driverVersion": 1 } } } } ] } } } ] })";

// The same device after a swap: chain 1 holds only plain cores.
const char* const SWAPPED_BOARD = R"({ "devices": [ { "chains": {
  "1": { "cores": [ { "type": 3 }, { "type": 3 } ] } } } ] })";

constexpr uint32_t H = TestHost::HANDLE;
constexpr uint32_t ERR = TestHost::SEVERITY_ERROR;
constexpr uint32_t ABORT = TestHost::SEVERITY_ABORT;
const char* const ABORT_TEXT = "Orv abort command";

class FaultTableTest;

struct Fault {
    const char* name;
    std::function<void(FaultTableTest&)> arrange;  // after board and data are in place
    std::function<uint32_t(FaultTableTest&)> act;  // the exported call that meets the fault
    uint32_t rc;
    // Exactly these messages (severity, text), in order; "{dir}" stands for the data directory.
    std::vector<std::pair<uint32_t, std::string>> messages;
    std::function<void(FaultTableTest&)> afterwards;  // board, caller's data, recovery
};

class FaultTableTest : public TestHost, public ::testing::WithParamInterface<Fault> {
public:
    using TestHost::board;
    using TestHost::clearMessages;
    using TestHost::lastMessageIs;
    using TestHost::loadBoard;
    using TestHost::makeMap;
    using TestHost::mapOf;

    static ORV_SLAVE_REF ref(uint32_t chain, uint32_t slave) { return {0, chain, slave}; }

    // The caller's data: a map and a count, preset so that a write shows.
    ORV_HASHMAP_HANDLE map = nullptr;
    uint32_t count = 77;
    TempDataDir data;

    std::string dir() const { return data.dir(); }
    void replaceByDirectory(const std::string& name) {
        std::filesystem::remove(data.path(name));
        std::filesystem::create_directory(data.path(name));
    }
    void ok(uint32_t rc) { ASSERT_EQ(rc, ORVNEBU_OK) << "arranging the row failed"; }
    uint32_t initialize(uint32_t chain, uint32_t slave) {
        return OrvNebu_initialize(H, ref(chain, slave));
    }
    bool registered(uint32_t chain, uint32_t slave) {
        ORV_SLAVE_REF r = ref(chain, slave);
        OrvRT::Orv_Core* core = OrvRT::Orv_CoreList::getSlave(H, &r);
        return core != nullptr && core->isOrvNebuSlave();
    }
    uint32_t getRegisters(uint32_t chain, uint32_t slave,
                          std::initializer_list<std::pair<std::string, std::string>> names) {
        map = makeMap(names);
        return OrvNebu_getRegisters(H, ref(chain, slave), &map);
    }
    uint32_t setParameters(uint32_t chain, uint32_t slave,
                           std::initializer_list<std::pair<std::string, std::string>> values) {
        map = makeMap(values);
        return OrvNebu_setParameters(H, ref(chain, slave), &map);
    }
    const OrvRT::Orv_HashMapCStr& caller() { return mapOf(map); }

protected:
    void SetUp() override {
        TestHost::SetUp();
        // A copy of the demo data directory that a row may break.
        for (const auto& entry : std::filesystem::directory_iterator(NEBU_TEST_DATA_DIR)) {
            std::filesystem::copy_file(entry.path(), data.path(entry.path().filename().string()));
        }
        setDataDir(data.dir());
        loadBoard(BOARD);
    }
};

// The expected text with the data directory filled in.
std::string expand(std::string text, const std::string& dir) {
    const size_t at = text.find("{dir}");
    return at == std::string::npos ? text : text.replace(at, 5, dir);
}

std::vector<Fault> faults() {
    using T = FaultTableTest;
    const std::string badBus = "Invalid NEBU Bus Device:0, user chain number/bus:1.";
    // Slave 0 of chain 1 is initialized, and fails to, leaving no slave object.
    const auto init10 = [](T& t) { return t.initialize(1, 0); };
    const auto none10 = [](T& t) { EXPECT_FALSE(t.registered(1, 0)); };
    return {
        {"BusGoneAfterABoardSwap",
         [](T& t) {
             t.ok(t.initialize(1, 0));
             t.loadBoard(SWAPPED_BOARD);
             t.clearMessages();
             // Rediscovery finds no master: no slaves, and the old bus is forgotten.
             t.ok(OrvNebu_getSlaveCount(H, 0, 1, &t.count));
             EXPECT_EQ(t.count, 0u);
         },
         [](T& t) {
             return t.getRegisters(1, 0, {{"CTRL_MODE", "mine"}});
         },
         ORVNEBU_FAILED,
         {{ERR, badBus}},
         [=](T& t) {
             EXPECT_EQ(t.caller(), (OrvRT::Orv_HashMapCStr{{"CTRL_MODE", "mine"}}));
             EXPECT_TRUE(t.registered(1, 0));  // the slave object waits for its bus
             EXPECT_EQ(OrvNebu_initialize(H, FaultTableTest::ref(1, 0)), ORVNEBU_FAILED);
             EXPECT_TRUE(t.lastMessageIs(ERR, badBus));
             EXPECT_TRUE(t.registered(1, 0));  // a failed initialize removes nothing
         }},
        {"DirectoryFileUnreadableADirectory",
         [](T& t) { t.replaceByDirectory("orvnebu_directory.csv"); },
         init10,
         ORVNEBU_FAILED,
         {{ERR, "Unable to open {dir}orvnebu_directory.csv"}, {ABORT, ABORT_TEXT}},
         none10},
        {"RegisterFileUnreadableADirectory",
         [](T& t) { t.replaceByDirectory("ctrl_regs.csv"); },
         init10,
         ORVNEBU_FAILED,
         {{ERR, "Unable to open OrvNebu register file: {dir}ctrl_regs.csv"}, {ABORT, ABORT_TEXT}},
         none10},
        {"RegisterFileSpanningMoreThanOneBurst",
         [](T& t) {
             std::ofstream(t.data.path("ctrl_regs.csv"), std::ios::app)
                 << "FAR,1ffff,0,0,3,far away,rw,0,y\n";
             t.ok(t.initialize(1, 0));
         },
         [](T& t) { return t.getRegisters(1, 0, {}); },
         ORVNEBU_FAILED,
         {{ERR,
           "Registers of {dir}ctrl_regs.csv span words 0x0 to 0x1FFFF (131072 words): "
           "more than one burst moves (131071)"}},
         [](T& t) {
             EXPECT_TRUE(t.caller().empty());
             // Registers of a narrower span are read as ever.
             EXPECT_EQ(t.getRegisters(1, 0, {{"CTRL_MODE", ""}, {"FAR", ""}}), ORVNEBU_FAILED);
             EXPECT_EQ(t.getRegisters(1, 0, {{"CTRL_MODE", ""}}), ORVNEBU_OK);
         }},
        {"ParameterFileMissing",
         [](T& t) { std::filesystem::remove(t.data.path("ctrl_params.csv")); },
         init10,
         ORVNEBU_FAILED,
         {{ERR, "Unable to open OrvNebu parameter file: {dir}ctrl_params.csv"},
          {ABORT, ABORT_TEXT}},
         none10},
        {"LineRateStringThatCannotBeRead",
         [](T& t) { t.ok(t.initialize(2, 0)); },
         [](T& t) {
             return t.setParameters(
                 2, 0, {{"line_rate0", "fast FB=2, REF=1, DIVSEL=1"}, {"sysclk_freq", "50"}});
         },
         ORVNEBU_FAILED,
         {{ERR, "Unable to set line rate from string 'fast FB=2, REF=1, DIVSEL=1'"}},
         [](T& t) {
             for (uint32_t address = 0; address < 0x40; ++address) {
                 EXPECT_EQ(t.board()->peek(0, 2, 0, address), address == 4 ? 0x0300u : 0u)
                     << address;
             }
         }},
        {"SlaveChainThatLoops",
         [](T& t) {
             t.ok(t.initialize(2, 1));
             t.ok(t.initialize(2, 2));
             // Board words cannot point backwards; a host that registers slave objects of its
             // own can. Slave 2 now points back to slave 1.
             ORV_SLAVE_REF r = FaultTableTest::ref(2, 2);
             OrvRT::Orv_Core* old = OrvRT::Orv_CoreList::getSlave(H, &r);
             OrvRT::Orv_CoreList::removeCore(H, &old);
             OrvRT::Orv_HashMapCStr info{
                 {"slave_type", "66"}, {"orv_drv_ver", "1"}, {"next_slave", "-1"}};
             OrvRT::OrvNebu_Slave* looping = OrvRT::OrvNebu_SlaveFactory::create(
                 H, r, info, OrvRT::OrvNebu_TransceiverClasses::slaveClasses());
             ASSERT_NE(looping, nullptr);
             OrvRT::Orv_CoreList::addCore(H, looping);
         },
         [](T& t) { return t.getRegisters(2, 1, {}); },
         ORVNEBU_OK,
         {},
         [](T& t) {
             // Slave 1 takes its clock from the south line (REFCLKSEL 5); nobody on the loop
             // drives it, so the question comes back round and ends as unknown.
             t.map = t.makeMap({{"refclk_source", ""}});
             EXPECT_EQ(OrvNebu_getParameters(H, FaultTableTest::ref(2, 1), &t.map), ORVNEBU_OK);
             EXPECT_EQ(t.caller(),
                       (OrvRT::Orv_HashMapCStr{{"refclk_source", "Unknown ref clock source"}}));
             t.map = t.makeMap({{"internal_param_NORTH_DRIVER", ""}});
             EXPECT_EQ(OrvNebu_getParameters(H, FaultTableTest::ref(2, 2), &t.map), ORVNEBU_OK);
             EXPECT_EQ(t.caller(), (OrvRT::Orv_HashMapCStr{{"internal_param_NORTH_DRIVER",
                                                            "Unknown ref clock source"}}));
         }},
    };
}

TEST_P(FaultTableTest, SurvivesWithExactReport) {
    const Fault& fault = GetParam();
    fault.arrange(*this);
    if (HasFatalFailure()) return;
    clearMessages();
    EXPECT_EQ(fault.act(*this), fault.rc);
    std::vector<std::pair<uint32_t, std::string>> actual, expected = fault.messages;
    for (const Message& m : messages()) actual.emplace_back(m.severity, m.text);
    for (auto& e : expected) e.second = expand(e.second, dir());
    EXPECT_EQ(actual, expected);
    fault.afterwards(*this);
}

INSTANTIATE_TEST_SUITE_P(Rows, FaultTableTest, ::testing::ValuesIn(faults()),
                         [](const ::testing::TestParamInfo<Fault>& row) { return row.param.name; });

}  // namespace
