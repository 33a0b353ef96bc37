// The stand-in host's per-session core lists and the board behind every session; shared by
// the core library's sources only.
#pragma once

#include <cstdint>
#include <memory>
#include <vector>

#include "host/OrvCore.h"

namespace OrvSim {

class Board;

// The cores registered in a session, taken out of its list; the caller deletes them.
std::vector<OrvRT::Orv_Core*> takeSessionCores(uint32_t handle);

}  // namespace OrvSim
