// The console's own commands: settings, direct board access, counters, the scan and dump
// tours, the print tools and help.
#include <cstdio>
#include <memory>
#include <ostream>
#include <string>
#include <vector>

#include "CommandLine.h"
#include "Console.h"
#include "HostMap.h"
#include "PrintCommands.h"
#include "TextFormat.h"
#include "UsageError.h"
#include "hostsim/Sim.h"
#include "hostsim/board/Board.h"

namespace nebu {

namespace {
constexpr uint32_t LAST_BUS_ADDRESS = 0x1FFFF;

std::shared_ptr<OrvSim::Board> currentBoard() {
    auto board = OrvSim::getBoard();
    if (!board) throw UsageError("no board is loaded");
    return board;
}

uint32_t busAddress(const std::string& word) {
    const uint32_t address = parseNumber(word, "ADDRESS");
    if (address > LAST_BUS_ADDRESS) {
        throw UsageError("ADDRESS " + word + " is outside the bus (0..0x1FFFF)");
    }
    return address;
}
}  // namespace

void Console::cmdStatus(const Words& args) {
    if (args[0] == "on") {
        statusOn_ = true;
    } else if (args[0] == "off") {
        statusOn_ = false;
    } else {
        throw UsageError("usage: status on|off");
    }
}

void Console::cmdSession(const Words& args) { session_ = number(args, 0, "N"); }

void Console::cmdEndSession(const Words& args) {
    const uint32_t handle = args.empty() ? session_ : number(args, 0, "N");
    OrvSim::endSession(handle);
    sessionsUsed_.erase(handle);
    for (auto it = initialized_.begin(); it != initialized_.end();) {
        it = std::get<0>(*it) == handle ? initialized_.erase(it) : std::next(it);
    }
}

void Console::cmdPeek(const Words& args) {
    const ORV_SLAVE_REF ref = slaveRef(args, 0);
    const uint32_t address = busAddress(args[3]);
    const uint32_t n = args.size() > 4 ? count(args, 4, "COUNT") : 1;
    auto board = currentBoard();
    std::vector<uint32_t> words;
    words.reserve(n);
    for (uint32_t i = 0; i < n; ++i) {
        // Like a burst with increment, the address wraps at the end of the bus.
        const uint32_t at = (address + i) & LAST_BUS_ADDRESS;
        try {
            words.push_back(board->peek(ref.device, ref.userChain, ref.slaveIndex, at));
        } catch (const std::out_of_range& e) {
            throw UsageError(std::string("peek: ") + e.what());
        }
    }
    print(formatDataWords("peek", words));
}

void Console::cmdPoke(const Words& args) {
    const ORV_SLAVE_REF ref = slaveRef(args, 0);
    const uint32_t address = busAddress(args[3]);
    checkValueCount(args, 4);
    // Every value is checked before the first is written, so a typo writes nothing.
    std::vector<uint16_t> values;
    for (size_t i = 4; i < args.size(); ++i) {
        const uint32_t value = number(args, i, "VALUE");
        if (value > 0xFFFF) throw UsageError("VALUE " + args[i] + " does not fit 16 bits");
        values.push_back(static_cast<uint16_t>(value));
    }
    auto board = currentBoard();
    try {
        for (size_t i = 0; i < values.size(); ++i) {
            const uint32_t at = (address + static_cast<uint32_t>(i)) & LAST_BUS_ADDRESS;
            board->poke(ref.device, ref.userChain, ref.slaveIndex, at, values[i]);
        }
    } catch (const std::out_of_range& e) {
        throw UsageError(std::string("poke: ") + e.what());
    }
}

void Console::cmdStats(const Words&) {
    useSession();
    const OrvSim::JtagStats s = OrvSim::takeStats(session_);
    print(
        "stats commands=" + std::to_string(s.commands) +
        " writeBits=" + std::to_string(s.writeBits) + " readBits=" + std::to_string(s.readBits) +
        " flushes=" + std::to_string(s.flushes) + " statusReads=" + std::to_string(s.statusReads) +
        " roundTrips=" + std::to_string(s.roundTrips) + " cableUs=" + cableMicroseconds(s, cable_));
}

void Console::cmdScan(const Words&) {
    auto board = currentBoard();
    useSession();
    const uint32_t devices = board->deviceCount();
    if (devices == 0) print("no devices");
    for (uint32_t device = 0; device < devices; ++device) {
        const std::vector<uint32_t> chains = board->chains(device);
        if (chains.empty()) print("device " + std::to_string(device) + ": no chains");
        for (uint32_t chain : chains) {
            const std::string where =
                "device " + std::to_string(device) + " chain " + std::to_string(chain) + ": ";
            uint32_t slaves = 0;
            const uint32_t rc = api_.getSlaveCount(session_, device, chain, &slaves);
            if (rc != ORVNEBU_OK) {
                failed_ = true;
                print(where + "getSlaveCount failed, " + formatRc(rc));
                continue;
            }
            print(where + (slaves == 0
                               ? std::string("no bus")
                               : std::to_string(slaves) + (slaves == 1 ? " slave" : " slaves")));
            for (uint32_t index = 0; index < slaves; ++index) {
                HostMap info;
                const ORV_SLAVE_REF ref{device, chain, index};
                const uint32_t infoRc = api_.getSlaveInfo(session_, ref, info.address());
                std::string line = "  slave " + std::to_string(index) + ":";
                if (infoRc != ORVNEBU_OK) {
                    failed_ = true;
                    print(line + " getSlaveInfo failed, " + formatRc(infoRc));
                    continue;
                }
                for (const char* name : {"slave_type", "orv_drv_ver", "core_type", "cg_ver",
                                         "cg_alpha_ver", "eda_ver", "next_slave"}) {
                    auto it = info.map().find(name);
                    if (it != info.map().end()) {
                        line += std::string(" ") + name + "=" + escapeText(it->second);
                    }
                }
                print(line);
            }
        }
    }
}

void Console::cmdDump(const Words& args) {
    const ORV_SLAVE_REF ref = slaveRef(args, 0);
    useSession();
    if (initialized_.count(key(ref)) == 0) {
        const uint32_t rc = api_.initialize(session_, ref);
        print("initialize: " + formatRc(rc));
        if (rc != ORVNEBU_OK) {
            failed_ = true;
            return;
        }
        initialized_.insert(key(ref));
    }
    HostMap registers;
    const uint32_t regRc = api_.getRegisters(session_, ref, registers.address());
    if (regRc != ORVNEBU_OK) failed_ = true;
    print("registers: " + formatRc(regRc));
    printMap(registers.map(), "  ");

    // An empty request asks for every parameter; inputs are added to that full request, not
    // put in its place, so the names of every parameter are asked for first.
    HostMap params;
    uint32_t paramRc = api_.getParameters(session_, ref, params.address());
    if (paramRc == ORVNEBU_OK && args.size() > 3) {
        for (auto& entry : params.map()) entry.second.clear();
        params.addWords(args, 3);
        paramRc = api_.getParameters(session_, ref, params.address());
    }
    if (paramRc != ORVNEBU_OK) failed_ = true;
    print("parameters: " + formatRc(paramRc));
    printMap(params.map(), "  ");
}

void Console::cmdPrintRegisterFile(const Words& args) {
    out_.flush();
    useSession();
    const int status = printRegisterFile(session_, args[0], out_, err_);
    if (status == 2) usageFailed_ = true;
    if (status == 1) failed_ = true;
}

void Console::cmdPrintParameterFile(const Words& args) {
    out_.flush();
    useSession();
    const int status = printParameterFile(session_, args[0], out_, err_);
    if (status == 2) usageFailed_ = true;
    if (status == 1) failed_ = true;
}

void Console::cmdQuit(const Words&) { quit_ = true; }

void Console::cmdHelp(const Words&) {
    print("Commands (D C S: device, user chain, slave index; numbers decimal or 0x hex;");
    print("maps as NAME or NAME=VALUE; \"quotes\" keep blanks and commas; # starts a comment):");
    for (const auto& c : commands()) {
        if (c.run == &Console::cmdQuit && std::string(c.name) == "exit") continue;
        std::string synopsis = std::string("  ") + c.name;
        if (*c.args != '\0') synopsis += std::string(" ") + c.args;
        if (synopsis.size() < 52) synopsis.resize(52, ' ');
        std::string line = synopsis + " " + c.help;
        for (const char* fn : c.needs) {
            if (!api_.exports(fn)) {
                line += " [plug-in lacks OrvNebu_" + std::string(fn) + "]";
                break;
            }
        }
        print(line);
    }
}

}  // namespace nebu
