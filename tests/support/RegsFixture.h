// A TestHost with its own data directory and a board of several slaves, plus short helpers
// for the slave calls used by the slave and register tests.
#pragma once

#include <initializer_list>
#include <string>
#include <utility>
#include <vector>

#include "orvnebu/orvnebu.h"
#include "support/TempDataDir.h"
#include "support/TestHost.h"

class RegsFixture : public TestHost {
protected:
    // Slaves 0 and 1: type 0x11, 2: type 0x12, 3 and 5: type 0x13 (3 points to 5), 6: type
    // 0x14 whose register file is missing; positions 4 and 7 are empty.
    static constexpr const char* BOARD = R"({ "devices": [ { "chains": { "1": { "cores": [
        { "type": 3 },
        { "type": 14, "master": { "slaveCount": 8, "slaves": {
            "0": { "slaveType": "0x11", "driverVersion": 1, "coreType": 5, "cgVersion": "0x0203",
                   "cgAlphaVersion": 7, "edaVersion": "0x0A01", "word6": 9, "nextSlave": 0 },
            "1": { "slaveType": "0x11", "driverVersion": 1 },
            "2": { "slaveType": "0x12", "driverVersion": 1 },
            "3": { "slaveType": "0x13", "driverVersion": 1, "nextSlave": 2 },
            "5": { "slaveType": "0x13", "driverVersion": 1 },
            "6": { "slaveType": "0x14", "driverVersion": 1 } } } } ] } } } ] })";

    static constexpr const char* DIRECTORY =
        "slave_type,orv_drv_ver_min,orv_drv_ver_max,registers,parameters\n"
        "0x11,1,0xFFFF,regs.csv,\n"
        "0x12,1,0xFFFF,regs.csv,\n"
        "0x13,1,0xFFFF,chain.csv,\n"
        "0x14,1,0xFFFF,missing.csv,\n";

    // WIDE: 24 bits over words 0x10 and 0x11; REV: bit-reversed byte; TRIPLE: three slices
    // of word 0x30; A and B at words 0x02 and 0x08; FAR at 0x40.
    static constexpr const char* REGS =
        "name,address,order,start,end,text,access,text,include\n"
        "WIDE,10,0,0,15,low,rw,,y\n"
        "WIDE,11,1,0,7,high,rw,,y\n"
        "REV,20,0,7,0,reversed,rw,,y\n"
        "TRIPLE,30,2,12,15,top,rw,,y\n"
        "TRIPLE,30,0,0,3,bottom,rw,,y\n"
        "TRIPLE,30,1,8,11,middle,rw,,y\n"
        "A,2,0,0,15,,rw,,y\n"
        "B,8,0,4,11,,rw,,y\n"
        "FAR,40,0,0,15,,r,,y\n";

    static constexpr const char* CHAIN_REGS =
        "name,address,order,start,end,text,access,text,include\n"
        "ID,0,0,0,15,,r,,y\n";

    void SetUp() override {
        TestHost::SetUp();
        nebutest::unsetEnv("ZAN_ORV_SWITCH_REG_HANDLER");
        data_.write("orvnebu_directory.csv", DIRECTORY);
        data_.write("regs.csv", REGS);
        data_.write("chain.csv", CHAIN_REGS);
        setDataDir(data_.dir());
        loadBoard(BOARD);
    }

    void TearDown() override {
        nebutest::unsetEnv("ZAN_ORV_SWITCH_REG_HANDLER");
        TestHost::TearDown();
    }

    static ORV_SLAVE_REF ref(uint32_t slave, uint32_t device = 0, uint32_t chain = 1) {
        return ORV_SLAVE_REF{device, chain, slave};
    }

    uint32_t initialize(uint32_t slave) { return OrvNebu_initialize(HANDLE, ref(slave)); }
    uint32_t terminate(uint32_t slave) { return OrvNebu_terminate(HANDLE, ref(slave)); }

    uint32_t getRegs(uint32_t slave, ORV_HASHMAP_HANDLE& map) {
        return OrvNebu_getRegisters(HANDLE, ref(slave), &map);
    }
    uint32_t setRegs(uint32_t slave, ORV_HASHMAP_HANDLE& map) {
        return OrvNebu_setRegisters(HANDLE, ref(slave), &map);
    }

    uint16_t peek(uint32_t slave, uint32_t address) { return board()->peek(0, 1, slave, address); }
    void poke(uint32_t slave, uint32_t address, uint16_t value) {
        board()->poke(0, 1, slave, address, value);
    }

    // Starts recording the wire afresh.
    void watchBus() {
        enableTrace();
        clearTrace();
        clearMessages();
        stats();
    }

    TempDataDir data_;
};
