// The stand-in host's JTAG sessions: the queue of pending writes, counters and trace lines.
#include "hostsim/jtag/JtagSession.h"

#include <chrono>
#include <cstring>
#include <map>
#include <memory>
#include <stdexcept>

#include "hostsim/jtag/SessionRegistry.h"

namespace OrvSim {

namespace {

// Never destroyed: plug-in code may still reach the host while the process ends.
SessionRegistry<JtagSession>& registry() {
    static auto* sessions = new SessionRegistry<JtagSession>();
    return *sessions;
}

// "0x" and ceil(bitCount/4) upper-case digits of the bits, bit k of the text's number being
// bit k of the word.
void appendBitsHex(std::string& line, const uint8_t* bits, uint32_t bitCount) {
    static const char DIGITS[] = "0123456789ABCDEF";
    line += "0x";
    const uint32_t digits = bitCount / 4u + (bitCount % 4u != 0 ? 1u : 0u);
    for (uint32_t d = digits; d-- > 0;) {
        unsigned nibble = (bits[d / 2u] >> ((d % 2u) * 4u)) & 0xFu;
        const uint32_t firstBit = d * 4u;
        if (bitCount - firstBit < 4u) nibble &= (1u << (bitCount - firstBit)) - 1u;
        line += DIGITS[nibble];
    }
}

void traceCommand(const char* kind, const JtagCommand& command, const uint8_t* bits) {
    std::string line;
    line.reserve(48 + command.bitCount / 4u);
    line += "jtag ";
    line += kind;
    line += " cmd=";
    line += std::to_string(command.cmd);
    line += " bits=";
    line += std::to_string(command.bitCount);
    line += " data=";
    appendBitsHex(line, bits, command.bitCount);
    traceLine(line);
}

size_t byteCount(uint32_t bitCount) {
    return static_cast<size_t>(bitCount / 8u + (bitCount % 8u != 0 ? 1u : 0u));
}

}  // namespace

std::shared_ptr<JtagSession> JtagSession::get(uint32_t handle) { return registry().get(handle); }

std::vector<uint32_t> JtagSession::handles() { return registry().handles(); }

void JtagSession::forget(uint32_t handle) {
    // Destroyed here, outside the registry, unless a call still holds it.
    registry().drop(handle);
}

void JtagSession::queueWrite(JtagWriteRunner runner, void* context, const JtagCommand& command,
                             const uint8_t* bits) {
    std::lock_guard<std::recursive_mutex> guard(mutex_);
    const size_t size = byteCount(command.bitCount);
    const size_t offset = bytes_.size();
    bytes_.insert(bytes_.end(), bits, bits + size);
    pending_.push_back(Pending{runner, context, command, offset});
    ++stats_.commands;
    stats_.writeBits += command.bitCount;
    if (traceEnabled()) traceCommand("write", command, bits);
}

void JtagSession::runPendingLocked() {
    // A sink that flushes from inside a flush finds the queue already being sent.
    if (running_ || pending_.empty()) return;
    running_ = true;
    try {
        for (const Pending& p : pending_) p.runner(p.context, p.command, bytes_.data() + p.offset);
    } catch (...) {
        running_ = false;
        pending_.clear();
        bytes_.clear();
        throw;
    }
    running_ = false;
    pending_.clear();
    bytes_.clear();
}

void JtagSession::sendQueued() {
    std::lock_guard<std::recursive_mutex> guard(mutex_);
    runPendingLocked();
}

void JtagSession::flush() {
    std::lock_guard<std::recursive_mutex> guard(mutex_);
    ++stats_.flushes;
    if (!pending_.empty()) ++stats_.roundTrips;
    if (traceEnabled()) traceLine("jtag flush");
    runPendingLocked();
}

void JtagSession::readDone(const JtagCommand& command, const uint8_t* data) {
    std::lock_guard<std::recursive_mutex> guard(mutex_);
    ++stats_.commands;
    stats_.readBits += command.bitCount;
    ++stats_.roundTrips;
    if (traceEnabled()) traceCommand("read", command, data);
}

void JtagSession::coreStatusRead(uint32_t device, uint32_t chain, uint32_t core, uint32_t type,
                                 bool found) {
    std::lock_guard<std::recursive_mutex> guard(mutex_);
    ++stats_.statusReads;
    ++stats_.roundTrips;
    if (found && traceEnabled()) {
        traceLine("jtag status device=" + std::to_string(device) +
                  " chain=" + std::to_string(chain) + " core=" + std::to_string(core) +
                  " type=" + std::to_string(type));
    }
}

void JtagSession::coreCountRead() {
    std::lock_guard<std::recursive_mutex> guard(mutex_);
    ++stats_.statusReads;
    ++stats_.roundTrips;
}

JtagStats JtagSession::takeStats() {
    std::lock_guard<std::recursive_mutex> guard(mutex_);
    JtagStats taken = stats_;
    stats_ = JtagStats();
    return taken;
}

void JtagSession::end() {
    std::lock_guard<std::recursive_mutex> guard(mutex_);
    if (!pending_.empty()) ++stats_.roundTrips;
    runPendingLocked();
    std::vector<Pending>().swap(pending_);
    std::vector<uint8_t>().swap(bytes_);
}

void JtagSession::lockTarget(uint32_t timeout) {
    if (!targetLock_.try_lock_for(std::chrono::milliseconds(timeout))) {
        throw std::runtime_error("Timed out after " + std::to_string(timeout) +
                                 " ms waiting for the JTAG target of session " +
                                 std::to_string(handle_) + ".");
    }
    if (depth_++ == 0) holder_.store(std::this_thread::get_id());
    std::lock_guard<std::recursive_mutex> guard(mutex_);
    ++takesByTimeout_[timeout];
}

void JtagSession::unlockTarget() {
    if (--depth_ == 0) holder_.store(std::thread::id());
    targetLock_.unlock();
}

void JtagSession::noteHostCall() {
    const bool held = holder_.load(std::memory_order_relaxed) == std::this_thread::get_id();
    (held ? callsHeld_ : callsUnheld_).fetch_add(1, std::memory_order_relaxed);
}

TargetLockUse JtagSession::takeLockUse() {
    std::lock_guard<std::recursive_mutex> guard(mutex_);
    TargetLockUse taken;
    taken.takesByTimeout.swap(takesByTimeout_);
    taken.callsHeld = callsHeld_.exchange(0);
    taken.callsUnheld = callsUnheld_.exchange(0);
    return taken;
}

}  // namespace OrvSim
