// The slave factory and its table of creation records.
#include "slave/OrvNebu_SlaveFactory.h"

#include <algorithm>
#include <iterator>
#include <stdexcept>

#include "base/OrvNebu_CsvText.h"
#include "host/OrvUtil.h"
#include "slave/OrvNebu_DefaultSlave.h"
#include "slave/OrvNebu_DirectoryReader.h"
#include "transceiver/OrvNebu_VanduM3Qrc.h"
#include "transceiver/OrvNebu_VanduR2Qra.h"
#include "transceiver/OrvNebu_VanduR3Qra.h"
#include "transceiver/OrvNebu_VanduR3Qrb.h"

namespace OrvRT {

namespace {

// Sorted by slave type.
const OrvNebu_SlaveFactory::CreationRecord CREATION_RECORDS[] = {
    {0x00, 0, 0xFFFF, &OrvNebu_DefaultSlave::create},
    {0x01, 1, 1, &OrvNebu_VanduM3Qrc::create},
    {0x11, 1, 0xFFFF, &OrvNebu_DefaultSlave::create},
    {0x12, 1, 0xFFFF, &OrvNebu_DefaultSlave::create},
    {0x13, 1, 0xFFFF, &OrvNebu_DefaultSlave::create},
    {0x14, 1, 0xFFFF, &OrvNebu_DefaultSlave::create},
    {0x15, 1, 0xFFFF, &OrvNebu_VanduR3Qra::create},
    {0x21, 1, 0xFFFF, &OrvNebu_DefaultSlave::create},
    {0x31, 1, 0xFFFF, &OrvNebu_DefaultSlave::create},
    {0x41, 1, 1, &OrvNebu_DefaultSlave::create},
    {0x42, 1, 1, &OrvNebu_VanduR2Qra::create},
    {0x43, 1, 1, &OrvNebu_VanduR3Qra::create},
    {0x44, 1, 1, &OrvNebu_VanduM3Qrc::create},
    {0x45, 1, 1, &OrvNebu_VanduR3Qrb::create},
};

std::string valueOf(const Orv_HashMapCStr& map, const char* key) {
    auto it = map.find(key);
    return it == map.end() ? std::string() : it->second;
}

}  // namespace

const OrvNebu_SlaveFactory::CreationRecord* OrvNebu_SlaveFactory::records(size_t& count) {
    count = std::size(CREATION_RECORDS);
    return CREATION_RECORDS;
}

OrvNebu_SlaveFactory::CreateFunction OrvNebu_SlaveFactory::findCreateFunction(
    int32_t slaveType, int32_t driverVersion) {
    const CreationRecord* begin = std::begin(CREATION_RECORDS);
    const CreationRecord* end = std::end(CREATION_RECORDS);
    // The first record past the type, or of the type with a maximum version reaching V.
    const CreationRecord* it = std::lower_bound(begin, end, 0, [&](const CreationRecord& r, int) {
        return r.slaveType < slaveType ||
               (r.slaveType == slaveType && r.maxDriverVersion < driverVersion);
    });
    if (it != end && it->slaveType == slaveType && it->minDriverVersion <= driverVersion &&
        it->maxDriverVersion >= driverVersion) {
        return it->create;
    }
    return &OrvNebu_DefaultSlave::create;
}

OrvNebu_Slave* OrvNebu_SlaveFactory::create(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                                            const Orv_HashMapCStr& slaveInfo) {
    const std::string typeText = valueOf(slaveInfo, "slave_type");
    const std::string versionText = valueOf(slaveInfo, "orv_drv_ver");
    const int32_t slaveType = OrvNebu_CsvText::decimalToInt32(typeText);
    const int32_t driverVersion = OrvNebu_CsvText::decimalToInt32(versionText);

    const std::string dataDir = Orv_Util::getVanduDataDirPath();
    Orv_HashMapCStr entry(100);
    OrvNebu_DirectoryReader::getEntry(handle, dataDir + DIRECTORY_FILE_NAME, slaveType,
                                      driverVersion, entry);
    std::string registerFile = valueOf(entry, "registers");
    if (!registerFile.empty()) registerFile = dataDir + registerFile;
    std::string parameterFile = valueOf(entry, "parameters");
    if (!parameterFile.empty()) parameterFile = dataDir + parameterFile;

    CreateFunction createFunction = findCreateFunction(slaveType, driverVersion);
    if (registerFile.empty()) {
        throw std::logic_error("No OrvNebu register file specified for OrvNebu slave type: " +
                               typeText + ", orv driver version: " + versionText);
    }
    ORV_CORE_INFO coreInfo{{1, static_cast<uint32_t>(slaveType), 0, 0, 0}};
    return createFunction(handle, coreInfo, slaveRef, slaveInfo, registerFile, parameterFile);
}

}  // namespace OrvRT
