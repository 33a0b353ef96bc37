// The transaction of a bus whose master sits on the Pivo controller core: every bus operation
// as a sequence of the master's seven commands, sent with OrvCore_runCoreCommand.
#pragma once

#include <cstdint>

#include "bus/OrvNebu_Transaction.h"
#include "host/OrvTypes.h"

namespace OrvRT {

class OrvNebu_PivoTransaction : public OrvNebu_Transaction {
public:
    // Command codes of the bus master.
    static constexpr uint32_t CMD_RESET_CONTROL = 1;
    static constexpr uint32_t CMD_MASTER_STATUS = 2;
    static constexpr uint32_t CMD_ERROR_BITS = 3;
    static constexpr uint32_t CMD_TRANSFER_CONTROL = 4;
    static constexpr uint32_t CMD_ADDRESS = 5;
    static constexpr uint32_t CMD_DATA = 6;
    static constexpr uint32_t CMD_CLOCK_CONTROL = 7;

    static constexpr uint32_t MASTER_CORE_TYPE = 14;
    static constexpr uint32_t MAX_SLAVE_COUNT = 255;
    static constexpr uint32_t MAX_BURST_WORDS = 0x1FFFF;
    static constexpr uint32_t MAX_ADDRESS = 0x1FFFF;
    // Reads of the master or clock status before a handshake gives up.
    static constexpr uint32_t MAX_POLLS = 11;
    // Byte buffer of a master core status read.
    static constexpr uint32_t STATUS_BUFFER_SIZE = 154;
    static constexpr uint32_t STATUS_BUFFER_GROW = 10;
    static constexpr uint32_t STATUS_BUFFER_RESERVE = 10;
    // Bytes of a reset control word or an error bits word: up to MAX_SLAVE_COUNT + 2 bits.
    static constexpr uint32_t CONTROL_BYTES = (MAX_SLAVE_COUNT + 2 + 7) / 8;

    // coreRef: the master core every command goes to. slaveCount: 1..255 slave positions.
    OrvNebu_PivoTransaction(ORV_CORE_REF coreRef, uint32_t slaveCount);
    ~OrvNebu_PivoTransaction() override;

    uint32_t getSlaveCount(uint32_t handle, uint32_t device, uint32_t userChain) override;
    uint32_t getSlaveHandles(uint32_t handle, uint32_t device, uint32_t userChain,
                             uint32_t* slaveHandles, uint32_t count) override;
    void getBusInfo(uint32_t handle, uint32_t device, uint32_t userChain,
                    ORV_HASHMAP_HANDLE busInfoHash) override;
    void getBusErrorStatus(uint32_t handle, uint32_t device, uint32_t userChain,
                           uint32_t* errorStatus, uint32_t errorStatusLen) override;
    void clearBusErrorStatus(uint32_t handle, uint32_t device, uint32_t userChain) override;
    void resetBus(uint32_t handle, uint32_t device, uint32_t userChain) override;
    void testSlaveInterface(uint32_t handle, ORV_SLAVE_REF slaveRef, uint32_t* result) override;
    void resetSlave(uint32_t handle, ORV_SLAVE_REF slaveRef) override;
    void disableSlave(uint32_t handle, ORV_SLAVE_REF slaveRef) override;
    void enableSlave(uint32_t handle, ORV_SLAVE_REF slaveRef) override;
    void singleSlaveRead(uint32_t handle, ORV_SLAVE_REF slaveRef, uint32_t address,
                         uint32_t* buffer, uint32_t* status) override;
    void singleSlaveWrite(uint32_t handle, ORV_SLAVE_REF slaveRef, uint32_t address, uint32_t value,
                          uint32_t* status) override;
    void singleSlaveReadModifyWrite(uint32_t handle, ORV_SLAVE_REF slaveRef, uint32_t address,
                                    uint32_t value, uint32_t mask, uint32_t* status) override;
    void singleSlaveWriteAndInspect(uint32_t handle, ORV_SLAVE_REF slaveRef, uint32_t address,
                                    uint32_t value, uint32_t* rdBuf, uint32_t* status) override;
    void burstSlaveRead(uint32_t handle, ORV_SLAVE_REF slaveRef, uint32_t address,
                        uint32_t incrAddress, uint32_t* buffer, uint32_t numRead,
                        uint32_t* status) override;
    void burstSlaveWrite(uint32_t handle, ORV_SLAVE_REF slaveRef, uint32_t address,
                         uint32_t incrAddress, const uint32_t* buffer, uint32_t numWrite,
                         uint32_t* status) override;
    void broadcastSingleWrite(uint32_t handle, uint32_t device, uint32_t userChain,
                              uint32_t address, uint32_t value, uint32_t* status) override;

    // Command primitives: the only code that builds bit words. Bit k of a word is bit k%8 of
    // byte k/8.

    // Writes slaveCount + 2 bits of the reset control word.
    virtual void writeResetControl(uint32_t handle, const uint8_t* control);
    // The 4-bit master status.
    virtual void readMasterStatus(uint32_t handle, uint32_t* masterStatus);
    // Reads bitCount error bits into bits (at least (bitCount + 7) / 8 bytes).
    virtual void readErrorBits(uint32_t handle, uint8_t* bits, uint32_t bitCount);
    virtual void writeTransferControl(uint32_t handle, uint32_t wordCount, bool burst,
                                      bool incrAddress, bool broadcast, uint32_t slaveIndex);
    virtual void writeAddress(uint32_t handle, bool write, uint32_t address);
    // Sends one 16-bit data word and flushes.
    virtual void writeData(uint32_t handle, uint32_t value);
    virtual void readData(uint32_t handle, uint32_t* value);
    // Sends count words (16 bits each) and two 0 bits, then flushes. count <= MAX_BURST_WORDS.
    virtual void writeBurstData(uint32_t handle, const uint32_t* words, uint32_t count);
    // Receives count words of 16 bits. count <= MAX_BURST_WORDS.
    virtual void readBurstData(uint32_t handle, uint32_t* words, uint32_t count);
    // write: drives the system clock reset with bit 0 of value. Otherwise reads the clock
    // state into *locked and *notRunning.
    virtual void accessClockControl(uint32_t handle, uint32_t value, uint32_t* locked,
                                    uint32_t* notRunning, bool write);
    // Sends the low bitCount (<= 32) bits of value.
    virtual uint32_t writeCommand(uint32_t handle, uint32_t cmd, uint32_t value, uint32_t bitCount);
    // Receives bitCount (<= 32) bits into *value.
    virtual uint32_t readCommand(uint32_t handle, uint32_t cmd, uint32_t* value, uint32_t bitCount);

private:
    // Writes strobe then hold, polls the master for completion and clears the control word;
    // throws the timeout after the last poll.
    void resetHandshake(uint32_t handle, const uint8_t* strobe, const uint8_t* hold);
    void resetSystemClock(uint32_t handle);
    // Refuses what the master cannot carry out as asked; nothing has been sent yet.
    void checkTransfer(const ORV_SLAVE_REF& slaveRef, uint32_t address) const;
    void checkBurstCount(uint32_t count) const;
    // Refuses a burst whose incrementing address would run past the last bus address.
    void checkBurstEnd(uint32_t address, uint32_t incrAddress, uint32_t count) const;
    void deliverStatus(uint32_t handle, const ORV_SLAVE_REF& slaveRef, uint32_t* status);
    uint32_t runCommand(uint32_t handle, uint32_t cmd, const uint8_t* dataIn, uint8_t* dataOut,
                        uint32_t bitCount);

    const ORV_CORE_REF coreRef_;
    const uint32_t slaveCount_;
};

}  // namespace OrvRT
