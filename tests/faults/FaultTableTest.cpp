// The failures the plug-in must survive where the console cannot stage them: a data directory
// broken under a running session and a board swapped under a known bus. Each checks the exact
// messages with their severities, the return code, and what the caller's data holds after.
#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <memory>
#include <string>

#include "api/CallHost.h"
#include "host/OrvCore.h"
#include "registers/OrvNebu_DefaultRegisterHandler.h"
#include "support/TempDataDir.h"

namespace {

using FaultTableTest = CallHost;

TEST_F(FaultTableTest, AnUnreadableFileFailsInitializeWithAnAbortAndLeavesNoSlave) {
    const struct {
        const char* file;
        std::string report;  // the reader's message, before the file's path
        bool before;  // initialized before (its old object goes first) and the file replaced by
                      // a directory, or else the file removed
    } rows[] = {
        {"orvnebu_directory.csv", "Unable to open ", true},
        {"ctrl_regs.csv", "Unable to open OrvNebu register file: ", true},
        {"ctrl_params.csv", "Unable to open OrvNebu parameter file: ", false},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.file);
        freshHost();
        if (row.before) {
            ASSERT_EQ(OrvNebu_initialize(H, at(1)), ORVNEBU_OK);
        }
        std::filesystem::remove(data_->path(row.file));
        if (row.before) std::filesystem::create_directory(data_->path(row.file));
        said();
        EXPECT_EQ(OrvNebu_initialize(H, at(1)), ORVNEBU_FAILED);
        EXPECT_EQ(said(),
                  "256 " + row.report + data_->path(row.file) + "|32768 Orv abort command|");
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

}  // namespace
