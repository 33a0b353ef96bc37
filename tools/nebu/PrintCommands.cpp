// The print commands: the library's definition-file reader reads the file afresh and prints
// its image, or reports why it refuses the file as the plug-in would.
#include "PrintCommands.h"

#include <ostream>

#include "base/OrvNebu_FileProblem.h"
#include "base/OrvNebu_ParamFile.h"
#include "base/OrvNebu_RegisterFile.h"

namespace nebu {

namespace {

template <class File>
int printFile(uint32_t handle, const std::string& path, std::ostream& out) {
    const File file(path);
    const OrvRT::OrvNebu_FileProblem* refusal =
        OrvRT::OrvNebu_FileProblem::firstRefusal(file.problems());
    if (refusal != nullptr) {
        OrvRT::OrvNebu_FileProblem::send(handle, *refusal);
        return 1;
    }
    file.print(out);
    return 0;
}

}  // namespace

int printRegisterFile(uint32_t handle, const std::string& path, std::ostream& out,
                      std::ostream& /*err*/) {
    return printFile<OrvRT::OrvNebu_RegisterFile>(handle, path, out);
}

int printParameterFile(uint32_t handle, const std::string& path, std::ostream& out,
                       std::ostream& /*err*/) {
    return printFile<OrvRT::OrvNebu_ParamFile>(handle, path, out);
}

}  // namespace nebu
