// The plug-in's exported functions as the console reaches them: one pointer per function,
// null when the loaded plug-in does not export it.
#pragma once

#include <string>

#include "orvnebu/orvnebu.h"

// X(name): every exported function, in the order of the public header.
#define NEBU_EXPORTED_FUNCTIONS(X) \
    X(initialize)                  \
    X(terminate)                   \
    X(getBusInfo)                  \
    X(getSlaveCount)               \
    X(getSlaveHandles)             \
    X(getSlaveInfo)                \
    X(getRegisters)                \
    X(setRegisters)                \
    X(getParameters)               \
    X(setParameters)               \
    X(getParameterChoices)         \
    X(read)                        \
    X(write)                       \
    X(getBusErrorStatus)           \
    X(clearBusErrorStatus)         \
    X(resetBus)                    \
    X(testSlaveInterface)          \
    X(resetSlave)                  \
    X(disableSlave)                \
    X(enableSlave)                 \
    X(singleSlaveRead)             \
    X(singleSlaveWrite)            \
    X(singleSlaveReadModifyWrite)  \
    X(singleSlaveWriteAndInspect)  \
    X(burstSlaveRead)              \
    X(burstSlaveWrite)             \
    X(broadcastSingleWrite)

namespace nebu {

class SharedLibrary;

struct PluginApi {
#define NEBU_API_MEMBER(name) decltype(&OrvNebu_##name) name = nullptr;
    NEBU_EXPORTED_FUNCTIONS(NEBU_API_MEMBER)
#undef NEBU_API_MEMBER

    // Looks every function up by its exported name.
    static PluginApi resolve(const SharedLibrary& library);

    // Whether the function of that name (without "OrvNebu_") is there; false for other names.
    bool exports(const std::string& name) const;
};

}  // namespace nebu
