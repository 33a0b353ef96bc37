// Fuzzes the console's parsers and interpreter: the first line of the input is split into
// words and read as the console's options; the other lines are run as commands against the
// demo board with the plug-in linked in. The print commands are left out: they read whatever
// path they are given, and the file readers have targets of their own.
#include <sstream>
#include <string>
#include <vector>

#include "CommandLine.h"
#include "Console.h"
#include "FuzzSupport.h"
#include "Options.h"
#include "PluginApi.h"
#include "UsageError.h"

namespace {
nebu::PluginApi linkedApi() {
    nebu::PluginApi api;
#define NEBU_FUZZ_API(name) api.name = &OrvNebu_##name;
    NEBU_EXPORTED_FUNCTIONS(NEBU_FUZZ_API)
#undef NEBU_FUZZ_API
    return api;
}

bool readsFiles(const std::string& line) {
    try {
        const std::vector<std::string> words = nebu::splitWords(line);
        return !words.empty() && words[0].rfind("print", 0) == 0;
    } catch (const nebu::UsageError&) {
        return false;
    }
}

// Every failed exported call has a session message between its echo and its return code.
void checkFailuresReported(const std::string& output) {
    std::istringstream lines(output);
    std::string line;
    bool message = false;
    while (std::getline(lines, line)) {
        if (line.rfind("> ", 0) == 0) message = false;
        if (line.rfind("message ", 0) == 0) message = true;
        if (line == "rc=0x80000000") NEBU_FUZZ_CHECK(message);
    }
}
}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    using namespace nebufuzz;
    static const std::string boardText =
        readText(std::string(NEBU_FUZZ_DATA_DIR) + "/../boards/demo.json");
    static const nebu::PluginApi api = linkedApi();

    std::istringstream input(std::string(reinterpret_cast<const char*>(data), size));
    std::string first;
    std::getline(input, first);
    nebu::Options options;
    try {
        options = nebu::parseOptions(nebu::splitWords(first));
        (void)nebu::usageText();
    } catch (const nebu::UsageError&) {
        // The console would print it and stop; the commands still run with the defaults.
    }

    OrvSim::resetHost();
    OrvSim::setBoard(freshBoard(boardText));
    OrvSim::setDataDir(demoDataDir());
    std::ostringstream out;
    {
        nebu::Console console(api, out, nullStream(), options.session);
        // Lists of 0x20000 words take milliseconds to print and reach nothing that 256 do not.
        console.setMaxCommandWords(0x100);
        console.installSinks(options.trace);
        std::string line;
        for (int n = 0; n < 16 && !console.quitRequested() && std::getline(input, line); ++n) {
            if (!readsFiles(line)) console.runLine(line);
        }
        for (const auto& command : options.commands) {
            if (console.quitRequested()) break;
            if (!readsFiles(command)) console.runLine(command);
        }
        console.finish();
        const int status = console.exitStatus();
        NEBU_FUZZ_CHECK(status >= 0 && status <= 2);
    }
    OrvSim::resetHost();
    checkFailuresReported(out.str());
    return 0;
}
