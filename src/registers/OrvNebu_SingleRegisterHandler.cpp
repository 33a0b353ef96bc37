// Named registers moved slice by slice with single-word transfers.
#include "registers/OrvNebu_SingleRegisterHandler.h"

#include <utility>
#include <vector>

#include "bus/OrvNebu_BusList.h"
#include "host/OrvUtil.h"

namespace OrvRT {

OrvNebu_SingleRegisterHandler::OrvNebu_SingleRegisterHandler(uint32_t handle,
                                                             const std::string& regFilename)
    : OrvNebu_RegisterHandler(handle, regFilename) {
    readRegistersFromFile(handle);
}

OrvNebu_SingleRegisterHandler::~OrvNebu_SingleRegisterHandler() = default;

OrvNebu_RegisterHandler::Cache& OrvNebu_SingleRegisterHandler::cache() {
    // Emptied at unload without deleting the handlers it still holds: the map holds plain
    // pointers, and slaves the host never removed may still use them.
    static Cache instance;
    return instance;
}

OrvNebu_RegisterHandler* OrvNebu_SingleRegisterHandler::getRegisterHandler(
    uint32_t handle, const std::string& regFilename) {
    return getFromCache<OrvNebu_SingleRegisterHandler>(cache(), handle, regFilename);
}

OrvNebu_RegisterHandler* OrvNebu_SingleRegisterHandler::findRegisterHandler(
    uint32_t handle, const std::string& regFilename) {
    (void)handle;
    return findInCache(cache(), regFilename);
}

void OrvNebu_SingleRegisterHandler::releaseRegisterHandler(OrvNebu_RegisterHandler* handler) {
    (void)handler;
    releaseToCache(cache());
}

uint32_t OrvNebu_SingleRegisterHandler::getHandlerCount() { return cache().handlerCount; }

void OrvNebu_SingleRegisterHandler::readAndPrint(uint32_t handle, const std::string& regFilename,
                                                 std::ostream& out) {
    OrvNebu_SingleRegisterHandler handler(handle, regFilename);
    handler.print(handle, out);
}

std::string OrvNebu_SingleRegisterHandler::getValue(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                                                    OrvNebu_Transaction& bus, const Register& reg) {
    std::string digits;
    digits.reserve(reg.totalWidth);
    for (auto it = reg.slices.rbegin(); it != reg.slices.rend(); ++it) {
        uint32_t word = 0;
        bus.singleSlaveRead(handle, slaveRef, (*it)->address, &word, nullptr);
        (*it)->appendDigits(word, digits);
    }
    std::string hex;
    Orv_NumberUtil::binStr2HexStr(digits, hex);
    return hex;
}

void OrvNebu_SingleRegisterHandler::setValue(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                                             OrvNebu_Transaction& bus, const Register& reg,
                                             const std::string& digits) {
    size_t pos = 0;
    for (auto it = reg.slices.rbegin(); it != reg.slices.rend(); ++it) {
        const RegisterSlice& s = **it;
        uint32_t value = 0;
        uint32_t keepMask = 0xFFFFFFFFu;
        s.mergeDigits(digits, pos, value, keepMask);
        bus.singleSlaveReadModifyWrite(handle, slaveRef, s.address, value, keepMask, nullptr);
        pos += s.width();
    }
}

void OrvNebu_SingleRegisterHandler::getRegisters(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                                                 Orv_HashMapCStr* registers) {
    const OrvNebu_TransactionPtr bus =
        OrvNebu_BusList::getBusList()->getBus(handle, slaveRef.device, slaveRef.userChain);
    if (registers->empty()) {
        for (const auto& entry : file_->registers()) {
            (*registers)[entry.first] = getValue(handle, slaveRef, *bus, entry.second);
        }
        return;
    }
    checkRegisterNames(handle, *registers);
    for (auto& entry : *registers) {
        entry.second = getValue(handle, slaveRef, *bus, *findRegister(entry.first));
    }
}

void OrvNebu_SingleRegisterHandler::setRegisters(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                                                 Orv_HashMapCStr* registers) {
    const OrvNebu_TransactionPtr bus =
        OrvNebu_BusList::getBusList()->getBus(handle, slaveRef.device, slaveRef.userChain);
    checkRegisterNames(handle, *registers);
    // Every value is converted first, so a bad value writes nothing at all.
    std::vector<std::pair<const Register*, std::string>> values;
    values.reserve(registers->size());
    for (const auto& entry : *registers) {
        const Register* reg = findRegister(entry.first);
        std::string digits;
        toDigits(entry.second, *reg, digits);
        values.emplace_back(reg, std::move(digits));
    }
    for (const auto& v : values) setValue(handle, slaveRef, *bus, *v.first, v.second);
}

}  // namespace OrvRT
