// What a host application (the nebu console, the tests) uses to run the stand-in host:
// the board behind every session, the data directory, message and trace sinks, counters and
// the end of a session. The plug-in never includes this.
#pragma once

#include <cstdint>
#include <functional>
#include <map>
#include <memory>
#include <string>

#include "host/OrvExport.h"

namespace OrvSim {

class Board;

// The target every session talks to. Null: no device answers (core counts fail).
ORV_CORE_API void setBoard(std::shared_ptr<Board> board);
ORV_CORE_API std::shared_ptr<Board> getBoard();

// What Orv_Util::getVanduDataDirPath returns; a trailing separator is added when missing.
// Empty text forgets it ("./" again).
ORV_UTIL_API void setDataDir(const std::string& dir);

// Receives every OrvJtag_session_sendMessage. Default: none (messages are dropped).
using MessageSink = std::function<void(uint32_t handle, uint32_t severity, const std::string& text)>;
ORV_JTAG_API void setMessageSink(MessageSink sink);

// Receives one line per JTAG operation as it happens (console format, without newline).
// Null switches tracing off.
using TraceSink = std::function<void(const std::string& line)>;
ORV_JTAG_API void setTraceSink(TraceSink sink);

struct JtagStats {
    uint64_t commands = 0;     // core commands run (reads and writes)
    uint64_t writeBits = 0;    // bits shifted in by write commands
    uint64_t readBits = 0;     // bits shifted out by read commands
    uint64_t flushes = 0;      // OrvJtag_target_flush calls
    uint64_t statusReads = 0;  // core status reads and core count reads
    uint64_t roundTrips = 0;   // reads, status/count reads, flushes that had writes queued
};
// The session's counters since the previous call; resets them.
ORV_JTAG_API JtagStats takeStats(uint32_t handle);

// How a session's target lock was held since the previous call (which resets it), so that a
// test sees every host operation of a call made under the lock with the right timeout.
struct TargetLockUse {
    std::map<uint32_t, uint64_t> takesByTimeout;  // OrvJtagTargetLock takes, by timeout (ms)
    uint64_t callsHeld = 0;    // JTAG and core list operations made by the lock's holder
    uint64_t callsUnheld = 0;  // the same made by a caller that did not hold the lock
};
ORV_JTAG_API TargetLockUse takeTargetLockUse(uint32_t handle);

// addSessionMessageListener calls so far, each counted as it begins (before it waits for the
// listener registry, which the host holds while it tells listeners of a session end).
ORV_JTAG_API uint64_t listenerRegistrations();

// The host's end of a session: every registered SessionMessageListener gets sessionEnded,
// then the session's core list (and the cores in it) is dropped and its queued writes are
// sent; then the host forgets the session, counters included. A later use of the handle
// starts a new session.
ORV_CORE_API void endSession(uint32_t handle);

// Ends every session, then forgets listeners, sinks, board and data directory: a fresh host,
// for tests. A plug-in has to register its listeners again, as with a new host process.
ORV_CORE_API void resetHost();

}  // namespace OrvSim
