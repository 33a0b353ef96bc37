// Test fixture for the bus: the stand-in host with tracing on, an empty bus list, and
// helpers that build the expected trace lines of the master's commands.
#pragma once

#include <gtest/gtest.h>

#include <cstdint>
#include <string>
#include <vector>

#include "bus/OrvNebu_BusList.h"
#include "support/TestHost.h"

namespace OrvNebuBusTest {

class BusFixture : public TestHost {
protected:
    static constexpr uint32_t FAILED = 0x80000000u;

    void SetUp() override {
        TestHost::SetUp();
        forgetBuses();
        enableTrace();
    }

    // The bus list outlives every host; drop what an earlier test may have left in it.
    static void forgetBuses() {
        for (uint32_t h = 0; h < 256; ++h) OrvRT::OrvNebu_BusList::getBusList()->sessionEnded(h);
    }

    // A host that no longer knows any session or listener, with the same board.
    void freshHost(const std::string& json) {
        TestHost::SetUp();
        loadBoard(json);
        enableTrace();
    }

    void clearLog() {
        clearMessages();
        clearTrace();
    }

    std::vector<std::string> jtag() const { return traceStartingWith("jtag "); }

    // Expects exactly one message, with this severity and text.
    void expectOnlyMessage(uint32_t severity, const std::string& text) {
        const auto all = messages();
        ASSERT_EQ(all.size(), 1u) << joined();
        EXPECT_EQ(all[0].severity, severity);
        EXPECT_EQ(all[0].text, text);
    }

    std::string joined() const {
        std::string all;
        for (const auto& line : trace()) all += line + "\n";
        for (const auto& m : messages())
            all += "message " + std::to_string(m.severity) + ": " + m.text + "\n";
        return all;
    }
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
