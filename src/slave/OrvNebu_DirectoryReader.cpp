// The directory file reader: the first row matching a slave type and driver version.
#include "slave/OrvNebu_DirectoryReader.h"

#include "base/OrvNebu_DirectoryFile.h"
#include "base/Orv_AbortException.h"

namespace OrvRT {

OrvNebu_DirectoryReader::OrvNebu_DirectoryReader(uint32_t handle, const std::string& fileName,
                                                 int32_t slaveType, int32_t driverVersion)
    : handle_(handle), fileName_(fileName), slaveType_(slaveType), driverVersion_(driverVersion) {}

bool OrvNebu_DirectoryReader::getEntry(uint32_t handle, const std::string& fileName,
                                       int32_t slaveType, int32_t driverVersion,
                                       Orv_HashMapCStr& entry) {
    OrvNebu_DirectoryReader reader(handle, fileName, slaveType, driverVersion);
    return reader.getResult(entry);
}

bool OrvNebu_DirectoryReader::getResult(Orv_HashMapCStr& entry) {
    const OrvNebu_DirectoryFile file(fileName_);
    const OrvNebu_FileProblem* refusal = OrvNebu_FileProblem::firstRefusal(file.problems());
    if (refusal != nullptr) {
        OrvNebu_FileProblem::send(handle_, *refusal);
        throw Orv_AbortException();
    }
    const OrvNebu_DirectoryFile::Row* row = file.findRow(slaveType_, driverVersion_);
    if (row == nullptr) return false;
    file.fillEntry(*row, entry);
    return true;
}

}  // namespace OrvRT
