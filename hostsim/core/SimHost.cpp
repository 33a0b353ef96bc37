// What a host application drives: the board behind every session, the end of a session and
// a fresh host for tests.
#include <atomic>
#include <mutex>

#include "host/OrvCore.h"
#include "host/OrvJtag.h"
#include "hostsim/Sim.h"
#include "hostsim/board/Board.h"
#include "hostsim/core/CoreSessions.h"
#include "hostsim/jtag/JtagSession.h"

namespace OrvSim {

namespace {
std::mutex boardMutex;
std::atomic<bool> boardRefuses{false};
// Never destroyed: plug-in code may still reach the host while the process ends.
std::shared_ptr<Board>& currentBoard() {
    static auto* board = new std::shared_ptr<Board>();
    return *board;
}
}  // namespace

void setBoard(std::shared_ptr<Board> board) {
    std::shared_ptr<Board> old;
    {
        std::lock_guard<std::mutex> guard(boardMutex);
        old = std::move(currentBoard());
        boardRefuses.store(board != nullptr && board->hasFailingCommands());
        currentBoard() = std::move(board);
    }
    // The old board goes away outside the lock.
}

bool boardMayRefuseCommands() { return boardRefuses.load(std::memory_order_relaxed); }

std::shared_ptr<Board> getBoard() {
    std::lock_guard<std::mutex> guard(boardMutex);
    return currentBoard();
}

void endSession(uint32_t handle) {
    const std::shared_ptr<JtagSession> session = JtagSession::get(handle);
    notifySessionEnded(handle);
    // A call still running in the session finishes first: its cores and queued writes must not
    // go from under it. Listeners are told before, so that one may wait for that call.
    session->lockTarget(UINT32_MAX);
    for (OrvRT::Orv_Core* core : takeSessionCores(handle)) delete core;
    session->end();
    JtagSession::forget(handle);
    session->unlockTarget();
}

void resetHost() {
    for (uint32_t handle : JtagSession::handles()) endSession(handle);
    forgetListeners();
    setMessageSink(nullptr);
    setTraceSink(nullptr);
    setBoard(nullptr);
    setDataDir(std::string());
}

}  // namespace OrvSim
