// Decodes recorded JTAG trace lines into NEBU bus transfers (control word, address word, data),
// so tests can check what went over the wire.
#pragma once

#include <cstdint>
#include <sstream>
#include <string>
#include <vector>

struct BusTransfer {
    bool write = false;
    bool burst = false;
    bool increment = false;
    uint32_t slave = 0;
    uint32_t address = 0;
    uint32_t count = 0;     // the control word's count (0 for single transfers)
    uint32_t dataBits = 0;  // bits of the data command
    uint64_t data = 0;      // its bits as one number (a single word's value); 0 past 64 bits
};

struct TraceCommand {
    bool write = false;
    uint32_t cmd = 0;
    uint32_t bits = 0;
    std::string data;  // hexadecimal digits without prefix
};

inline bool parseTraceCommand(const std::string& line, TraceCommand& out) {
    std::istringstream in(line);
    std::string jtag, kind, cmd, bits, data;
    if (!(in >> jtag >> kind >> cmd >> bits >> data)) return false;
    if (jtag != "jtag" || (kind != "write" && kind != "read")) return false;
    out.write = kind == "write";
    out.cmd = static_cast<uint32_t>(std::stoul(cmd.substr(4)));
    out.bits = static_cast<uint32_t>(std::stoul(bits.substr(5)));
    out.data = data.substr(7);
    return true;
}

// One entry per transfer: command 4, then 5, then 6.
inline std::vector<BusTransfer> decodeTransfers(const std::vector<std::string>& trace) {
    std::vector<BusTransfer> transfers;
    BusTransfer current;
    int stage = 0;
    for (const auto& line : trace) {
        TraceCommand c;
        if (!parseTraceCommand(line, c)) continue;
        if (c.cmd == 4 && c.write) {
            uint64_t w = std::stoull(c.data, nullptr, 16);
            current = BusTransfer();
            current.count = static_cast<uint32_t>(w & 0x1FFFF);
            current.burst = (w >> 17) & 1;
            current.increment = (w >> 18) & 1;
            current.slave = static_cast<uint32_t>((w >> 20) & 0xFF);
            stage = 1;
        } else if (c.cmd == 5 && c.write && stage == 1) {
            uint64_t w = std::stoull(c.data, nullptr, 16);
            current.address = static_cast<uint32_t>(w & 0x1FFFF);
            current.write = (w >> 17) & 1;
            stage = 2;
        } else if (c.cmd == 6 && stage == 2) {
            current.dataBits = c.bits;
            current.data = c.data.size() <= 16 ? std::stoull(c.data, nullptr, 16) : 0;
            transfers.push_back(current);
            stage = 0;
        }
    }
    return transfers;
}
