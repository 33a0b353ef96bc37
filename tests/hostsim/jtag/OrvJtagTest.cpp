// The stand-in host's JTAG-session library: the target lock, session messages and the
// listener registry with the end of a session.
#include <algorithm>
#include <deque>
#include <future>
#include <stdexcept>
#include <string>
#include <vector>

#include "host/OrvCore.h"
#include "host/OrvJtag.h"
#include "support/TestHost.h"

namespace {

using OrvRT::OrvJtagTargetLock;

// Counts the ends it hears of; registers a follower the first time, as the plug-in's bus
// list registers itself again from inside its own callbacks.
class RecordingListener : public OrvRT::SessionMessageListener {
public:
    void sessionNotice(uint32_t) override {}
    void sessionEnded(uint32_t handle) override {
        ended.push_back(handle);
        coreSeen = OrvRT::Orv_CoreList::getSlave(handle, &ref) != nullptr;
        if (follower != nullptr) {
            registeredInside = OrvRT::addSessionMessageListener(follower);
            follower = nullptr;
        }
    }
    std::vector<uint32_t> ended;
    ORV_SLAVE_REF ref{0, 1, 2};
    bool coreSeen = false;
    OrvRT::SessionMessageListener* follower = nullptr;
    uint32_t registeredInside = 0;
};

class OrvJtagTest : public TestHost {
protected:
    // Outlives the fresh host of TearDown, which still tells them of the ends.
    RecordingListener* newListener() { return &listeners_.emplace_back(); }

private:
    std::deque<RecordingListener> listeners_;
};

// Tries the lock of handle from another thread; the text of the failure, or "" when taken.
std::string lockFromOtherThread(uint32_t handle, uint32_t timeout) {
    return std::async(std::launch::async,
                      [=] {
                          try {
                              OrvJtagTargetLock lock(handle, timeout);
                              return std::string();
                          } catch (const std::runtime_error& e) {
                              return std::string(e.what());
                          }
                      })
        .get();
}

TEST_F(OrvJtagTest, TheSameCallerTakesTheLockAgainAnotherThreadTimesOut) {
    {
        OrvJtagTargetLock outer(HANDLE, 60000);
        OrvJtagTargetLock inner(HANDLE, 60000);  // nested, as exported calls nest
        const std::string failure = lockFromOtherThread(HANDLE, 20);
        EXPECT_EQ(failure, "Timed out after 20 ms waiting for the JTAG target of session 1.");
        // Other sessions have their own target.
        EXPECT_EQ(lockFromOtherThread(HANDLE + 1, 20), "");
    }
    // Released as often as taken: free for the other thread again.
    EXPECT_EQ(lockFromOtherThread(HANDLE, 60000), "");
}

TEST_F(OrvJtagTest, MessagesReachTheSinkWithHandleSeverityAndText) {
    OrvJtag_session_sendMessage(3, 256, "first\nline");
    OrvJtag_session_sendMessage(HANDLE, 32768, nullptr);
    const auto all = messages();
    ASSERT_EQ(all.size(), 2u);
    EXPECT_EQ(all[0].handle, 3u);
    EXPECT_EQ(all[0].severity, 256u);
    EXPECT_EQ(all[0].text, "first\nline");
    EXPECT_LAST_MESSAGE(SEVERITY_ABORT, "");
    EXPECT_EQ(lastMessage().handle, HANDLE);
    OrvSim::setMessageSink(nullptr);  // dropped without a sink
    OrvJtag_session_sendMessage(HANDLE, 256, "lost");
    EXPECT_FALSE(hasMessage(256, "lost"));
}

TEST_F(OrvJtagTest, ListenersRegisterOnceAndHearOfEverySessionEnd) {
    auto* first = newListener();
    auto* second = newListener();
    const uint32_t count = OrvRT::addSessionMessageListener(first);
    EXPECT_EQ(OrvRT::addSessionMessageListener(first), count);
    EXPECT_EQ(OrvRT::addSessionMessageListener(nullptr), count);
    second->follower = first;  // already registered: nothing changes from inside either
    EXPECT_EQ(OrvRT::addSessionMessageListener(second), count + 1);

    OrvSim::endSession(7);
    OrvSim::endSession(HANDLE);
    EXPECT_EQ(first->ended, (std::vector<uint32_t>{7, HANDLE}));
    EXPECT_EQ(second->ended, (std::vector<uint32_t>{7, HANDLE}));
    EXPECT_EQ(second->registeredInside, count + 1);
}

TEST_F(OrvJtagTest, AListenerRegisteredDuringAnEndHearsOfTheNextEnd) {
    auto* registrar = newListener();
    auto* late = newListener();
    registrar->follower = late;
    const uint32_t count = OrvRT::addSessionMessageListener(registrar);
    OrvSim::endSession(HANDLE);
    EXPECT_EQ(registrar->registeredInside, count + 1);
    EXPECT_TRUE(late->ended.empty());  // the end in progress went to the listeners before it
    OrvSim::endSession(HANDLE);
    EXPECT_EQ(late->ended, (std::vector<uint32_t>{HANDLE}));
    EXPECT_EQ(registrar->ended, (std::vector<uint32_t>{HANDLE, HANDLE}));
}

TEST_F(OrvJtagTest, ListenersHearOfTheEndBeforeTheCoresGo) {
    auto* listener = newListener();
    OrvRT::addSessionMessageListener(listener);
    ORV_CORE_REF ref{0, 1, 2};
    OrvRT::Orv_CoreList::addCore(HANDLE,
                                 new OrvRT::Orv_Core(HANDLE, ref, ORV_CORE_INFO{}, nullptr, 0));
    OrvSim::endSession(HANDLE);
    EXPECT_TRUE(listener->coreSeen);
    EXPECT_EQ(OrvRT::Orv_CoreList::getSlave(HANDLE, &listener->ref), nullptr);
}

TEST_F(OrvJtagTest, AFreshHostEndsEverySessionAndForgetsItsListeners) {
    auto* listener = newListener();
    OrvRT::addSessionMessageListener(listener);
    OrvJtag_target_flush(11);
    OrvJtag_target_flush(12);
    OrvSim::resetHost();
    std::sort(listener->ended.begin(), listener->ended.end());
    EXPECT_EQ(listener->ended, (std::vector<uint32_t>{11, 12}));
    EXPECT_EQ(OrvSim::takeStats(11).flushes, 0u);
    // The sinks are gone too.
    OrvJtag_session_sendMessage(HANDLE, 256, "after reset");
    EXPECT_FALSE(hasMessage(256, "after reset"));

    // The old registration is gone: a plug-in of the new host registers anew.
    listener->ended.clear();
    EXPECT_EQ(OrvRT::addSessionMessageListener(newListener()), 1u);
    OrvSim::resetHost();
    EXPECT_TRUE(listener->ended.empty());
}

}  // namespace
