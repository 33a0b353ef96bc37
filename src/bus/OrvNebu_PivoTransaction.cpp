// The Pivo transaction: bus operations as command sequences to the bus master core.
#include "bus/OrvNebu_PivoTransaction.h"

#include <stdexcept>
#include <string>
#include <vector>

#include "host/OrvCore.h"
#include "host/OrvJtag.h"
#include "host/OrvUtil.h"

namespace OrvRT {

namespace {

const char* const MSG_INVALID_BUS = "Invalid NEBU Bus.\n";
const char* const MSG_ERROR_STATUS_LEN = "errorStatusLen must equal to maximum slaves supported.\n";
const char* const MSG_CLOCK_RESET = "NEBU Master could not reset the System Clock.\n";
const char* const MSG_CLOCK_NOT_LOCKED = "The System Clock is not locked.\n";
const char* const MSG_CLOCK_NOT_RUNNING = "The System Clock is not running.\n";
const char* const MSG_TIMED_OUT = "NEBU Master timed out.\n";
const char* const MSG_INVALID_SLAVE_INDEX =
    "Invalid slave index (Slave Index >= Maximum Slaves Supported).\n";
const char* const MSG_INVALID_BURST_LENGTH =
    "Invalid burst length (Word Count > Maximum Burst Length 131071).\n";
const char* const MSG_INVALID_ADDRESS =
    "Invalid bus address (Address > Maximum Address 0x1FFFF).\n";
const char* const MSG_INVALID_BURST_END =
    "Invalid burst end address (Address + Word Count - 1 > Maximum Address 0x1FFFF).\n";
const char* const KEY_DCLK_HAS_RESET = "dclk_has_reset";

// Bursts up to this many words run on stack buffers; longer ones allocate once.
constexpr uint32_t STACK_BURST_WORDS = 128;

inline void setBit(uint8_t* bytes, uint32_t bit) {
    bytes[bit / 8] = static_cast<uint8_t>(bytes[bit / 8] | (1u << (bit % 8)));
}

inline uint32_t getBit(const uint8_t* bytes, uint32_t bit) {
    return (bytes[bit / 8] >> (bit % 8)) & 1u;
}

// A host map that is deleted on every path out of the scope.
class TemporaryHostMap {
public:
    TemporaryHostMap() : map_(OrvContainer_hashmapCStr_new()) {}
    ~TemporaryHostMap() { OrvContainer_hashmapCStr_delete(map_); }
    TemporaryHostMap(const TemporaryHostMap&) = delete;
    TemporaryHostMap& operator=(const TemporaryHostMap&) = delete;
    ORV_HASHMAP_HANDLE get() const { return map_; }

private:
    ORV_HASHMAP_HANDLE map_;
};

}  // namespace

OrvNebu_PivoTransaction::OrvNebu_PivoTransaction(ORV_CORE_REF coreRef, uint32_t slaveCount)
    : coreRef_(coreRef), slaveCount_(slaveCount) {
    // The control and error words are sized for 255 slaves; anything else would overrun them.
    if (slaveCount == 0 || slaveCount > MAX_SLAVE_COUNT) throw std::logic_error(MSG_INVALID_BUS);
}

OrvNebu_PivoTransaction::~OrvNebu_PivoTransaction() = default;

uint32_t OrvNebu_PivoTransaction::getSlaveCount(uint32_t, uint32_t, uint32_t) {
    return slaveCount_;
}

uint32_t OrvNebu_PivoTransaction::getSlaveHandles(uint32_t, uint32_t, uint32_t,
                                                  uint32_t* slaveHandles, uint32_t count) {
    if (slaveHandles == nullptr) return 0;
    for (uint32_t i = 0; i < count; ++i) slaveHandles[i] = i;
    return count;
}

void OrvNebu_PivoTransaction::getBusInfo(uint32_t handle, uint32_t, uint32_t,
                                         ORV_HASHMAP_HANDLE busInfoHash) {
    Orv_ByteBuffer status(STATUS_BUFFER_SIZE, STATUS_BUFFER_GROW, STATUS_BUFFER_RESERVE);
    ORV_CORE_INFO info{};
    Orv_CoreComm::getCoreStatus(handle, coreRef_, &info, status, status.getSize() * 8);
    if (info.word[1] != MASTER_CORE_TYPE) throw std::logic_error(MSG_INVALID_BUS);

    Orv_HashMapCStr& map = *static_cast<Orv_HashMapCStr*>(busInfoHash);
    std::string text;
    map["period_int"] = Orv_NumberUtil::uLL2DecStr(status.getBits(68, 10), text);
    map["period_frc"] = Orv_NumberUtil::uLL2DecStr(status.getBits(78, 10), text);
    map[KEY_DCLK_HAS_RESET] = Orv_NumberUtil::uLL2DecStr(status.getBits(88, 1), text);
}

void OrvNebu_PivoTransaction::getBusErrorStatus(uint32_t handle, uint32_t, uint32_t,
                                                uint32_t* errorStatus, uint32_t errorStatusLen) {
    if (errorStatusLen < slaveCount_) throw std::logic_error(MSG_ERROR_STATUS_LEN);
    uint8_t bits[CONTROL_BYTES] = {};
    readErrorBits(handle, bits, slaveCount_ + 2);
    const uint32_t busBits = bits[0] & 3u;
    for (uint32_t i = 0; i < slaveCount_; ++i)
        errorStatus[i] = (getBit(bits, i + 2) << 2) | busBits;
}

void OrvNebu_PivoTransaction::clearBusErrorStatus(uint32_t handle, uint32_t device,
                                                  uint32_t userChain) {
    resetBus(handle, device, userChain);
}

void OrvNebu_PivoTransaction::resetBus(uint32_t handle, uint32_t device, uint32_t userChain) {
    TemporaryHostMap busInfo;
    getBusInfo(handle, device, userChain, busInfo.get());
    const char* dclkHasReset = OrvContainer_hashmapCStr_getCStr(busInfo.get(), KEY_DCLK_HAS_RESET);
    if (dclkHasReset != nullptr && dclkHasReset[0] == '1') resetSystemClock(handle);

    // Every slave bit and the bus bit after them, with and without the strobe in bit 0.
    uint8_t strobe[CONTROL_BYTES] = {};
    uint8_t hold[CONTROL_BYTES] = {};
    for (uint32_t bit = 1; bit < slaveCount_ + 2; ++bit) {
        setBit(strobe, bit);
        setBit(hold, bit);
    }
    setBit(strobe, 0);
    resetHandshake(handle, strobe, hold);
}

void OrvNebu_PivoTransaction::resetSystemClock(uint32_t handle) {
    accessClockControl(handle, 1, nullptr, nullptr, true);
    accessClockControl(handle, 0, nullptr, nullptr, true);
    uint32_t locked = 0;
    uint32_t notRunning = 1;
    uint32_t reads = 0;
    while (notRunning != 0 && locked != 1) {
        if (reads == MAX_POLLS) {
            std::string message(MSG_CLOCK_RESET);
            if (locked != 1) message += MSG_CLOCK_NOT_LOCKED;
            if (notRunning != 0) message += MSG_CLOCK_NOT_RUNNING;
            throw std::logic_error(message);
        }
        accessClockControl(handle, 0, &locked, &notRunning, false);
        ++reads;
    }
}

void OrvNebu_PivoTransaction::resetHandshake(uint32_t handle, const uint8_t* strobe,
                                             const uint8_t* hold) {
    writeResetControl(handle, strobe);
    writeResetControl(handle, hold);
    bool done = false;
    for (uint32_t reads = 0; reads < MAX_POLLS && !done; ++reads) {
        uint32_t masterStatus = 0;
        readMasterStatus(handle, &masterStatus);
        done = (masterStatus & 2u) != 0;
    }
    const uint8_t cleared[CONTROL_BYTES] = {};
    writeResetControl(handle, cleared);
    if (!done) {
        // The caller may never touch this bus again: release the reset now rather than leave
        // the cleared word waiting in the JTAG queue.
        OrvJtag_target_flush(handle);
        throw std::logic_error(MSG_TIMED_OUT);
    }
}

void OrvNebu_PivoTransaction::testSlaveInterface(uint32_t, ORV_SLAVE_REF, uint32_t* result) {
    *result = 0;
}

void OrvNebu_PivoTransaction::resetSlave(uint32_t handle, ORV_SLAVE_REF slaveRef) {
    // The control word has no bit for a slave position the bus does not have.
    if (slaveRef.slaveIndex >= slaveCount_) throw std::logic_error(MSG_INVALID_SLAVE_INDEX);
    uint8_t strobe[CONTROL_BYTES] = {};
    uint8_t hold[CONTROL_BYTES] = {};
    setBit(strobe, 0);
    setBit(strobe, slaveRef.slaveIndex + 1);
    setBit(hold, slaveRef.slaveIndex + 1);
    resetHandshake(handle, strobe, hold);
}

void OrvNebu_PivoTransaction::disableSlave(uint32_t, ORV_SLAVE_REF) {}

void OrvNebu_PivoTransaction::enableSlave(uint32_t, ORV_SLAVE_REF) {}

void OrvNebu_PivoTransaction::checkTransfer(const ORV_SLAVE_REF& slaveRef, uint32_t address) const {
    // The master sees only 8 bits of slave index and 17 of address: anything wider would
    // reach a different slave or address than the caller named.
    if (slaveRef.slaveIndex > MAX_SLAVE_COUNT) throw std::logic_error(MSG_INVALID_SLAVE_INDEX);
    if (address > MAX_ADDRESS) throw std::logic_error(MSG_INVALID_ADDRESS);
}

void OrvNebu_PivoTransaction::checkBurstCount(uint32_t count) const {
    // The count field holds 17 bits; a longer burst would move more words than announced.
    if (count > MAX_BURST_WORDS) throw std::logic_error(MSG_INVALID_BURST_LENGTH);
}

void OrvNebu_PivoTransaction::checkBurstEnd(uint32_t address, uint32_t incrAddress,
                                            uint32_t count) const {
    // The master's address wraps to 0 after the last one: such a burst reaches words the
    // caller never named.
    if (incrAddress != 0 && count != 0 &&
        static_cast<uint64_t>(address) + count - 1u > MAX_ADDRESS) {
        throw std::logic_error(MSG_INVALID_BURST_END);
    }
}

void OrvNebu_PivoTransaction::deliverStatus(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                                            uint32_t* status) {
    if (status == nullptr) return;
    if (slaveRef.slaveIndex >= slaveCount_) throw std::logic_error(MSG_INVALID_SLAVE_INDEX);
    uint32_t errorStatus[MAX_SLAVE_COUNT];
    getBusErrorStatus(handle, slaveRef.device, slaveRef.userChain, errorStatus, slaveCount_);
    *status = errorStatus[slaveRef.slaveIndex];
}

void OrvNebu_PivoTransaction::singleSlaveRead(uint32_t handle, ORV_SLAVE_REF slaveRef,
                                              uint32_t address, uint32_t* buffer,
                                              uint32_t* status) {
    checkTransfer(slaveRef, address);
    writeTransferControl(handle, 0, false, false, false, slaveRef.slaveIndex);
    writeAddress(handle, false, address);
    readData(handle, buffer);
    deliverStatus(handle, slaveRef, status);
}

void OrvNebu_PivoTransaction::singleSlaveWrite(uint32_t handle, ORV_SLAVE_REF slaveRef,
                                               uint32_t address, uint32_t value, uint32_t* status) {
    checkTransfer(slaveRef, address);
    writeTransferControl(handle, 0, false, false, false, slaveRef.slaveIndex);
    writeAddress(handle, true, address);
    writeData(handle, value & 0xFFFFu);
    deliverStatus(handle, slaveRef, status);
}

void OrvNebu_PivoTransaction::singleSlaveReadModifyWrite(uint32_t handle, ORV_SLAVE_REF slaveRef,
                                                         uint32_t address, uint32_t value,
                                                         uint32_t mask, uint32_t* status) {
    uint32_t word = 0;
    singleSlaveRead(handle, slaveRef, address, &word, nullptr);
    singleSlaveWrite(handle, slaveRef, address, (word & mask) | value, nullptr);
    deliverStatus(handle, slaveRef, status);
}

void OrvNebu_PivoTransaction::singleSlaveWriteAndInspect(uint32_t handle, ORV_SLAVE_REF slaveRef,
                                                         uint32_t address, uint32_t value,
                                                         uint32_t* rdBuf, uint32_t* status) {
    singleSlaveWrite(handle, slaveRef, address, value, nullptr);
    singleSlaveRead(handle, slaveRef, address, rdBuf, nullptr);
    deliverStatus(handle, slaveRef, status);
}

void OrvNebu_PivoTransaction::burstSlaveRead(uint32_t handle, ORV_SLAVE_REF slaveRef,
                                             uint32_t address, uint32_t incrAddress,
                                             uint32_t* buffer, uint32_t numRead, uint32_t* status) {
    checkTransfer(slaveRef, address);
    checkBurstCount(numRead);
    checkBurstEnd(address, incrAddress, numRead);
    writeTransferControl(handle, numRead, true, incrAddress != 0, false, slaveRef.slaveIndex);
    writeAddress(handle, false, address);
    readBurstData(handle, buffer, numRead);
    deliverStatus(handle, slaveRef, status);
}

void OrvNebu_PivoTransaction::burstSlaveWrite(uint32_t handle, ORV_SLAVE_REF slaveRef,
                                              uint32_t address, uint32_t incrAddress,
                                              const uint32_t* buffer, uint32_t numWrite,
                                              uint32_t* status) {
    checkTransfer(slaveRef, address);
    checkBurstCount(numWrite);
    checkBurstEnd(address, incrAddress, numWrite);
    writeTransferControl(handle, numWrite, true, incrAddress != 0, false, slaveRef.slaveIndex);
    writeAddress(handle, true, address);
    writeBurstData(handle, buffer, numWrite);
    deliverStatus(handle, slaveRef, status);
}

void OrvNebu_PivoTransaction::broadcastSingleWrite(uint32_t handle, uint32_t device,
                                                   uint32_t userChain, uint32_t address,
                                                   uint32_t value, uint32_t* status) {
    if (address > MAX_ADDRESS) throw std::logic_error(MSG_INVALID_ADDRESS);
    writeTransferControl(handle, 0, false, false, true, 0);
    writeAddress(handle, true, address);
    writeData(handle, value & 0xFFFFu);
    if (status == nullptr) return;
    uint32_t errorStatus[MAX_SLAVE_COUNT];
    getBusErrorStatus(handle, device, userChain, errorStatus, slaveCount_);
    *status = errorStatus[0] & 3u;
}

// Command primitives.

uint32_t OrvNebu_PivoTransaction::runCommand(uint32_t handle, uint32_t cmd, const uint8_t* dataIn,
                                             uint8_t* dataOut, uint32_t bitCount) {
    return OrvCore_runCoreCommand(handle, coreRef_.device, coreRef_.userChain, coreRef_.coreIndex,
                                  cmd, dataIn, dataOut, bitCount, 0);
}

void OrvNebu_PivoTransaction::writeResetControl(uint32_t handle, const uint8_t* control) {
    runCommand(handle, CMD_RESET_CONTROL, control, nullptr, slaveCount_ + 2);
}

void OrvNebu_PivoTransaction::readMasterStatus(uint32_t handle, uint32_t* masterStatus) {
    readCommand(handle, CMD_MASTER_STATUS, masterStatus, 4);
}

void OrvNebu_PivoTransaction::readErrorBits(uint32_t handle, uint8_t* bits, uint32_t bitCount) {
    runCommand(handle, CMD_ERROR_BITS, nullptr, bits, bitCount);
}

void OrvNebu_PivoTransaction::writeTransferControl(uint32_t handle, uint32_t wordCount, bool burst,
                                                   bool incrAddress, bool broadcast,
                                                   uint32_t slaveIndex) {
    const uint32_t word = (wordCount & 0x1FFFFu) | (static_cast<uint32_t>(burst) << 17) |
                          (static_cast<uint32_t>(incrAddress) << 18) |
                          (static_cast<uint32_t>(broadcast) << 19) | ((slaveIndex & 0xFFu) << 20);
    writeCommand(handle, CMD_TRANSFER_CONTROL, word, 29);
}

void OrvNebu_PivoTransaction::writeAddress(uint32_t handle, bool write, uint32_t address) {
    const uint32_t word = (address & 0x1FFFFu) | (static_cast<uint32_t>(write) << 17);
    writeCommand(handle, CMD_ADDRESS, word, 19);
}

void OrvNebu_PivoTransaction::writeData(uint32_t handle, uint32_t value) {
    writeCommand(handle, CMD_DATA, value & 0xFFFFu, 18);
    OrvJtag_target_flush(handle);
}

void OrvNebu_PivoTransaction::readData(uint32_t handle, uint32_t* value) {
    readCommand(handle, CMD_DATA, value, 16);
}

void OrvNebu_PivoTransaction::writeBurstData(uint32_t handle, const uint32_t* words,
                                             uint32_t count) {
    checkBurstCount(count);
    uint8_t small[2 * STACK_BURST_WORDS + 1];
    std::vector<uint8_t> large;
    uint8_t* bytes = small;
    if (count > STACK_BURST_WORDS) {
        large.resize(2 * static_cast<size_t>(count) + 1);
        bytes = large.data();
    }
    for (uint32_t i = 0; i < count; ++i) {
        bytes[2 * i] = static_cast<uint8_t>(words[i]);
        bytes[2 * i + 1] = static_cast<uint8_t>(words[i] >> 8);
    }
    bytes[2 * count] = 0;  // the two trailing 0 bits
    runCommand(handle, CMD_DATA, bytes, nullptr, count * 16 + 2);
    OrvJtag_target_flush(handle);
}

void OrvNebu_PivoTransaction::readBurstData(uint32_t handle, uint32_t* words, uint32_t count) {
    checkBurstCount(count);
    uint8_t small[2 * STACK_BURST_WORDS];
    std::vector<uint8_t> large;
    uint8_t* bytes = small;
    if (count > STACK_BURST_WORDS) {
        large.resize(2 * static_cast<size_t>(count));
        bytes = large.data();
    } else {
        for (uint32_t i = 0; i < 2 * count; ++i) bytes[i] = 0;
    }
    runCommand(handle, CMD_DATA, nullptr, bytes, count * 16);
    for (uint32_t i = 0; i < count; ++i)
        words[i] =
            static_cast<uint32_t>(bytes[2 * i]) | (static_cast<uint32_t>(bytes[2 * i + 1]) << 8);
}

void OrvNebu_PivoTransaction::accessClockControl(uint32_t handle, uint32_t value, uint32_t* locked,
                                                 uint32_t* notRunning, bool write) {
    if (write) {
        writeCommand(handle, CMD_CLOCK_CONTROL, value & 1u, 4);
        return;
    }
    uint32_t clock = 0;
    readCommand(handle, CMD_CLOCK_CONTROL, &clock, 3);
    *locked = (clock >> 1) & 1u;
    *notRunning = (clock >> 2) & 1u;
}

uint32_t OrvNebu_PivoTransaction::writeCommand(uint32_t handle, uint32_t cmd, uint32_t value,
                                               uint32_t bitCount) {
    const uint8_t bytes[4] = {static_cast<uint8_t>(value), static_cast<uint8_t>(value >> 8),
                              static_cast<uint8_t>(value >> 16), static_cast<uint8_t>(value >> 24)};
    return runCommand(handle, cmd, bytes, nullptr, bitCount);
}

uint32_t OrvNebu_PivoTransaction::readCommand(uint32_t handle, uint32_t cmd, uint32_t* value,
                                              uint32_t bitCount) {
    uint8_t bytes[4] = {};
    const uint32_t rc = runCommand(handle, cmd, nullptr, bytes, bitCount);
    *value = static_cast<uint32_t>(bytes[0]) | (static_cast<uint32_t>(bytes[1]) << 8) |
             (static_cast<uint32_t>(bytes[2]) << 16) | (static_cast<uint32_t>(bytes[3]) << 24);
    return rc;
}

}  // namespace OrvRT
