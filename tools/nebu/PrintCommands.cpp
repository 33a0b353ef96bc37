// The print commands. The library's readers do not offer their print operation yet.
#include "PrintCommands.h"

#include <ostream>

namespace nebu {

int printRegisterFile(uint32_t /*handle*/, const std::string& /*path*/, std::ostream& /*out*/,
                      std::ostream& err) {
    err << "nebu: printRegisterFile is not available yet" << std::endl;
    return 2;
}

int printParameterFile(uint32_t /*handle*/, const std::string& /*path*/, std::ostream& /*out*/,
                       std::ostream& err) {
    err << "nebu: printParameterFile is not available yet" << std::endl;
    return 2;
}

}  // namespace nebu
