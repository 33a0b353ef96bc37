// Fuzzes the register definition file reader: the input is a register file. It is printed as
// the reader sees it, then a slave whose directory entry names it is initialised and every
// register read and written back through the exported calls.
#include <string>
#include <vector>

#include "FuzzSupport.h"
#include "base/OrvNebu_DataDirectory.h"
#include "base/OrvNebu_RegisterFile.h"
#include "host/OrvCore.h"
#include "orvnebu/orvnebu.h"
#include "registers/OrvNebu_DefaultRegisterHandler.h"

namespace {
const char* const BOARD = R"({ "devices": [ { "chains": { "1": { "cores": [ { "type": 14,
  "master": { "slaveCount": 2, "slaves": { "0": { "slaveType": "0x11", "driverVersion": 1,
  "memory": { "0x0000": ["0x0001", "0x8421", "0xFFFF", "0x1234"], "0x1FFEF": "0x0042" } } } } } ] } } } ] })";
}

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    using namespace nebufuzz;
    ScratchDir& dir = ScratchDir::instance();
    static const bool once = [&dir]() {
        dir.write("orvnebu_directory.csv",
                  "slave_type,orv_drv_ver_min,orv_drv_ver_max,registers,parameters,description\n"
                  "0x11,1,0xFFFF,fuzz_regs.csv,,fuzzed registers\n");
        return true;
    }();
    (void)once;
    dir.write("fuzz_regs.csv", data, size);

    HostRun run(BOARD, dir.dir());
    try {
        OrvRT::OrvNebu_DefaultRegisterHandler::readAndPrint(1, dir.path("fuzz_regs.csv"),
                                                            nullStream());
    } catch (...) {
        // Reported on the session channel; the exported calls below meet it again.
    }
    checkBothReadings<OrvRT::OrvNebu_RegisterFile>(dir.path("fuzz_regs.csv"));
    // The file tools' reading of the whole directory: the checks across lines and files.
    (void)OrvRT::OrvNebu_DataDirectory(dir.dir()).problems();

    const ORV_SLAVE_REF ref{0, 1, 0};
    if (!run.check(OrvNebu_initialize(1, ref))) return 0;
    ORV_HASHMAP_HANDLE regs = OrvContainer_hashmapCStr_new();
    run.check(OrvNebu_getRegisters(1, ref, &regs));
    auto& values = *static_cast<OrvRT::Orv_HashMapCStr*>(regs);
    // Each register alone: the value read, and all bits set for the first one.
    std::vector<std::pair<std::string, std::string>> entries(values.begin(), values.end());
    // A long file would make a run slow without reaching new code.
    if (entries.size() > 8) entries.resize(8);
    for (const auto& entry : entries) {
        std::vector<std::string> tries{entry.second};
        if (&entry == &entries.front()) tries.emplace_back(40, 'F');
        for (const std::string& value : tries) {
            ORV_HASHMAP_HANDLE one = OrvContainer_hashmapCStr_new();
            (*static_cast<OrvRT::Orv_HashMapCStr*>(one))[entry.first] = value;
            run.check(OrvNebu_setRegisters(1, ref, &one));
            run.check(OrvNebu_getRegisters(1, ref, &one));
            OrvContainer_hashmapCStr_delete(one);
        }
    }
    // All of them at once, as read.
    ORV_HASHMAP_HANDLE all = OrvContainer_hashmapCStr_new();
    *static_cast<OrvRT::Orv_HashMapCStr*>(all) =
        OrvRT::Orv_HashMapCStr(entries.begin(), entries.end());
    run.check(OrvNebu_setRegisters(1, ref, &all));
    OrvContainer_hashmapCStr_delete(all);
    OrvContainer_hashmapCStr_delete(regs);
    run.check(OrvNebu_terminate(1, ref));
    return 0;
}
