// The board file reader: JSON text to devices, chains, cores, masters and slaves, with an
// error naming the file, the place in the file and the problem for anything malformed.
#include <initializer_list>
#include <limits>
#include <nlohmann/json.hpp>
#include <set>
#include <type_traits>

#include "hostsim/board/BoardImpl.h"

namespace OrvSim {

namespace {

using nlohmann::json;

constexpr uint64_t U32_MAX = 0xFFFFFFFFu;
constexpr uint64_t U16_MAX = 0xFFFFu;

struct Range {
    int64_t lo;
    uint64_t hi;
    bool hexBounds;
};

std::string hexText(uint64_t value) {
    static const char digits[] = "0123456789ABCDEF";
    std::string text;
    do {
        text.insert(text.begin(), digits[value & 0xFu]);
        value >>= 4;
    } while (value != 0);
    return "0x" + text;
}

std::string rangeText(const Range& r) {
    return std::to_string(r.lo) + ".." + (r.hexBounds ? hexText(r.hi) : std::to_string(r.hi));
}

// A number text: decimal or 0x hexadecimal, an optional minus sign before it.
bool parseNumberText(const std::string& text, bool& negative, uint64_t& magnitude, bool& overflow) {
    size_t pos = 0;
    negative = false;
    overflow = false;
    magnitude = 0;
    if (pos < text.size() && text[pos] == '-') {
        negative = true;
        ++pos;
    }
    unsigned base = 10;
    if (text.size() - pos > 2 && text[pos] == '0' &&
        (text[pos + 1] == 'x' || text[pos + 1] == 'X')) {
        base = 16;
        pos += 2;
    }
    if (pos == text.size()) return false;
    for (; pos < text.size(); ++pos) {
        const char c = text[pos];
        unsigned digit;
        if (c >= '0' && c <= '9') {
            digit = unsigned(c - '0');
        } else if (base == 16 && c >= 'a' && c <= 'f') {
            digit = unsigned(c - 'a' + 10);
        } else if (base == 16 && c >= 'A' && c <= 'F') {
            digit = unsigned(c - 'A' + 10);
        } else {
            return false;
        }
        if (magnitude > (std::numeric_limits<uint64_t>::max() - digit) / base) overflow = true;
        magnitude = magnitude * base + digit;
    }
    return true;
}

// The error of a board file: the file, the place in it (when there is one) and the problem.
[[noreturn]] void failIn(const std::string& name, const std::string& path,
                         const std::string& problem) {
    throw BoardError(name + ": " + (path.empty() ? std::string() : path + ": ") + problem);
}

std::string at(const std::string& path, const std::string& key) {
    return path.empty() ? key : path + "." + key;
}

// Watches the parser go by: refuses a key given twice in one object, which the parser would
// silently let the last one win, and nesting deeper than a board ever needs, before a value
// too deep to print or walk is built.
class StructureCheck {
public:
    static constexpr size_t MAX_DEPTH = 32;

    explicit StructureCheck(const std::string& name) : name_(name) {}

    void see(json::parse_event_t event, const json& parsed) {
        switch (event) {
            case json::parse_event_t::object_start:
            case json::parse_event_t::array_start: {
                const std::string path = stack_.empty() ? std::string() : childPath(stack_.back());
                if (stack_.size() >= MAX_DEPTH) {
                    fail(path, "nested deeper than " + std::to_string(MAX_DEPTH) + " levels");
                }
                stack_.push_back(
                    Level{event == json::parse_event_t::object_start, path, {}, {}, 0});
                break;
            }
            case json::parse_event_t::key: {
                Level& object = stack_.back();
                object.key = parsed.get<std::string>();
                if (!object.keys.insert(object.key).second) {
                    fail(at(object.path, object.key), "key \"" + object.key + "\" is given twice");
                }
                break;
            }
            case json::parse_event_t::object_end:
            case json::parse_event_t::array_end:
                stack_.pop_back();
                elementDone();
                break;
            case json::parse_event_t::value:
                elementDone();
                break;
        }
    }

private:
    struct Level {
        bool object;
        std::string path;
        std::set<std::string> keys;  // of an object, so far
        std::string key;             // of an object, the current one
        size_t index;                // of an array, the current element
    };

    [[noreturn]] void fail(const std::string& path, const std::string& problem) const {
        failIn(name_, path, problem);
    }

    static std::string childPath(const Level& level) {
        return level.object ? at(level.path, level.key)
                            : level.path + "[" + std::to_string(level.index) + "]";
    }

    void elementDone() {
        if (!stack_.empty() && !stack_.back().object) ++stack_.back().index;
    }

