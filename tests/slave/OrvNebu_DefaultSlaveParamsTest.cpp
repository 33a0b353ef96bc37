// The parameter engine of the default slave, driven through the exported parameter calls
// against the virtual board: matching, setting, the order in which actions run, messages.
#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <memory>
#include <string>
#include <vector>

#include "host/OrvCore.h"
#include "hostsim/Sim.h"
#include "hostsim/board/Board.h"
#include "orvnebu/orvnebu.h"
#include "params/OrvNebu_DefaultParamReader.h"
#include "slave/OrvNebu_DefaultSlave.h"
#include "support/TestHost.h"

using OrvRT::Orv_HashMapCStr;

namespace {

constexpr uint32_t SESSION = TestHost::HANDLE;
constexpr uint32_t FAILED = 0x80000000u;
const ORV_SLAVE_REF CTRL = {0, 1, 0};      // type 0x11: register and parameter file
const ORV_SLAVE_REF PLAIN = {0, 1, 1};     // type 0x12: no parameter file
const ORV_SLAVE_REF RECORDED = {0, 1, 2};  // registered by the test with extra actions
const ORV_SLAVE_REF CTRL2 = {0, 1, 3};     // type 0x11 again

const char* const BOARD = R"({"devices": [{"chains": {"1": {"cores": [{"type": 3},
  {"type": 14, "master": {"slaveCount": 4, "slaves": {
    "0": {"slaveType": "0x11", "driverVersion": 1,
          "memory": {"0x0000": ["0x00D1", "0x0005", "0x001F"]}},
    "1": {"slaveType": "0x12", "driverVersion": 1, "memory": {"0x0000": "0x0001"}},
    "2": {"slaveType": "0x11", "driverVersion": 1, "memory": {"0x0001": "0x000C"}},
    "3": {"slaveType": "0x11", "driverVersion": 1}
  }}}]}}}]})";

const char* const DIRECTORY =
    "slave_type,orv_drv_ver_min,orv_drv_ver_max,registers,parameters\n"
    "0x11,1,1,regs.csv,params.csv\n"
    "0x12,1,1,regs.csv,\n";

// EN: word 0 bit 0; SEL: word 0 bits 5..4; LVL: word 1 bits 3..0; WIDE: word 2, 16 bits.
const char* const REGISTERS =
    "name,address,order,start,end,text,access,notes,include\n"
    "EN,0,0,0,0,enable,rw,,y\n"
    "SEL,0,0,4,5,select,rw,,y\n"
    "LVL,1,0,0,3,level,rw,,y\n"
    "WIDE,2,0,0,15,count,rw,,y\n";

const char* const PARAMETERS =
    "param,index,choice,settings\n"
    "MODE,0,Off,EN=0\n"
    "MODE,1,On,EN=1,SEL=01\n"
    "MODE,2,Fast,EN=1,SEL=10\n"
    "MODE,3,Same,EN=1,SEL=01\n"
    "LEVEL,0,Low,LVL=0000\n"
    "LEVEL,1,Mid,LVL=0101\n"
    "LEVEL,2,High,LVL=1111\n"
    "COUNT,0,Small,WIDE=11111\n"
    "COUNT,1,Zero,WIDE=\n"
    "COUNT,2,Other,\n";

struct Said {
    uint32_t severity;
    std::string text;
    bool operator==(const Said& o) const { return severity == o.severity && text == o.text; }
};
std::ostream& operator<<(std::ostream& os, const Said& m) {
    return os << "{" << m.severity << ", \"" << m.text << "\"}";
}

// A computed action that logs what the engine asks of it. It needs LVL and reports LVL's
// value under each of its names; setting stores its first name's value into LVL.
class RecordingAction : public OrvRT::OrvNebu_ParamAction {
public:
    RecordingAction(std::string id, std::vector<std::string> names, uint32_t priority,
                    std::vector<std::string>& log)
        : id_(std::move(id)), names_(std::move(names)), priority_(priority), log_(log) {}
    const std::string& getParamName() override { return names_.front(); }
    const std::vector<std::string>* getParamNames() override { return &names_; }
    uint32_t getPriority() override { return priority_; }
    void getRegsToRead(Orv_HashMapCStr& registers) override {
        log_.push_back(id_ + ":regs");
        registers["LVL"];
    }
    void readRegsAndUpdateParams(bool allParams, Orv_HashMapCStr& registers,
                                 Orv_HashMapCStr& params) override {
        log_.push_back(id_ + (allParams ? ":read-all" : ":read"));
        for (const std::string& n : names_) params[n] = registers["LVL"];
    }
    void setParams(Orv_HashMapCStr& params, Orv_HashMapCStr& registers) override {
        log_.push_back(id_ + ":set");
        registers["LVL"] = params[names_.front()];
    }

private:
    std::string id_;
    std::vector<std::string> names_;
    uint32_t priority_;
    std::vector<std::string>& log_;
};

