// Register definition files: reading, the register model, checks, the printed image.
#include "base/OrvNebu_RegisterFile.h"

#include <algorithm>
#include <exception>
#include <fstream>
#include <map>

#include "base/OrvNebu_CsvText.h"
#include "host/OrvUtil.h"

namespace OrvRT {

namespace {

std::string bitRange(uint32_t low, uint32_t high) {
    return low == high ? "bit " + std::to_string(low)
                       : "bits " + std::to_string(low) + " to " + std::to_string(high);
}

uint32_t bitMask(const OrvNebu_RegisterFile::RegisterSlice& s) {
    const uint32_t width = s.highBit() - s.lowBit() + 1;
    return (width >= 32 ? 0xFFFFFFFFu : ((1u << width) - 1u)) << s.lowBit();
}

// The lowest and highest bit set in a non-zero mask, as a bit range text.
std::string maskRange(uint32_t mask) {
    uint32_t first = 0;
    while (((mask >> first) & 1u) == 0) ++first;
    uint32_t last = 31;
    while (((mask >> last) & 1u) == 0) --last;
    return bitRange(first, last);
}

bool isHexNumber(const std::string& text) {
    try {
        return !text.empty() && text.find_first_not_of(" \t") != std::string::npos &&
               (Orv_NumberUtil::hexStr2UInt(text), true);
    } catch (const std::exception&) {
        return false;
    }
}

bool startsWithNumber(const std::string& text) {
    size_t i = text.find_first_not_of(" \t");
    if (i != std::string::npos && (text[i] == '+' || text[i] == '-')) ++i;
    return i < text.size() && text[i] >= '0' && text[i] <= '9';
}

}  // namespace

void OrvNebu_RegisterFile::RegisterSlice::appendDigits(uint32_t word, std::string& digits) const {
    if (endBit >= startBit) {
        for (uint32_t bit = endBit + 1; bit-- > startBit;)
            digits += ((word >> bit) & 1u) ? '1' : '0';
    } else {
        for (uint32_t bit = endBit; bit <= startBit; ++bit)
            digits += ((word >> bit) & 1u) ? '1' : '0';
    }
}

void OrvNebu_RegisterFile::RegisterSlice::mergeDigits(const std::string& digits, size_t pos,
                                                      uint32_t& value, uint32_t& keepMask) const {
    const uint32_t n = width();
    for (uint32_t i = 0; i < n; ++i) {
        uint32_t bit = endBit >= startBit ? endBit - i : endBit + i;
        uint32_t mask = 1u << bit;
        if (digits[pos + i] == '1') value |= mask;
        keepMask &= ~mask;
    }
}

OrvNebu_RegisterFile::OrvNebu_RegisterFile(const std::string& path, Reading reading) : path_(path) {
    std::ifstream in;
    OrvNebu_CsvText::openFile(in, path_);
    if (in.is_open()) readLines(in, reading);
    if (!opened_) {
        // What was read of a file that fails part way is not the file.
        lines_.clear();
        registers_.clear();
        minAddress_ = 0xFFFFFFFFu;
        maxAddress_ = 0;
        problems_.clear();
        problems_.push_back(OrvNebu_FileProblem::unreadable(
            path_, "Unable to open OrvNebu register file: " + path_));
        return;
    }
    if (reading == EVERY_PROBLEM) {
        checkSlices();
        checkSpan();
    }
}

void OrvNebu_RegisterFile::readLines(std::istream& in, Reading reading) {
    std::string line;
    if (!std::getline(in, line)) {
        // A path that opens but cannot be read (a directory) must not pass for an empty file.
        opened_ = !in.bad();
        return;
    }
    if (reading == EVERY_PROBLEM) checkFirstLine(line);
    Orv_Util::stripEndingCR(line);
    header_ = line;
    uint32_t lineNumber = 1;
    while (std::getline(in, line)) {
        ++lineNumber;
        Orv_Util::stripEndingCR(line);
        if (!parseLine(lineNumber, line) && reading == FIRST_REFUSAL) break;
    }
    // A read error part way must not leave a model that silently lacks registers.
    opened_ = !in.bad();
}

bool OrvNebu_RegisterFile::parseLine(uint32_t lineNumber, const std::string& line) {
    std::vector<std::string>& cols = columns_;
    OrvNebu_CsvText::splitCommas(line, cols);
    if (cols.size() < MIN_COLUMNS) {
        refuseLine(lineNumber, line, 0, OrvNebu_FileProblem::SEVERITY_MALFORMED_LINE,
                   (line.empty() ? std::string("empty line")
                                 : "line of " + std::to_string(cols.size()) + " columns") +
                       ": a register line needs 9 columns");
        return false;
    }
    Orv_Util::unQuote(cols);
    RegisterSlice slice;
    slice.line = lineNumber;
    try {
        slice.address = Orv_NumberUtil::hexStr2UInt(cols[1]);
    } catch (const std::exception& e) {
        refuseLine(lineNumber, line, 2, OrvNebu_FileProblem::SEVERITY_ERROR, e.what());
        return false;
    }
    slice.order = static_cast<uint32_t>(OrvNebu_CsvText::decimalToInt32(cols[2]));
    slice.startBit = static_cast<uint32_t>(OrvNebu_CsvText::decimalToInt32(cols[3]));
    slice.endBit = static_cast<uint32_t>(OrvNebu_CsvText::decimalToInt32(cols[4]));
    slice.included = cols[8].find('n') == std::string::npos;
    // A word has bits 0 to 31 and the bus 17 address bits: anything else cannot be moved. An
    // excluded line is not looked at.
    if (slice.included && (slice.startBit > HIGHEST_WORD_BIT || slice.endBit > HIGHEST_WORD_BIT)) {
        refuseLine(
            lineNumber, line, slice.startBit > HIGHEST_WORD_BIT ? 4 : 5,
            OrvNebu_FileProblem::SEVERITY_ERROR,
            "Register bit out of range 0 to 31: start bit " + cols[3] + ", end bit " + cols[4]);
        return false;
    }
    if (slice.included && slice.address > MAX_BUS_ADDRESS) {
        refuseLine(lineNumber, line, 2, OrvNebu_FileProblem::SEVERITY_ERROR,
                   "Register address out of range 0 to 1ffff: " + cols[1]);
        return false;
    }
    slice.readable = cols[6].find('r') != std::string::npos;
    slice.writable = cols[6].find('w') != std::string::npos;
    if (cols.size() >= MIN_COLUMNS + 1) slice.trailer = line.substr(line.rfind(','));
    slice.registerName = std::move(cols[0]);
    slice.text6 = std::move(cols[5]);
    slice.text8 = std::move(cols[7]);
    addSlice(std::move(slice));
    return true;
}

void OrvNebu_RegisterFile::addSlice(RegisterSlice&& slice) {
    lines_.push_back(std::move(slice));
    const RegisterSlice* s = &lines_.back();
    if (!s->included) return;
    // A line without a name belongs to no register: it is kept for the file image only,
    // since no call can ever name it.
    if (!s->registerName.empty()) {
        Register& reg = registers_[s->registerName];
        if (reg.slices.empty()) reg.name = s->registerName;
        auto pos = std::upper_bound(
            reg.slices.begin(), reg.slices.end(), s->order,
            [](uint32_t order, const RegisterSlice* other) { return order < other->order; });
        reg.slices.insert(pos, s);
        reg.totalWidth += s->width();
        reg.minAddress = std::min(reg.minAddress, s->address);
        reg.maxAddress = std::max(reg.maxAddress, s->address);
    }
    minAddress_ = std::min(minAddress_, s->address);
    maxAddress_ = std::max(maxAddress_, s->address);
}

void OrvNebu_RegisterFile::refuseLine(uint32_t lineNumber, const std::string& line, uint32_t column,
                                      uint32_t severity, const std::string& text) {
    OrvNebu_FileProblem problem{path_, lineNumber, column, severity, text, {}};
    if (severity == OrvNebu_FileProblem::SEVERITY_ERROR)
        problem.messages.push_back({severity, text});
    problem.messages.push_back({OrvNebu_FileProblem::SEVERITY_MALFORMED_LINE,
                                "Unable to parse file: " + path_ +
                                    " line:" + std::to_string(lineNumber) + ": " + line + "\n"});
    problems_.push_back(std::move(problem));
}

void OrvNebu_RegisterFile::warn(uint32_t line, uint32_t column, const std::string& text) {
    problems_.push_back({path_, line, column, OrvNebu_FileProblem::SEVERITY_WARNING, text, {}});
}

void OrvNebu_RegisterFile::checkFirstLine(const std::string& line) {
    if (OrvNebu_CsvText::hasInnerCR(line)) {
        warn(1, 0,
             "line ends are carriage returns alone: the plug-in reads the whole file as one "
             "header line and finds no registers");
        return;
    }
    std::string first = line;
    Orv_Util::stripEndingCR(first);
    std::vector<std::string> cols;
    OrvNebu_CsvText::splitCommas(first, cols);
    Orv_Util::unQuote(cols);
    if (cols.size() >= MIN_COLUMNS && isHexNumber(cols[1]) && startsWithNumber(cols[2]) &&
        startsWithNumber(cols[3]) && startsWithNumber(cols[4])) {
        warn(1, 0,
             "the first line is a register line, but the first line of a register file is "
             "its header: register " +
                 cols[0] + " is lost");
    }
}

void OrvNebu_RegisterFile::checkSlices() {
    struct Placed {
        uint32_t mask;
        const RegisterSlice* slice;
    };
    std::map<uint32_t, std::vector<Placed>> words;
    for (const RegisterSlice& s : lines_) {
        if (!s.included) continue;
        const std::string where =
            bitRange(s.lowBit(), s.highBit()) + " of word 0x" + OrvNebu_CsvText::hexText(s.address);
        if (s.registerName.empty())
            warn(s.line, 1, "slice without a register name: no call can reach it");
        if (s.highBit() >= BUS_WORD_BITS) {
            warn(s.line, 4,
                 "register " + s.registerName + ": " + where + " lie beyond the " +
                     std::to_string(BUS_WORD_BITS) + "-bit bus word");
        }
        const uint32_t mask = bitMask(s);
        std::vector<Placed>& placed = words[s.address];
        for (const Placed& other : placed) {
            const uint32_t common = mask & other.mask;
            if (common == 0) continue;
            const std::string shared =
                maskRange(common) + " of word 0x" + OrvNebu_CsvText::hexText(s.address);
            if (other.slice->registerName == s.registerName) {
                if (s.registerName.empty()) continue;
                // One register holding a bit twice: a write sets it from two digits, a read
                // repeats it.
                warn(s.line, 4,
                     "register " + s.registerName + " holds " + shared + " twice (also on line " +
                         std::to_string(other.slice->line) +
                         "): a value written does not read back");
            } else if (s.writable || other.slice->writable) {
                // Two read-only views of the same bits (an alias, a mirrored order) cannot
                // clobber each other; a writable one can.
                warn(s.line, 4,
                     "register " + s.registerName + " overlaps register " +
                         other.slice->registerName + " (line " + std::to_string(other.slice->line) +
                         ") in " + shared);
            }
        }
        placed.push_back(Placed{mask, &s});
    }
}

void OrvNebu_RegisterFile::checkSpan() {
    // The line at which the included lines first span more than one burst.
    uint32_t low = 0xFFFFFFFFu;
    uint32_t high = 0;
    const RegisterSlice* lowSlice = nullptr;
    const RegisterSlice* highSlice = nullptr;
    for (const RegisterSlice& s : lines_) {
        if (!s.included) continue;
        if (s.address < low) {
            low = s.address;
            lowSlice = &s;
        }
        if (s.address > high) {
            high = s.address;
            highSlice = &s;
        }
        if (high >= low && high - low >= MAX_BURST_WORDS) {
            warn(s.line, 2,
                 "registers span words 0x" + OrvNebu_CsvText::hexText(low) + " (line " +
                     std::to_string(lowSlice->line) + ") to 0x" + OrvNebu_CsvText::hexText(high) +
                     " (line " + std::to_string(highSlice->line) + "): " +
                     std::to_string(high - low + 1) + " words, more than one burst moves (" +
                     std::to_string(MAX_BURST_WORDS) + "), so a read of every register fails");
            return;
        }
    }
}

const OrvNebu_RegisterFile::Register* OrvNebu_RegisterFile::findRegister(
    const std::string& name) const {
    if (name.empty()) return nullptr;
    auto it = registers_.find(name);
    return it == registers_.end() ? nullptr : &it->second;
}

void OrvNebu_RegisterFile::print(std::ostream& out) const {
    out << header_ << '\n' << std::flush;
    for (const RegisterSlice& s : lines_) {
        if (!s.included) continue;
        out << s.registerName << ',';
        if (s.address >= 10 && s.address <= 15) out << '0';
        out << OrvNebu_CsvText::hexText(s.address) << ',' << s.order << ',' << s.startBit << ','
            << s.endBit << ',' << s.text6 << ',' << (s.readable ? "r" : "")
            << (s.writable ? "w" : "") << ',' << s.text8 << ",y" << s.trailer << '\n'
            << std::flush;
    }
}

}  // namespace OrvRT
