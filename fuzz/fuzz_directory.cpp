// Fuzzes the directory reader: the first eight bytes are the slave type and driver version
// looked up, the rest is the directory file.
#include <cstring>
#include <string>

#include "FuzzSupport.h"
#include "base/OrvNebu_DirectoryFile.h"
#include "slave/OrvNebu_DirectoryReader.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    using namespace nebufuzz;
    if (size < 8) return 0;
    int32_t slaveType = 0;
    int32_t driverVersion = 0;
    std::memcpy(&slaveType, data, 4);
    std::memcpy(&driverVersion, data + 4, 4);
    ScratchDir& dir = ScratchDir::instance();
    dir.write("orvnebu_directory.csv", data + 8, size - 8);

    HostRun run(R"({ "devices": [] })", dir.dir());
    OrvRT::Orv_HashMapCStr entry;
    try {
        const bool found = OrvRT::OrvNebu_DirectoryReader::getEntry(
            1, dir.path("orvnebu_directory.csv"), slaveType, driverVersion, entry);
        if (!found) NEBU_FUZZ_CHECK(entry.empty());
    } catch (...) {
        // Reported on the session channel.
    }
    // Not the whole data directory: the names in a fuzzed file may lead anywhere.
    checkBothReadings<OrvRT::OrvNebu_DirectoryFile>(dir.path("orvnebu_directory.csv"));
    return 0;
}
