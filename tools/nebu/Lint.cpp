// `nebu lint`: the directory file, every register and parameter file it names, and what the
// transceiver slaves' computed parameters need, read with the plug-in's own readers so that
// lint and the plug-in never disagree about what parses.
#include "Lint.h"

#include <algorithm>
#include <cctype>
#include <cstdint>
#include <filesystem>
#include <fstream>
#include <map>
#include <memory>
#include <ostream>
#include <set>
#include <stdexcept>
#include <string>
#include <utility>
#include <vector>

#include "base/OrvNebu_CsvText.h"
#include "host/OrvUtil.h"
#include "hostsim/Sim.h"
#include "params/OrvNebu_DefaultParamReader.h"
#include "params/OrvNebu_ParamChoiceAction.h"
#include "registers/OrvNebu_RegisterHandler.h"
#include "slave/OrvNebu_DirectoryReader.h"

namespace nebu {

namespace {

using OrvRT::Orv_HashMapCStr;
using OrvRT::Orv_Util;
using OrvRT::OrvNebu_CsvText;
using OrvRT::OrvNebu_RegisterHandler;

// The session lint's readers report on; no plug-in session ever has it.
constexpr uint32_t LINT_SESSION = 0x4C494E54u;
// Slave data words carry 16 bits; higher bits of a word never cross the bus.
constexpr uint32_t BUS_WORD_BITS = 16;
const char* const DIRECTORY_FILE = "orvnebu_directory.csv";

std::string hex(uint32_t value) {
    static const char* const DIGITS = "0123456789abcdef";
    std::string text;
    do {
        text.insert(text.begin(), DIGITS[value & 0xFu]);
        value >>= 4;
    } while (value != 0);
    return "0x" + text;
}

std::string bitRange(uint32_t low, uint32_t high) {
    return low == high ? "bit " + std::to_string(low)
                       : "bits " + std::to_string(low) + " to " + std::to_string(high);
}

void stripCR(std::string& line) {
    if (!line.empty() && line.back() == '\r') line.pop_back();
}

class Report {
public:
    // line 0: the file as a whole.
    void add(const std::string& file, uint32_t line, const std::string& text) {
        problems_.push_back(Problem{{file, line, text}, problems_.size()});
    }
    // Sorted by file and line, in the order found within a line.
    std::vector<LintProblem> take() {
        std::sort(problems_.begin(), problems_.end(), [](const Problem& a, const Problem& b) {
            if (a.problem.file != b.problem.file) return a.problem.file < b.problem.file;
            if (a.problem.line != b.problem.line) return a.problem.line < b.problem.line;
            return a.sequence < b.sequence;
        });
        std::vector<LintProblem> sorted;
        for (Problem& p : problems_) sorted.push_back(std::move(p.problem));
        problems_.clear();
        return sorted;
    }

private:
    struct Problem {
        LintProblem problem;
        size_t sequence;
    };
    std::vector<Problem> problems_;
};

// What the readers send on lint's session while a file is read.
class MessageLog {
public:
    MessageLog() {
        OrvSim::setMessageSink([this](uint32_t handle, uint32_t severity, const std::string& text) {
            if (handle == LINT_SESSION) messages_.emplace_back(severity, text);
        });
    }
    ~MessageLog() { OrvSim::setMessageSink(nullptr); }
    MessageLog(const MessageLog&) = delete;
    MessageLog& operator=(const MessageLog&) = delete;

    void clear() { messages_.clear(); }
    const std::vector<std::pair<uint32_t, std::string>>& messages() const { return messages_; }

private:
    std::vector<std::pair<uint32_t, std::string>> messages_;
};

// A register file read line by line with the register handler's own line parser, going on
// after a refused line (the plug-in stops there) so that every bad line is reported.
class RegisterFileCheck : public OrvNebu_RegisterHandler {
public:
    explicit RegisterFileCheck(const std::string& path)
        : OrvNebu_RegisterHandler(LINT_SESSION, path) {}

