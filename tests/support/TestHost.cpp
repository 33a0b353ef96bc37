// The stand-in host fixture's recording and set-up.
#include "support/TestHost.h"

#include "host/OrvCore.h"

void TestHost::SetUp() {
    OrvSim::resetHost();
    OrvSim::setMessageSink([this](uint32_t handle, uint32_t severity, const std::string& text) {
        std::lock_guard<std::mutex> guard(mutex_);
        messages_.push_back(Message{handle, severity, text});
    });
    setDataDir(NEBU_TEST_DATA_DIR);
}

void TestHost::TearDown() {
    // Ends every session used (listeners hear of it) and forgets board and sinks.
    OrvSim::resetHost();
    for (ORV_HASHMAP_HANDLE map : maps_) OrvContainer_hashmapCStr_delete(map);
    maps_.clear();
    board_.reset();
}

std::shared_ptr<OrvSim::Board> TestHost::loadBoard(const std::string& json) {
    board_ = OrvSim::Board::loadText(json, "test board");
    OrvSim::setBoard(board_);
    return board_;
}

void TestHost::setDataDir(const std::string& dir) { OrvSim::setDataDir(dir); }

std::vector<TestHost::Message> TestHost::messages() const {
    std::lock_guard<std::mutex> guard(mutex_);
    return messages_;
}

void TestHost::clearMessages() {
    std::lock_guard<std::mutex> guard(mutex_);
    messages_.clear();
}

namespace {
std::string describe(const std::vector<TestHost::Message>& messages) {
    std::string text = "messages:";
    for (const auto& m : messages) text += "\n  " + std::to_string(m.severity) + " " + m.text;
    return text;
}
}  // namespace

::testing::AssertionResult TestHost::hasMessage(uint32_t severity, const std::string& text) const {
    const auto all = messages();
    for (const auto& m : all) {
        if (m.severity == severity && m.text == text) return ::testing::AssertionSuccess();
    }
    return ::testing::AssertionFailure()
           << "no message " << severity << ": \"" << text << "\" among " << describe(all);
}

::testing::AssertionResult TestHost::lastMessageIs(uint32_t severity,
                                                   const std::string& text) const {
    const auto all = messages();
    if (!all.empty() && all.back().severity == severity && all.back().text == text) {
        return ::testing::AssertionSuccess();
    }
    return ::testing::AssertionFailure()
           << "last message is not " << severity << ": \"" << text << "\"; " << describe(all);
}

::testing::AssertionResult TestHost::noMessages() const {
    const auto all = messages();
    if (all.empty()) return ::testing::AssertionSuccess();
    return ::testing::AssertionFailure() << "expected no message; " << describe(all);
}

void TestHost::enableTrace() {
    OrvSim::setTraceSink([this](const std::string& line) {
        std::lock_guard<std::mutex> guard(mutex_);
        trace_.push_back(line);
    });
}

std::vector<std::string> TestHost::trace() const {
    std::lock_guard<std::mutex> guard(mutex_);
    return trace_;
}

void TestHost::clearTrace() {
    std::lock_guard<std::mutex> guard(mutex_);
    trace_.clear();
}

std::vector<std::string> TestHost::traceStartingWith(const std::string& prefix) const {
    std::vector<std::string> lines;
    for (const auto& line : trace()) {
        if (line.compare(0, prefix.size(), prefix) == 0) lines.push_back(line);
    }
    return lines;
}

ORV_HASHMAP_HANDLE TestHost::makeMap(
    std::initializer_list<std::pair<std::string, std::string>> entries) {
    ORV_HASHMAP_HANDLE map = OrvContainer_hashmapCStr_new();
    maps_.push_back(map);
    for (const auto& entry : entries) mapOf(map)[entry.first] = entry.second;
    return map;
}
