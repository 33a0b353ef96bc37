// The transceiver test slave of a dual of the first family (R2, Qra): clock frequencies, both line
// rates and the reference clock source.
#pragma once

#include <cstdint>
#include <string>

#include "slave/OrvNebu_DefaultSlave.h"

namespace OrvRT {

class OrvNebu_VanduR2Qra : public OrvNebu_DefaultSlave {
public:
    static constexpr uint32_t START_PRIORITY = 5000;
    // Registers holding the dual's number and its position in the device.
    static constexpr const char* DUAL_NUMBER = "DUAL_NUMBER";
    static constexpr const char* DUAL_COORDINATE = "DUAL_COORDINATE";

    // The factory's creation function. A failed initialisation is reported to the host
    // (severity 256) and gives null.
    static OrvNebu_Slave* create(uint32_t handle, const ORV_CORE_INFO& coreInfo,
                                 const ORV_SLAVE_REF& slaveRef, const Orv_HashMapCStr& slaveInfo,
                                 const std::string& registerFile, const std::string& parameterFile);

    OrvNebu_VanduR2Qra(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                       const ORV_CORE_INFO& coreInfo, const Orv_HashMapCStr& slaveInfo);

    void init(uint32_t handle, const std::string& registerFile,
              const std::string& parameterFile) override;
    // Adds the computed actions, priorities from START_PRIORITY up. Throws when a line-rate
    // action misses its choice parameters; actions added before stay with the slave.
    void addToActionsHashMap(uint32_t handle, OrvNebu_ActionsMap& actions) override;

    // "dual_" number ":" coordinate, from register values; missing names are entered empty.
    static std::string& makeLocationName(Orv_HashMapCStr& registers, std::string& out);
};

}  // namespace OrvRT