    // False when the file cannot be opened.
    bool read(Report& report) {
        std::ifstream in;
        OrvNebu_CsvText::openFile(in, regFilename_);
        if (!in.is_open()) return false;
        std::string line;
        if (!std::getline(in, line)) return true;
        uint32_t lineNumber = 1;
        while (std::getline(in, line)) {
            ++lineNumber;
            Orv_Util::stripEndingCR(line);
            const size_t before = slices_.size();
            try {
                if (!parseLine(lineNumber, line)) {
                    report.add(
                        regFilename_, lineNumber,
                        (line.empty()
                             ? std::string("empty line")
                             : "line of " + std::to_string(columnCount(line)) + " columns") +
                            ": a register line needs 9 columns (the plug-in refuses the file)");
                    clean_ = false;
                    continue;
                }
            } catch (const std::exception& e) {
                report.add(regFilename_, lineNumber,
                           std::string(e.what()) + " (the plug-in refuses the file)");
                clean_ = false;
                continue;
            }
            // The deque keeps earlier slices in place as it grows.
            if (slices_.size() > before) lines_.emplace_back(lineNumber, &slices_.back());
        }
        if (in.bad()) {
            report.add(regFilename_, 0, "cannot be read");
            clean_ = false;
        }
        return true;
    }

    void checkSlices(Report& report) const {
        struct Placed {
            uint32_t line;
            uint32_t mask;
            const RegisterSlice* slice;
        };
        std::map<uint32_t, std::vector<Placed>> words;
        for (const auto& entry : lines_) {
            const uint32_t line = entry.first;
            const RegisterSlice& s = *entry.second;
            const uint32_t low = std::min(s.startBit, s.endBit);
            const uint32_t high = std::max(s.startBit, s.endBit);
            if (s.registerName.empty()) {
                report.add(regFilename_, line,
                           "slice without a register name: no call can reach it");
            }
            if (high >= BUS_WORD_BITS) {
                report.add(regFilename_, line,
                           "register " + s.registerName + ": " + bitRange(low, high) + " of word " +
                               hex(s.address) + " lie beyond the " + std::to_string(BUS_WORD_BITS) +
                               "-bit bus word");
            }
            // Parsed slices lie within bits 0 to 31.
            const uint32_t width = high - low + 1;
            const uint32_t mask = (width >= 32 ? 0xFFFFFFFFu : ((1u << width) - 1u)) << low;
            std::vector<Placed>& placed = words[s.address];
            for (const Placed& other : placed) {
                const uint32_t common = mask & other.mask;
                // Two read-only views of the same bits (an alias, a mirrored order) cannot
                // clobber each other; a writable one can.
                if (common == 0 || other.slice->registerName == s.registerName ||
                    (!s.writable && !other.slice->writable)) {
                    continue;
                }
                uint32_t first = 0;
                while (((common >> first) & 1u) == 0) ++first;
                uint32_t last = 31;
                while (((common >> last) & 1u) == 0) --last;
                report.add(regFilename_, line,
                           "register " + s.registerName + " overlaps register " +
                               other.slice->registerName + " (line " + std::to_string(other.line) +
                               ") in " + bitRange(first, last) + " of word " + hex(s.address));
            }
            placed.push_back(Placed{line, mask, &s});
        }
    }

    // Every line parsed: what the plug-in would hold.
    bool clean() const { return clean_; }

    void getRegisters(uint32_t, const ORV_SLAVE_REF&, Orv_HashMapCStr*) override {
        throw std::logic_error("a register file check moves no registers");
    }
    void setRegisters(uint32_t, const ORV_SLAVE_REF&, Orv_HashMapCStr*) override {
        throw std::logic_error("a register file check moves no registers");
    }

private:
    static size_t columnCount(const std::string& line) {
        return static_cast<size_t>(std::count(line.begin(), line.end(), ',')) + 1;
    }

    std::vector<std::pair<uint32_t, const RegisterSlice*>> lines_;
    bool clean_ = true;
};

// Reads a parameter file the way a slave's initialisation does; the actions stay in the
// reader's cache under lint's session until the session ends.
class ParamFileCheck {
public:
    ParamFileCheck(const std::string& path, MessageLog& log) : path_(path), log_(log) {}

