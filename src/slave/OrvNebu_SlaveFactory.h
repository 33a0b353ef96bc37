// Turns a slave's identification map into a slave object: the directory file names its
// definition files, the slave class table chooses its class, and the creation functions come
// from the layers that define the classes.
#pragma once

#include <cstdint>
#include <string>

#include "base/OrvNebu_DirectoryFile.h"
#include "base/OrvNebu_SlaveClassTable.h"
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

    // The creation function of every class of the table: the default slave's until the layer
    // that defines a class enters its own.
    struct SlaveClasses {
        SlaveClasses();
        CreateFunction create[OrvNebu_SlaveClassTable::SLAVE_CLASS_COUNT];
    };

    static constexpr const char* DIRECTORY_FILE_NAME = OrvNebu_DirectoryFile::FILE_NAME;

    // The new slave object, or null when its init failed. Throws when the directory file
    // cannot be read (after reporting) or names no register file for the slave.
    static OrvNebu_Slave* create(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                                 const Orv_HashMapCStr& slaveInfo, const SlaveClasses& classes);

    // The creation function for a slave type and driver version (the default slave's when no
    // record covers them).
    static CreateFunction findCreateFunction(int32_t slaveType, int32_t driverVersion,
                                             const SlaveClasses& classes);
};

}  // namespace OrvRT
