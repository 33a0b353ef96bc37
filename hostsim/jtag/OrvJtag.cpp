// The stand-in host's JTAG-session library: target lock, session messages, listeners, flush,
// and the sinks and counters a host application reads.
#include "host/OrvJtag.h"

#include <algorithm>
#include <atomic>
#include <chrono>
#include <mutex>
#include <stdexcept>
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

std::mutex listenerMutex;
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

JtagStats takeStats(uint32_t handle) { return JtagSession::get(handle).takeStats(); }

std::vector<OrvRT::SessionMessageListener*> listenersSnapshot() {
    std::lock_guard<std::mutex> guard(listenerMutex);
    return listeners();
}

}  // namespace OrvSim

namespace OrvRT {

OrvJtagTargetLock::OrvJtagTargetLock(uint32_t handle, uint32_t timeout) : handle_(handle) {
    auto& lock = OrvSim::JtagSession::get(handle).targetLock();
    if (!lock.try_lock_for(std::chrono::milliseconds(timeout))) {
        throw std::runtime_error("Timed out after " + std::to_string(timeout) +
                                 " ms waiting for the JTAG target of session " +
                                 std::to_string(handle) + ".");
    }
}

OrvJtagTargetLock::~OrvJtagTargetLock() { OrvSim::JtagSession::get(handle_).targetLock().unlock(); }

uint32_t addSessionMessageListener(SessionMessageListener* listener) {
    std::lock_guard<std::mutex> guard(OrvSim::listenerMutex);
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

void OrvJtag_target_flush(uint32_t handle) { OrvSim::JtagSession::get(handle).flush(); }

}  // extern "C"