    // False when the file could not be read; the reader's messages become problems, those of
    // an unopenable file on the directory line that names it.
    // hint: added to the message of a file that does not open.
    bool read(Report& report, const std::string& directoryFile, uint32_t directoryLine,
              const std::string& hint) {
        log_.clear();
        try {
            OrvRT::OrvNebu_DefaultParamReader::addToHashMap(LINT_SESSION, path_, actions_);
            return true;
        } catch (...) {
        }
        std::string reason;
        const std::string parsePrefix = "Unable to parse file: " + path_ + " line:";
        for (const auto& message : log_.messages()) {
            const std::string& text = message.second;
            if (text.compare(0, parsePrefix.size(), parsePrefix) == 0) {
                const uint32_t line = static_cast<uint32_t>(
                    OrvNebu_CsvText::decimalToInt32(text.substr(parsePrefix.size())));
                report.add(path_, line,
                           (reason.empty()
                                ? std::string("malformed row: a row needs 4 fields and settings "
                                              "of the form REGISTER=bits")
                                : reason) +
                               " (the plug-in refuses the file)");
                return false;
            }
            if (text.rfind("Unable to open ", 0) == 0) {
                report.add(directoryFile, directoryLine, text + hint);
                return false;
            }
            reason = text;
        }
        report.add(directoryFile, directoryLine,
                   "the parameter file " + path_ + " cannot be read" +
                       (reason.empty() ? std::string() : ": " + reason));
        return false;
    }

    bool has(const std::string& name) const { return actions_.count(name) != 0; }

    // Settings that name registers the register file lacks, or values wider than them.
    void checkSettings(Report& report, const RegisterFileCheck& registers) const {
        for (const auto& entry : actions_) {
            auto* action = dynamic_cast<OrvRT::OrvNebu_ParamChoiceAction*>(entry.second);
            if (action == nullptr || entry.first != action->getParamName()) continue;
            // Each row adds one choice, so choice i sits i rows below the parameter's first.
            const uint32_t firstLine =
                action->getPriority() - OrvRT::OrvNebu_ParamChoiceAction::START_PRIORITY;
            const auto& choices = action->getChoiceList();
            for (size_t i = 0; i < choices.size(); ++i) {
                const uint32_t line = firstLine + static_cast<uint32_t>(i);
                for (const auto& setting : choices[i].getRegValueList()) {
                    const auto* reg = registers.findRegister(setting.first);
                    const std::string where = "parameter " + action->getParamName() + ", choice " +
                                              choices[i].getChoiceName() + ": ";
                    if (reg == nullptr) {
                        report.add(path_, line,
                                   where + "register " + setting.first + " is not in " +
                                       registers.getRegFilename());
                        continue;
                    }
                    const uint32_t bits = significantBits(setting.second);
                    if (bits > reg->totalWidth) {
                        report.add(path_, line,
                                   where + "value 0x" + setting.second + " of register " +
                                       setting.first + " needs " + std::to_string(bits) +
                                       " bits, the register has " +
                                       std::to_string(reg->totalWidth));
                    }
                }
            }
        }
    }

private:
    // Bits needed by a hexadecimal value text (as the reader converts the binary digits).
    static uint32_t significantBits(const std::string& hexText) {
        size_t i = 0;
        while (i < hexText.size() && hexText[i] == '0') ++i;
        if (i == hexText.size()) return 0;
        const char c = static_cast<char>(std::toupper(static_cast<unsigned char>(hexText[i])));
        const uint32_t digit = static_cast<uint32_t>(c >= 'A' ? c - 'A' + 10 : c - '0') & 0xFu;
        uint32_t top = 0;
        while ((digit >> top) > 1u) ++top;
        const uint64_t bits = static_cast<uint64_t>(hexText.size() - i - 1) * 4u + top + 1u;
        return bits > UINT32_MAX ? UINT32_MAX : static_cast<uint32_t>(bits);
    }

