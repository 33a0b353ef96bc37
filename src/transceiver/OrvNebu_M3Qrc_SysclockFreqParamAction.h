// The system clock input "sysclk_freq" of an M3Qrc dual, which its clock-frequency action needs.
#pragma once

#include "transceiver/OrvNebu_InputParamAction.h"

namespace OrvRT {

class OrvNebu_M3Qrc_SysclockFreqParamAction : public OrvNebu_InputParamAction {
public:
    static constexpr const char* IN_PARAM_NAME = "sysclk_freq";

    OrvNebu_M3Qrc_SysclockFreqParamAction(OrvNebu_DefaultSlave* slave, uint32_t priority)
        : OrvNebu_InputParamAction(slave, priority, IN_PARAM_NAME) {}
};

}  // namespace OrvRT
