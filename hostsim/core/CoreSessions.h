// The stand-in host's per-session core lists, as the rest of the core library reaches them.
#pragma once

#include <cstdint>
#include <vector>

#include "host/OrvCore.h"

namespace OrvSim {

// The cores registered in a session, taken out of its list, which the host then drops; the
// caller deletes them.
std::vector<OrvRT::Orv_Core*> takeSessionCores(uint32_t handle);

// Whether the board behind the sessions has a command channel fault at all (cheap; checked
// before a command asks the board about its own).
bool boardMayRefuseCommands();

}  // namespace OrvSim