    std::string path_;
    MessageLog& log_;
    OrvRT::OrvNebu_ActionsMap actions_;
};

// What the computed parameters of a transceiver slave class read and choose from.
struct TransceiverNeeds {
    const char* className;
    std::vector<std::string> registers;
    std::vector<std::string> parameters;
};

std::vector<std::string> counterRegisters(const std::vector<std::string>& clocks,
                                          const std::vector<std::string>& suffixes) {
    std::vector<std::string> names;
    for (const std::string& suffix : suffixes) {
        for (const std::string& clock : clocks) {
            names.push_back(clock + "_FREQ_CNT" + suffix);
            names.push_back(clock + "_FREQ_TUNE" + suffix);
        }
    }
    return names;
}

const TransceiverNeeds& m3QrcNeeds() {
    static const TransceiverNeeds needs = [] {
        TransceiverNeeds n{"M3Qrc",
                           counterRegisters({"TXOUTCLK", "RXRECCLK", "TXUSRCLK", "TXUSRCLK2",
                                             "RXUSRCLK", "RXUSRCLK2"},
                                            {"0", "1"}),
                           {}};
        n.registers.push_back("MAX_LINERATE");
        for (const char* c : {"0", "1"}) {
            for (const char* p : {"pll_divsel_fb_", "pll_divsel_ref_", "pll_txdivsel_out_",
                                  "pll_rxdivsel_out_", "tx_data_width"}) {
                n.parameters.push_back(std::string(p) + c);
            }
        }
        return n;
    }();
    return needs;
}

const TransceiverNeeds& r3QraNeeds() {
    static const TransceiverNeeds needs = [] {
        TransceiverNeeds n{
            "R3Qra",
            counterRegisters(
                {"TXUSRCLK", "TXUSRCLK2", "RXUSRCLK", "RXUSRCLK2", "TXOUTCLK", "RXRECCLK"}, {""}),
            {"txpll_divsel_fb", "txpll_divsel45_fb", "txpll_divsel_ref", "txpll_divsel_out",
             "rxpll_divsel_fb", "rxpll_divsel_ref", "rxpll_divsel_out", "tx_data_width"}};
        n.registers.push_back("MAX_LINERATE");
        n.registers.push_back("TX_OVERSAMPLE_MODE");
        return n;
    }();
    return needs;
}

const TransceiverNeeds& r2QraNeeds() {
    static const TransceiverNeeds needs = [] {
        TransceiverNeeds n{
            "R2Qra",
            counterRegisters({"TXUSRCLK", "TXUSRCLK2", "RXUSRCLK", "RXUSRCLK2"}, {"0", "1"}),
            {"pll_divsel_fb", "pll_divsel_ref", "pll_rxdivsel_out_0", "pll_rxdivsel_out_1"}};
        for (const char* r : {"INTDATAWIDTH", "CLKSOUTH_SEL", "CLKNORTH_SEL", "REFCLKSEL",
                              "DUAL_NUMBER", "DUAL_COORDINATE"}) {
            n.registers.push_back(r);
        }
        return n;
    }();
    return needs;
}

const TransceiverNeeds& r3QrbNeeds() {
    static const TransceiverNeeds needs = [] {
        TransceiverNeeds n{"R3Qrb", counterRegisters({"TXUSERCLKOUT"}, {""}), {}};
        const auto rx = counterRegisters({"RXUSERCLKOUT"}, {"0", "1", "2", "3"});
        n.registers.insert(n.registers.end(), rx.begin(), rx.end());
        return n;
    }();
    return needs;
}

// The slave factory's transceiver records: type, driver versions, class.
struct TransceiverRecord {
    int32_t slaveType;
    int32_t minVersion;
    int32_t maxVersion;
    const TransceiverNeeds& (*needs)();
};
const TransceiverRecord TRANSCEIVER_RECORDS[] = {
    {0x01, 1, 1, m3QrcNeeds}, {0x15, 1, 0xFFFF, r3QraNeeds}, {0x42, 1, 1, r2QraNeeds},
    {0x43, 1, 1, r3QraNeeds}, {0x44, 1, 1, m3QrcNeeds},      {0x45, 1, 1, r3QrbNeeds},
};

using DirectoryLine = LintDirectoryLine;

bool isDirectory(const std::string& path) {
    std::error_code error;
    return std::filesystem::is_directory(path, error);
}

bool canOpen(const std::string& path) {
    std::ifstream in;
    OrvNebu_CsvText::openFile(in, path);
    return in.is_open() && !isDirectory(path);
}

std::string typeText(int32_t type) { return hex(static_cast<uint32_t>(type)); }

class Linter {
public:
    Linter(const std::string& dataDir, Report& report)
        : dataDir_(dataDir), directoryFile_(dataDir + DIRECTORY_FILE), report_(report) {}

