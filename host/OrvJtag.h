// JTAG-session library of the host: the target lock, session messages, listeners, flush.
#pragma once

#include <cstdint>
#include <memory>

#include "host/OrvExport.h"

namespace OrvRT {

// Holds the session's JTAG target while it lives. The same thread may take it again while it
// holds it. timeout is in milliseconds; throws std::runtime_error when it runs out.
class ORV_JTAG_API OrvJtagTargetLock {
public:
    OrvJtagTargetLock(uint32_t handle, uint32_t timeout);
    ~OrvJtagTargetLock();
    OrvJtagTargetLock(const OrvJtagTargetLock&) = delete;
    OrvJtagTargetLock& operator=(const OrvJtagTargetLock&) = delete;

private:
    // The session's target, kept while it is held even if the session ends meanwhile.
    std::shared_ptr<void> target_;
};

// Receives the host's session notices. The host never deletes a listener.
class SessionMessageListener {
public:
    virtual void sessionNotice(uint32_t handle) = 0;
    virtual void sessionEnded(uint32_t handle) = 0;

protected:
    ~SessionMessageListener() = default;
};

// Registers a listener; registering one already registered does nothing. Returns the number
// of registered listeners.
ORV_JTAG_API uint32_t addSessionMessageListener(SessionMessageListener* listener);

}  // namespace OrvRT

extern "C" {
// Severities: 256 error, 512 malformed definition-file line, 32768 aborted command.
ORV_JTAG_API void OrvJtag_session_sendMessage(uint32_t handle, uint32_t severity, const char* text);
// Carries out every JTAG operation queued on the session's target.
ORV_JTAG_API void OrvJtag_target_flush(uint32_t handle);
}
