// Line rate of one channel of an M3Qrc dual, as a choice over its PLL dividers.
#pragma once

#include "transceiver/OrvNebu_PllLineRateParamAction.h"

namespace OrvRT {

class OrvNebu_M3Qrc_LineRateParamAction : public OrvNebu_PllLineRateParamAction {
public:
    // channel: 0, or any other value for channel 1. Throws when the slave lacks one of the
    // divider or data width choice parameters of the channel.
    OrvNebu_M3Qrc_LineRateParamAction(OrvNebu_DefaultSlave* slave, uint32_t channel,
                                      uint32_t priority);

protected:
    uint64_t dividerFactor(Orv_HashMapCStr& params) override;
    uint64_t expectedFrequency(bool flag, uint64_t rate, uint64_t dataWidth) override;
    void dividerSettings(uint64_t fb, uint64_t ref, uint64_t divsel,
                         Orv_HashMapCStr& settings) override;

private:
    std::string rxDivselName_;
};

}  // namespace OrvRT
