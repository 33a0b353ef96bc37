// The stand-in host for the exported calls: a board, a copy of the demo data directory a test
// may break, and the session messages read as one text: "SEVERITY TEXT|" each.
#pragma once

#include <functional>

#include "api/OrvNebu_Frame.h"
#include "host/OrvCore.h"
#include "orvnebu/orvnebu.h"
#include "registers/OrvNebu_DefaultRegisterHandler.h"
#include "support/TempDataDir.h"
#include "support/TestHost.h"

class CallHost : public TestHost {
protected:
    // Device 0, chain 1: a plain core, then a master with 4 positions: a control block at 0
    // (word 0 = enable 1, mode 1 "run", clock divider 0x12), the others empty; chain 0: a
    // 2-slave master. Device 1 is a configuration controller.
    static constexpr const char* CALLS_BOARD = R"({ "devices": [ { "chains": { "1": { "cores": [
        { "type": 3 }, { "type": 14, "master": { "slaveCount": 4, "dclkHasReset": true,
        "slaves": { "0": { "slaveType": "0x11", "driverVersion": 1,
        "memory": { "0x0000": "0x1203" } } } } } ] },
        "0": { "cores": [ { "type": 14, "master": { "slaveCount": 2 } } ] } } },
      { "trellom": true, "chains": { "1": { "cores": [ { "type": 14, "master": {
        "slaveCount": 2 } } ] } } } ] })";
    static constexpr uint32_t H = HANDLE;
    std::unique_ptr<TempDataDir> data_;

    void SetUp() override { freshHost(); }
    void freshHost() {
        TestHost::SetUp();
        data_ = std::make_unique<TempDataDir>();
        for (const auto& entry : std::filesystem::directory_iterator(NEBU_TEST_DATA_DIR))
            std::filesystem::copy_file(entry.path(), data_->path(entry.path().filename().string()));
        setDataDir(data_->dir());
        loadBoard(CALLS_BOARD);
    }
    bool registered() { return coreAt(0) != nullptr && coreAt(0)->isOrvNebuSlave(); }
    static ORV_SLAVE_REF at(uint32_t chain, uint32_t index = 0) { return {0, chain, index}; }
    OrvRT::Orv_Core* coreAt(uint32_t index) {
        ORV_SLAVE_REF r = at(1, index);
        return OrvRT::Orv_CoreList::getSlave(H, &r);
    }
    // The messages since the previous call, then forgets them.
    std::string said() {
        std::string all;
        for (const Message& m : messages()) all += std::to_string(m.severity) + " " + m.text + "|";
        clearMessages();
        return all;
    }
    // A call's outcome: "ok|" or "failed|", then what it said.
    std::string after(uint32_t rc) {
        return (rc == ORVNEBU_OK ? "ok|" : rc == ORVNEBU_FAILED ? "failed|" : "rc?|") + said();
    }
};
