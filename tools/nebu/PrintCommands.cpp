// The print commands: the library's own readers print the image of a definition file.
#include "PrintCommands.h"

#include <ostream>

#include "registers/OrvNebu_DefaultRegisterHandler.h"

namespace nebu {

int printRegisterFile(uint32_t handle, const std::string& path, std::ostream& out,
                      std::ostream& /*err*/) {
    try {
        OrvRT::OrvNebu_DefaultRegisterHandler::readAndPrint(handle, path, out);
        return 0;
    } catch (...) {
        // The reader has reported why on the session channel.
        return 1;
    }
}

int printParameterFile(uint32_t /*handle*/, const std::string& /*path*/, std::ostream& /*out*/,
                       std::ostream& err) {
    err << "nebu: printParameterFile is not available yet" << std::endl;
    return 2;
}

}  // namespace nebu
