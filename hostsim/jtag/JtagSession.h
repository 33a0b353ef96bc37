// One session of the stand-in host's JTAG library: target lock, queue of pending writes,
// counters and trace. The core library pushes type-erased writes; a flush runs them.
#pragma once

#include <atomic>
#include <cstdint>
#include <map>
#include <memory>
#include <mutex>
#include <string>
#include <thread>
#include <vector>

#include "host/OrvExport.h"
#include "host/OrvJtag.h"
#include "hostsim/Sim.h"

namespace OrvSim {

template <class T>
class SessionRegistry;

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
    // The session of handle, created on first use and dropped by forget(). Holding the pointer
    // keeps an ended session's object alive, so a call that began before the end completes.
    static std::shared_ptr<JtagSession> get(uint32_t handle);
    // The handles of the sessions the host holds, ascending.
    static std::vector<uint32_t> handles();
    // Drops the host's entry of the session (what endSession leaves of it: nothing).
    static void forget(uint32_t handle);

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
    // Sends what is queued (a closing cable flushes), then empties the queue.
    void end();

    // The target lock: the same thread may take it again; throws std::runtime_error when the
    // timeout (ms) runs out. Each take and its timeout are recorded.
    void lockTarget(uint32_t timeout);
    void unlockTarget();
    // Records whether the caller of a host operation on the session holds its target.
    void noteHostCall();
    TargetLockUse takeLockUse();

    JtagSession(const JtagSession&) = delete;
    JtagSession& operator=(const JtagSession&) = delete;

private:
    template <class T>
    friend class SessionRegistry;
    explicit JtagSession(uint32_t handle) : handle_(handle) {}
    struct Pending {
        JtagWriteRunner runner;
        void* context;
        JtagCommand command;
        size_t offset;  // of its bits in bytes_
    };
    void runPendingLocked();

    const uint32_t handle_;
    std::recursive_timed_mutex targetLock_;
    std::atomic<std::thread::id> holder_{};
    uint32_t depth_ = 0;  // nested takes of the holder; only the holder touches it
    // Guards the queue, counters and lock record; recursive so that a sink may read counters.
    std::recursive_mutex mutex_;
    std::vector<Pending> pending_;
    std::vector<uint8_t> bytes_;  // bits of all pending writes, reused
    bool running_ = false;
    JtagStats stats_;
    std::map<uint32_t, uint64_t> takesByTimeout_;
    // Counted on every host operation, so without the mutex.
    std::atomic<uint64_t> callsHeld_{0};
    std::atomic<uint64_t> callsUnheld_{0};
};

// Whether a trace sink is set (cheap; checked before formatting a line).
ORV_JTAG_API bool traceEnabled();
// Sends a line to the trace sink, if any.
ORV_JTAG_API void traceLine(const std::string& line);
// Tells every registered listener that the session ended, holding the host's listener registry
// all the while, as a host may: a listener registered meanwhile hears of the next end.
ORV_JTAG_API void notifySessionEnded(uint32_t handle);
// Forgets every registered listener (a fresh host).
ORV_JTAG_API void forgetListeners();

}  // namespace OrvSim