// A default slave with computed actions, as the transceiver slaves add theirs.
class RecordingSlave : public OrvRT::OrvNebu_DefaultSlave {
public:
    // ghost: also store A under a name its own list lacks.
    RecordingSlave(const ORV_SLAVE_REF& ref, std::vector<std::string>& log, bool ghost)
        : OrvNebu_DefaultSlave(SESSION, ref, info(), Orv_HashMapCStr()), log_(log), ghost_(ghost) {}
    void addToActionsHashMap(uint32_t, OrvRT::OrvNebu_ActionsMap& actions) override {
        // A: three names; Z and Y share a priority, Z added first.
        auto* a = new RecordingAction("A", {"a1", "a2", "a3"}, 5000, log_);
        add(actions, a);
        add(actions, new RecordingAction("Z", {"zeta"}, 5001, log_));
        add(actions, new RecordingAction("Y", {"alpha"}, 5001, log_));
        if (ghost_) actions["ghost"] = a;
    }

private:
    static ORV_CORE_INFO info() { return ORV_CORE_INFO{{1, 0x11, 0, 0, 0}}; }
    void add(OrvRT::OrvNebu_ActionsMap& actions, OrvRT::OrvNebu_ParamAction* action) {
        ownedActions_.push_back(action);
        OrvRT::OrvNebu_ParamAction::addActionToHashMap(actions, action);
    }
    std::vector<std::string>& log_;
    bool ghost_;
};

class DefaultSlaveParams : public TestHost {
protected:
    void SetUp() override {
        TestHost::SetUp();
        dir_ = std::filesystem::temp_directory_path() /
               ("nebu_engine_" + std::to_string(::testing::UnitTest::GetInstance()->random_seed()) +
                "_" + ::testing::UnitTest::GetInstance()->current_test_info()->name());
        std::filesystem::create_directories(dir_);
        write("orvnebu_directory.csv", DIRECTORY);
        write("regs.csv", REGISTERS);
        write("params.csv", PARAMETERS);
        setDataDir(dir_.string());
        board_ = loadBoard(BOARD);
    }

    void TearDown() override {
        OrvSim::endSession(SESSION);
        TestHost::TearDown();
        std::error_code ec;
        std::filesystem::remove_all(dir_, ec);
    }

    void write(const std::string& name, const std::string& content) {
        std::ofstream(dir_ / name, std::ios::binary) << content;
    }

    void initialize(const ORV_SLAVE_REF& ref) {
        ASSERT_EQ(ORVNEBU_OK, OrvNebu_initialize(SESSION, ref));
        clearMessages();
        OrvSim::takeStats(SESSION);
    }

    RecordingSlave* registerRecordingSlave(bool ghost = false) {
        initialize(CTRL);  // finds the bus
        auto* slave = new RecordingSlave(RECORDED, log_, ghost);
        slave->init(SESSION, (dir_ / "regs.csv").string(), (dir_ / "params.csv").string());
        OrvRT::Orv_CoreList::addCore(SESSION, slave);
        OrvSim::takeStats(SESSION);
        return slave;
    }

    ORV_HASHMAP_HANDLE hostMap(const Orv_HashMapCStr& entries) {
        ORV_HASHMAP_HANDLE map = makeMap();
        mapOf(map) = entries;
        return map;
    }

    // A host map that holds zeta before alpha: a walk in its own order runs zeta first.
    ORV_HASHMAP_HANDLE zetaFirst(const Orv_HashMapCStr& entries) {
        ORV_HASHMAP_HANDLE map = hostMap(entries);
        for (const auto& entry : mapOf(map)) {
            if (entry.first == "zeta") break;
            EXPECT_NE("alpha", entry.first) << "the map's own order passes for sorted";
        }
        return map;
    }

