// One session of the stand-in host's JTAG library: target lock, queue of pending writes,
// counters and trace. The core library pushes type-erased writes; a flush runs them.
#pragma once

#include <atomic>
#include <cstdint>
#include <mutex>
#include <string>
#include <vector>

#include "host/OrvExport.h"
#include "host/OrvJtag.h"
#include "hostsim/Sim.h"

namespace OrvSim {

// Where a command goes and what it shifts.
struct JtagCommand {
    uint32_t device;
    uint32_t chain;
    uint32_t core;
    uint32_t cmd;
    uint32_t bitCount;
};

// Carries out one queued write; context is what was given with it. The result is not used
// (a write that reached no core is simply lost, as on a cable).
using JtagWriteRunner = void (*)(void* context, const JtagCommand& command, const uint8_t* bits);

class ORV_JTAG_API JtagSession {
public:
    // The session of handle, created on first use. Sessions are never destroyed, so the
    // reference stays valid for the life of the process.
    static JtagSession& get(uint32_t handle);
    // The handles used since their session was last reset, ascending: what a fresh host has
    // to end, however many sessions the process has seen.
    static std::vector<uint32_t> usedHandles();

    uint32_t handle() const { return handle_; }

    // Queues a write (bits copied) and prints its trace line.
    void queueWrite(JtagWriteRunner runner, void* context, const JtagCommand& command,
                    const uint8_t* bits);
    // Sends what is queued without counting a round trip of its own (a read carries it).
    void sendQueued();
    // OrvJtag_target_flush: counts, traces and sends.
    void flush();
    // After a read has returned its bits in data (call sendQueued before it): counts, traces.
    void readDone(const JtagCommand& command, const uint8_t* data);
    // A core status read; traced only when it found the core (type is its core type).
    void coreStatusRead(uint32_t device, uint32_t chain, uint32_t core, uint32_t type, bool found);
    // A core count read: counted, not traced.
    void coreCountRead();

    JtagStats takeStats();
    // Sends what is queued (a closing cable flushes), then empties the queue. Counters stay.
    void end();
    // Counters back to zero as well, for a fresh host; the session counts as unused again.
    void reset();

    std::recursive_timed_mutex& targetLock() { return targetLock_; }

    JtagSession(const JtagSession&) = delete;
    JtagSession& operator=(const JtagSession&) = delete;

private:
    explicit JtagSession(uint32_t handle) : handle_(handle) {}
    struct Pending {
        JtagWriteRunner runner;
        void* context;
        JtagCommand command;
        size_t offset;  // of its bits in bytes_
    };
    void runPendingLocked();

    const uint32_t handle_;
    std::atomic<bool> used_{false};
    std::recursive_timed_mutex targetLock_;
    // Guards the queue and counters; recursive so that a sink may read counters.
    std::recursive_mutex mutex_;
    std::vector<Pending> pending_;
    std::vector<uint8_t> bytes_;  // bits of all pending writes, reused
    bool running_ = false;
    JtagStats stats_;
};

// Whether a trace sink is set (cheap; checked before formatting a line).
ORV_JTAG_API bool traceEnabled();
// Sends a line to the trace sink, if any.
ORV_JTAG_API void traceLine(const std::string& line);
// The registered listeners, copied so that a listener may register another meanwhile.
ORV_JTAG_API std::vector<OrvRT::SessionMessageListener*> listenersSnapshot();

}  // namespace OrvSim
