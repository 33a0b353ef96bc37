// The failures the plug-in must survive where the console cannot stage them: a data directory
// broken under a running session and a board swapped under a known bus. Each checks the exact
// messages with their severities, the return code, and what the caller's data holds after.
#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "host/OrvCore.h"
#include "orvnebu/orvnebu.h"
#include "registers/OrvNebu_DefaultRegisterHandler.h"
#include "support/TempDataDir.h"
#include "support/TestHost.h"

namespace {

// Device 0, chain 1: a plain core, then a master with 4 positions: a control block at 0
// (word 0 = enable 1, mode 1 "run", clock divider 0x12).
const char* const BOARD = R"({ "devices": [ { "chains": { "1": { "cores": [ { "type": 3 },
    { "type": 14, "master": { "slaveCount": 4, "dclkHasReset": true, "slaves": {
        "0": { "slaveType": "0x11", "driverVersion": 1, "memory": { "0x0000": "0x1203" } }
    } } } ] } } } ] })";

constexpr uint32_t H = TestHost::HANDLE;
constexpr ORV_SLAVE_REF SLAVE{0, 1, 0};
using Messages = std::vector<std::pair<uint32_t, std::string>>;

class FaultTableTest : public TestHost {
protected:
    std::unique_ptr<TempDataDir> data_;
    ORV_HASHMAP_HANDLE map_ = nullptr;

    void SetUp() override { freshHost(); }
    // A new host with its own copy of the demo data directory, for a row to break.
    void freshHost() {
        TestHost::SetUp();
        data_ = std::make_unique<TempDataDir>();
        for (const auto& entry : std::filesystem::directory_iterator(NEBU_TEST_DATA_DIR))
            std::filesystem::copy_file(entry.path(), data_->path(entry.path().filename().string()));
        setDataDir(data_->dir());
        loadBoard(BOARD);
    }
    bool registered() {
        ORV_SLAVE_REF r = SLAVE;
        OrvRT::Orv_Core* core = OrvRT::Orv_CoreList::getSlave(H, &r);
        return core != nullptr && core->isOrvNebuSlave();
    }
    uint32_t getRegisters(std::initializer_list<std::pair<std::string, std::string>> names) {
        map_ = makeMap(names);
        return OrvNebu_getRegisters(H, SLAVE, &map_);
    }
    Messages sent() {
        Messages all;
        for (const Message& m : messages()) all.emplace_back(m.severity, m.text);
        clearMessages();
        return all;
    }
};

TEST_F(FaultTableTest, AnUnreadableFileFailsInitializeWithAnAbortAndLeavesNoSlave) {
    const struct {
        const char* file;
        const char* report;  // the reader's message, before the file's path
        bool directory;      // replaced by a directory, or else removed
        bool before;         // initialized before: its old object goes first, then the new fails
    } rows[] = {
        {"orvnebu_directory.csv", "Unable to open ", true, true},
        {"ctrl_regs.csv", "Unable to open OrvNebu register file: ", true, true},
        {"ctrl_params.csv", "Unable to open OrvNebu parameter file: ", false, false},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.file);
        freshHost();
        if (row.before) {
            ASSERT_EQ(OrvNebu_initialize(H, SLAVE), ORVNEBU_OK);
        }
        std::filesystem::remove(data_->path(row.file));
        if (row.directory) std::filesystem::create_directory(data_->path(row.file));
        clearMessages();
        EXPECT_EQ(OrvNebu_initialize(H, SLAVE), ORVNEBU_FAILED);
        EXPECT_EQ(sent(), (Messages{{SEVERITY_ERROR, row.report + data_->path(row.file)},
                                    {SEVERITY_ABORT, "Orv abort command"}}));
        EXPECT_FALSE(registered());
        EXPECT_EQ(OrvRT::OrvNebu_DefaultRegisterHandler::getHandlerCount(), 0u);
    }
}

TEST_F(FaultTableTest, RegistersSpanningMoreThanOneBurstAreRefusedAndTheRestStillRead) {
    std::ofstream(data_->path("ctrl_regs.csv"), std::ios::app)
        << "FAR,1ffff,0,0,3,far away,rw,0,y\n";
    ASSERT_EQ(OrvNebu_initialize(H, SLAVE), ORVNEBU_OK);
    clearMessages();
    EXPECT_EQ(getRegisters({}), ORVNEBU_FAILED);
    EXPECT_EQ(sent(), (Messages{{SEVERITY_ERROR, "Registers of " + data_->path("ctrl_regs.csv") +
                                                     " span words 0x0 to 0x1FFFF (131072 words): "
                                                     "more than one burst moves (131071)"}}));
    EXPECT_TRUE(mapOf(map_).empty());
    EXPECT_EQ(getRegisters({{"CTRL_MODE", ""}, {"FAR", ""}}), ORVNEBU_FAILED);
    EXPECT_EQ(getRegisters({{"CTRL_MODE", ""}}), ORVNEBU_OK);
}

TEST_F(FaultTableTest, ABusGoneAfterABoardSwapFailsItsSlaveAndKeepsTheCallersData) {
    ASSERT_EQ(OrvNebu_initialize(H, SLAVE), ORVNEBU_OK);
    loadBoard(R"({ "devices": [ { "chains": {
        "1": { "cores": [ { "type": 3 }, { "type": 3 } ] } } } ] })");
    // Rediscovery finds no master: no slaves, and the old bus is forgotten.
    uint32_t count = 77;
    ASSERT_EQ(OrvNebu_getSlaveCount(H, 0, 1, &count), ORVNEBU_OK);
    EXPECT_EQ(count, 0u);
    clearMessages();
    const Messages badBus{{SEVERITY_ERROR, "Invalid NEBU Bus Device:0, user chain number/bus:1."}};
    EXPECT_EQ(getRegisters({{"CTRL_MODE", "mine"}}), ORVNEBU_FAILED);
    EXPECT_EQ(sent(), badBus);
    EXPECT_EQ(mapOf(map_), (OrvRT::Orv_HashMapCStr{{"CTRL_MODE", "mine"}}));
    EXPECT_TRUE(registered());  // the slave object waits for its bus
    EXPECT_EQ(OrvNebu_initialize(H, SLAVE), ORVNEBU_FAILED);
    EXPECT_EQ(sent(), badBus);
    EXPECT_TRUE(registered());  // a failed initialize removes nothing
}

}  // namespace
