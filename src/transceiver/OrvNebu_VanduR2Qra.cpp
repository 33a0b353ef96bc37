// The transceiver test slave of a dual of the first family (R2, Qra).
#include "transceiver/OrvNebu_VanduR2Qra.h"

#include <memory>

#include "transceiver/OrvNebu_ClockFreqParamAction.h"
#include "transceiver/OrvNebu_LineRateParamAction.h"
#include "transceiver/OrvNebu_RefClockParamAction.h"
#include "transceiver/OrvNebu_VanduSupport.h"

namespace OrvRT {

OrvNebu_Slave* OrvNebu_VanduR2Qra::create(uint32_t handle, const ORV_CORE_INFO& coreInfo,
                                          const ORV_SLAVE_REF& slaveRef,
                                          const Orv_HashMapCStr& slaveInfo,
                                          const std::string& registerFile,
                                          const std::string& parameterFile) {
    return vandu::createReporting<OrvNebu_VanduR2Qra>(handle, coreInfo, slaveRef, slaveInfo,
                                                      registerFile, parameterFile);
}

OrvNebu_VanduR2Qra::OrvNebu_VanduR2Qra(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                                       const ORV_CORE_INFO& coreInfo,
                                       const Orv_HashMapCStr& slaveInfo)
    : OrvNebu_DefaultSlave(handle, slaveRef, coreInfo, slaveInfo) {}

void OrvNebu_VanduR2Qra::init(uint32_t handle, const std::string& registerFile,
                              const std::string& parameterFile) {
    OrvNebu_DefaultSlave::init(handle, registerFile, parameterFile);
}

void OrvNebu_VanduR2Qra::addToActionsHashMap(uint32_t, OrvNebu_ActionsMap& actions) {
    uint32_t priority = START_PRIORITY;
    vandu::adopt(ownedActions_, actions,
                 std::make_unique<OrvNebu_ClockFreqParamAction>(this, priority++));
    vandu::adopt(ownedActions_, actions,
                 std::make_unique<OrvNebu_LineRateParamAction>(this, priority++));
    vandu::adopt(ownedActions_, actions,
                 std::make_unique<OrvNebu_RefClockParamAction>(this, priority++));
}

std::string& OrvNebu_VanduR2Qra::makeLocationName(Orv_HashMapCStr& registers, std::string& out) {
    return vandu::locationName("dual_", DUAL_NUMBER, DUAL_COORDINATE, registers, out);
}

}  // namespace OrvRT
