// Line rate of one channel of an R3Qrb quad: the M3Qrc action under its own name (the R3Qrb
// slave does not create it).
#pragma once

#include "transceiver/OrvNebu_M3Qrc_LineRateParamAction.h"

namespace OrvRT {

class OrvNebu_R3Qrb_LineRateParamAction : public OrvNebu_M3Qrc_LineRateParamAction {
public:
    OrvNebu_R3Qrb_LineRateParamAction(OrvNebu_DefaultSlave* slave, uint32_t channel,
                                      uint32_t priority)
        : OrvNebu_M3Qrc_LineRateParamAction(slave, channel, priority) {}
};

}  // namespace OrvRT
