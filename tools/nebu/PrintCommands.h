// The console's two print commands: tools over definition files, which use the library's
// definition-file reader directly instead of going through the exported functions.
#pragma once

#include <cstdint>
#include <iosfwd>
#include <string>

namespace nebu {

// Prints the image of a register definition file, as the register handlers read it, on out;
// the file is read afresh each time. handle: the session whose message channel reports why
// the file is refused, as the plug-in reports it. Returns what
// the command adds to the exit status: 0 printed, 1 the file could not be read (reported on
// the session channel), 2 a usage error (reported on err as a "nebu: " line).
int printRegisterFile(uint32_t handle, const std::string& path, std::ostream& out,
                      std::ostream& err);

// The same for a parameter definition file.
int printParameterFile(uint32_t handle, const std::string& path, std::ostream& out,
                       std::ostream& err);

}  // namespace nebu
