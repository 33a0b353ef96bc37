// The system clock input "sysclk_freq" of an R3Qra dual, which its clock-frequency action needs.
#pragma once

#include "transceiver/OrvNebu_InputParamAction.h"

namespace OrvRT {

class OrvNebu_R3Qra_SysclockFreqParamAction : public OrvNebu_InputParamAction {
public:
    static constexpr const char* IN_PARAM_NAME = "sysclk_freq";

    OrvNebu_R3Qra_SysclockFreqParamAction(OrvNebu_DefaultSlave* slave, uint32_t priority)
        : OrvNebu_InputParamAction(slave, priority, IN_PARAM_NAME) {}
};

}  // namespace OrvRT