    Orv_HashMapCStr get(const ORV_SLAVE_REF& ref, const Orv_HashMapCStr& request,
                        uint32_t rc = ORVNEBU_OK) {
        ORV_HASHMAP_HANDLE params = hostMap(request);
        EXPECT_EQ(rc, OrvNebu_getParameters(SESSION, ref, &params));
        return mapOf(params);
    }

    uint32_t set(const ORV_SLAVE_REF& ref, const Orv_HashMapCStr& request) {
        ORV_HASHMAP_HANDLE params = hostMap(request);
        return OrvNebu_setParameters(SESSION, ref, &params);
    }

    std::vector<std::string> choices(const ORV_SLAVE_REF& ref, const Orv_HashMapCStr& request,
                                     uint32_t rc = ORVNEBU_OK) {
        ORV_HASHMAP_HANDLE params = hostMap(request);
        std::vector<std::string> list{"stale"};
        void* listHandle = &list;
        EXPECT_EQ(rc, OrvNebu_getParameterChoices(SESSION, ref, &params, &listHandle));
        return list;
    }

    uint16_t word(uint32_t slave, uint32_t address) { return board_->peek(0, 1, slave, address); }

    // The messages since the previous call, all of which must be for SESSION.
    std::vector<Said> takeMessages() {
        std::vector<Said> m;
        for (const TestHost::Message& message : messages()) {
            EXPECT_EQ(SESSION, message.handle);
            m.push_back({message.severity, message.text});
        }
        clearMessages();
        return m;
    }

    std::filesystem::path dir_;
    std::shared_ptr<OrvSim::Board> board_;
    std::vector<std::string> log_;
};

}  // namespace

TEST_F(DefaultSlaveParams, ReadingNamesTheFirstMatchingChoice) {
    initialize(CTRL);
    // Word 0 = 0xD1: EN 1, SEL 01 (On and Same match; On has the lower index).
    EXPECT_EQ((Orv_HashMapCStr{{"MODE", "On"}}), get(CTRL, {{"MODE", "ignored"}}));
    // One read round trip for the whole request.
    EXPECT_EQ(1u, OrvSim::takeStats(SESSION).roundTrips);
    EXPECT_EQ((Orv_HashMapCStr{{"MODE", "On"}, {"LEVEL", "Mid"}, {"COUNT", "Small"}}),
              get(CTRL, {{"MODE", ""}, {"LEVEL", ""}, {"COUNT", ""}}));
    // Everything when nothing particular is asked for.
    EXPECT_EQ((Orv_HashMapCStr{{"MODE", "On"}, {"LEVEL", "Mid"}, {"COUNT", "Small"}}),
              get(CTRL, {}));

    // 001F read back matches the setting written as 11111 (1F); 0000 matches the empty
    // setting; a value no choice holds reads as the empty text.
    board_->poke(0, 1, 0, 0, 0x0020);
    board_->poke(0, 1, 0, 1, 0x0003);
    board_->poke(0, 1, 0, 2, 0x0000);
    EXPECT_EQ((Orv_HashMapCStr{{"MODE", "Off"}, {"LEVEL", ""}, {"COUNT", "Zero"}}), get(CTRL, {}));
    // A choice without settings matches anything it reaches.
    board_->poke(0, 1, 0, 2, 0x1234);
    EXPECT_EQ("Other", get(CTRL, {{"COUNT", ""}}).at("COUNT"));
    board_->poke(0, 1, 0, 0, 0x0021);
    EXPECT_EQ("Fast", get(CTRL, {{"MODE", ""}}).at("MODE"));
    EXPECT_TRUE(takeMessages().empty());
}

