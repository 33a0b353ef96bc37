// The NEBU bus master model: command decoding, handshakes, transfers and error bits.
//
// Choices where the board file contract is silent:
// - Commands reach a core's master whatever the core's type; a core without a master ignores
//   writes and reads zeros (Board::runCommand).
// - A write whose bit count does not match its command (1: slaveCount + 2, 4: 29, 5: 19,
//   7: 4 bits), a data command whose bit count fits neither the single nor the burst layout, a
//   data command against the direction of the address word's write bit, a broadcast read and an
//   unknown command code are ignored (reads deliver zeros) and set bus error bit 1, so that a
//   host fault shows up in the error status. Reads of commands 2, 3 and 7 deliver as many bits
//   of the register as asked for.
// - A burst whose data command carries another number of words than the transfer control
//   word's count moves the words the data command carries and sets bus error bit 1.
// - Each data command runs the transfer set up by the latest commands 4 and 5; the address
//   register does not advance, so a repeated data command repeats the transfer.
// - A reset starts when the strobe falls (bit 0 written set, then clear); the slaves and the bus
//   bit of the word written with the strobe clear are the ones reset. resetPolls 0 completes
//   the reset at once; n > 0 completes it at the n-th master status read. Status bit 1 stays
//   set until the strobe rises again.
// - The clock reads locked before any clock reset pulse unless clockPolls is -1; while the
//   reset bit is held it reads unlocked; clockPolls 0 relocks when the pulse ends. Not-running
//   follows clockRunning alone.
// - A transfer to a position at or above slaveCount counts as an empty position (bus error
//   bit 0). A broadcast write reaches every present slave and sets the error bit of each
//   faulty one; empty positions are not addressed by it. A faulty slave still moves the data.
// - The identification words are read-only over the bus (writes to 0x1FFF0..0x1FFF7 are
//   dropped); poke changes them.
// - The two trailing bits of a data write, bit 28 of command 4 and bit 18 of command 5 are not
//   examined.
#include "hostsim/board/BusMaster.h"

#include <stdexcept>
#include <string>

