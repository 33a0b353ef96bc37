// The exported parameter calls: get, set and list the choices of a slave's named parameters.
#include <string>
#include <vector>

#include "api/OrvNebu_Frame.h"
#include "orvnebu/orvnebu.h"
#include "slave/OrvNebu_Slave.h"

using namespace OrvRT;

extern "C" {

uint32_t ORVNEBU_CALL OrvNebu_getParameters(uint32_t handle, ORV_SLAVE_REF slaveRef,
                                            ORV_HASHMAP_HANDLE* params) {
    return lockedFrame(handle, [&] {
        OrvNebu_Slave& slave = resolveSlave(handle, slaveRef);
        checkArgument(params != nullptr && *params != nullptr,
                      "OrvNebu_getParameters() argument checking failed:(params != 0)");
        slave.getParameters(handle, slaveRef, static_cast<Orv_HashMapCStr*>(*params));
    });
}

uint32_t ORVNEBU_CALL OrvNebu_setParameters(uint32_t handle, ORV_SLAVE_REF slaveRef,
                                            ORV_HASHMAP_HANDLE* params) {
    return lockedFrame(handle, [&] {
        OrvNebu_Slave& slave = resolveSlave(handle, slaveRef);
        checkArgument(params != nullptr && *params != nullptr,
                      "OrvNebu_setParameters() argument checking failed:(params != 0)");
        slave.setParameters(handle, slaveRef, static_cast<Orv_HashMapCStr*>(*params));
    });
}

uint32_t ORVNEBU_CALL OrvNebu_getParameterChoices(uint32_t handle, ORV_SLAVE_REF slaveRef,
                                                  ORV_HASHMAP_HANDLE* params,
                                                  ORV_STRINGLIST_HANDLE* choices) {
    return lockedFrame(handle, [&] {
        OrvNebu_Slave& slave = resolveSlave(handle, slaveRef);
        checkArgument(
            params != nullptr && *params != nullptr && choices != nullptr && *choices != nullptr,
            "OrvNebu_getParameterChoices() argument checking failed:(params != 0) && "
            "(choices != 0)");
        slave.getParameterChoices(handle, slaveRef, static_cast<Orv_HashMapCStr*>(*params),
                                  static_cast<std::vector<std::string>*>(*choices));
    });
}

}  // extern "C"
