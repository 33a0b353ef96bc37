// The virtual board: devices, user chains and the cores behind each chain's controller core,
// with NEBU bus masters that execute the seven master commands bit for bit.
#pragma once

#include <cstdint>
#include <map>
#include <memory>
#include <stdexcept>
#include <string>
#include <vector>

#if defined(_WIN32)
#define NEBU_BOARD_API
#else
#define NEBU_BOARD_API __attribute__((visibility("default")))
#endif

namespace OrvSim {

// A board file that cannot be read or is malformed; what() names the file and the problem.
class NEBU_BOARD_API BoardError : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

class NEBU_BOARD_API Board {
public:
    // Throws BoardError.
    static std::shared_ptr<Board> loadFile(const std::string& path);
    // name: used in error messages in place of a file name.
    static std::shared_ptr<Board> loadText(const std::string& json, const std::string& name);

    // An independent board in this one's present state: runs that each need a fresh board
    // copy one instead of reading the file again.
    std::shared_ptr<Board> copy() const;

    virtual ~Board();

    uint32_t deviceCount() const;
    // User chain numbers of a device that are present in the file, ascending.
    std::vector<uint32_t> chains(uint32_t device) const;
    bool isTrellom(uint32_t device) const;
    // False when the device does not exist; an absent chain has 0 cores.
    bool coreCount(uint32_t device, uint32_t chain, uint32_t& count) const;
    // Fills info (word[1] = type) and status bits (bit k = bit k%8 of byte k/8, bitCount
    // bits, bytes zeroed first). False when the core does not exist.
    bool coreStatus(uint32_t device, uint32_t chain, uint32_t core, uint32_t info[5],
                    uint8_t* bits, uint32_t bitCount) const;
    // Runs one command on a core: dataIn for a write, dataOut (bitCount bits, zeroed first)
    // for a read. A core without a master ignores writes and reads zeros. False when the
    // core does not exist.
    bool runCommand(uint32_t device, uint32_t chain, uint32_t core, uint32_t cmd,
                    const uint8_t* dataIn, uint8_t* dataOut, uint32_t bitCount);
    // Whether the host's command channel fails for that command to the core (a fault setting
    // of the board file); false for a core that does not exist.
    bool commandFails(uint32_t device, uint32_t chain, uint32_t core, uint32_t cmd) const;
    // Whether any core has such a fault.
    bool hasFailingCommands() const;

    // Direct access to a slave's memory on the chain's first bus master, no JTAG.
    // Throw std::out_of_range when there is no such master or slave.
    uint16_t peek(uint32_t device, uint32_t chain, uint32_t slave, uint32_t address) const;
    void poke(uint32_t device, uint32_t chain, uint32_t slave, uint32_t address, uint16_t value);

    // Inspection and fault settings of the chain's first bus master, for tests; throw
    // std::out_of_range like peek.
    // Error bits 0 and 1 of command 3.
    uint32_t busErrorBits(uint32_t device, uint32_t chain) const;
    // Error bit of a slave position (also an empty one below slaveCount).
    bool slaveErrorBit(uint32_t device, uint32_t chain, uint32_t slave) const;
    // The last reset control word written (slaveCount + 2 bits, bit k = bit k%8 of byte k/8);
    // empty before the first one.
    std::vector<uint8_t> lastResetControl(uint32_t device, uint32_t chain) const;
    // The last transfer control word (29 bits) and address word (19 bits) written; 0 before.
    uint32_t lastTransferControl(uint32_t device, uint32_t chain) const;
    uint32_t lastAddressWord(uint32_t device, uint32_t chain) const;
    // Bits 0 and 1 of value become the bus error bits.
    void setBusErrorBits(uint32_t device, uint32_t chain, uint32_t bits);
    void setSlaveFaulty(uint32_t device, uint32_t chain, uint32_t slave, bool faulty);
    // As resetPolls / clockPolls / clockRunning of the board file, from the next handshake on.
    void setResetPolls(uint32_t device, uint32_t chain, int32_t polls);
    void setClockPolls(uint32_t device, uint32_t chain, int32_t polls);
    void setClockRunning(uint32_t device, uint32_t chain, bool running);

    struct Impl;

private:
    explicit Board(std::unique_ptr<Impl> impl);
    std::unique_ptr<Impl> impl_;
};

}  // namespace OrvSim
