// The exported frame: exception translation into one message with its severity and the
// failure code, and the lock released before the message goes out.
#include <gtest/gtest.h>

#include <functional>
#include <future>
#include <stdexcept>
#include <string>

#include "api/OrvNebu_Frame.h"
#include "base/Orv_AbortException.h"
#include "bus/BusFixture.h"
#include "host/OrvJtag.h"

namespace OrvNebuBusTest {
namespace {

using OrvRT::lockedFrame;
using OrvRT::unlockedFrame;

class FrameTest : public BusFixture {};

TEST_F(FrameTest, ExceptionsBecomeOneMessageWithTheirSeverity) {
    struct Case {
        const char* name;
        std::function<void()> body;
        uint32_t severity;
        std::string text;
    };
    const Case cases[] = {
        {"abort", [] { throw OrvRT::Orv_AbortException(); }, 32768, "Orv abort command"},
        {"abort text in a plain logic error", [] { throw std::logic_error("Orv abort command"); },
         32768, "Orv abort command"},
        {"longer text", [] { throw std::logic_error("Orv abort command."); }, 256,
         "Orv abort command."},
        {"shorter text", [] { throw std::runtime_error("Orv abort"); }, 256, "Orv abort"},
        {"other standard exception", [] { throw std::out_of_range("bad index"); }, 256,
         "bad index"},
        {"not a standard exception", [] { throw 42; }, 256, "Orv internal error."},
        {"a string", [] { throw std::string("text"); }, 256, "Orv internal error."},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        clearLog();
        EXPECT_EQ(lockedFrame(3, c.body), FAILED);
        auto sent = messages();
        ASSERT_EQ(sent.size(), 1u);
        EXPECT_EQ(sent[0].handle, 3u);
        EXPECT_EQ(sent[0].severity, c.severity);
        EXPECT_EQ(sent[0].text, c.text);

        clearLog();
        EXPECT_EQ(unlockedFrame(4, c.body), FAILED);
        sent = messages();
        ASSERT_EQ(sent.size(), 1u);
        EXPECT_EQ(sent[0].handle, 4u);
        EXPECT_EQ(sent[0].severity, c.severity);
        EXPECT_EQ(sent[0].text, c.text);
    }
    clearLog();
    EXPECT_EQ(lockedFrame(3, [] {}), 0u);
    EXPECT_TRUE(messages().empty());
}

TEST_F(FrameTest, TheLockIsHeldForTheBodyAndReleasedBeforeTheMessage) {
    // Another thread trying the lock: it fails while this thread holds it.
    auto otherThreadGetsLock = [] {
        return std::async(std::launch::async,
                          [] {
                              try {
                                  OrvRT::OrvJtagTargetLock lock(5, 50);
                                  return true;
                              } catch (const std::exception&) {
                                  return false;
                              }
                          })
            .get();
    };
    bool duringBody = true;
    bool duringMessage = false;
    OrvSim::setMessageSink(
        [&](uint32_t, uint32_t, const std::string&) { duringMessage = otherThreadGetsLock(); });
    EXPECT_EQ(lockedFrame(5,
                          [&] {
                              duringBody = otherThreadGetsLock();
                              throw std::logic_error("failed");
                          }),
              FAILED);
    EXPECT_FALSE(duringBody);
    EXPECT_TRUE(duringMessage);
}

TEST_F(FrameTest, ASinkThatThrowsDoesNotEscape) {
    OrvSim::setMessageSink([](uint32_t, uint32_t, const std::string&) { throw 1; });
    EXPECT_EQ(lockedFrame(3, [] { throw std::logic_error("x"); }), FAILED);
}

}  // namespace
}  // namespace OrvNebuBusTest
