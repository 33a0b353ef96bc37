// The stand-in host's JTAG-session library: target lock, session messages, listeners, flush,
// and the sinks and counters a host application reads.
#include "host/OrvJtag.h"

#include <algorithm>
#include <atomic>
#include <mutex>
#include <string>
#include <vector>

#include "hostsim/Sim.h"
#include "hostsim/jtag/JtagSession.h"

namespace OrvSim {

namespace {

std::mutex sinkMutex;
std::atomic<bool> tracing{false};

// Never destroyed: a plug-in's static destructors may still send messages at exit.
MessageSink& messageSink() {
    static auto* sink = new MessageSink();
    return *sink;
}
TraceSink& traceSink() {
    static auto* sink = new TraceSink();
    return *sink;
}

// Recursive: a listener told of an end may register another.
std::recursive_mutex listenerMutex;
std::atomic<uint64_t> registrations{0};
std::vector<OrvRT::SessionMessageListener*>& listeners() {
    // Never destroyed: a plug-in unloaded at exit may still register.
    static auto* list = new std::vector<OrvRT::SessionMessageListener*>();
    return *list;
}

}  // namespace

void setMessageSink(MessageSink sink) {
    std::lock_guard<std::mutex> guard(sinkMutex);
    messageSink() = std::move(sink);
}

void setTraceSink(TraceSink sink) {
    std::lock_guard<std::mutex> guard(sinkMutex);
    tracing.store(static_cast<bool>(sink), std::memory_order_relaxed);
    traceSink() = std::move(sink);
}

bool traceEnabled() { return tracing.load(std::memory_order_relaxed); }

void traceLine(const std::string& line) {
    TraceSink sink;
    {
        std::lock_guard<std::mutex> guard(sinkMutex);
        sink = traceSink();
    }
    if (sink) sink(line);
}

JtagStats takeStats(uint32_t handle) { return JtagSession::get(handle)->takeStats(); }

TargetLockUse takeTargetLockUse(uint32_t handle) { return JtagSession::get(handle)->takeLockUse(); }

uint64_t listenerRegistrations() { return registrations.load(); }

void notifySessionEnded(uint32_t handle) {
    std::lock_guard<std::recursive_mutex> guard(listenerMutex);
    const std::vector<OrvRT::SessionMessageListener*> now = listeners();
    for (OrvRT::SessionMessageListener* listener : now) listener->sessionEnded(handle);
}

void forgetListeners() {
    std::lock_guard<std::recursive_mutex> guard(listenerMutex);
    listeners().clear();
}

}  // namespace OrvSim

namespace OrvRT {

OrvJtagTargetLock::OrvJtagTargetLock(uint32_t handle, uint32_t timeout) {
    std::shared_ptr<OrvSim::JtagSession> session = OrvSim::JtagSession::get(handle);
    session->lockTarget(timeout);
    target_ = std::move(session);
}

OrvJtagTargetLock::~OrvJtagTargetLock() {
    static_cast<OrvSim::JtagSession*>(target_.get())->unlockTarget();
}

uint32_t addSessionMessageListener(SessionMessageListener* listener) {
    ++OrvSim::registrations;
    std::lock_guard<std::recursive_mutex> guard(OrvSim::listenerMutex);
    auto& list = OrvSim::listeners();
    if (listener != nullptr && std::find(list.begin(), list.end(), listener) == list.end()) {
        list.push_back(listener);
    }
    return static_cast<uint32_t>(list.size());
}

}  // namespace OrvRT

extern "C" {

void OrvJtag_session_sendMessage(uint32_t handle, uint32_t severity, const char* text) {
    OrvSim::MessageSink sink;
    {
        std::lock_guard<std::mutex> guard(OrvSim::sinkMutex);
        sink = OrvSim::messageSink();
    }
    if (sink) sink(handle, severity, text != nullptr ? std::string(text) : std::string());
}

void OrvJtag_target_flush(uint32_t handle) {
    const std::shared_ptr<OrvSim::JtagSession> session = OrvSim::JtagSession::get(handle);
    session->noteHostCall();
    session->flush();
}

}  // extern "C"