    // The lines that reach the key columns.
    std::vector<DirectoryLine> run() {
        std::vector<DirectoryLine> lines;
        if (!readDirectory(lines)) return lines;
        checkOverlaps(lines);
        for (const DirectoryLine& d : lines) checkFiles(d);
        return lines;
    }

    size_t filesRead() const {
        size_t n = 0;
        for (const auto& f : registerFiles_) n += f.second != nullptr ? 1 : 0;
        for (const auto& f : paramFiles_) n += f.second != nullptr ? 1 : 0;
        return n;
    }

private:
    // The library's reader judges whether the file opens and its header is usable; the walk
    // over every line follows the same rules.
    bool readDirectory(std::vector<DirectoryLine>& lines) {
        log_.clear();
        try {
            Orv_HashMapCStr entry;
            // No slave has this type, so the reader goes through the whole file.
            OrvRT::OrvNebu_DirectoryReader::getEntry(LINT_SESSION, directoryFile_, INT32_MIN,
                                                     INT32_MIN, entry);
        } catch (...) {
            const std::string text =
                log_.messages().empty() ? "cannot be read" : log_.messages().front().second;
            if (text.rfind("Unable to parse header", 0) == 0) {
                report_.add(directoryFile_, 1,
                            text +
                                ": the header needs at least 5 columns, among them "
                                "slave_type, orv_drv_ver_min and orv_drv_ver_max");
            } else {
                report_.add(directoryFile_, 0, text);
            }
            return false;
        }
        std::ifstream in;
        OrvNebu_CsvText::openFile(in, directoryFile_);
        std::string line;
        std::getline(in, line);
        stripCR(line);
        std::transform(line.begin(), line.end(), line.begin(),
                       [](unsigned char c) { return static_cast<char>(std::tolower(c)); });
        std::vector<std::string> header;
        OrvNebu_CsvText::splitCommas(line, header);
        int32_t typeColumn = -1, minColumn = -1, maxColumn = -1, regColumn = -1, paramColumn = -1;
        for (size_t i = header.size(); i-- > 0;) {
            const std::string name = Orv_Util::trimWhitespace(header[i]);
            const int32_t column = static_cast<int32_t>(i);
            if (name == "slave_type")
                typeColumn = column;
            else if (name == "orv_drv_ver_min")
                minColumn = column;
            else if (name == "orv_drv_ver_max")
                maxColumn = column;
            else if (name == "registers")
                regColumn = column;
            else if (name == "parameters")
                paramColumn = column;
        }
        const int32_t highest = std::max(typeColumn, std::max(minColumn, maxColumn));
        if (regColumn < 0) {
            report_.add(directoryFile_, 1,
                        "the header has no registers column: no slave can be created");
        }
        std::vector<std::string> fields;
        uint32_t lineNumber = 1;
        while (std::getline(in, line)) {
            ++lineNumber;
            stripCR(line);
            OrvNebu_CsvText::splitCommas(line, fields);
            if (static_cast<int64_t>(fields.size()) <= highest) {
                // The reader passes over such lines; only a blank one can be meant so.
                if (line.find_first_not_of(" \t") != std::string::npos) {
                    report_.add(directoryFile_, lineNumber,
                                "line of " + std::to_string(fields.size()) +
                                    " fields is never used: the key columns need " +
                                    std::to_string(highest + 1));
                }
                continue;
            }
            DirectoryLine d;
            d.line = lineNumber;
            d.slaveType = OrvNebu_CsvText::autoBaseToInt32(fields[static_cast<size_t>(typeColumn)]);
            d.minVersion = OrvNebu_CsvText::autoBaseToInt32(fields[static_cast<size_t>(minColumn)]);
            d.maxVersion = OrvNebu_CsvText::autoBaseToInt32(fields[static_cast<size_t>(maxColumn)]);
            auto field = [&](int32_t column) {
                return column >= 0 && static_cast<size_t>(column) < fields.size()
                           ? fields[static_cast<size_t>(column)]
                           : std::string();
            };
            d.registers = field(regColumn);
            d.parameters = field(paramColumn);
            if (d.minVersion > d.maxVersion) {
                report_.add(directoryFile_, lineNumber,
                            "slave type " + typeText(d.slaveType) + ": driver versions " +
                                std::to_string(d.minVersion) + " to " +
                                std::to_string(d.maxVersion) + " is an empty range");
            }
            if (d.registers.empty() && regColumn >= 0) {
                report_.add(directoryFile_, lineNumber,
                            "slave type " + typeText(d.slaveType) +
                                " has no register file: its slaves cannot be created");
            }
            lines.push_back(d);
        }
        return true;
    }

