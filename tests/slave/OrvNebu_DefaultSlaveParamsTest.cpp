// The parameter engine of the default slave, driven through the exported parameter calls
// against the virtual board: matching, setting, the order in which actions run, messages.
#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <iterator>
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
const ORV_SLAVE_REF RECORDED = {0, 1, 2};  // registered by the test with extra actions
const ORV_SLAVE_REF CTRL2 = {0, 1, 3};     // type 0x11 again

// The board and data files of the slave_params transcript.
const std::filesystem::path FILES = std::filesystem::path(NEBU_TEST_FILES_DIR) / "engine";

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
        for (const char* name : {"orvnebu_directory.csv", "regs.csv", "params.csv"}) {
            std::filesystem::copy_file(FILES / name, dir_ / name);
        }
        setDataDir(dir_.string());
        std::ifstream board(FILES / "board.json");
        board_ = loadBoard(std::string(std::istreambuf_iterator<char>(board), {}));
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

// Reading and setting choices on the board are in the slave_params transcript.
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