    std::string name_;
    std::vector<Level> stack_;
};

class Reader {
public:
    explicit Reader(const std::string& name) : name_(name) {}

    [[noreturn]] void fail(const std::string& path, const std::string& problem) const {
        failIn(name_, path, problem);
    }

    std::unique_ptr<Board::Impl> board(const json& root) const {
        if (!root.is_object()) fail("", "expected a JSON object, got " + shown(root));
        checkKeys(root, "", {"devices"});
        if (!root.contains("devices")) fail("", "\"devices\" is missing");
        const json& devices = root.at("devices");
        if (!devices.is_array()) fail("devices", "expected an array, got " + shown(devices));
        auto impl = std::make_unique<Board::Impl>();
        for (size_t i = 0; i < devices.size(); ++i) {
            impl->devices.push_back(device(devices[i], "devices[" + std::to_string(i) + "]"));
        }
        return impl;
    }

private:
    static std::string shown(const json& value) {
        std::string text = value.dump(-1, ' ', false, json::error_handler_t::replace);
        if (text.size() > 40) text = text.substr(0, 37) + "...";
        return text;
    }

    void checkKeys(const json& object, const std::string& path,
                   std::initializer_list<const char*> known) const {
        for (auto it = object.begin(); it != object.end(); ++it) {
            bool found = false;
            for (const char* k : known) found = found || it.key() == k;
            if (found) continue;
            std::string list;
            for (const char* k : known) list += std::string(list.empty() ? "" : ", ") + k;
            fail(at(path, it.key()), "unknown key (known keys: " + list + ")");
        }
    }

    void expectObject(const json& value, const std::string& path) const {
        if (!value.is_object()) fail(path, "expected an object, got " + shown(value));
    }

    bool flag(const json& value, const std::string& path) const {
        if (!value.is_boolean()) fail(path, "expected true or false, got " + shown(value));
        return value.get<bool>();
    }

    // A number or a number text within r.
    int64_t number(const json& value, const std::string& path, const Range& r) const {
        bool negative = false;
        bool overflow = false;
        uint64_t magnitude = 0;
        std::string text;
        if (value.is_number_unsigned()) {
            magnitude = value.get<uint64_t>();
            text = value.dump();
        } else if (value.is_number_integer()) {
            const int64_t v = value.get<int64_t>();
            negative = v < 0;
            magnitude = negative ? uint64_t(-(v + 1)) + 1u : uint64_t(v);
            text = value.dump();
        } else if (value.is_number_float()) {
            fail(path, "expected a whole number, got " + shown(value));
        } else if (value.is_string()) {
            text = value.get<std::string>();
            if (!parseNumberText(text, negative, magnitude, overflow)) {
                fail(path, shown(value) + " is not a decimal or 0x hexadecimal number");
            }
        } else {
            fail(path, "expected a number, got " + shown(value));
        }
        const bool inRange =
            !overflow &&
            (negative ? (r.lo < 0 && magnitude <= uint64_t(-r.lo))
                      : (magnitude <= r.hi && (r.lo <= 0 || magnitude >= uint64_t(r.lo))));
        if (!inRange) fail(path, text + " is out of range " + rangeText(r));
        return negative ? -int64_t(magnitude) : int64_t(magnitude);
    }

    uint32_t unsignedNumber(const json& value, const std::string& path, uint64_t hi,
                            bool hexBounds = false) const {
        return uint32_t(number(value, path, Range{0, hi, hexBounds}));
    }

    // An object key that stands for a number.
    uint32_t keyNumber(const std::string& key, const std::string& path, const char* what,
                       uint64_t hi, bool hexBounds) const {
        bool negative = false;
        bool overflow = false;
        uint64_t magnitude = 0;
        if (!parseNumberText(key, negative, magnitude, overflow) || negative) {
            fail(path,
                 std::string(what) + " \"" + key + "\" is not a decimal or 0x hexadecimal number");
        }
        if (overflow || magnitude > hi) {
            fail(path, std::string(what) + " " + key + " is out of range " +
                           rangeText(Range{0, hi, hexBounds}));
        }
        return uint32_t(magnitude);
    }

    BoardDevice device(const json& value, const std::string& path) const {
        expectObject(value, path);
        checkKeys(value, path, {"trellom", "chains"});
        BoardDevice result;
        if (value.contains("trellom"))
            result.trellom = flag(value.at("trellom"), at(path, "trellom"));
        if (!value.contains("chains")) return result;
        const json& chains = value.at("chains");
        const std::string chainsPath = at(path, "chains");
        expectObject(chains, chainsPath);
        for (auto it = chains.begin(); it != chains.end(); ++it) {
            const std::string chainPath = at(chainsPath, it.key());
            const uint32_t number = keyNumber(it.key(), chainPath, "chain", U32_MAX, false);
            if (result.chains.count(number) != 0) {
                fail(chainPath, "chain " + std::to_string(number) + " is given twice");
            }
            result.chains[number] = chain(it.value(), chainPath);
        }
        return result;
    }

