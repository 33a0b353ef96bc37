// The nebu program: options, board, data directory, plug-in, then the commands.
#pragma once

#include <functional>
#include <iosfwd>
#include <string>

namespace nebu {

class Console;
struct Options;

// Runs the console as main would; returns the exit status (0, 1 or 2).
int runNebu(int argc, char** argv, std::istream& in, std::ostream& out, std::ostream& err,
            bool inIsTerminal);

// Sets up the stand-in host as the options say (board, data directory, trace), loads the
// plug-in, runs `commands` on the console, then ends its sessions and unloads the plug-in as a
// host does. Defaults are found beside the program in exeDir. Returns the exit status; a
// start-up usage error is one "nebu: " line on err and gives 2.
int runConsole(const Options& options, const std::string& exeDir, std::ostream& out,
               std::ostream& err, const std::function<void(Console&)>& commands);

}  // namespace nebu