namespace OrvSim {

namespace {

bool bitAt(const uint8_t* data, uint32_t k) { return ((data[k / 8] >> (k % 8)) & 1u) != 0; }

void setBitAt(uint8_t* data, uint32_t k) { data[k / 8] = uint8_t(data[k / 8] | (1u << (k % 8))); }

// Up to 32 bits from a bit word of bitCount bits; missing bits read 0.
uint32_t valueOf(const uint8_t* data, uint32_t bitCount) {
    uint32_t value = 0;
    for (uint32_t k = 0; k < bitCount && k < 32; ++k) {
        if (bitAt(data, k)) value |= 1u << k;
    }
    return value;
}

// Puts the low `width` bits of value into a bit word of bitCount bits.
void putValue(uint8_t* out, uint32_t bitCount, uint32_t value, uint32_t width) {
    for (uint32_t k = 0; k < bitCount && k < width; ++k) {
        if ((value >> k) & 1u) setBitAt(out, k);
    }
}

std::string hex(uint32_t value) {
    static const char digits[] = "0123456789ABCDEF";
    std::string text;
    do {
        text.insert(text.begin(), digits[value & 0xFu]);
        value >>= 4;
    } while (value != 0);
    return "0x" + text;
}

constexpr uint32_t TRANSFER_CONTROL_BITS = 29;
constexpr uint32_t ADDRESS_BITS = 19;
constexpr uint32_t MASTER_STATUS_BITS = 4;
constexpr uint32_t CLOCK_WRITE_BITS = 4;
constexpr uint32_t CLOCK_READ_BITS = 3;
constexpr uint32_t WORD_BITS = 16;
constexpr uint32_t TRAILING_WRITE_BITS = 2;

}  // namespace

BusMaster::BusMaster(const MasterConfig& config, std::vector<std::optional<BoardSlave>> slaves)
    : config_(config),
      slaves_(std::move(slaves)),
      busErrors_(config.busErrors & 3u),
      clockState_(config.clockPolls == -1 ? ClockState::RELOCKING : ClockState::LOCKED) {
    slaves_.resize(config_.slaveCount);
    slaveErrors_.assign(config_.slaveCount, 0);
}

void BusMaster::write(uint32_t cmd, const uint8_t* data, uint32_t bitCount) {
    switch (cmd) {
        case CMD_RESET_CONTROL:
            writeResetControl(data, bitCount);
            return;
        case CMD_TRANSFER_CONTROL:
            if (bitCount != TRANSFER_CONTROL_BITS) return protocolError();
            transferControl_ = valueOf(data, bitCount);
            return;
        case CMD_ADDRESS:
            if (bitCount != ADDRESS_BITS) return protocolError();
            addressWord_ = valueOf(data, bitCount);
            return;
        case CMD_DATA:
            writeData(data, bitCount);
            return;
        case CMD_CLOCK_CONTROL:
            writeClockControl(data, bitCount);
            return;
        default:
            protocolError();
    }
}

void BusMaster::read(uint32_t cmd, uint8_t* out, uint32_t bitCount) {
    switch (cmd) {
        case CMD_MASTER_STATUS:
            putValue(out, bitCount, readMasterStatus(), MASTER_STATUS_BITS);
            return;
        case CMD_ERROR_BITS:
            readErrorBits(out, bitCount);
            return;
        case CMD_DATA:
            readData(out, bitCount);
            return;
        case CMD_CLOCK_CONTROL:
            putValue(out, bitCount, readClockControl(), CLOCK_READ_BITS);
            return;
        default:
            protocolError();
    }
}

// --- resets ---------------------------------------------------------------------------------

void BusMaster::writeResetControl(const uint8_t* data, uint32_t bitCount) {
    const uint32_t width = config_.slaveCount + 2;
    if (bitCount != width) return protocolError();
    resetWord_.assign(data, data + (width + 7) / 8);
    if (width % 8 != 0) resetWord_.back() = uint8_t(resetWord_.back() & ((1u << (width % 8)) - 1));

    const bool strobe = bitAt(data, 0);
    if (strobe && !resetStrobe_) {
        resetState_ = ResetState::ARMED;
    } else if (!strobe && resetStrobe_ && resetState_ == ResetState::ARMED) {
        resetTargets_ = resetWord_;
        resetReads_ = 0;
        resetState_ = ResetState::PENDING;
        if (config_.resetPolls == 0) completeReset();
    }
    resetStrobe_ = strobe;
}

uint32_t BusMaster::readMasterStatus() {
    if (resetState_ == ResetState::PENDING) {
        ++resetReads_;
        if (config_.resetPolls >= 0 && resetReads_ >= config_.resetPolls) completeReset();
    }
    return resetState_ == ResetState::DONE ? 2u : 0u;
}

void BusMaster::completeReset() {
    const uint32_t n = config_.slaveCount;
    if (bitAt(resetTargets_.data(), n + 1)) {
        busErrors_ = 0;
        slaveErrors_.assign(n, 0);
    }
    for (uint32_t i = 0; i < n; ++i) {
        if (bitAt(resetTargets_.data(), i + 1)) slaveErrors_[i] = 0;
    }
    resetState_ = ResetState::DONE;
}

void BusMaster::readErrorBits(uint8_t* out, uint32_t bitCount) const {
    putValue(out, bitCount, busErrors_, 2);
    for (uint32_t i = 0; i < config_.slaveCount && i + 2 < bitCount; ++i) {
        if (slaveErrors_[i] != 0) setBitAt(out, i + 2);
    }
}

// --- clock ----------------------------------------------------------------------------------

void BusMaster::writeClockControl(const uint8_t* data, uint32_t bitCount) {
    if (bitCount != CLOCK_WRITE_BITS) return protocolError();
    const bool reset = bitAt(data, 0);
    if (reset) {
        clockState_ = ClockState::IN_RESET;
    } else if (clockResetBit_) {
        clockReads_ = 0;
        clockState_ = config_.clockPolls == 0 ? ClockState::LOCKED : ClockState::RELOCKING;
    }
    clockResetBit_ = reset;
}

uint32_t BusMaster::readClockControl() {
    if (clockState_ == ClockState::RELOCKING && config_.clockPolls >= 0) {
        ++clockReads_;
        if (clockReads_ >= config_.clockPolls) clockState_ = ClockState::LOCKED;
    }
    uint32_t value = 0;
    if (clockState_ == ClockState::LOCKED) value |= 2u;
    if (!config_.clockRunning) value |= 4u;
    return value;
}

// --- transfers ------------------------------------------------------------------------------

bool BusMaster::wordsCarried(uint32_t bitCount, uint32_t extra, uint32_t& words) {
    const bool burst = ((transferControl_ >> 17) & 1u) != 0;
    if (!burst) {
        words = 1;
        return bitCount == WORD_BITS + extra;
    }
    if (bitCount < extra || (bitCount - extra) % WORD_BITS != 0) return false;
    words = (bitCount - extra) / WORD_BITS;
    if (words != (transferControl_ & ADDRESS_MASK)) protocolError();
    return true;
}

BoardSlave* BusMaster::transferTarget() {
    const uint32_t index = (transferControl_ >> 20) & 0xFFu;
    if (index >= slaves_.size() || !slaves_[index]) {
        busErrors_ |= 1u;
        return nullptr;
    }
    if (slaves_[index]->faulty) slaveErrors_[index] = 1;
    return &*slaves_[index];
}

void BusMaster::writeData(const uint8_t* data, uint32_t bitCount) {
    const bool isWrite = ((addressWord_ >> 17) & 1u) != 0;
    uint32_t words = 0;
    if (!isWrite || !wordsCarried(bitCount, TRAILING_WRITE_BITS, words)) return protocolError();

    const bool increment = ((transferControl_ >> 18) & 1u) != 0;
    const bool broadcast = ((transferControl_ >> 19) & 1u) != 0;
    auto storeAll = [&](BoardSlave& slave) {
        uint32_t address = addressWord_ & ADDRESS_MASK;
        for (uint32_t i = 0; i < words; ++i) {
            store(slave, address, uint16_t(data[2 * i] | (data[2 * i + 1] << 8)));
            if (increment) address = (address + 1) & ADDRESS_MASK;
        }
    };
    if (broadcast) {
        for (size_t i = 0; i < slaves_.size(); ++i) {
            if (!slaves_[i]) continue;
            if (slaves_[i]->faulty) slaveErrors_[i] = 1;
            storeAll(*slaves_[i]);
        }
        return;
    }
    if (BoardSlave* slave = transferTarget()) storeAll(*slave);
}

void BusMaster::readData(uint8_t* out, uint32_t bitCount) {
    const bool isWrite = ((addressWord_ >> 17) & 1u) != 0;
    const bool broadcast = ((transferControl_ >> 19) & 1u) != 0;
    uint32_t words = 0;
    if (isWrite || broadcast || !wordsCarried(bitCount, 0, words)) return protocolError();

    BoardSlave* slave = transferTarget();
    if (!slave) return;
    const bool increment = ((transferControl_ >> 18) & 1u) != 0;
    uint32_t address = addressWord_ & ADDRESS_MASK;
    for (uint32_t i = 0; i < words; ++i) {
        const uint16_t value = fetch(*slave, address);
        out[2 * i] = uint8_t(value & 0xFFu);
        out[2 * i + 1] = uint8_t(value >> 8);
        if (increment) address = (address + 1) & ADDRESS_MASK;
    }
}

uint16_t BusMaster::fetch(const BoardSlave& slave, uint32_t address) {
    if (address >= IDENT_FIRST && address < IDENT_FIRST + IDENT_COUNT) {
        return slave.ident[address - IDENT_FIRST];
    }
    return slave.memory.get(address);
}

void BusMaster::store(BoardSlave& slave, uint32_t address, uint16_t value) {
    if (address >= IDENT_FIRST && address < IDENT_FIRST + IDENT_COUNT) return;
    slave.memory.set(address, value);
}

SlaveMemory& SlaveMemory::operator=(const SlaveMemory& other) {
    if (this == &other) return *this;
    for (size_t i = 0; i < pages_.size(); ++i) {
        pages_[i] = other.pages_[i] ? std::make_unique<Page>(*other.pages_[i]) : nullptr;
    }
    return *this;
}

void SlaveMemory::set(uint32_t address, uint16_t value) {
    address &= ADDRESS_MASK;
    std::unique_ptr<Page>& page = pages_[address >> PAGE_BITS];
    if (!page) {
        if (value == 0) return;
        page = std::make_unique<Page>();
        page->fill(0);
    }
    (*page)[address & PAGE_MASK] = value;
}

// --- direct access --------------------------------------------------------------------------

void BusMaster::checkDirectAccess(uint32_t slave, uint32_t address) const {
    if (slave >= slaves_.size() || !slaves_[slave]) {
        throw std::out_of_range("no slave at position " + std::to_string(slave) + " (slaveCount " +
                                std::to_string(config_.slaveCount) + ")");
    }
    if (address > ADDRESS_MASK) {
        throw std::out_of_range("address " + hex(address) + " is out of range 0..0x1FFFF");
    }
}

uint16_t BusMaster::peek(uint32_t slave, uint32_t address) const {
    checkDirectAccess(slave, address);
    return fetch(*slaves_[slave], address);
}

void BusMaster::poke(uint32_t slave, uint32_t address, uint16_t value) {
    checkDirectAccess(slave, address);
    BoardSlave& target = *slaves_[slave];
    if (address >= IDENT_FIRST && address < IDENT_FIRST + IDENT_COUNT) {
        target.ident[address - IDENT_FIRST] = value;
        return;
    }
    store(target, address, value);
}

bool BusMaster::slaveErrorBit(uint32_t slave) const {
    if (slave >= slaveErrors_.size()) {
        throw std::out_of_range("no slave position " + std::to_string(slave) + " (slaveCount " +
                                std::to_string(config_.slaveCount) + ")");
    }
    return slaveErrors_[slave] != 0;
}

void BusMaster::setResetPolls(int32_t polls) {
    if (polls < -1) throw std::out_of_range("resetPolls " + std::to_string(polls) + " is below -1");
    config_.resetPolls = polls;
}

void BusMaster::setClockPolls(int32_t polls) {
    if (polls < -1) throw std::out_of_range("clockPolls " + std::to_string(polls) + " is below -1");
    config_.clockPolls = polls;
}

void BusMaster::setSlaveFaulty(uint32_t slave, bool faulty) {
    checkDirectAccess(slave, 0);
    slaves_[slave]->faulty = faulty;
}

}  // namespace OrvSim
