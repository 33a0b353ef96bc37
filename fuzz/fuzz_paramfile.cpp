// Fuzzes the parameter definition file reader: the input is a parameter file. It is printed as
// the reader sees it, then a slave whose directory entry names it (with the demo control
// registers) is initialised and every parameter listed, read, offered and set.
#include <string>
#include <vector>

#include "FuzzSupport.h"
#include "base/OrvNebu_DataDirectory.h"
#include "base/OrvNebu_ParamFile.h"
#include "host/OrvCore.h"
#include "orvnebu/orvnebu.h"
#include "params/OrvNebu_DefaultParamReader.h"

namespace {
const char* const BOARD = R"({ "devices": [ { "chains": { "1": { "cores": [ { "type": 14,
  "master": { "slaveCount": 2, "slaves": { "0": { "slaveType": "0x11", "driverVersion": 1,
  "memory": { "0x0000": ["0x0001", "0x0000", "0x00FF", "0x1234"] } } } } } ] } } } ] })";

using Map = OrvRT::Orv_HashMapCStr;
Map& mapOf(ORV_HASHMAP_HANDLE handle) { return *static_cast<Map*>(handle); }

// A host map that frees itself.
struct HostMap {
    ORV_HASHMAP_HANDLE handle = OrvContainer_hashmapCStr_new();
    HostMap() = default;
    explicit HostMap(const Map& entries) { mapOf(handle) = entries; }
    ~HostMap() { OrvContainer_hashmapCStr_delete(handle); }
    HostMap(const HostMap&) = delete;
    HostMap& operator=(const HostMap&) = delete;
};
}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    using namespace nebufuzz;
    ScratchDir& dir = ScratchDir::instance();
    static const bool once = [&dir]() {
        dir.write("orvnebu_directory.csv",
                  "slave_type,orv_drv_ver_min,orv_drv_ver_max,registers,parameters,description\n"
                  "0x11,1,0xFFFF,ctrl_regs.csv,fuzz_params.csv,fuzzed parameters\n");
        dir.write("ctrl_regs.csv", readText(demoFile("ctrl_regs.csv")));
        return true;
    }();
    (void)once;
    dir.write("fuzz_params.csv", data, size);

    HostRun run(BOARD, dir.dir());
    try {
        OrvRT::OrvNebu_DefaultParamReader::readAndPrint(dir.path("fuzz_params.csv"), nullStream());
    } catch (...) {
        // Reported on the session channel; the exported calls below meet it again.
    }
    checkBothReadings<OrvRT::OrvNebu_ParamFile>(dir.path("fuzz_params.csv"));
    // The file tools' reading of the whole directory: the checks across lines and files.
    (void)OrvRT::OrvNebu_DataDirectory(dir.dir()).problems();
    // Printing caches the file under session 0; its end must forget it.
    OrvSim::endSession(0);
    NEBU_FUZZ_CHECK(OrvRT::OrvNebu_DefaultParamReader::cachedFileCount(0) == 0);

    const ORV_SLAVE_REF ref{0, 1, 0};
    if (!run.check(OrvNebu_initialize(1, ref))) return 0;
    HostMap all;
    run.check(OrvNebu_getParameters(1, ref, &all.handle));
    std::vector<std::string> names;
    for (const auto& entry : mapOf(all.handle)) names.push_back(entry.first);
    // A long file would make a run slow without reaching new code.
    if (names.size() > 8) names.resize(8);
    for (const std::string& name : names) {
        HostMap ask(Map{{name, ""}});
        std::vector<std::string> choices;
        ORV_STRINGLIST_HANDLE list = &choices;
        run.check(OrvNebu_getParameterChoices(1, ref, &ask.handle, &list));
        std::vector<std::string> values(choices.begin(), choices.end());
        if (values.size() > 2) values.resize(2);
        values.push_back("no such choice");
        for (const std::string& value : values) {
            HostMap set(Map{{name, value}});
            run.check(OrvNebu_setParameters(1, ref, &set.handle));
            HostMap get(Map{{name, ""}});
            run.check(OrvNebu_getParameters(1, ref, &get.handle));
        }
    }
    run.check(OrvNebu_terminate(1, ref));
    return 0;
}
