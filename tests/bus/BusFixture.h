// Test fixture for the bus: a stand-in host with a board from JSON text, one ordered log of
// trace lines and session messages, and helpers to build the expected trace lines.
#pragma once

#include <gtest/gtest.h>

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "hostsim/board/Board.h"
#include "bus/OrvNebu_BusList.h"
#include "hostsim/Sim.h"

namespace OrvNebuBusTest {

struct Message {
    uint32_t handle;
    uint32_t severity;
    std::string text;
};

class BusFixture : public ::testing::Test {
protected:
    static constexpr uint32_t FAILED = 0x80000000u;
    static constexpr uint32_t LAST_HANDLE = 8;

    void SetUp() override {
        forgetBuses();
        freshHost();
    }

    // A host that knows no session, listener or core; the board and the sinks are set again.
    void freshHost() {
        OrvSim::resetHost();
        if (board) OrvSim::setBoard(board);
        OrvSim::setMessageSink([this](uint32_t handle, uint32_t severity, const std::string& text) {
            messages.push_back({handle, severity, text});
            log.push_back("message " + std::to_string(severity) + ": " + text);
        });
        OrvSim::setTraceSink([this](const std::string& line) { log.push_back(line); });
    }

    void TearDown() override {
        for (uint32_t h = 1; h <= LAST_HANDLE; ++h) OrvSim::endSession(h);
        forgetBuses();
        OrvSim::resetHost();
    }

    // The bus list outlives every host; drop what an earlier test may have left in it.
    static void forgetBuses() {
        for (uint32_t h = 0; h < 256; ++h)
            OrvRT::OrvNebu_BusList::getBusList()->sessionEnded(h);
    }

    void loadBoard(const std::string& json) {
        board = OrvSim::Board::loadText(json, "test board");
        OrvSim::setBoard(board);
    }

    void clearLog() {
        log.clear();
        messages.clear();
    }

    // The lines of the log that are JTAG trace lines.
    std::vector<std::string> jtag() const {
        std::vector<std::string> lines;
        for (const auto& line : log)
            if (line.rfind("jtag ", 0) == 0) lines.push_back(line);
        return lines;
    }

    // Expects exactly one message, with this severity and text.
    void expectOnlyMessage(uint32_t severity, const std::string& text) {
        ASSERT_EQ(messages.size(), 1u) << joined();
        EXPECT_EQ(messages[0].severity, severity);
        EXPECT_EQ(messages[0].text, text);
    }

    std::string joined() const {
        std::string all;
        for (const auto& line : log) all += line + "\n";
        return all;
    }

    std::shared_ptr<OrvSim::Board> board;
    std::vector<std::string> log;
    std::vector<Message> messages;
};

// "0x" and ceil(bits/4) upper-case hexadecimal digits of value.
inline std::string hexBits(uint64_t value, uint32_t bits) {
    static const char digits[] = "0123456789ABCDEF";
    std::string text;
    for (uint32_t d = (bits + 3) / 4; d-- > 0;) text += digits[(value >> (4 * d)) & 0xF];
    return "0x" + text;
}

inline std::string jtagWrite(uint32_t cmd, uint32_t bits, uint64_t value) {
    return "jtag write cmd=" + std::to_string(cmd) + " bits=" + std::to_string(bits) +
           " data=" + hexBits(value, bits);
}

inline std::string jtagRead(uint32_t cmd, uint32_t bits, uint64_t value) {
    return "jtag read cmd=" + std::to_string(cmd) + " bits=" + std::to_string(bits) +
           " data=" + hexBits(value, bits);
}

}  // namespace OrvNebuBusTest
