// Test support for the virtual board: drives a bus master core with raw commands, the way the
// host's core command channel does, and builds the words the plug-in sends.
#pragma once

#include <gtest/gtest.h>

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "hostsim/board/Board.h"

namespace boardtest {

// bitCount bits of value, least significant first, in a byte array.
inline std::vector<uint8_t> bitsOf(uint64_t value, uint32_t bitCount) {
    std::vector<uint8_t> bytes((bitCount + 7) / 8, 0);
    for (uint32_t k = 0; k < bitCount && k < 64; ++k) {
        if ((value >> k) & 1u) bytes[k / 8] = uint8_t(bytes[k / 8] | (1u << (k % 8)));
    }
    return bytes;
}

inline uint64_t valueOf(const std::vector<uint8_t>& bytes, uint32_t bitCount) {
    uint64_t value = 0;
    for (uint32_t k = 0; k < bitCount && k < 64; ++k) {
        if ((bytes[k / 8] >> (k % 8)) & 1u) value |= uint64_t(1) << k;
    }
    return value;
}

inline bool bitAt(const std::vector<uint8_t>& bytes, uint32_t k) {
    return k / 8 < bytes.size() && ((bytes[k / 8] >> (k % 8)) & 1u) != 0;
}

// A board with one bus master at device 0, chain 1, core `masterCore`.
class BoardBus : public ::testing::Test {
protected:
    static constexpr uint32_t DEV = 0;
    static constexpr uint32_t CHAIN = 1;

    // master: the body of the master object (without braces), behind a {type 3} core.
    void loadMaster(const std::string& master) {
        board = OrvSim::Board::loadText(
            R"({"devices":[{"chains":{"1":{"cores":[{"type":3},{"type":14,"master":{)" + master +
                "}}]}}}]}",
            "test.json");
        slaveCount = 0;
        std::vector<uint8_t> bits(20, 0);
        uint32_t info[5];
        ASSERT_TRUE(board->coreStatus(DEV, CHAIN, masterCore, info, bits.data(), 160));
        slaveCount = uint32_t((bits[7] >> 4) | ((bits[8] & 0xFu) << 4));  // bits 60..67
    }

    void write(uint32_t cmd, const std::vector<uint8_t>& bytes, uint32_t bitCount) {
        ASSERT_TRUE(
            board->runCommand(DEV, CHAIN, masterCore, cmd, bytes.data(), nullptr, bitCount));
    }
    void write(uint32_t cmd, uint64_t value, uint32_t bitCount) {
        write(cmd, bitsOf(value, bitCount), bitCount);
    }
    std::vector<uint8_t> readBytes(uint32_t cmd, uint32_t bitCount) {
        // One spare byte filled with a marker shows that nothing is written past the bits.
        std::vector<uint8_t> bytes((bitCount + 7) / 8 + 1, 0xA5);
        EXPECT_TRUE(
            board->runCommand(DEV, CHAIN, masterCore, cmd, nullptr, bytes.data(), bitCount));
        EXPECT_EQ(bytes.back(), 0xA5) << "read wrote past its bits";
        bytes.pop_back();
        return bytes;
    }
    uint64_t read(uint32_t cmd, uint32_t bitCount) {
        return valueOf(readBytes(cmd, bitCount), bitCount);
    }

    // The words of the plug-in's command primitives.
    void transferControl(uint32_t count, bool burst, bool incr, bool broadcast, uint32_t slave) {
        write(4,
              (count & 0x1FFFFu) | (uint64_t(burst) << 17) | (uint64_t(incr) << 18) |
                  (uint64_t(broadcast) << 19) | (uint64_t(slave & 0xFFu) << 20),
              29);
    }
    void address(bool isWrite, uint32_t addr) {
        write(5, (addr & 0x1FFFFu) | (uint64_t(isWrite) << 17), 19);
    }

    uint16_t singleRead(uint32_t slave, uint32_t addr) {
        transferControl(0, false, false, false, slave);
        address(false, addr);
        return uint16_t(read(6, 16));
    }
    void singleWrite(uint32_t slave, uint32_t addr, uint16_t value) {
        transferControl(0, false, false, false, slave);
        address(true, addr);
        write(6, value, 18);
    }
    std::vector<uint16_t> burstRead(uint32_t slave, uint32_t addr, bool incr, uint32_t n) {
        transferControl(n, true, incr, false, slave);
        address(false, addr);
        std::vector<uint8_t> bytes = readBytes(6, n * 16);
        std::vector<uint16_t> words;
        for (uint32_t i = 0; i < n; ++i)
            words.push_back(uint16_t(bytes[2 * i] | (bytes[2 * i + 1] << 8)));
        return words;
    }
    void burstWrite(uint32_t slave, uint32_t addr, bool incr, const std::vector<uint16_t>& words,
                    bool broadcast = false) {
        transferControl(uint32_t(words.size()), true, incr, broadcast, slave);
        address(true, addr);
        std::vector<uint8_t> bytes(2 * words.size() + 1, 0);
        for (size_t i = 0; i < words.size(); ++i) {
            bytes[2 * i] = uint8_t(words[i] & 0xFFu);
            bytes[2 * i + 1] = uint8_t(words[i] >> 8);
        }
        write(6, bytes, uint32_t(words.size() * 16 + 2));
    }

    // Reset control word with the given bits set (bit 0 strobe, i + 1 slave i, slaveCount + 1 bus).
    std::vector<uint8_t> resetWord(const std::vector<uint32_t>& setBits) {
        std::vector<uint8_t> bytes((slaveCount + 2 + 7) / 8, 0);
        for (uint32_t k : setBits) bytes[k / 8] = uint8_t(bytes[k / 8] | (1u << (k % 8)));
        return bytes;
    }
    // The handshake's two writes: with the strobe, then without it.
    void strobeReset(const std::vector<uint32_t>& targets) {
        std::vector<uint32_t> withStrobe = targets;
        withStrobe.push_back(0);
        write(1, resetWord(withStrobe), slaveCount + 2);
        write(1, resetWord(targets), slaveCount + 2);
    }
    void busReset() { strobeReset({slaveCount + 1}); }
    uint32_t masterStatus() { return uint32_t(read(2, 4)); }
    // Command 3: bits 0 and 1 bus, bit i + 2 slave i.
    std::vector<uint8_t> errorBits() { return readBytes(3, slaveCount + 2); }
    uint32_t busErrors() { return uint32_t(valueOf(errorBits(), 2)); }
    bool slaveError(uint32_t slave) { return bitAt(errorBits(), slave + 2); }

    std::shared_ptr<OrvSim::Board> board;
    uint32_t masterCore = 1;
    uint32_t slaveCount = 0;
};

}  // namespace boardtest
