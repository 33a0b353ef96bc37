// The console's command-line options.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "CableModel.h"

namespace nebu {

struct Options {
    std::string boardFile;   // empty: the demo board beside the executable
    std::string dataDir;     // empty: the demo data directory beside the executable
    std::string pluginPath;  // empty: the plug-in built beside the executable
    uint32_t session = 1;
    bool trace = false;
    CableModel cable;  // --tck-mhz, --round-trip-us
    bool help = false;
    std::vector<std::string> commands;  // the -e commands, in order
    std::string script;                 // empty: none
};

// args: the arguments after the program name. Long options also take "--name=VALUE"; "--"
// ends the options. Throws UsageError.
Options parseOptions(const std::vector<std::string>& args);

// One line of synopsis, then one line per option.
std::string usageText();

}  // namespace nebu
