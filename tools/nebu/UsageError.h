// The console's usage error: a wrong command, option, argument, number or board file. The
// console prints it as one "nebu: " line on standard error and exits with status 2.
#pragma once

#include <stdexcept>

namespace nebu {

class UsageError : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

}  // namespace nebu