    BoardChain chain(const json& value, const std::string& path) const {
        expectObject(value, path);
        checkKeys(value, path, {"cores"});
        BoardChain result;
        if (!value.contains("cores")) return result;
        const json& cores = value.at("cores");
        const std::string coresPath = at(path, "cores");
        if (!cores.is_array()) fail(coresPath, "expected an array, got " + shown(cores));
        for (size_t i = 0; i < cores.size(); ++i) {
            result.cores.push_back(core(cores[i], coresPath + "[" + std::to_string(i) + "]"));
        }
        return result;
    }

    BoardCore core(const json& value, const std::string& path) const {
        expectObject(value, path);
        checkKeys(value, path, {"type", "master", "status", "failingCommands"});
        BoardCore result;
        if (!value.contains("type")) fail(path, "\"type\" is missing");
        result.type = unsignedNumber(value.at("type"), at(path, "type"), U32_MAX);
        if (value.contains("status")) {
            result.hasRawStatus = true;
            result.rawStatus = rawStatus(value.at("status"), at(path, "status"));
        }
        if (value.contains("failingCommands")) {
            result.failingCommands =
                failingCommands(value.at("failingCommands"), at(path, "failingCommands"));
        }
        if (value.contains("master"))
            result.master = master(value.at("master"), at(path, "master"));
        return result;
    }

    // Command codes 1 to 7, as bits.
    uint32_t failingCommands(const json& value, const std::string& path) const {
        if (!value.is_array()) fail(path, "expected an array, got " + shown(value));
        uint32_t codes = 0;
        for (size_t i = 0; i < value.size(); ++i) {
            codes |=
                1u << number(value[i], path + "[" + std::to_string(i) + "]", Range{1, 7, false});
        }
        return codes;
    }

    // One hexadecimal number of any length: bit k of the number is status bit k.
    std::vector<uint8_t> rawStatus(const json& value, const std::string& path) const {
        std::vector<uint8_t> bytes;
        if (value.is_number_unsigned()) {
            for (uint64_t v = value.get<uint64_t>(); v != 0; v >>= 8)
                bytes.push_back(uint8_t(v & 0xFFu));
            return bytes;
        }
        if (!value.is_string()) fail(path, "expected a hexadecimal text, got " + shown(value));
        std::string text = value.get<std::string>();
        if (text.size() > 2 && text[0] == '0' && (text[1] == 'x' || text[1] == 'X'))
            text.erase(0, 2);
        if (text.empty()) fail(path, shown(value) + " is not a hexadecimal number");
        size_t bit = 0;
        for (auto it = text.rbegin(); it != text.rend(); ++it, bit += 4) {
            const char c = *it;
            unsigned digit;
            if (c >= '0' && c <= '9') {
                digit = unsigned(c - '0');
            } else if (c >= 'a' && c <= 'f') {
                digit = unsigned(c - 'a' + 10);
            } else if (c >= 'A' && c <= 'F') {
                digit = unsigned(c - 'A' + 10);
            } else {
                fail(path, shown(value) + " is not a hexadecimal number");
            }
            if (bit % 8 == 0) bytes.push_back(0);
            bytes.back() = uint8_t(bytes.back() | (digit << (bit % 8)));
        }
        return bytes;
    }

