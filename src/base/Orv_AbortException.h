// The abort exception: thrown by a component that has already reported its own failure on
// the session channel, so that the exported frame reports only the abort.
#pragma once

#include <stdexcept>

namespace OrvRT {

class Orv_AbortException : public std::logic_error {
public:
    static constexpr const char* MESSAGE = "Orv abort command";
    Orv_AbortException() : std::logic_error(MESSAGE) {}
};

}  // namespace OrvRT
