// The slave factory: directory entry, class and creation of a slave.
#include "slave/OrvNebu_SlaveFactory.h"

#include <stdexcept>

#include "base/OrvNebu_CsvText.h"
#include "base/OrvNebu_NameMaps.h"
#include "host/OrvUtil.h"
#include "slave/OrvNebu_DefaultSlave.h"
#include "slave/OrvNebu_DirectoryReader.h"

namespace OrvRT {

namespace {

std::string valueOf(const Orv_HashMapCStr& map, const char* key) {
    auto it = map.find(key);
    return it == map.end() ? std::string() : it->second;
}

}  // namespace

OrvNebu_SlaveFactory::SlaveClasses::SlaveClasses() {
    for (CreateFunction& function : create) function = &OrvNebu_DefaultSlave::create;
}

OrvNebu_SlaveFactory::CreateFunction OrvNebu_SlaveFactory::findCreateFunction(
    int32_t slaveType, int32_t driverVersion, const SlaveClasses& classes) {
    return classes.create[OrvNebu_SlaveClassTable::find(slaveType, driverVersion)];
}

OrvNebu_Slave* OrvNebu_SlaveFactory::create(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                                            const Orv_HashMapCStr& slaveInfo,
                                            const SlaveClasses& classes) {
    const std::string typeText = valueOf(slaveInfo, "slave_type");
    const std::string versionText = valueOf(slaveInfo, "orv_drv_ver");
    const int32_t slaveType = OrvNebu_CsvText::decimalToInt32(typeText);
    const int32_t driverVersion = OrvNebu_CsvText::decimalToInt32(versionText);

    const std::string dataDir = Orv_Util::getVanduDataDirPath();
    Orv_HashMapCStr entry(ORVNEBU_MAP_BUCKETS);
    OrvNebu_DirectoryReader::getEntry(handle, dataDir + DIRECTORY_FILE_NAME, slaveType,
                                      driverVersion, entry);
    std::string registerFile = valueOf(entry, "registers");
    if (!registerFile.empty()) registerFile = dataDir + registerFile;
    std::string parameterFile = valueOf(entry, "parameters");
    if (!parameterFile.empty()) parameterFile = dataDir + parameterFile;

    CreateFunction createFunction = findCreateFunction(slaveType, driverVersion, classes);
    if (registerFile.empty()) {
        throw std::logic_error("No OrvNebu register file specified for OrvNebu slave type: " +
                               typeText + ", orv driver version: " + versionText);
    }
    ORV_CORE_INFO coreInfo{{1, static_cast<uint32_t>(slaveType), 0, 0, 0}};
    return createFunction(handle, coreInfo, slaveRef, slaveInfo, registerFile, parameterFile);
}

}  // namespace OrvRT
