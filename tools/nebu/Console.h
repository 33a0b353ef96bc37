// The console's interpreter: reads command lines, calls the plug-in's exported functions or
// runs its own commands, and prints echo, messages, return codes and outputs.
#pragma once

#include <algorithm>
#include <cstdint>
#include <iosfwd>
#include <set>
#include <string>
#include <tuple>
#include <vector>

#include "CableModel.h"
#include "PluginApi.h"
#include "host/OrvTypes.h"

namespace nebu {

// Bound of every word array the console allocates for a command (the bus has 0x20000
// addresses), so that a mistyped count cannot exhaust memory.
constexpr uint32_t MAX_COMMAND_WORDS = 0x20000;

class Console {
public:
    // api: the plug-in's functions (null entries make their commands unknown). session: the
    // handle of the first command.
    Console(const PluginApi& api, std::ostream& out, std::ostream& err, uint32_t session);
    // Removes the sinks it installed.
    ~Console();
    Console(const Console&) = delete;
    Console& operator=(const Console&) = delete;

    // The cable that stats estimates its time on.
    void setCable(const CableModel& cable) { cable_ = cable; }
    // A lower bound than MAX_COMMAND_WORDS, for runs that must stay quick.
    void setMaxCommandWords(uint32_t words) { maxWords_ = std::min(words, MAX_COMMAND_WORDS); }
    // Prints session messages, and with trace every JTAG operation, on out.
    void installSinks(bool trace);
    // Skips an empty or comment line; otherwise echoes it, runs it and prints its outputs.
    void runLine(const std::string& line);
    // Runs every line of in until its end or quit; with prompt, shows "nebu> " before each.
    void runStream(std::istream& in, bool prompt);
    // Removes the sinks and ends every session the console used, so that the slave objects
    // are gone while the plug-in is still loaded.
    void finish();

    // 2 after a usage error, else 1 after a failed exported call, else 0.
    int exitStatus() const;
    uint32_t session() const { return session_; }
    // After quit or exit: the program reads no more commands.
    bool quitRequested() const { return quit_; }

private:
    using Words = std::vector<std::string>;
    struct Command {
        const char* name;
        const char* args;
        size_t minArgs;
        size_t maxArgs;
        std::vector<const char*> needs;  // exported functions it calls, without "OrvNebu_"
        void (Console::*run)(const Words& args);
        const char* help;
    };
    static const std::vector<Command>& commands();

    void print(const std::string& line);
    void usageError(const std::string& text);
    void useSession();
    void reportRc(uint32_t rc);
    void printMap(const OrvRT::Orv_HashMapCStr& map, const char* indent = "");
    void printStatus(uint32_t status);
    uint32_t* statusPointer(uint32_t& status) { return statusOn_ ? &status : nullptr; }

    static uint32_t number(const Words& args, size_t i, const char* what);
    uint32_t count(const Words& args, size_t i, const char* what) const;
    // Refuses more than maxWords_ values after the first `fixed` words.
    void checkValueCount(const Words& args, size_t fixed) const;
    static ORV_SLAVE_REF slaveRef(const Words& args, size_t first);
    using RefKey = std::tuple<uint32_t, uint32_t, uint32_t, uint32_t>;
    RefKey key(const ORV_SLAVE_REF& ref) const {
        return {session_, ref.device, ref.userChain, ref.slaveIndex};
    }

    // Commands of the exported functions.
    void cmdInitialize(const Words& args);
    void cmdTerminate(const Words& args);
    void cmdGetBusInfo(const Words& args);
    void cmdGetSlaveCount(const Words& args);
    void cmdGetSlaveHandles(const Words& args);
    void cmdGetSlaveInfo(const Words& args);
    void cmdGetRegisters(const Words& args);
    void cmdSetRegisters(const Words& args);
    void cmdGetParameters(const Words& args);
    void cmdSetParameters(const Words& args);
    void cmdGetParameterChoices(const Words& args);
    void cmdRead(const Words& args);
    void cmdWrite(const Words& args);
    void cmdGetBusErrorStatus(const Words& args);
    void cmdClearBusErrorStatus(const Words& args);
    void cmdResetBus(const Words& args);
    void cmdTestSlaveInterface(const Words& args);
    void cmdResetSlave(const Words& args);
    void cmdDisableSlave(const Words& args);
    void cmdEnableSlave(const Words& args);
    void cmdSingleSlaveRead(const Words& args);
    void cmdSingleSlaveWrite(const Words& args);
    void cmdSingleSlaveReadModifyWrite(const Words& args);
    void cmdSingleSlaveWriteAndInspect(const Words& args);
    void cmdBurstSlaveRead(const Words& args);
    void cmdBurstSlaveWrite(const Words& args);
    void cmdBroadcastSingleWrite(const Words& args);

    // The console's own commands.
    void cmdStatus(const Words& args);
    void cmdSession(const Words& args);
    void cmdEndSession(const Words& args);
    void cmdPeek(const Words& args);
    void cmdPoke(const Words& args);
    void cmdStats(const Words& args);
    void cmdScan(const Words& args);
    void cmdDump(const Words& args);
    void cmdPrintRegisterFile(const Words& args);
    void cmdPrintParameterFile(const Words& args);
    void cmdHelp(const Words& args);
    void cmdQuit(const Words& args);

    PluginApi api_;
    std::ostream& out_;
    std::ostream& err_;
    uint32_t session_;
    CableModel cable_;
    uint32_t maxWords_ = MAX_COMMAND_WORDS;
    bool statusOn_ = true;
    bool failed_ = false;
    bool usageFailed_ = false;
    bool sinksInstalled_ = false;
    bool quit_ = false;
    std::set<uint32_t> sessionsUsed_;
    std::set<RefKey> initialized_;  // slave objects this console made and has not removed
};

}  // namespace nebu