    void checkOverlaps(const std::vector<DirectoryLine>& lines) {
        for (size_t i = 0; i < lines.size(); ++i) {
            const DirectoryLine& d = lines[i];
            if (d.minVersion > d.maxVersion) continue;
            for (size_t j = 0; j < i; ++j) {
                const DirectoryLine& e = lines[j];
                if (e.slaveType != d.slaveType || e.minVersion > e.maxVersion) continue;
                const int32_t low = std::max(d.minVersion, e.minVersion);
                const int32_t high = std::min(d.maxVersion, e.maxVersion);
                if (low > high) continue;
                report_.add(directoryFile_, d.line,
                            "slave type " + typeText(d.slaveType) + ": driver versions " +
                                std::to_string(low) + " to " + std::to_string(high) +
                                " are already covered by line " + std::to_string(e.line) +
                                ", which wins");
                break;
            }
        }
    }

    RegisterFileCheck* registerFile(const DirectoryLine& d) {
        if (d.registers.empty()) return nullptr;
        const std::string path = dataDir_ + d.registers;
        auto it = registerFiles_.find(path);
        if (it != registerFiles_.end()) return it->second.get();
        std::unique_ptr<RegisterFileCheck> check(new RegisterFileCheck(path));
        if (isDirectory(path) || !check->read(report_)) {
            report_.add(directoryFile_, d.line,
                        "Unable to open OrvNebu register file: " + path + blankHint(d.registers));
            check.reset();
        } else {
            check->checkSlices(report_);
        }
        return (registerFiles_[path] = std::move(check)).get();
    }

    ParamFileCheck* paramFile(const DirectoryLine& d) {
        if (d.parameters.empty()) return nullptr;
        const std::string path = dataDir_ + d.parameters;
        auto it = paramFiles_.find(path);
        if (it != paramFiles_.end()) return it->second.get();
        std::unique_ptr<ParamFileCheck> check(new ParamFileCheck(path, log_));
        bool read = false;
        if (isDirectory(path)) {
            report_.add(directoryFile_, d.line, "Unable to open OrvNebu parameter file: " + path);
        } else {
            read = check->read(report_, directoryFile_, d.line, blankHint(d.parameters));
        }
        if (!read) check.reset();
        return (paramFiles_[path] = std::move(check)).get();
    }

    // Directory values are used as they stand; blanks around a name are a common slip.
    std::string blankHint(const std::string& name) const {
        const std::string trimmed = Orv_Util::trimWhitespace(name);
        if (trimmed == name || trimmed.empty() || !canOpen(dataDir_ + trimmed)) return "";
        return " (blanks around the name are part of it)";
    }

