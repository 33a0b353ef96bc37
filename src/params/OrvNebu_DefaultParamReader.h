// Reads parameter definition files into choice parameter actions, cached per session and file.
#pragma once

#include <cstdint>
#include <string>

#include "slave/OrvNebu_ParamAction.h"

namespace OrvRT {

class OrvNebu_DefaultParamReader {
public:
    // Adds the choice actions of the file (read on first use in the session) to actions.
    // Reports a failure on the session channel and throws Orv_AbortException.
    static void addToHashMap(uint32_t handle, const std::string& paramFile,
                             OrvNebu_ActionsMap& actions);
};

}  // namespace OrvRT
