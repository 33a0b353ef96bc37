// The interpreter loop, the command table and the helpers every command shares.
#include "Console.h"

#include <istream>
#include <limits>
#include <ostream>

#include "CommandLine.h"
#include "TextFormat.h"
#include "UsageError.h"
#include "hostsim/Sim.h"

namespace nebu {

namespace {
constexpr size_t ANY = std::numeric_limits<size_t>::max();
}

const std::vector<Console::Command>& Console::commands() {
    // clang-format off
    static const std::vector<Command> table = {
        {"initialize", "D C S", 3, 3, {"initialize"}, &Console::cmdInitialize,
         "create the slave object"},
        {"terminate", "D C S", 3, 3, {"terminate"}, &Console::cmdTerminate,
         "remove the slave object"},
        {"getBusInfo", "D C", 2, 2, {"getBusInfo"}, &Console::cmdGetBusInfo, "bus information"},
        {"getSlaveCount", "D C", 2, 2, {"getSlaveCount"}, &Console::cmdGetSlaveCount,
         "discover the bus, count its slaves"},
        {"getSlaveHandles", "D C COUNT", 3, 3, {"getSlaveHandles"},
         &Console::cmdGetSlaveHandles, "slave indices"},
        {"getSlaveInfo", "D C S [NAME=VALUE...]", 3, ANY, {"getSlaveInfo"},
         &Console::cmdGetSlaveInfo, "identification of a slave"},
        {"getRegisters", "D C S [NAME...]", 3, ANY, {"getRegisters"}, &Console::cmdGetRegisters,
         "read registers (all when none named)"},
        {"setRegisters", "D C S NAME=VALUE...", 3, ANY, {"setRegisters"},
         &Console::cmdSetRegisters, "write registers"},
        {"getParameters", "D C S [NAME[=VALUE]...]", 3, ANY, {"getParameters"},
         &Console::cmdGetParameters, "read parameters (all when none named)"},
        {"setParameters", "D C S NAME=VALUE...", 3, ANY, {"setParameters"},
         &Console::cmdSetParameters, "set parameters"},
        {"getParameterChoices", "D C S NAME[=VALUE]...", 3, ANY, {"getParameterChoices"},
         &Console::cmdGetParameterChoices, "choices of a parameter"},
        {"read", "D C S ADDRESS SIZE", 5, 5, {"read"}, &Console::cmdRead,
         "raw words as hexadecimal text"},
        {"write", "D C S ADDRESS SIZE HEXTEXT", 6, 6, {"write"}, &Console::cmdWrite,
         "raw words from hexadecimal text"},
        {"getBusErrorStatus", "D C LEN", 3, 3, {"getBusErrorStatus"},
         &Console::cmdGetBusErrorStatus, "bus and slave error bits"},
        {"clearBusErrorStatus", "D C", 2, 2, {"clearBusErrorStatus"},
         &Console::cmdClearBusErrorStatus, "clear the error bits"},
        {"resetBus", "D C", 2, 2, {"resetBus"}, &Console::cmdResetBus, "reset the bus"},
        {"testSlaveInterface", "D C S", 3, 3, {"testSlaveInterface"},
         &Console::cmdTestSlaveInterface, "test a slave's interface"},
        {"resetSlave", "D C S", 3, 3, {"resetSlave"}, &Console::cmdResetSlave,
         "reset a slave"},
        {"disableSlave", "D C S", 3, 3, {"disableSlave"}, &Console::cmdDisableSlave,
         "disable a slave"},
        {"enableSlave", "D C S", 3, 3, {"enableSlave"}, &Console::cmdEnableSlave,
         "enable a slave"},
        {"singleSlaveRead", "D C S ADDRESS", 4, 4, {"singleSlaveRead"},
         &Console::cmdSingleSlaveRead, "read one word"},
        {"singleSlaveWrite", "D C S ADDRESS VALUE", 5, 5, {"singleSlaveWrite"},
         &Console::cmdSingleSlaveWrite, "write one word"},
        {"singleSlaveReadModifyWrite", "D C S ADDRESS VALUE MASK", 6, 6,
         {"singleSlaveReadModifyWrite"}, &Console::cmdSingleSlaveReadModifyWrite,
         "word = (word AND MASK) OR VALUE"},
        {"singleSlaveWriteAndInspect", "D C S ADDRESS VALUE", 5, 5,
         {"singleSlaveWriteAndInspect"}, &Console::cmdSingleSlaveWriteAndInspect,
         "write one word and read it back"},
        {"burstSlaveRead", "D C S ADDRESS INCR COUNT", 6, 6, {"burstSlaveRead"},
         &Console::cmdBurstSlaveRead, "read COUNT words"},
        {"burstSlaveWrite", "D C S ADDRESS INCR VALUE...", 5, ANY, {"burstSlaveWrite"},
         &Console::cmdBurstSlaveWrite, "write the words"},
        {"broadcastSingleWrite", "D C ADDRESS VALUE", 4, 4, {"broadcastSingleWrite"},
         &Console::cmdBroadcastSingleWrite, "write one word to every slave"},

        {"status", "on|off", 1, 1, {}, &Console::cmdStatus,
         "pass and print the status word of bus calls, or not"},
        {"session", "N", 1, 1, {}, &Console::cmdSession, "later commands use session N"},
        {"endSession", "[N]", 0, 1, {}, &Console::cmdEndSession,
         "end session N (default: the current one)"},
        {"peek", "D C S ADDRESS [COUNT]", 4, 5, {}, &Console::cmdPeek,
         "read slave memory on the board, no JTAG"},
        {"poke", "D C S ADDRESS VALUE...", 5, ANY, {}, &Console::cmdPoke,
         "write slave memory on the board, no JTAG"},
        {"stats", "", 0, 0, {}, &Console::cmdStats,
         "JTAG counters since the previous stats, and their cable time"},
        {"scan", "", 0, 0, {"getSlaveCount", "getSlaveInfo"}, &Console::cmdScan,
         "every bus of the board and its slaves"},
        {"dump", "D C S [NAME=VALUE...]", 3, ANY, {"initialize", "getRegisters", "getParameters"},
         &Console::cmdDump, "every register and parameter of a slave"},
        {"printRegisterFile", "PATH", 1, 1, {}, &Console::cmdPrintRegisterFile,
         "print a register definition file as read"},
        {"printParameterFile", "PATH", 1, 1, {}, &Console::cmdPrintParameterFile,
         "print a parameter definition file as read"},
        {"help", "", 0, 0, {}, &Console::cmdHelp, "this list"},
        {"quit", "", 0, 0, {}, &Console::cmdQuit, "read no more commands (also: exit)"},
        {"exit", "", 0, 0, {}, &Console::cmdQuit, "read no more commands"},
    };
    // clang-format on
    return table;
}

Console::Console(const PluginApi& api, std::ostream& out, std::ostream& err, uint32_t session)
    : api_(api), out_(out), err_(err), session_(session) {}

Console::~Console() {
    if (sinksInstalled_) {
        OrvSim::setMessageSink(nullptr);
        OrvSim::setTraceSink(nullptr);
    }
}

void Console::installSinks(bool trace) {
    OrvSim::setMessageSink([this](uint32_t, uint32_t severity, const std::string& text) {
        print("message " + std::to_string(severity) + ": " + escapeText(text));
    });
    if (trace) {
        OrvSim::setTraceSink([this](const std::string& line) { print(line); });
    } else {
        OrvSim::setTraceSink(nullptr);
    }
    sinksInstalled_ = true;
}

void Console::print(const std::string& line) { out_ << line << '\n'; }

void Console::usageError(const std::string& text) {
    out_.flush();  // keep the error after the echo when both go to one terminal
    err_ << "nebu: " << oneLine(text) << std::endl;
    usageFailed_ = true;
}

void Console::useSession() { sessionsUsed_.insert(session_); }

void Console::reportRc(uint32_t rc) {
    print(formatRc(rc));
    if (rc != ORVNEBU_OK) failed_ = true;
}

void Console::printMap(const OrvRT::Orv_HashMapCStr& map, const char* indent) {
    for (const auto& line : formatMapLines(map)) print(indent + line);
}

void Console::printStatus(uint32_t status) {
    if (statusOn_) print("status=" + std::to_string(status));
}

uint32_t Console::number(const Words& args, size_t i, const char* what) {
    return parseNumber(args[i], what);
}

uint32_t Console::count(const Words& args, size_t i, const char* what) const {
    const uint32_t n = parseNumber(args[i], what);
    if (n > maxWords_) {
        throw UsageError(std::string(what) + " " + args[i] + " is more than the console allows (" +
                         std::to_string(maxWords_) + ")");
    }
    return n;
}

void Console::checkValueCount(const Words& args, size_t fixed) const {
    if (args.size() - fixed > maxWords_) {
        throw UsageError("more than " + std::to_string(maxWords_) + " words");
    }
}

ORV_SLAVE_REF Console::slaveRef(const Words& args, size_t first) {
    ORV_SLAVE_REF ref;
    ref.device = parseNumber(args[first], "D");
    ref.userChain = parseNumber(args[first + 1], "C");
    ref.slaveIndex = parseNumber(args[first + 2], "S");
    return ref;
}

void Console::runLine(const std::string& line) {
    Words words;
    try {
        words = splitWords(line);
    } catch (const UsageError& e) {
        print("> " + stripLineEnd(line));
        usageError(e.what());
        return;
    }
    if (words.empty()) return;
    print("> " + stripLineEnd(line));

    const std::string& name = words[0];
    const Command* command = nullptr;
    for (const auto& c : commands()) {
        if (name == c.name) command = &c;
    }
    try {
        if (command == nullptr) throw UsageError("unknown command '" + name + "'");
        for (const char* fn : command->needs) {
            if (!api_.exports(fn)) {
                throw UsageError("unknown command '" + name +
                                 "' (the plug-in does not export OrvNebu_" + fn + ")");
            }
        }
        const Words args(words.begin() + 1, words.end());
        if (args.size() < command->minArgs || args.size() > command->maxArgs) {
            std::string usage = std::string("usage: ") + command->name;
            if (*command->args != '\0') usage += std::string(" ") + command->args;
            throw UsageError(usage);
        }
        (this->*command->run)(args);
    } catch (const UsageError& e) {
        usageError(e.what());
    } catch (const std::exception& e) {
        usageError(name + ": " + e.what());
    }
    out_.flush();
}

void Console::runStream(std::istream& in, bool prompt) {
    std::string line;
    while (!quit_) {
        if (prompt) out_ << "nebu> " << std::flush;
        if (!std::getline(in, line)) break;
        runLine(line);
    }
    if (prompt && !quit_) out_ << '\n' << std::flush;
}

void Console::finish() {
    if (sinksInstalled_) {
        OrvSim::setMessageSink(nullptr);
        OrvSim::setTraceSink(nullptr);
        sinksInstalled_ = false;
    }
    for (uint32_t handle : sessionsUsed_) OrvSim::endSession(handle);
    sessionsUsed_.clear();
    initialized_.clear();
    out_.flush();
}

int Console::exitStatus() const {
    if (usageFailed_) return 2;
    return failed_ ? 1 : 0;
}

}  // namespace nebu