TEST_F(DefaultSlaveParams, SettingWritesTheChoiceAndKeepsOtherBits) {
    initialize(CTRL);
    board_->poke(0, 1, 0, 0, 0xFF00);
    // Any letter case names the choice; bits outside EN and SEL stay.
    EXPECT_EQ(ORVNEBU_OK, set(CTRL, {{"MODE", "FAST"}}));
    EXPECT_EQ(0xFF21, word(0, 0));
    // One read and one flushed write.
    EXPECT_EQ(2u, OrvSim::takeStats(SESSION).roundTrips);

    // Off sets EN alone: SEL keeps its bits.
    EXPECT_EQ(ORVNEBU_OK, set(CTRL, {{"MODE", "off"}}));
    EXPECT_EQ(0xFF20, word(0, 0));

    // Two parameters in one call: one read and one write of the words they cover.
    OrvSim::takeStats(SESSION);
    EXPECT_EQ(ORVNEBU_OK, set(CTRL, {{"MODE", "On"}, {"COUNT", "small"}}));
    EXPECT_EQ(0xFF11, word(0, 0));
    EXPECT_EQ(0x001F, word(0, 2));
    EXPECT_EQ(0x0005, word(0, 1));
    EXPECT_EQ(2u, OrvSim::takeStats(SESSION).roundTrips);
    EXPECT_EQ((Orv_HashMapCStr{{"MODE", "On"}, {"COUNT", "Small"}}),
              get(CTRL, {{"MODE", ""}, {"COUNT", ""}}));

    // An empty-width setting writes zero.
    EXPECT_EQ(ORVNEBU_OK, set(CTRL, {{"COUNT", "Zero"}}));
    EXPECT_EQ(0x0000, word(0, 2));
    EXPECT_TRUE(takeMessages().empty());
}

TEST_F(DefaultSlaveParams, NothingIsWrittenForEmptyOrUnknownValues) {
    initialize(CTRL);
    // The empty value, and a choice without settings, write nothing at all.
    EXPECT_EQ(ORVNEBU_OK, set(CTRL, {{"MODE", ""}}));
    EXPECT_EQ(ORVNEBU_OK, set(CTRL, {{"COUNT", "other"}}));
    EXPECT_EQ(0u, OrvSim::takeStats(SESSION).commands);
    EXPECT_TRUE(takeMessages().empty());

    // An unknown choice fails before anything is written, also the valid request beside it.
    EXPECT_EQ(FAILED, set(CTRL, {{"MODE", "Fast"}, {"LEVEL", "Max"}}));
    EXPECT_EQ((std::vector<Said>{
                  {256, "Setting Parameter 'LEVEL' to value 'Max' is not a valid choice."}}),
              takeMessages());
    EXPECT_EQ(0u, OrvSim::takeStats(SESSION).commands);
    EXPECT_EQ(0x00D1, word(0, 0));

    // Unknown parameter names, for a get and for a set.
    EXPECT_EQ((Orv_HashMapCStr{{"LEVEL", ""}, {"NOPE", "x"}}),
              get(CTRL, {{"LEVEL", ""}, {"NOPE", "x"}}, FAILED));
    EXPECT_EQ(FAILED, set(CTRL, {{"mode", "On"}}));
    EXPECT_EQ((std::vector<Said>{{256, "OrvNebu_getParameter() - Unknown parameter name 'NOPE'"},
                                 {256, "OrvNebu_getParameter() - Unknown parameter name 'mode'"}}),
              takeMessages());
    EXPECT_EQ(0u, OrvSim::takeStats(SESSION).commands);
}

TEST_F(DefaultSlaveParams, Choices) {
    initialize(CTRL);
    EXPECT_EQ((std::vector<std::string>{"Off", "On", "Fast", "Same"}),
              choices(CTRL, {{"MODE", ""}}));
    EXPECT_EQ((std::vector<std::string>{"Small", "Zero", "Other"}),
              choices(CTRL, {{"COUNT", "whatever"}}));
    EXPECT_EQ(0u, OrvSim::takeStats(SESSION).commands);
    EXPECT_TRUE(takeMessages().empty());

    choices(CTRL, {}, FAILED);
    choices(CTRL, {{"Mode", ""}}, FAILED);
    EXPECT_EQ((std::vector<Said>{
                  {256,
                   "OrvNebu_getParameterChoices(): 'params' argument has no parameter name passed "
                   "in."},
                  {256, "OrvNebu_getParameterChoices(): param 'Mode' is not a valid parameter."}}),
              takeMessages());
}

