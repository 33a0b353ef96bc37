// The transceiver test slave of a quad of the R3 family (Qrb).
#include "transceiver/OrvNebu_VanduR3Qrb.h"

#include <memory>

#include "transceiver/OrvNebu_R3Qrb_ClockFreqParamAction.h"
#include "transceiver/OrvNebu_R3Qrb_SysclockFreqParamAction.h"
#include "transceiver/OrvNebu_VanduSupport.h"

namespace OrvRT {

OrvNebu_Slave* OrvNebu_VanduR3Qrb::create(uint32_t handle, const ORV_CORE_INFO& coreInfo,
                                          const ORV_SLAVE_REF& slaveRef,
                                          const Orv_HashMapCStr& slaveInfo,
                                          const std::string& registerFile,
                                          const std::string& parameterFile) {
    return vandu::createReporting<OrvNebu_VanduR3Qrb>(handle, coreInfo, slaveRef, slaveInfo,
                                                      registerFile, parameterFile);
}

OrvNebu_VanduR3Qrb::OrvNebu_VanduR3Qrb(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                                       const ORV_CORE_INFO& coreInfo,
                                       const Orv_HashMapCStr& slaveInfo)
    : OrvNebu_DefaultSlave(handle, slaveRef, coreInfo, slaveInfo) {}

void OrvNebu_VanduR3Qrb::init(uint32_t handle, const std::string& registerFile,
                              const std::string& parameterFile) {
    OrvNebu_DefaultSlave::init(handle, registerFile, parameterFile);
}

void OrvNebu_VanduR3Qrb::addToActionsHashMap(uint32_t, OrvNebu_ActionsMap& actions) {
    uint32_t priority = START_PRIORITY;
    vandu::adopt(ownedActions_, actions,
                 std::make_unique<OrvNebu_R3Qrb_ClockFreqParamAction>(this, priority++));
    vandu::adopt(ownedActions_, actions,
                 std::make_unique<OrvNebu_R3Qrb_SysclockFreqParamAction>(this, priority++));
}

std::string& OrvNebu_VanduR3Qrb::makeLocationName(Orv_HashMapCStr& registers, std::string& out) {
    return vandu::locationName("quad_", QUAD_NUMBER, QUAD_COORDINATE, registers, out);
}

}  // namespace OrvRT