    void checkFiles(const DirectoryLine& d) {
        RegisterFileCheck* registers = registerFile(d);
        ParamFileCheck* params = paramFile(d);
        if (registers != nullptr && params != nullptr && registers->clean()) {
            const std::string key = registers->getRegFilename() + '\n' + dataDir_ + d.parameters;
            if (settingsChecked_.insert(key).second) params->checkSettings(report_, *registers);
        }
        for (const TransceiverRecord& record : TRANSCEIVER_RECORDS) {
            if (record.slaveType != d.slaveType || d.minVersion > d.maxVersion ||
                record.maxVersion < d.minVersion || record.minVersion > d.maxVersion) {
                continue;
            }
            const TransceiverNeeds& needs = record.needs();
            const std::string what =
                "slave type " + typeText(d.slaveType) + " (" + needs.className + " transceiver)";
            if (d.parameters.empty()) {
                report_.add(directoryFile_, d.line,
                            what + " has no parameter file, so none of its computed parameters");
            }
            if (registers != nullptr && registers->clean()) {
                for (const std::string& name : needs.registers) {
                    if (registers->findRegister(name) == nullptr) {
                        report_.add(directoryFile_, d.line,
                                    what + " needs register " + name + ", which " +
                                        registers->getRegFilename() + " lacks");
                    }
                }
            }
            if (params != nullptr) {
                for (const std::string& name : needs.parameters) {
                    if (!params->has(name)) {
                        report_.add(directoryFile_, d.line,
                                    what + " needs parameter " + name + ", which " + dataDir_ +
                                        d.parameters + " lacks");
                    }
                }
            }
        }
    }

    std::string dataDir_;
    std::string directoryFile_;
    Report& report_;
    MessageLog log_;
    std::map<std::string, std::unique_ptr<RegisterFileCheck>> registerFiles_;
    std::map<std::string, std::unique_ptr<ParamFileCheck>> paramFiles_;
    std::set<std::string> settingsChecked_;
};

}  // namespace

LintResult lintDataDir(const std::string& dataDir) {
    Report report;
    LintResult result;
    {
        Linter linter(dataDir, report);
        result.directoryLines = linter.run();
        result.filesRead = linter.filesRead();
    }
    // The parameter reader keeps lint's files cached under its session until it ends.
    OrvSim::endSession(LINT_SESSION);
    result.problems = report.take();
    return result;
}

int runLint(const std::vector<std::string>& args, const std::string& defaultDataDir,
            std::ostream& out, std::ostream& err) {
    std::string dataDir = defaultDataDir;
    size_t given = 0;
    for (const std::string& arg : args) {
        if (arg == "--help" || arg == "-h") {
            out << "usage: nebu lint [DATA_DIR]\n"
                   "  checks the directory file of DATA_DIR (default: the demo data directory),\n"
                   "  the register and parameter files it names and what transceiver slaves\n"
                   "  need; prints FILE:LINE: problem lines and a summary; exit status 0 when\n"
                   "  clean, 1 with problems, 2 for a usage error\n";
            return 0;
        }
        if (arg.size() > 1 && arg[0] == '-') {
            err << "nebu: unknown lint option '" << arg << "'" << std::endl;
            return 2;
        }
        if (++given > 1) {
            err << "nebu: lint takes one data directory, not also '" << arg << "'" << std::endl;
            return 2;
        }
        dataDir = arg;
    }
    if (dataDir.empty() || !isDirectory(dataDir)) {
        err << "nebu: lint: no data directory '" << dataDir << "'" << std::endl;
        return 2;
    }
#if defined(_WIN32)
    const bool separated = dataDir.back() == '/' || dataDir.back() == '\\';
#else
    const bool separated = dataDir.back() == '/';
#endif
    // '/' joins on Windows too, as the stand-in host joins the data directory.
    if (!separated) dataDir += '/';

    const LintResult result = lintDataDir(dataDir);
    for (const LintProblem& p : result.problems) {
        out << p.file;
        if (p.line != 0) out << ':' << p.line;
        out << ": " << p.text << '\n';
    }
    const size_t n = result.problems.size();
    out << "lint " << dataDir << ": " << result.directoryLines.size() << " directory lines, "
        << result.filesRead << " definition files, ";
    if (n == 0) {
        out << "no problems" << std::endl;
        return 0;
    }
    out << n << (n == 1 ? " problem" : " problems") << std::endl;
    return 1;
}

}  // namespace nebu
