// What the four transceiver test slave classes share: the creation that reports a failed
// initialisation to the host, adopting computed actions, and the location name of a unit.
#pragma once

#include <exception>
#include <memory>
#include <string>
#include <vector>

#include "host/OrvJtag.h"
#include "host/OrvTypes.h"
#include "params/OrvNebu_ParamAction.h"
#include "slave/OrvNebu_Slave.h"

namespace OrvRT {
namespace vandu {

constexpr uint32_t SEVERITY_ERROR = 256;

// Constructs and initialises a Slave; on failure sends the exception's text (when it is a
// standard exception) and returns null.
template <class Slave>
OrvNebu_Slave* createReporting(uint32_t handle, const ORV_CORE_INFO& coreInfo,
                               const ORV_SLAVE_REF& slaveRef, const Orv_HashMapCStr& slaveInfo,
                               const std::string& registerFile, const std::string& parameterFile) {
    Slave* slave = nullptr;
    try {
        slave = new Slave(handle, slaveRef, coreInfo, slaveInfo);
        OrvNebu_Slave* base = slave;
        base->init(handle, registerFile, parameterFile);
        return slave;
    } catch (const std::exception& e) {
        try {
            OrvJtag_session_sendMessage(handle, SEVERITY_ERROR, e.what());
        } catch (...) {
        }
    } catch (...) {
    }
    delete slave;
    return nullptr;
}

// Hands the action to the slave's owned list, then enters it under all its names.
inline void adopt(std::vector<OrvNebu_ParamAction*>& owned, OrvNebu_ActionsMap& actions,
                  std::unique_ptr<OrvNebu_ParamAction> action) {
    owned.push_back(action.get());
    OrvNebu_ParamAction* raw = action.release();
    OrvNebu_ParamAction::addActionToHashMap(actions, raw);
}

// prefix, the number register's value, ":", the coordinate register's value; names missing
// from the map are entered empty.
inline std::string& locationName(const char* prefix, const char* numberReg, const char* coordReg,
                                 Orv_HashMapCStr& registers, std::string& out) {
    out = prefix;
    out += registers[numberReg];
    out += ':';
    out += registers[coordReg];
    return out;
}

}  // namespace vandu
}  // namespace OrvRT
