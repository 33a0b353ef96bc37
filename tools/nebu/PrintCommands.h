// The console's two print commands: tools over definition files, which call the library's
// own readers directly instead of going through the exported functions.
#pragma once

#include <cstdint>
#include <iosfwd>
#include <string>

namespace nebu {

// Prints the image of a register definition file, as the default register handler reads it,
// on out. handle: the session whose message channel reports reading failures. Returns what
// the command adds to the exit status: 0 printed, 1 the file could not be read (reported on
// the session channel), 2 a usage error (reported on err as a "nebu: " line).
int printRegisterFile(uint32_t handle, const std::string& path, std::ostream& out,
                      std::ostream& err);

// The same for a parameter definition file and the default parameter file reader.
int printParameterFile(uint32_t handle, const std::string& path, std::ostream& out,
                       std::ostream& err);

}  // namespace nebu
