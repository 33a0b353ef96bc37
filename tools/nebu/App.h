// The nebu program: options, board, data directory, plug-in, then the commands.
#pragma once

#include <iosfwd>

namespace nebu {

// Runs the console as main would; returns the exit status (0, 1 or 2).
int runNebu(int argc, char** argv, std::istream& in, std::ostream& out, std::ostream& err,
            bool inIsTerminal);

}  // namespace nebu
