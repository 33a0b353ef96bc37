// The print commands. The library's readers do not offer their print operation yet.
#include "PrintCommands.h"

#include <ostream>

#include "params/OrvNebu_DefaultParamReader.h"

namespace nebu {

int printRegisterFile(uint32_t /*handle*/, const std::string& /*path*/, std::ostream& /*out*/,
                      std::ostream& err) {
    err << "nebu: printRegisterFile is not available yet" << std::endl;
    return 2;
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
