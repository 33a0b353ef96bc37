// Where the reference clock of an R2Qra dual comes from: its own input, the global clock, or
// the nearest neighbour dual along the slave chain that drives the clock line toward it.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "params/OrvNebu_ParamAction.h"

namespace OrvRT {

class OrvNebu_DefaultSlave;

class OrvNebu_RefClockParamAction : public OrvNebu_ParamAction {
public:
    static constexpr const char* CLKSOUTH_SEL = "CLKSOUTH_SEL";
    static constexpr const char* CLKNORTH_SEL = "CLKNORTH_SEL";
    static constexpr const char* REFCLK_SEL = "REFCLKSEL";
    static constexpr const char* REFCLK_SOURCE = "refclk_source";
    static constexpr const char* SOUTH_DRIVER = "internal_param_SOUTH_DRIVER";
    static constexpr const char* NORTH_DRIVER = "internal_param_NORTH_DRIVER";
    static constexpr const char* UNKNOWN_SOURCE = "Unknown ref clock source";

    OrvNebu_RefClockParamAction(OrvNebu_DefaultSlave* slave, uint32_t priority);

    const std::string& getParamName() override { return names_.front(); }
    const std::vector<std::string>* getParamNames() override { return &names_; }
    uint32_t getPriority() override { return priority_; }
    void getRegsToRead(Orv_HashMapCStr& registers) override;
    // Answers those of its three names that are keys of params. A neighbour that cannot
    // answer (another slave type) makes this fail with the neighbour's error.
    void readRegsAndUpdateParams(bool allParams, Orv_HashMapCStr& registers,
                                 Orv_HashMapCStr& params) override;
    void setParams(Orv_HashMapCStr& params, Orv_HashMapCStr& registers) override;

    // Stores "refclk_source" into params.
    void getRefClkSource(Orv_HashMapCStr& registers, Orv_HashMapCStr& params);

private:
    // The answer of the next (south) or previous (north) slave to that direction's driver
    // question; the unknown source when there is none or the question came round a loop.
    std::string askNeighbour(bool south);
    // This dual's answer to a driver question in one direction.
    std::string driverAnswer(bool south, Orv_HashMapCStr& registers);

    OrvNebu_DefaultSlave* slave_;
    uint32_t priority_;
    std::vector<std::string> names_;
};

}  // namespace OrvRT
