// The transceiver test slave of a dual of the R3 family (Qra).
#include "transceiver/OrvNebu_VanduR3Qra.h"

#include <memory>

#include "transceiver/OrvNebu_R3Qra_ClockFreqParamAction.h"
#include "transceiver/OrvNebu_R3Qra_LineRateParamAction.h"
#include "transceiver/OrvNebu_R3Qra_SysclockFreqParamAction.h"
#include "transceiver/OrvNebu_VanduSupport.h"

namespace OrvRT {

OrvNebu_Slave* OrvNebu_VanduR3Qra::create(uint32_t handle, const ORV_CORE_INFO& coreInfo,
                                          const ORV_SLAVE_REF& slaveRef,
                                          const Orv_HashMapCStr& slaveInfo,
                                          const std::string& registerFile,
                                          const std::string& parameterFile) {
    return vandu::createReporting<OrvNebu_VanduR3Qra>(handle, coreInfo, slaveRef, slaveInfo,
                                                      registerFile, parameterFile);
}

OrvNebu_VanduR3Qra::OrvNebu_VanduR3Qra(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                                       const ORV_CORE_INFO& coreInfo,
                                       const Orv_HashMapCStr& slaveInfo)
    : OrvNebu_DefaultSlave(handle, slaveRef, coreInfo, slaveInfo) {}

void OrvNebu_VanduR3Qra::init(uint32_t handle, const std::string& registerFile,
                              const std::string& parameterFile) {
    OrvNebu_DefaultSlave::init(handle, registerFile, parameterFile);
}

void OrvNebu_VanduR3Qra::addToActionsHashMap(uint32_t, OrvNebu_ActionsMap& actions) {
    uint32_t priority = START_PRIORITY;
    vandu::adopt(ownedActions_, actions,
                 std::make_unique<OrvNebu_R3Qra_ClockFreqParamAction>(this, priority++));
    vandu::adopt(ownedActions_, actions,
                 std::make_unique<OrvNebu_R3Qra_LineRateParamAction>(this, priority++));
    vandu::adopt(ownedActions_, actions,
                 std::make_unique<OrvNebu_R3Qra_SysclockFreqParamAction>(this, priority++));
}

std::string& OrvNebu_VanduR3Qra::makeLocationName(Orv_HashMapCStr& registers, std::string& out) {
    return vandu::locationName("dual_", DUAL_NUMBER, DUAL_COORDINATE, registers, out);
}

}  // namespace OrvRT
