// Block reads and writes of named registers: one burst each way over the covering words.
#include "registers/OrvNebu_DefaultRegisterHandler.h"

#include <algorithm>
#include <stdexcept>
#include <vector>

#include "bus/OrvNebu_BusList.h"
#include "host/OrvUtil.h"

namespace OrvRT {

OrvNebu_DefaultRegisterHandler::OrvNebu_DefaultRegisterHandler(uint32_t handle,
                                                               const std::string& regFilename)
    : OrvNebu_RegisterHandler(handle, regFilename) {
    readRegistersFromFile(handle);
}

OrvNebu_DefaultRegisterHandler::~OrvNebu_DefaultRegisterHandler() = default;

OrvNebu_RegisterHandler::Cache& OrvNebu_DefaultRegisterHandler::cache() {
    // Emptied at unload without deleting the handlers it still holds: the map holds plain
    // pointers, and slaves the host never removed may still use them.
    static Cache instance;
    return instance;
}

OrvNebu_RegisterHandler* OrvNebu_DefaultRegisterHandler::getRegisterHandler(
    uint32_t handle, const std::string& regFilename) {
    return getFromCache<OrvNebu_DefaultRegisterHandler>(cache(), handle, regFilename);
}

OrvNebu_RegisterHandler* OrvNebu_DefaultRegisterHandler::findRegisterHandler(
    uint32_t handle, const std::string& regFilename) {
    (void)handle;
    return findInCache(cache(), regFilename);
}

void OrvNebu_DefaultRegisterHandler::releaseRegisterHandler(OrvNebu_RegisterHandler* handler) {
    (void)handler;
    releaseToCache(cache());
}

uint32_t OrvNebu_DefaultRegisterHandler::getHandlerCount() { return cache().handlerCount; }

void OrvNebu_DefaultRegisterHandler::readAndPrint(uint32_t handle, const std::string& regFilename,
                                                  std::ostream& out) {
    OrvNebu_DefaultRegisterHandler handler(handle, regFilename);
    handler.print(handle, out);
}

void OrvNebu_DefaultRegisterHandler::getAddressRange(uint32_t* firstAddress, uint32_t* lastAddress,
                                                     const Orv_HashMapCStr* registers) const {
    *firstAddress = 0xFFFFFFFFu;
    *lastAddress = 0;
    for (const auto& entry : *registers) {
        const Register* reg = findRegister(entry.first);
        if (reg == nullptr) continue;
        *firstAddress = std::min(*firstAddress, reg->minAddress);
        *lastAddress = std::max(*lastAddress, reg->maxAddress);
    }
}

std::string OrvNebu_DefaultRegisterHandler::getValue(const Register& reg, const WordBlock& block) {
    std::string digits;
    digits.reserve(reg.totalWidth);
    for (auto it = reg.slices.rbegin(); it != reg.slices.rend(); ++it) {
        (*it)->appendDigits(block.word((*it)->address), digits);
    }
    std::string hex;
    Orv_NumberUtil::binStr2HexStr(digits, hex);
    return hex;
}

void OrvNebu_DefaultRegisterHandler::setValue(const Register& reg, WordBlock& block,
                                              const std::string& digits) {
    size_t pos = 0;
    for (auto it = reg.slices.rbegin(); it != reg.slices.rend(); ++it) {
        const RegisterSlice& s = **it;
        uint32_t value = 0;
        uint32_t keepMask = 0xFFFFFFFFu;
        s.mergeDigits(digits, pos, value, keepMask);
        uint32_t& word = block.word(s.address);
        word = (word & keepMask) | value;
        pos += s.width();
    }
}

void OrvNebu_DefaultRegisterHandler::readBlock(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                                               OrvNebu_Transaction& bus, WordBlock& block) const {
    const uint32_t count = block.lastAddress - block.firstAddress + 1;
    // Said in the words of the file: a burst the caller never asked for would not be.
    if (count > OrvNebu_RegisterFile::MAX_BURST_WORDS) {
        std::string first, last;
        const std::string text = "Registers of " + regFilename_ + " span words 0x" +
                                 Orv_NumberUtil::uLL2HexStr(block.firstAddress, first) + " to 0x" +
                                 Orv_NumberUtil::uLL2HexStr(block.lastAddress, last) + " (" +
                                 std::to_string(count) + " words): more than one burst moves (" +
                                 std::to_string(OrvNebu_RegisterFile::MAX_BURST_WORDS) + ")";
        throw std::logic_error(text);
    }
    block.words.assign(count, 0);
    bus.burstSlaveRead(handle, slaveRef, block.firstAddress, 1, block.words.data(), count, nullptr);
}

void OrvNebu_DefaultRegisterHandler::getRegisters(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                                                  Orv_HashMapCStr* registers) {
    const OrvNebu_TransactionPtr bus =
        OrvNebu_BusList::getBusList()->getBus(handle, slaveRef.device, slaveRef.userChain);
    WordBlock block;
    if (registers->empty()) {
        // A file without registers has nothing to read.
        if (file_->registers().empty()) return;
        block.firstAddress = file_->minAddress();
        block.lastAddress = file_->maxAddress();
    } else {
        checkRegisterNames(handle, *registers);
        getAddressRange(&block.firstAddress, &block.lastAddress, registers);
    }
    readBlock(handle, slaveRef, *bus, block);
    if (registers->empty()) {
        for (const auto& entry : file_->registers())
            (*registers)[entry.first] = getValue(entry.second, block);
    } else {
        for (auto& entry : *registers) entry.second = getValue(*findRegister(entry.first), block);
    }
}

void OrvNebu_DefaultRegisterHandler::setRegisters(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                                                  Orv_HashMapCStr* registers) {
    const OrvNebu_TransactionPtr bus =
        OrvNebu_BusList::getBusList()->getBus(handle, slaveRef.device, slaveRef.userChain);
    checkRegisterNames(handle, *registers);
    // Nothing named, nothing to move.
    if (registers->empty()) return;

    // Every value is converted before the bus is touched, so a bad value writes nothing.
    std::vector<std::pair<const Register*, std::string>> values;
    values.reserve(registers->size());
    for (const auto& entry : *registers) {
        const Register* reg = findRegister(entry.first);
        std::string digits;
        toDigits(entry.second, *reg, digits);
        values.emplace_back(reg, std::move(digits));
    }

    WordBlock block;
    getAddressRange(&block.firstAddress, &block.lastAddress, registers);
    readBlock(handle, slaveRef, *bus, block);
    for (const auto& v : values) setValue(*v.first, block, v.second);
    bus->burstSlaveWrite(handle, slaveRef, block.firstAddress, 1, block.words.data(),
                         static_cast<uint32_t>(block.words.size()), nullptr);
}

}  // namespace OrvRT
