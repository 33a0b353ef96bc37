// Test fixture for the bus: the stand-in host with tracing on and an empty bus list.
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
        // The bus list outlives every host; drop what an earlier test may have left in it.
        for (uint32_t h = 0; h < 256; ++h) OrvRT::OrvNebu_BusList::getBusList()->sessionEnded(h);
        enableTrace();
    }

    void clearLog() {
        clearMessages();
        clearTrace();
    }

    std::vector<std::string> jtag() const { return traceStartingWith("jtag "); }

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

}  // namespace OrvNebuBusTest
