// What a host application drives: the board behind every session, the end of a session and
// a fresh host for tests.
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
        currentBoard() = std::move(board);
    }
    // The old board goes away outside the lock.
}

std::shared_ptr<Board> getBoard() {
    std::lock_guard<std::mutex> guard(boardMutex);
    return currentBoard();
}

void endSession(uint32_t handle) {
    JtagSession& session = JtagSession::get(handle);
    for (OrvRT::SessionMessageListener* listener : listenersSnapshot()) {
        listener->sessionEnded(handle);
    }
    for (OrvRT::Orv_Core* core : takeSessionCores(handle)) delete core;
    session.end();
}

void resetHost() {
    // Only the sessions used since the last reset can hold anything: a process that has seen
    // many handles (a fuzzer) does not pay for all of them on every reset.
    const std::vector<uint32_t> used = JtagSession::usedHandles();
    for (uint32_t handle : used) endSession(handle);
    setMessageSink(nullptr);
    setTraceSink(nullptr);
    setBoard(nullptr);
    setDataDir(std::string());
    for (uint32_t handle : used) JtagSession::get(handle).reset();
}

}  // namespace OrvSim
