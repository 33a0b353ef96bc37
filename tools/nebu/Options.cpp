// Command-line option parsing of the console.
#include "Options.h"

#include <functional>

#include "CommandLine.h"
#include "UsageError.h"

namespace nebu {

std::string usageText() {
    return "usage: nebu [--board FILE] [--data-dir DIR] [--session N] [--trace] [--plugin PATH]"
           " [--tck-mhz F]\n"
           "            [--round-trip-us R] [-e COMMAND]... [SCRIPT]\n"
           "  --board FILE     virtual board (JSON); default: the demo board\n"
           "  --data-dir DIR   host data directory; default: the demo data directory\n"
           "  --session N      session handle of the first command (default 1)\n"
           "  --trace          print every JTAG operation\n"
           "  --plugin PATH    plug-in library to load; default: the one built beside nebu\n"
           "  --tck-mhz F      cable test clock in MHz for the stats estimate (default 30)\n"
           "  --round-trip-us R  cost of one cable round trip in microseconds (default 125)\n"
           "  -e COMMAND       run one command (repeatable); SCRIPT runs first when given\n"
           "  SCRIPT           file of commands; without -e and SCRIPT, standard input\n"
           "       nebu lint [DATA_DIR]   check a data directory (default: the demo data)\n"
           "       nebu check [--update] TRANSCRIPT...   run transcripts of sessions again\n"
           "       nebu doc [DATA_DIR] -o DIR   write its register-map pages into DIR\n";
}

namespace {

// An option word: its name, and the value given with "--name=VALUE" if any.
struct OptionWord {
    std::string name;
    bool hasInlineValue = false;
    std::string inlineValue;

    explicit OptionWord(const std::string& arg) : name(arg) {
        const size_t eq = arg.find('=');
        if (arg.compare(0, 2, "--") == 0 && eq != std::string::npos) {
            inlineValue = arg.substr(eq + 1);
            hasInlineValue = true;
            name.resize(eq);
        }
    }
};

std::string nonEmpty(const std::string& value, const std::string& option, const char* what) {
    if (value.empty()) throw UsageError("option " + option + " needs " + what);
    return value;
}

// Stores one option in options; next() takes the following argument as its value.
void applyOption(Options& options, const OptionWord& word,
                 const std::function<std::string()>& next) {
    const std::string& arg = word.name;
    auto value = [&]() { return word.hasInlineValue ? word.inlineValue : next(); };
    auto noValue = [&]() {
        if (word.hasInlineValue) throw UsageError("option " + arg + " takes no argument");
    };
    if (arg == "--board") {
        options.boardFile = nonEmpty(value(), arg, "a file name");
    } else if (arg == "--data-dir") {
        options.dataDir = nonEmpty(value(), arg, "a directory");
    } else if (arg == "--plugin") {
        options.pluginPath = nonEmpty(value(), arg, "a path");
    } else if (arg == "--session") {
        options.session = parseNumber(value(), "--session");
    } else if (arg == "--trace") {
        noValue();
        options.trace = true;
    } else if (arg == "--tck-mhz") {
        options.cable.tckMhz = parseCableFigure(value(), arg, false);
    } else if (arg == "--round-trip-us") {
        options.cable.roundTripUs = parseCableFigure(value(), arg, true);
    } else if (arg == "-e") {
        options.commands.push_back(value());
    } else if (arg == "--help" || arg == "-h") {
        noValue();
        options.help = true;
    } else {
        throw UsageError("unknown option '" + arg + "'");
    }
}

}  // namespace

Options parseOptions(const std::vector<std::string>& args) {
    Options options;
    bool scriptSeen = false;
    auto setScript = [&](const std::string& path) {
        if (scriptSeen)
            throw UsageError("more than one script: '" + options.script + "', '" + path + "'");
        options.script = path;
        scriptSeen = true;
    };
    for (size_t i = 0; i < args.size(); ++i) {
        const std::string& arg = args[i];
        if (arg == "--") {
            for (++i; i < args.size(); ++i) setScript(args[i]);
            break;
        }
        if (arg.size() < 2 || arg[0] != '-') {
            setScript(arg);
            continue;
        }
        const OptionWord word(arg);
        applyOption(options, word, [&]() {
            if (i + 1 >= args.size())
                throw UsageError("option " + word.name + " needs an argument");
            return args[++i];
        });
    }
    return options;
}

}  // namespace nebu