TEST_F(DefaultSlaveParams, ArgumentChecksComeAfterTheSlave) {
    initialize(CTRL);
    ORV_HASHMAP_HANDLE params = makeMap({{"MODE", ""}});
    ORV_HASHMAP_HANDLE nullHandle = nullptr;
    std::vector<std::string> list;
    void* listHandle = &list;
    void* nullList = nullptr;
    EXPECT_EQ(FAILED, OrvNebu_getParameters(SESSION, CTRL, nullptr));
    EXPECT_EQ(FAILED, OrvNebu_getParameters(SESSION, CTRL, &nullHandle));
    EXPECT_EQ(FAILED, OrvNebu_setParameters(SESSION, CTRL, nullptr));
    EXPECT_EQ(FAILED, OrvNebu_getParameterChoices(SESSION, CTRL, &params, nullptr));
    EXPECT_EQ(FAILED, OrvNebu_getParameterChoices(SESSION, CTRL, &params, &nullList));
    EXPECT_EQ(FAILED, OrvNebu_getParameterChoices(SESSION, CTRL, &nullHandle, &listHandle));
    const std::string choicesCheck =
        "OrvNebu_getParameterChoices() argument checking failed:(params != 0) && (choices != 0)";
    EXPECT_EQ(
        (std::vector<Said>{{256, "OrvNebu_getParameters() argument checking failed:(params != 0)"},
                           {256, "OrvNebu_getParameters() argument checking failed:(params != 0)"},
                           {256, "OrvNebu_setParameters() argument checking failed:(params != 0)"},
                           {256, choicesCheck},
                           {256, choicesCheck},
                           {256, choicesCheck}}),
        takeMessages());

    // No slave object under the reference: that is reported, whatever the arguments.
    const ORV_SLAVE_REF none = {0, 1, 2};
    const std::string unknown =
        "Data structures not initialized for OrvNebu slave Device:0, user chain number/bus:1, "
        "slave index:2.";
    EXPECT_EQ(FAILED, OrvNebu_getParameters(SESSION, none, nullptr));
    EXPECT_EQ(FAILED, OrvNebu_setParameters(SESSION, none, nullptr));
    EXPECT_EQ(FAILED, OrvNebu_getParameterChoices(SESSION, none, nullptr, nullptr));
    EXPECT_EQ((std::vector<Said>{{256, unknown}, {256, unknown}, {256, unknown}}), takeMessages());
}

TEST_F(DefaultSlaveParams, ASlaveWithoutParameterFileHasNoParameters) {
    initialize(PLAIN);
    EXPECT_EQ(Orv_HashMapCStr{}, get(PLAIN, {}));
    EXPECT_EQ(1u, OrvSim::takeStats(SESSION).roundTrips);
    get(PLAIN, {{"MODE", ""}}, FAILED);
    choices(PLAIN, {{"MODE", ""}}, FAILED);
    EXPECT_EQ((std::vector<Said>{
                  {256, "OrvNebu_getParameter() - Unknown parameter name 'MODE'"},
                  {256, "OrvNebu_getParameterChoices(): param 'MODE' is not a valid parameter."}}),
              takeMessages());
}

TEST_F(DefaultSlaveParams, SlavesOfASessionShareTheFileActions) {
    initialize(CTRL);
    initialize(CTRL2);
    EXPECT_EQ(1u, OrvRT::OrvNebu_DefaultParamReader::cachedFileCount(SESSION));
    EXPECT_EQ("Off", get(CTRL2, {{"MODE", ""}}).at("MODE"));
    EXPECT_EQ("On", get(CTRL, {{"MODE", ""}}).at("MODE"));
    // The slaves go, the cached actions stay until the session ends.
    EXPECT_EQ(ORVNEBU_OK, OrvNebu_terminate(SESSION, CTRL));
    EXPECT_EQ("Off", get(CTRL2, {{"MODE", ""}}).at("MODE"));
    EXPECT_EQ(1u, OrvRT::OrvNebu_DefaultParamReader::cachedFileCount(SESSION));
}

TEST_F(DefaultSlaveParams, ABadParameterFileStopsTheSlave) {
    write("params.csv", "h\nMODE,0,Off,EN=0\nMODE,1,On\n");
    EXPECT_EQ(FAILED, OrvNebu_initialize(SESSION, CTRL));
    // The data directory as the host hands it out, joined with '/' on every platform.
    const std::string path = dir_.string() + "/params.csv";
    std::vector<Said> messages = takeMessages();
    ASSERT_FALSE(messages.empty());
    EXPECT_EQ((Said{512, "Unable to parse file: " + path + " line:3: MODE,1,On"}),
              messages.front());
    EXPECT_EQ((Said{32768, "Orv abort command"}), messages.back());
    get(CTRL, {}, FAILED);
    EXPECT_EQ(0u, OrvRT::OrvNebu_DefaultParamReader::cachedFileCount(SESSION));
}

