// Reads the directory file, which maps a slave type and driver version range to the slave's
// register and parameter definition files.
#pragma once

#include <cstdint>
#include <string>

#include "host/OrvTypes.h"

namespace OrvRT {

class OrvNebu_DirectoryReader {
public:
    // Fills entry from the first line matching the slave type and driver version, under the
    // header's (lower-case, trimmed) column names. True when a line matched. A file that
    // cannot be opened or whose header is unusable is reported, then Orv_AbortException.
    static bool getEntry(uint32_t handle, const std::string& fileName, int32_t slaveType,
                         int32_t driverVersion, Orv_HashMapCStr& entry);

private:
    OrvNebu_DirectoryReader(uint32_t handle, const std::string& fileName, int32_t slaveType,
                            int32_t driverVersion);

    bool getResult(Orv_HashMapCStr& entry);

    uint32_t handle_;
    std::string fileName_;
    int32_t slaveType_;
    int32_t driverVersion_;
};

}  // namespace OrvRT
