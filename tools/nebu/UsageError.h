// The console's usage error: a wrong command, option, argument, number or board file. The
// console prints it as one "nebu: " line on standard error and exits with status 2.
#pragma once

#include <stdexcept>
#include <string>

namespace nebu {

class UsageError : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

// The text with its line breaks written as \n and \r, so that an error stays one line.
inline std::string oneLine(const std::string& text) {
    std::string line;
    for (char c : text) {
        if (c == '\n') {
            line += "\\n";
        } else if (c == '\r') {
            line += "\\r";
        } else {
            line += c;
        }
    }
    return line;
}

}  // namespace nebu