    std::unique_ptr<BusMaster> master(const json& value, const std::string& path) const {
        expectObject(value, path);
        checkKeys(value, path,
                  {"slaveCount", "periodInt", "periodFrc", "dclkHasReset", "resetPolls",
                   "clockPolls", "clockRunning", "busErrors", "slaves"});
        MasterConfig config;
        auto get = [&](const char* key, const Range& r, auto& field) {
            if (!value.contains(key)) return;
            field = static_cast<std::remove_reference_t<decltype(field)>>(
                number(value.at(key), at(path, key), r));
        };
        auto getFlag = [&](const char* key, bool& field) {
            if (value.contains(key)) field = flag(value.at(key), at(path, key));
        };
        const int64_t maxPolls = std::numeric_limits<int32_t>::max();
        get("slaveCount", Range{0, 255, false}, config.slaveCount);
        get("periodInt", Range{0, 1023, false}, config.periodInt);
        get("periodFrc", Range{0, 1023, false}, config.periodFrc);
        getFlag("dclkHasReset", config.dclkHasReset);
        get("resetPolls", Range{-1, uint64_t(maxPolls), false}, config.resetPolls);
        get("clockPolls", Range{-1, uint64_t(maxPolls), false}, config.clockPolls);
        getFlag("clockRunning", config.clockRunning);
        get("busErrors", Range{0, 3, false}, config.busErrors);

        std::vector<std::optional<BoardSlave>> slaves(config.slaveCount);
        if (value.contains("slaves")) {
            const json& entries = value.at("slaves");
            const std::string slavesPath = at(path, "slaves");
            expectObject(entries, slavesPath);
            for (auto it = entries.begin(); it != entries.end(); ++it) {
                const std::string slavePath = at(slavesPath, it.key());
                const uint32_t index = keyNumber(it.key(), slavePath, "slave index", 255, false);
                if (index >= config.slaveCount) {
                    fail(slavePath, "slave index " + std::to_string(index) +
                                        " is not below slaveCount " +
                                        std::to_string(config.slaveCount));
                }
                if (slaves[index]) {
                    fail(slavePath, "slave " + std::to_string(index) + " is given twice");
                }
                slaves[index] = slave(it.value(), slavePath);
            }
        }
        return std::make_unique<BusMaster>(config, std::move(slaves));
    }

    BoardSlave slave(const json& value, const std::string& path) const {
        static const char* const IDENT_KEYS[BusMaster::IDENT_COUNT] = {
            "slaveType",      "driverVersion", "coreType", "cgVersion",
            "cgAlphaVersion", "edaVersion",    "word6",    "nextSlave"};
        expectObject(value, path);
        checkKeys(value, path,
                  {"slaveType", "driverVersion", "coreType", "cgVersion", "cgAlphaVersion",
                   "edaVersion", "word6", "nextSlave", "faulty", "memory"});
        BoardSlave result;
        for (uint32_t i = 0; i < BusMaster::IDENT_COUNT; ++i) {
            const char* key = IDENT_KEYS[i];
            if (value.contains(key)) {
                result.ident[i] =
                    uint16_t(unsignedNumber(value.at(key), at(path, key), U16_MAX, true));
            }
        }
        if (value.contains("faulty")) result.faulty = flag(value.at("faulty"), at(path, "faulty"));
        if (value.contains("memory")) memory(value.at("memory"), at(path, "memory"), result);
        return result;
    }

    void memory(const json& value, const std::string& path, BoardSlave& slave) const {
        expectObject(value, path);
        std::set<uint32_t> given;
        for (auto it = value.begin(); it != value.end(); ++it) {
            const std::string entryPath = at(path, it.key());
            const uint32_t first =
                keyNumber(it.key(), entryPath, "address", BusMaster::ADDRESS_MASK, true);
            std::vector<uint16_t> words;
            if (it.value().is_array()) {
                for (size_t i = 0; i < it.value().size(); ++i) {
                    words.push_back(uint16_t(unsignedNumber(
                        it.value()[i], entryPath + "[" + std::to_string(i) + "]", U16_MAX, true)));
                }
            } else {
                words.push_back(uint16_t(unsignedNumber(it.value(), entryPath, U16_MAX, true)));
            }
            if (words.size() > BusMaster::ADDRESS_MASK + 1u - first) {
                fail(entryPath, std::to_string(words.size()) + " words from " + hexText(first) +
                                    " run past 0x1FFFF");
            }
            for (size_t i = 0; i < words.size(); ++i) {
                const uint32_t address = first + uint32_t(i);
                if (address >= BusMaster::IDENT_FIRST &&
                    address < BusMaster::IDENT_FIRST + BusMaster::IDENT_COUNT) {
                    fail(entryPath, "address " + hexText(address) +
                                        " holds an identification word (slaveType ... nextSlave)");
                }
                if (!given.insert(address).second) {
                    fail(entryPath, "address " + hexText(address) + " is given twice");
                }
                slave.memory.set(address, words[i]);
            }
        }
    }

    std::string name_;
};

}  // namespace

std::unique_ptr<Board::Impl> readBoard(const std::string& text, const std::string& name) {
    json root;
    StructureCheck check(name);
    try {
        root = json::parse(text, [&check](int, json::parse_event_t event, json& parsed) {
            check.see(event, parsed);
            return true;
        });
    } catch (const json::exception& e) {
        // A number too large for the parser is its out_of_range, not a parse_error. Drop the
        // library's "[json.exception.parse_error.N] " prefix.
        std::string what = e.what();
        const size_t end = what.find("] ");
        if (what.rfind("[json.exception.", 0) == 0 && end != std::string::npos)
            what.erase(0, end + 2);
        throw BoardError(name + ": not valid JSON: " + what);
    }
    return Reader(name).board(root);
}

}  // namespace OrvSim
