// The NEBU bus master model of the virtual board: the seven master commands, the slaves behind
// the master, their memories, identification words and error bits.
#pragma once

#include <array>
#include <cstdint>
#include <memory>
#include <optional>
#include <vector>

namespace OrvSim {

// A slave's 0x20000 words. Pages are made on the first non-zero write, so a board copies fast
// and a burst over the whole space does not go through a hash per word.
class SlaveMemory {
public:
    SlaveMemory() = default;
    SlaveMemory(const SlaveMemory& other) { *this = other; }
    SlaveMemory& operator=(const SlaveMemory& other);
    SlaveMemory(SlaveMemory&&) = default;
    SlaveMemory& operator=(SlaveMemory&&) = default;

    // Addresses wrap at 0x20000, as on the bus. A word never written reads 0.
    uint16_t get(uint32_t address) const {
        address &= ADDRESS_MASK;
        const Page* page = pages_[address >> PAGE_BITS].get();
        return page ? (*page)[address & PAGE_MASK] : uint16_t(0);
    }
    void set(uint32_t address, uint16_t value);

private:
    static constexpr uint32_t ADDRESS_MASK = 0x1FFFF;
    static constexpr uint32_t PAGE_BITS = 10;
    static constexpr uint32_t PAGE_MASK = (1u << PAGE_BITS) - 1;
    using Page = std::array<uint16_t, size_t(1) << PAGE_BITS>;
    std::array<std::unique_ptr<Page>, (ADDRESS_MASK >> PAGE_BITS) + 1> pages_;
};

// One slave position that holds a slave.
struct BoardSlave {
    // Words at 0x1FFF0..0x1FFF7: slaveType, driverVersion, coreType, cgVersion, cgAlphaVersion,
    // edaVersion, word6, nextSlave.
    uint16_t ident[8] = {};
    bool faulty = false;
    SlaveMemory memory;
};

// What the board file says about a master.
struct MasterConfig {
    uint32_t slaveCount = 0;  // 0..255
    uint32_t periodInt = 0;   // 10 bits
    uint32_t periodFrc = 0;   // 10 bits
    bool dclkHasReset = false;
    int32_t resetPolls = 1;  // -1: the reset never completes
    int32_t clockPolls = 1;  // -1: the clock never locks
    bool clockRunning = true;
    uint32_t busErrors = 0;  // initial error bits 0 and 1
};

class BusMaster {
public:
    static constexpr uint32_t ADDRESS_MASK = 0x1FFFF;
    static constexpr uint32_t IDENT_FIRST = 0x1FFF0;
    static constexpr uint32_t IDENT_COUNT = 8;

    enum Command : uint32_t {
        CMD_RESET_CONTROL = 1,
        CMD_MASTER_STATUS = 2,
        CMD_ERROR_BITS = 3,
        CMD_TRANSFER_CONTROL = 4,
        CMD_ADDRESS = 5,
        CMD_DATA = 6,
        CMD_CLOCK_CONTROL = 7,
    };

    // slaves: one entry per position (slaveCount entries); empty for an empty position.
    // A copy is a master in the same state with slaves of its own.
    BusMaster(const MasterConfig& config, std::vector<std::optional<BoardSlave>> slaves);

    // One command; data holds bitCount bits, least significant first.
    void write(uint32_t cmd, const uint8_t* data, uint32_t bitCount);
    // One command; out has room for bitCount bits and is zeroed by the caller.
    void read(uint32_t cmd, uint8_t* out, uint32_t bitCount);

    const MasterConfig& config() const { return config_; }

    // Direct access, no bus protocol. Throw std::out_of_range for an empty or absent position
    // or an address above 0x1FFFF.
    uint16_t peek(uint32_t slave, uint32_t address) const;
    void poke(uint32_t slave, uint32_t address, uint16_t value);

    // Inspection and fault settings.
    uint32_t busErrorBits() const { return busErrors_; }
    bool slaveErrorBit(uint32_t slave) const;
    const std::vector<uint8_t>& lastResetControl() const { return resetWord_; }
    uint32_t lastTransferControl() const { return transferControl_; }
    uint32_t lastAddressWord() const { return addressWord_; }
    void setBusErrorBits(uint32_t bits) { busErrors_ = bits & 3u; }
    void setSlaveFaulty(uint32_t slave, bool faulty);
    // polls below -1 throw std::out_of_range.
    void setResetPolls(int32_t polls);
    void setClockPolls(int32_t polls);
    void setClockRunning(bool running) { config_.clockRunning = running; }

private:
    enum class ResetState { IDLE, ARMED, PENDING, DONE };
    enum class ClockState { LOCKED, IN_RESET, RELOCKING };

    void protocolError() { busErrors_ |= 2u; }
    // Throws std::out_of_range unless the position holds a slave and the address is a bus one.
    void checkDirectAccess(uint32_t slave, uint32_t address) const;

    void writeResetControl(const uint8_t* data, uint32_t bitCount);
    uint32_t readMasterStatus();
    void completeReset();
    void readErrorBits(uint8_t* out, uint32_t bitCount) const;
    void writeClockControl(const uint8_t* data, uint32_t bitCount);
    uint32_t readClockControl();
    void writeData(const uint8_t* data, uint32_t bitCount);
    void readData(uint8_t* out, uint32_t bitCount);
    // The slave a non-broadcast transfer goes to, with its error bits set; null when the
    // position is empty (bus error bit 0 set).
    BoardSlave* transferTarget();
    // How many words a data command of bitCount bits carries (extra: the trailing write bits);
    // false when it fits no layout.
    bool wordsCarried(uint32_t bitCount, uint32_t extra, uint32_t& words);

    static uint16_t fetch(const BoardSlave& slave, uint32_t address);
    static void store(BoardSlave& slave, uint32_t address, uint16_t value);

    MasterConfig config_;
    std::vector<std::optional<BoardSlave>> slaves_;
    std::vector<uint8_t> slaveErrors_;
    uint32_t busErrors_;

    std::vector<uint8_t> resetWord_;
    bool resetStrobe_ = false;
    ResetState resetState_ = ResetState::IDLE;
    std::vector<uint8_t> resetTargets_;
    int64_t resetReads_ = 0;

    bool clockResetBit_ = false;
    ClockState clockState_;
    int64_t clockReads_ = 0;

    uint32_t transferControl_ = 0;
    uint32_t addressWord_ = 0;
};

}  // namespace OrvSim
