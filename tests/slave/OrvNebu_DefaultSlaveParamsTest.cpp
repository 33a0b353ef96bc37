// The parameter engine of the default slave, driven through the exported parameter calls
// against the virtual board: the order in which actions run, the shared file actions, messages.
// Reading and setting choices on the board are in the slave_params transcript.
#include <algorithm>
#include <filesystem>
#include <fstream>
#include <functional>
#include <iterator>

#include "host/OrvCore.h"
#include "orvnebu/orvnebu.h"
#include "slave/OrvNebu_DefaultSlave.h"
#include "support/TestHost.h"

using OrvRT::Orv_HashMapCStr;
using Strings = std::vector<std::string>;

namespace {

constexpr uint32_t SESSION = TestHost::HANDLE;
const ORV_SLAVE_REF CTRL = {0, 1, 0};      // type 0x11: register and parameter file
const ORV_SLAVE_REF RECORDED = {0, 1, 2};  // registered by the test with extra actions
// The board and data files of the slave_params transcript.
const std::filesystem::path FILES = std::filesystem::path(NEBU_TEST_FILES_DIR) / "engine";

// A computed action that logs what the engine asks of it. It needs LVL and reports LVL's
// value under each of its names; setting stores its first name's value into LVL.
class RecordingAction : public OrvRT::OrvNebu_ParamAction {
public:
    RecordingAction(std::string id, Strings names, uint32_t priority, Strings& log)
        : id_(std::move(id)), names_(std::move(names)), priority_(priority), log_(log) {}
    const std::string& getParamName() override { return names_.front(); }
    const Strings* getParamNames() override { return &names_; }
    uint32_t getPriority() override { return priority_; }
    void getRegsToRead(Orv_HashMapCStr& registers) override {
        log_.push_back(id_ + ":regs");
        registers["LVL"];
    }
    void readRegsAndUpdateParams(bool all, Orv_HashMapCStr& regs,
                                 Orv_HashMapCStr& params) override {
        log_.push_back(id_ + (all ? ":read-all" : ":read"));
        for (const std::string& n : names_) params[n] = regs["LVL"];
    }
    void setParams(Orv_HashMapCStr& params, Orv_HashMapCStr& registers) override {
        log_.push_back(id_ + ":set");
        registers["LVL"] = params[names_.front()];
    }

private:
    std::string id_;
    Strings names_;
    uint32_t priority_;
    Strings& log_;
};

// A default slave with computed actions, as the transceiver slaves add theirs.
// A: three names; Z and Y share a priority, Z added first. ghost: A also under a name its
// own list lacks.
class RecordingSlave : public OrvRT::OrvNebu_DefaultSlave {
public:
    RecordingSlave(Strings& log, bool ghost)
        : OrvNebu_DefaultSlave(SESSION, RECORDED, ORV_CORE_INFO{{1, 0x11, 0, 0, 0}}, {}),
          log_(log),
          ghost_(ghost) {}
    void addToActionsHashMap(uint32_t, OrvRT::OrvNebu_ActionsMap& actions) override {
        for (auto* a : {new RecordingAction("A", {"a1", "a2", "a3"}, 5000, log_),
                        new RecordingAction("Z", {"zeta"}, 5001, log_),
                        new RecordingAction("Y", {"alpha"}, 5001, log_)}) {
            ownedActions_.push_back(a);
            OrvRT::OrvNebu_ParamAction::addActionToHashMap(actions, a);
        }
        if (ghost_) actions["ghost"] = ownedActions_.front();
    }

private:
    Strings& log_;
    bool ghost_;
};

class DefaultSlaveParams : public TestHost {
protected:
    void SetUp() override {
        TestHost::SetUp();
        setDataDir(FILES.string());  // without the separator: the host joins with /
        std::ifstream board(FILES / "board.json");
        loadBoard(std::string(std::istreambuf_iterator<char>(board), {}));
    }
    void TearDown() override {
        OrvSim::endSession(SESSION);
        TestHost::TearDown();
    }

    void registerRecordingSlave(bool ghost = false) {
        ASSERT_EQ(ORVNEBU_OK, OrvNebu_initialize(SESSION, CTRL));  // finds the bus
        auto* slave = new RecordingSlave(log_, ghost);
        slave->init(SESSION, (FILES / "regs.csv").string(), (FILES / "params.csv").string());
        OrvRT::Orv_CoreList::addCore(SESSION, slave);
        OrvSim::takeStats(SESSION);
    }

    // A host map; zetaFirst: one that holds zeta before alpha, so that a walk in its own
    // order runs zeta first.
    ORV_HASHMAP_HANDLE hostMap(const Orv_HashMapCStr& entries, bool zetaFirst = false) {
        ORV_HASHMAP_HANDLE map = makeMap();
        mapOf(map) = entries;
        for (const auto& entry : mapOf(map)) {
            if (!zetaFirst || entry.first == "zeta") break;
            EXPECT_NE("alpha", entry.first) << "the map's own order passes for sorted";
        }
        return map;
    }

    Orv_HashMapCStr get(const Orv_HashMapCStr& request, bool zetaFirst = false) {
        ORV_HASHMAP_HANDLE params = hostMap(request, zetaFirst);
        EXPECT_EQ(ORVNEBU_OK, OrvNebu_getParameters(SESSION, RECORDED, &params));
        return mapOf(params);
    }

