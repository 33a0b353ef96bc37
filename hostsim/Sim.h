// What a host application (the nebu console, the tests) uses to run the stand-in host:
// the board behind every session, the data directory, message and trace sinks, counters and
// the end of a session. The plug-in never includes this.
#pragma once

#include <cstdint>
#include <functional>
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

// The host's end of a session: every registered SessionMessageListener gets sessionEnded,
// then the session's core list (and the cores in it) is dropped and its queued writes are
// sent before the queue is dropped. Counters stay.
ORV_CORE_API void endSession(uint32_t handle);

// Ends every session used so far, then forgets sinks, board, data directory and counters: a
// fresh host, for tests. Listeners stay registered (they are process-wide plug-in objects).
ORV_CORE_API void resetHost();

}  // namespace OrvSim