TEST_F(DefaultSlaveParams, EachRequestedActionRunsOnceInPriorityOrder) {
    registerRecordingSlave();
    // Two names of one action: it runs once. Choice actions (10000 on) come after.
    Orv_HashMapCStr result = get(RECORDED, {{"a3", ""}, {"MODE", ""}, {"a2", ""}});
    EXPECT_EQ((std::vector<std::string>{"A:regs", "A:read"}), log_);
    EXPECT_EQ((Orv_HashMapCStr{{"a1", "C"}, {"a2", "C"}, {"a3", "C"}, {"MODE", "Off"}}), result);
    EXPECT_EQ(1u, OrvSim::takeStats(SESSION).roundTrips);

    // Equal priorities: the action with the smaller requested name first, although Z was
    // added first and the map holds zeta before alpha.
    log_.clear();
    ORV_HASHMAP_HANDLE request = zetaFirst({{"alpha", ""}, {"zeta", ""}, {"a1", ""}});
    EXPECT_EQ(ORVNEBU_OK, OrvNebu_getParameters(SESSION, RECORDED, &request));
    EXPECT_EQ(
        (std::vector<std::string>{"A:regs", "Y:regs", "Z:regs", "A:read", "Y:read", "Z:read"}),
        log_);

    // Setting: each action once, in the same order, then one write.
    log_.clear();
    request = zetaFirst({{"alpha", "6"}, {"zeta", "9"}, {"a2", "3"}});
    EXPECT_EQ(ORVNEBU_OK, OrvNebu_setParameters(SESSION, RECORDED, &request));
    EXPECT_EQ((std::vector<std::string>{"A:set", "Y:set", "Z:set"}), log_);
    // Z ran last: its value is the one written.
    EXPECT_EQ(0x0009, word(2, 1));
    EXPECT_TRUE(takeMessages().empty());
}

TEST_F(DefaultSlaveParams, AnEmptyRequestRunsAnActionOncePerName) {
    registerRecordingSlave();
    Orv_HashMapCStr result = get(RECORDED, {});
    size_t aReads = 0;
    for (const std::string& entry : log_) aReads += entry == "A:read-all" ? 1 : 0;
    EXPECT_EQ(3u, aReads);
    // Priority order: A three times, then Y and Z (in map order), before any choice action.
    ASSERT_EQ(10u, log_.size());
    EXPECT_EQ("A:regs", log_[0]);
    EXPECT_EQ("A:regs", log_[2]);
    EXPECT_NE("A:regs", log_[3]);
    EXPECT_EQ("A:read-all", log_[5]);
    EXPECT_EQ("A:read-all", log_[7]);
    EXPECT_NE("A:read-all", log_[8]);
    EXPECT_EQ((Orv_HashMapCStr{{"a1", "C"},
                               {"a2", "C"},
                               {"a3", "C"},
                               {"zeta", "C"},
                               {"alpha", "C"},
                               {"MODE", "Off"},
                               {"LEVEL", ""},
                               {"COUNT", "Zero"}}),
              result);

    // A computed parameter has no choices.
    choices(RECORDED, {{"a2", ""}}, FAILED);
    EXPECT_EQ((std::vector<Said>{
                  {256, "OrvNebu_getParameterChoices(): param 'a2' is not a choice parameter."}}),
              takeMessages());
}

TEST_F(DefaultSlaveParams, ANameMissingFromItsActionsListIsTakenOnce) {
    // Without care the walk over requested names would take A again and again.
    registerRecordingSlave(true);
    Orv_HashMapCStr result = get(RECORDED, {{"ghost", ""}, {"a1", ""}});
    EXPECT_EQ((std::vector<std::string>{"A:regs", "A:read"}), log_);
    EXPECT_EQ("C", result.at("a1"));
    log_.clear();
    get(RECORDED, {{"ghost", ""}});
    EXPECT_EQ((std::vector<std::string>{"A:regs", "A:read"}), log_);
    log_.clear();
    EXPECT_EQ(ORVNEBU_OK, set(RECORDED, {{"ghost", "x"}, {"a1", "4"}}));
    EXPECT_EQ((std::vector<std::string>{"A:set"}), log_);
    EXPECT_EQ(0x0004, word(2, 1));
    EXPECT_TRUE(takeMessages().empty());
}
