// Turns a slave's identification map into a slave object: the directory file names its
// definition files, a fixed table of creation records chooses its class.
#pragma once

#include <cstdint>
#include <string>

#include "host/OrvTypes.h"

namespace OrvRT {

class OrvNebu_Slave;

class OrvNebu_SlaveFactory {
public:
    // The creation function of a slave class; returns null when the slave's init failed.
    typedef OrvNebu_Slave* (*CreateFunction)(uint32_t handle, const ORV_CORE_INFO& coreInfo,
                                             const ORV_SLAVE_REF& slaveRef,
                                             const Orv_HashMapCStr& slaveInfo,
                                             const std::string& registerFile,
                                             const std::string& parameterFile);

    struct CreationRecord {
        int32_t slaveType;
        int32_t minDriverVersion;
        int32_t maxDriverVersion;
        CreateFunction create;
    };

    static constexpr const char* DIRECTORY_FILE_NAME = "orvnebu_directory.csv";

    // The new slave object, or null when its init failed. Throws when the directory file
    // cannot be read (after reporting) or names no register file for the slave.
    static OrvNebu_Slave* create(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                                 const Orv_HashMapCStr& slaveInfo);

    // The creation function for a slave type and driver version (the default slave's when no
    // record covers them).
    static CreateFunction findCreateFunction(int32_t slaveType, int32_t driverVersion);
    // The table, sorted by slave type.
    static const CreationRecord* records(size_t& count);
};

}  // namespace OrvRT
