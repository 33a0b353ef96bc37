// The frame every exported function runs in: the target lock, exception translation into
// one session message and the failure code, and target lookup.
#pragma once

#include <cstdint>
#include <exception>

#include "bus/OrvNebu_BusList.h"
#include "host/OrvJtag.h"
#include "host/OrvTypes.h"

namespace OrvRT {

class OrvNebu_Slave;

constexpr uint32_t ORVNEBU_RC_OK = 0x00000000u;
constexpr uint32_t ORVNEBU_RC_FAILED = 0x80000000u;
constexpr uint32_t ORVNEBU_LOCK_TIMEOUT = 60000;
constexpr uint32_t ORVNEBU_SEVERITY_ERROR = 256;
constexpr uint32_t ORVNEBU_SEVERITY_ABORT = 32768;

// Sends the message for the exception in flight; returns the failure code. Call only from a
// catch block.
uint32_t reportCurrentException(uint32_t handle) noexcept;

// Runs body without the target lock; nothing escapes.
template <class Body>
uint32_t unlockedFrame(uint32_t handle, Body&& body) noexcept {
    try {
        body();
        return ORVNEBU_RC_OK;
    } catch (...) {
        return reportCurrentException(handle);
    }
}

// Runs body holding the session's target lock; the lock is released before any message.
template <class Body>
uint32_t lockedFrame(uint32_t handle, Body&& body) noexcept {
    try {
        OrvJtagTargetLock lock(handle, ORVNEBU_LOCK_TIMEOUT);
        body();
        return ORVNEBU_RC_OK;
    } catch (...) {
        return reportCurrentException(handle);
    }
}

// Throws std::logic_error(message) unless ok.
void checkArgument(bool ok, const char* message);

// The slave object registered under the reference; throws when there is none.
OrvNebu_Slave& resolveSlave(uint32_t handle, const ORV_SLAVE_REF& slaveRef);

// The transaction object of a bus, to hold while it is used; throws when there is no bus.
OrvNebu_TransactionPtr busOf(uint32_t handle, uint32_t device, uint32_t userChain);

}  // namespace OrvRT
