// The test fixture that brings up the stand-in host: a fresh host per test, a board from JSON
// text, the data directory, and the session messages and trace lines recorded for checks.
#pragma once

#include <gtest/gtest.h>

#include <cstdint>
#include <initializer_list>
#include <memory>
#include <mutex>
#include <string>
#include <utility>
#include <vector>

#include "host/OrvTypes.h"
#include "hostsim/Sim.h"
#include "hostsim/board/Board.h"

class TestHost : public ::testing::Test {
public:
    // One session message as the host received it.
    struct Message {
        uint32_t handle;
        uint32_t severity;
        std::string text;
    };

    static constexpr uint32_t HANDLE = 1;  // the session tests use unless they say otherwise

protected:
    void SetUp() override;
    void TearDown() override;

    // Loads the board (Board::loadText) and puts it behind every session. Throws BoardError.
    std::shared_ptr<OrvSim::Board> loadBoard(const std::string& json);
    std::shared_ptr<OrvSim::Board> board() const { return board_; }
    // Defaults to NEBU_TEST_DATA_DIR.
    void setDataDir(const std::string& dir);

    // Session messages received so far, in order (every session).
    std::vector<Message> messages() const;
    void clearMessages();
    // Whether a message with that severity and exactly that text was received.
    ::testing::AssertionResult hasMessage(uint32_t severity, const std::string& text) const;
    // Whether the last message has that severity and exactly that text.
    ::testing::AssertionResult lastMessageIs(uint32_t severity, const std::string& text) const;
    ::testing::AssertionResult noMessages() const;

    // Records the trace lines from now on.
    void enableTrace();
    std::vector<std::string> trace() const;
    void clearTrace();
    // The recorded lines that start with prefix (e.g. "jtag write cmd=6").
    std::vector<std::string> traceStartingWith(const std::string& prefix) const;

    // A host map made with OrvContainer_hashmapCStr_new and filled; freed in TearDown.
    ORV_HASHMAP_HANDLE makeMap(
        std::initializer_list<std::pair<std::string, std::string>> entries = {});
    static OrvRT::Orv_HashMapCStr& mapOf(ORV_HASHMAP_HANDLE map) {
        return *static_cast<OrvRT::Orv_HashMapCStr*>(map);
    }

    // Counters of the session since the previous call.
    OrvSim::JtagStats stats(uint32_t handle = HANDLE) { return OrvSim::takeStats(handle); }

private:
    mutable std::mutex mutex_;  // the sinks may be called from other threads
    std::vector<Message> messages_;
    std::vector<std::string> trace_;
    std::vector<ORV_HASHMAP_HANDLE> maps_;
    std::shared_ptr<OrvSim::Board> board_;
};

// Message checks: severity and exact text.
#define EXPECT_MESSAGE(severity, text) EXPECT_TRUE(hasMessage((severity), (text)))
#define EXPECT_LAST_MESSAGE(severity, text) EXPECT_TRUE(lastMessageIs((severity), (text)))
#define EXPECT_NO_MESSAGES() EXPECT_TRUE(noMessages())
