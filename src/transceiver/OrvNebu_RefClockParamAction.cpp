// Reference clock source of an R2Qra dual.
#include "transceiver/OrvNebu_RefClockParamAction.h"

#include <algorithm>

#include "slave/OrvNebu_DefaultSlave.h"
#include "transceiver/OrvNebu_VanduR2Qra.h"
#include "transceiver/OrvNebu_XcvrNumber.h"

namespace OrvRT {

namespace {

// The duals of this thread now passing a driver question on, per direction. next_slave links
// that lead back to a dual already asked would pass the question round for ever; a dual that
// meets its own question again answers the unknown source instead. Plain arrays: a
// thread_local with a destructor would keep the plug-in loaded after the host unloads it.
struct AskingList {
    const void* slaves[OrvNebu_Slave::MAX_CHAIN_STEPS];
    uint32_t count;
};
thread_local AskingList askingSouth;
thread_local AskingList askingNorth;

class AskingGuard {
public:
    AskingGuard(AskingList& list, const void* slave) : list_(list) {
        list_.slaves[list_.count++] = slave;
    }
    ~AskingGuard() { --list_.count; }
    AskingGuard(const AskingGuard&) = delete;
    AskingGuard& operator=(const AskingGuard&) = delete;

private:
    AskingList& list_;
};

// Whether slave is passing the question on already, or the walk has taken as many steps as
// a bus has slaves (it can only have gone round a loop then).
bool alreadyAsking(const AskingList& list, const void* slave) {
    if (list.count >= OrvNebu_Slave::MAX_CHAIN_STEPS) return true;
    return std::find(list.slaves, list.slaves + list.count, slave) != list.slaves + list.count;
}

}  // namespace

OrvNebu_RefClockParamAction::OrvNebu_RefClockParamAction(OrvNebu_DefaultSlave* slave,
                                                         uint32_t priority)
    : slave_(slave), priority_(priority), names_{REFCLK_SOURCE, SOUTH_DRIVER, NORTH_DRIVER} {}

void OrvNebu_RefClockParamAction::getRegsToRead(Orv_HashMapCStr& registers) {
    registers[CLKSOUTH_SEL] = std::string();
    registers[CLKNORTH_SEL] = std::string();
    registers[REFCLK_SEL] = std::string();
    registers[OrvNebu_VanduR2Qra::DUAL_NUMBER] = std::string();
    registers[OrvNebu_VanduR2Qra::DUAL_COORDINATE] = std::string();
}

void OrvNebu_RefClockParamAction::readRegsAndUpdateParams(bool, Orv_HashMapCStr& registers,
                                                          Orv_HashMapCStr& params) {
    if (params.find(REFCLK_SOURCE) != params.end()) getRefClkSource(registers, params);
    if (params.find(SOUTH_DRIVER) != params.end()) {
        params[SOUTH_DRIVER] = driverAnswer(true, registers);
    }
    if (params.find(NORTH_DRIVER) != params.end()) {
        params[NORTH_DRIVER] = driverAnswer(false, registers);
    }
}

void OrvNebu_RefClockParamAction::setParams(Orv_HashMapCStr&, Orv_HashMapCStr&) {}

void OrvNebu_RefClockParamAction::getRefClkSource(Orv_HashMapCStr& registers,
                                                  Orv_HashMapCStr& params) {
    const int64_t select = OrvNebu_XcvrNumber::readLld(registers[REFCLK_SEL]);
    std::string source;
    if (select == 1) {
        source = askNeighbour(false);
    } else if (select == 3) {
        OrvNebu_VanduR2Qra::makeLocationName(registers, source);
    } else if (select == 5 || select == 7) {
        source = askNeighbour(true);
    } else {
        source = "GREFCLK";
    }
    params[REFCLK_SOURCE] = source;
}

std::string OrvNebu_RefClockParamAction::driverAnswer(bool south, Orv_HashMapCStr& registers) {
    if (registers[south ? CLKSOUTH_SEL : CLKNORTH_SEL] == "1") {
        std::string name;
        return OrvNebu_VanduR2Qra::makeLocationName(registers, name);
    }
    AskingList& asking = south ? askingSouth : askingNorth;
    if (alreadyAsking(asking, slave_)) return UNKNOWN_SOURCE;
    AskingGuard guard(asking, slave_);
    return askNeighbour(south);
}

std::string OrvNebu_RefClockParamAction::askNeighbour(bool south) {
    OrvNebu_Slave* other = south ? slave_->getNextSlave() : slave_->getPreviousSlave();
    return slave_->getParamFromOtherSlave(other, south ? SOUTH_DRIVER : NORTH_DRIVER,
                                          UNKNOWN_SOURCE);
}

}  // namespace OrvRT
