// Start-up and shut-down of the console, in the order a real host keeps: the target and the
// data directory first, the plug-in loaded before the first command and unloaded after the
// sessions have ended.
#include "App.h"

#include <fstream>
#include <istream>
#include <memory>
#include <ostream>
#include <string>
#include <vector>

#include "Check.h"
#include "Console.h"
#include "Doc.h"
#include "Lint.h"
#include "Options.h"
#include "PluginApi.h"
#include "SharedLibrary.h"
#include "UsageError.h"
#include "hostsim/Sim.h"
#include "hostsim/board/Board.h"

namespace nebu {

namespace {
std::shared_ptr<OrvSim::Board> loadBoard(const std::string& path) {
    try {
        return OrvSim::Board::loadFile(path);
    } catch (const std::exception& e) {
        std::string text = e.what();
        // The user must learn which file was refused, whatever the loader says.
        if (text.find(path) == std::string::npos) text = path + ": " + text;
        throw UsageError(text);
    }
}

// Runs after the plug-in is gone, so nothing of it can be called any more.
struct HostReset {
    ~HostReset() {
        OrvSim::setMessageSink(nullptr);
        OrvSim::setTraceSink(nullptr);
        OrvSim::setBoard(nullptr);
    }
};
}  // namespace

int runConsole(const Options& options, const std::string& exeDir, std::ostream& out,
               std::ostream& err, const std::function<void(Console&)>& commands) {
    try {
        const std::string share = exeDir + "/../share/orvnebu/";
        auto board =
            loadBoard(options.boardFile.empty() ? share + "boards/demo.json" : options.boardFile);

        HostReset hostReset;
        SharedLibrary plugin(options.pluginPath.empty() ? defaultPluginPath(exeDir)
                                                        : options.pluginPath);
        OrvSim::setBoard(board);
        OrvSim::setDataDir(options.dataDir.empty() ? share + "data/" : options.dataDir);

        Console console(PluginApi::resolve(plugin), out, err, options.session);
        console.setCable(options.cable);
        console.installSinks(options.trace);
        commands(console);
        console.finish();
        return console.exitStatus();
    } catch (const UsageError& e) {
        out.flush();
        err << "nebu: " << oneLine(e.what()) << std::endl;
        return 2;
    }
}

int runNebu(int argc, char** argv, std::istream& in, std::ostream& out, std::ostream& err,
            bool inIsTerminal) {
    std::vector<std::string> args;
    for (int i = 1; i < argc; ++i) args.emplace_back(argv[i]);
    const std::string exeDir = executableDirectory(argc > 0 ? argv[0] : nullptr);
    if (!args.empty() && (args.front() == "lint" || args.front() == "doc")) {
        const std::vector<std::string> rest(args.begin() + 1, args.end());
        const std::string data = exeDir + "/../share/orvnebu/data/";
        return args.front() == "lint" ? runLint(rest, data, out, err)
                                      : runDoc(rest, data, out, err);
    }
    if (!args.empty() && args.front() == "check") {
        return runCheck(std::vector<std::string>(args.begin() + 1, args.end()), exeDir, out, err);
    }
    try {
        const Options options = parseOptions(args);
        if (options.help) {
            out << usageText() << "Type 'help' at the prompt (or -e help) for the commands.\n";
            return 0;
        }
        std::ifstream scriptFile;
        const bool scriptFromStdin = options.script == "-";
        if (!options.script.empty() && !scriptFromStdin) {
            // Binary: Windows' text mode would end a script at a Ctrl-Z; lines lose their CR.
            scriptFile.open(options.script, std::ios::binary);
            if (!scriptFile) throw UsageError("cannot open script " + options.script);
        }
        return runConsole(options, exeDir, out, err, [&](Console& console) {
            if (scriptFile.is_open()) console.runStream(scriptFile, false);
            if (scriptFromStdin) console.runStream(in, false);
            for (const auto& command : options.commands) {
                if (console.quitRequested()) break;
                console.runLine(command);
            }
            if (options.script.empty() && options.commands.empty()) {
                console.runStream(in, inIsTerminal);
            }
        });
    } catch (const UsageError& e) {
        out.flush();
        err << "nebu: " << oneLine(e.what()) << std::endl;
        return 2;
    }
}

}  // namespace nebu