    uint32_t set(const Orv_HashMapCStr& request, bool zetaFirst = false) {
        ORV_HASHMAP_HANDLE params = hostMap(request, zetaFirst);
        return OrvNebu_setParameters(SESSION, RECORDED, &params);
    }

    Strings log_;
};

}  // namespace

TEST_F(DefaultSlaveParams, ArgumentChecksComeAfterTheSlave) {
    ASSERT_EQ(ORVNEBU_OK, OrvNebu_initialize(SESSION, CTRL));
    ORV_HASHMAP_HANDLE params = makeMap({{"MODE", ""}}), nul = nullptr;
    Strings list;
    void *listHandle = &list, *nullList = nullptr;
    const std::string get = "OrvNebu_getParameters() argument checking failed:(params != 0)",
                      choices =
                          "OrvNebu_getParameterChoices() argument checking failed:(params != 0) "
                          "&& (choices != 0)";
    const std::pair<std::function<uint32_t()>, std::string> calls[] = {
        {[&] { return OrvNebu_getParameters(SESSION, CTRL, nullptr); }, get},
        {[&] { return OrvNebu_getParameters(SESSION, CTRL, &nul); }, get},
        {[&] { return OrvNebu_setParameters(SESSION, CTRL, nullptr); },
         "OrvNebu_setParameters() argument checking failed:(params != 0)"},
        {[&] { return OrvNebu_getParameterChoices(SESSION, CTRL, &params, nullptr); }, choices},
        {[&] { return OrvNebu_getParameterChoices(SESSION, CTRL, &params, &nullList); }, choices},
        {[&] { return OrvNebu_getParameterChoices(SESSION, CTRL, &nul, &listHandle); }, choices},
    };
    for (const auto& call : calls) {
        EXPECT_EQ(ORVNEBU_FAILED, call.first());
        EXPECT_LAST_MESSAGE(256, call.second);
    }
}

TEST_F(DefaultSlaveParams, EachRequestedActionRunsOnceInPriorityOrder) {
    registerRecordingSlave();
    // Two names of one action: it runs once. Choice actions (10000 on) come after.
    EXPECT_EQ((Orv_HashMapCStr{{"a1", "C"}, {"a2", "C"}, {"a3", "C"}, {"MODE", "Off"}}),
              get({{"a3", ""}, {"MODE", ""}, {"a2", ""}}));
    EXPECT_EQ((Strings{"A:regs", "A:read"}), log_);
    EXPECT_EQ(1u, OrvSim::takeStats(SESSION).roundTrips);

    // Equal priorities: the action with the smaller requested name first, although Z was
    // added first and the map holds zeta before alpha.
    log_.clear();
    get({{"alpha", ""}, {"zeta", ""}, {"a1", ""}}, true);
    EXPECT_EQ((Strings{"A:regs", "Y:regs", "Z:regs", "A:read", "Y:read", "Z:read"}), log_);

    // Setting: each action once, in the same order, then one write; Z's value is written.
    log_.clear();
    EXPECT_EQ(ORVNEBU_OK, set({{"alpha", "6"}, {"zeta", "9"}, {"a2", "3"}}, true));
    EXPECT_EQ((Strings{"A:set", "Y:set", "Z:set"}), log_);
    EXPECT_EQ(0x0009, board()->peek(0, 1, 2, 1));
    EXPECT_NO_MESSAGES();
}

TEST_F(DefaultSlaveParams, AnEmptyRequestRunsAnActionOncePerName) {
    registerRecordingSlave();
    const Orv_HashMapCStr all = get({});
    EXPECT_EQ(8u, all.size());
    EXPECT_EQ("C", all.at("zeta"));
    EXPECT_EQ("Zero", all.at("COUNT"));
    // Priority order: A three times, then Y and Z (in map order), before any choice action.
    ASSERT_EQ(10u, log_.size());
    std::sort(log_.begin() + 3, log_.begin() + 5);
    std::sort(log_.begin() + 8, log_.end());
    EXPECT_EQ((Strings{"A:regs", "A:regs", "A:regs", "Y:regs", "Z:regs", "A:read-all", "A:read-all",
                       "A:read-all", "Y:read-all", "Z:read-all"}),
              log_);
    // A computed parameter has no choices.
    ORV_HASHMAP_HANDLE params = hostMap({{"a2", ""}});
    void* list = &log_;
    EXPECT_EQ(ORVNEBU_FAILED, OrvNebu_getParameterChoices(SESSION, RECORDED, &params, &list));
    EXPECT_LAST_MESSAGE(256,
                        "OrvNebu_getParameterChoices(): param 'a2' is not a choice parameter.");
}

TEST_F(DefaultSlaveParams, ANameMissingFromItsActionsListIsTakenOnce) {
    // Without care the walk over requested names would take A again and again.
    registerRecordingSlave(true);
    EXPECT_EQ("C", get({{"ghost", ""}, {"a1", ""}}).at("a1"));
    get({{"ghost", ""}});
    EXPECT_EQ(ORVNEBU_OK, set({{"ghost", "x"}, {"a1", "4"}}));
    EXPECT_EQ((Strings{"A:regs", "A:read", "A:regs", "A:read", "A:set"}), log_);
    EXPECT_EQ(0x0004, board()->peek(0, 1, 2, 1));
    EXPECT_NO_MESSAGES();
}
