// The stand-in host's JTAG sessions: the queue of pending writes, counters and trace lines.
#include "hostsim/jtag/JtagSession.h"

#include <cstring>
#include <map>
#include <memory>
#include <set>

namespace OrvSim {

namespace {

std::mutex registryMutex;
// Sessions live until the process ends: references handed out stay valid.
std::map<uint32_t, std::unique_ptr<JtagSession>>& registry() {
    static auto* sessions = new std::map<uint32_t, std::unique_ptr<JtagSession>>();
    return *sessions;
}

// The handles of the sessions whose used_ is set.
std::set<uint32_t>& usedSet() {
    static auto* handles = new std::set<uint32_t>();
    return *handles;
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

JtagSession& JtagSession::get(uint32_t handle) {
    // Most calls come for the session of the previous call on the same thread.
    thread_local JtagSession* last = nullptr;
    if (last != nullptr && last->handle_ == handle && last->used_.load(std::memory_order_relaxed))
        return *last;
    std::lock_guard<std::mutex> guard(registryMutex);
    auto& slot = registry()[handle];
    if (!slot) slot.reset(new JtagSession(handle));
    last = slot.get();
    if (!last->used_.exchange(true)) usedSet().insert(handle);
    return *last;
}

std::vector<uint32_t> JtagSession::usedHandles() {
    std::lock_guard<std::mutex> guard(registryMutex);
    return std::vector<uint32_t>(usedSet().begin(), usedSet().end());
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

void JtagSession::reset() {
    std::lock_guard<std::recursive_mutex> guard(mutex_);
    pending_.clear();
    bytes_.clear();
    stats_ = JtagStats();
    std::lock_guard<std::mutex> registryGuard(registryMutex);
    used_.store(false);
    usedSet().erase(handle_);
}

}  // namespace OrvSim
