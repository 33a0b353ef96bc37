// The transceiver test slave of a dual of the M3 family (Qrc).
#include "transceiver/OrvNebu_VanduM3Qrc.h"

#include <memory>

#include "transceiver/OrvNebu_M3Qrc_ClockFreqParamAction.h"
#include "transceiver/OrvNebu_M3Qrc_LineRateParamAction.h"
#include "transceiver/OrvNebu_M3Qrc_SysclockFreqParamAction.h"
#include "transceiver/OrvNebu_VanduSupport.h"

namespace OrvRT {

OrvNebu_Slave* OrvNebu_VanduM3Qrc::create(uint32_t handle, const ORV_CORE_INFO& coreInfo,
                                          const ORV_SLAVE_REF& slaveRef,
                                          const Orv_HashMapCStr& slaveInfo,
                                          const std::string& registerFile,
                                          const std::string& parameterFile) {
    return vandu::createReporting<OrvNebu_VanduM3Qrc>(handle, coreInfo, slaveRef, slaveInfo,
                                                      registerFile, parameterFile);
}

OrvNebu_VanduM3Qrc::OrvNebu_VanduM3Qrc(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                                       const ORV_CORE_INFO& coreInfo,
                                       const Orv_HashMapCStr& slaveInfo)
    : OrvNebu_DefaultSlave(handle, slaveRef, coreInfo, slaveInfo) {}

void OrvNebu_VanduM3Qrc::init(uint32_t handle, const std::string& registerFile,
                              const std::string& parameterFile) {
    OrvNebu_DefaultSlave::init(handle, registerFile, parameterFile);
}

void OrvNebu_VanduM3Qrc::addToActionsHashMap(uint32_t, OrvNebu_ActionsMap& actions) {
    uint32_t priority = START_PRIORITY;
    vandu::adopt(ownedActions_, actions,
                 std::make_unique<OrvNebu_M3Qrc_ClockFreqParamAction>(this, priority++));
    vandu::adopt(ownedActions_, actions,
                 std::make_unique<OrvNebu_M3Qrc_LineRateParamAction>(this, 0, priority++));
    vandu::adopt(ownedActions_, actions,
                 std::make_unique<OrvNebu_M3Qrc_LineRateParamAction>(this, 1, priority++));
    vandu::adopt(ownedActions_, actions,
                 std::make_unique<OrvNebu_M3Qrc_SysclockFreqParamAction>(this, priority++));
}

std::string& OrvNebu_VanduM3Qrc::makeLocationName(Orv_HashMapCStr& registers, std::string& out) {
    return vandu::locationName("dual_", DUAL_NUMBER, DUAL_COORDINATE, registers, out);
}

}  // namespace OrvRT
