// The failures the plug-in must survive where the console cannot stage them: a data directory
// broken under a running session and a board swapped under a known bus. Each checks the exact
// messages with their severities, the return code, and what the caller's data holds after.
#include "api/CallHost.h"

using FaultTableTest = CallHost;

TEST_F(FaultTableTest, AnUnreadableFileFailsInitializeWithAnAbortAndLeavesNoSlave) {
    // The file, and the reader's message before its path. The first two were read before
    // (the old slave object goes first) and become directories; the last is removed.
    const std::pair<const char*, std::string> rows[] = {
        {"orvnebu_directory.csv", "Unable to open "},
        {"ctrl_regs.csv", "Unable to open OrvNebu register file: "},
        {"ctrl_params.csv", "Unable to open OrvNebu parameter file: "},
    };
    for (const auto& row : rows) {
        const bool before = &row != &rows[2];
        freshHost();
        if (before) {
            ASSERT_EQ(OrvNebu_initialize(H, at(1)), ORVNEBU_OK);
        }
        std::filesystem::remove(data_->path(row.first));
        if (before) std::filesystem::create_directory(data_->path(row.first));
        said();
        EXPECT_EQ(OrvNebu_initialize(H, at(1)), ORVNEBU_FAILED);
        EXPECT_EQ(said(),
                  "256 " + row.second + data_->path(row.first) + "|32768 Orv abort command|");
        EXPECT_FALSE(registered());
        EXPECT_EQ(OrvRT::OrvNebu_DefaultRegisterHandler::getHandlerCount(), 0u);
    }
}

TEST_F(FaultTableTest, RegistersSpanningMoreThanOneBurstAreRefusedAndTheRestStillRead) {
    std::ofstream(data_->path("ctrl_regs.csv"), std::ios::app) << "FAR,1ffff,0,0,3,far,rw,0,y\n";
    ASSERT_EQ(OrvNebu_initialize(H, at(1)), ORVNEBU_OK);
    ORV_HASHMAP_HANDLE all = makeMap(), two = makeMap({{"CTRL_MODE", ""}, {"FAR", ""}});
    ORV_HASHMAP_HANDLE near = makeMap({{"CTRL_MODE", ""}});
    said();
    EXPECT_EQ(after(OrvNebu_getRegisters(H, at(1), &all)),
              "failed|256 Registers of " + data_->path("ctrl_regs.csv") +
                  " span words 0x0 to 0x1FFFF (131072 words): more than one burst moves (131071)|");
    EXPECT_TRUE(mapOf(all).empty());
    EXPECT_EQ(OrvNebu_getRegisters(H, at(1), &two), ORVNEBU_FAILED);
    EXPECT_EQ(OrvNebu_getRegisters(H, at(1), &near), ORVNEBU_OK);
}

TEST_F(FaultTableTest, ABoardSwappedUnderAKnownBusFailsItsCallsAndKeepsTheCallersData) {
    ASSERT_EQ(OrvNebu_initialize(H, at(1)), ORVNEBU_OK);
    ORV_HASHMAP_HANDLE map = makeMap({{"CTRL_MODE", "mine"}});
    // The master's place now holds a core of another type.
    loadBoard(R"({ "devices": [ { "chains": {
        "1": { "cores": [ { "type": 3 }, { "type": 5 } ] } } } ] })");
    said();
    const std::string notMaster = "failed|256 Invalid NEBU Bus.\n|";
    EXPECT_EQ(after(OrvNebu_getBusInfo(H, 0, 1, &map)), notMaster);
    EXPECT_EQ(after(OrvNebu_resetBus(H, 0, 1)), notMaster);
    EXPECT_EQ(after(OrvNebu_clearBusErrorStatus(H, 0, 1)), notMaster);
    // Rediscovery finds no master: no slaves, and the old bus is forgotten.
    uint32_t count = 77;
    ASSERT_EQ(OrvNebu_getSlaveCount(H, 0, 1, &count), ORVNEBU_OK);
    EXPECT_EQ(count, 0u);
    const std::string noBus = "failed|256 Invalid NEBU Bus Device:0, user chain number/bus:1.|";
    EXPECT_EQ(after(OrvNebu_getRegisters(H, at(1), &map)), noBus);
    EXPECT_EQ(mapOf(map), (OrvRT::Orv_HashMapCStr{{"CTRL_MODE", "mine"}}));
    EXPECT_TRUE(registered());  // the slave object waits for its bus
    EXPECT_EQ(after(OrvNebu_initialize(H, at(1))), noBus);
    EXPECT_TRUE(registered());  // a failed initialize removes nothing
}
