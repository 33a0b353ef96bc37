// The print commands: the library's own readers print the image of a definition file.
#include "PrintCommands.h"

#include <ostream>

#include "params/OrvNebu_DefaultParamReader.h"
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

int printParameterFile(uint32_t /*handle*/, const std::string& path, std::ostream& out,
                       std::ostream& /*err*/) {
    // The reader reports its failures on session 0, the session it caches the file under.
    try {
        OrvRT::OrvNebu_DefaultParamReader::readAndPrint(path, out);
        return 0;
    } catch (...) {
        return 1;
    }
}

}  // namespace nebu
