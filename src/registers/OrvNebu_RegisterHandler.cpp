// Register definition files: reading, the register model, printing, the handler caches.
#include "registers/OrvNebu_RegisterHandler.h"

#include <algorithm>
#include <fstream>
#include <stdexcept>

#include "base/OrvNebu_CsvText.h"
#include "base/Orv_AbortException.h"
#include "host/OrvJtag.h"
#include "host/OrvUtil.h"

namespace OrvRT {

namespace {

constexpr size_t MIN_COLUMNS = 9;

// A register file line that is refused although it has its nine columns.
class UnusableLine : public std::exception {
public:
    explicit UnusableLine(std::string reason) : reason_(std::move(reason)) {}
    const char* what() const noexcept override { return reason_.c_str(); }

private:
    std::string reason_;
};

std::string hexText(uint32_t value) {
    static const char* const DIGITS = "0123456789abcdef";
    char buf[9];
    int n = 0;
    do {
        buf[8 - n] = DIGITS[value & 0xF];
        value >>= 4;
        ++n;
    } while (value != 0);
    return std::string(buf + 9 - n, static_cast<size_t>(n));
}

}  // namespace

void OrvNebu_RegisterHandler::RegisterSlice::appendDigits(uint32_t word,
                                                          std::string& digits) const {
    if (endBit >= startBit) {
        for (uint32_t bit = endBit + 1; bit-- > startBit;)
            digits += ((word >> bit) & 1u) ? '1' : '0';
    } else {
        for (uint32_t bit = endBit; bit <= startBit; ++bit)
            digits += ((word >> bit) & 1u) ? '1' : '0';
    }
}

void OrvNebu_RegisterHandler::RegisterSlice::mergeDigits(const std::string& digits, size_t pos,
                                                         uint32_t& value,
                                                         uint32_t& keepMask) const {
    const uint32_t n = width();
    for (uint32_t i = 0; i < n; ++i) {
        uint32_t bit = endBit >= startBit ? endBit - i : endBit + i;
        uint32_t mask = 1u << bit;
        if (digits[pos + i] == '1') value |= mask;
        keepMask &= ~mask;
    }
}

OrvNebu_RegisterHandler::OrvNebu_RegisterHandler(uint32_t handle, const std::string& regFilename)
    : regFilename_(regFilename) {
    (void)handle;
}

OrvNebu_RegisterHandler::~OrvNebu_RegisterHandler() = default;

const OrvNebu_RegisterHandler::Register* OrvNebu_RegisterHandler::findRegister(
    const std::string& name) const {
    return findRegisterMutable(name);
}

OrvNebu_RegisterHandler::Register* OrvNebu_RegisterHandler::findRegisterMutable(
    const std::string& name) const {
    if (name.empty()) return nullptr;
    auto it = registerMap_.find(name);
    return it == registerMap_.end() ? nullptr : const_cast<Register*>(&it->second);
}

void OrvNebu_RegisterHandler::readRegistersFromFile(uint32_t handle) {
    const std::string fileName = getRegFilename();
    std::ifstream in;
    OrvNebu_CsvText::openFile(in, fileName);
    const auto cannotOpen = [&]() {
        std::string text = "Unable to open OrvNebu register file: " + fileName;
        OrvJtag_session_sendMessage(handle, SEVERITY_ERROR, text.c_str());
        throw std::logic_error(text);
    };
    if (!in.is_open()) cannotOpen();
    std::string line;
    if (!std::getline(in, line)) {
        // A path that opens but cannot be read (a directory) must not pass for an empty file.
        if (in.bad()) cannotOpen();
        return;  // an empty file: no header, no registers
    }
    Orv_Util::stripEndingCR(line);
    header_ = line;
    uint32_t lineNumber = 1;
    while (std::getline(in, line)) {
        ++lineNumber;
        Orv_Util::stripEndingCR(line);
        bool parsed = false;
        try {
            parsed = parseLine(lineNumber, line);
        } catch (const UnusableLine& e) {
            OrvJtag_session_sendMessage(handle, SEVERITY_MALFORMED_LINE, e.what());
        } catch (const std::exception& e) {
            OrvJtag_session_sendMessage(handle, SEVERITY_ERROR, e.what());
        }
        if (!parsed) {
            std::string text = "Unable to parse file: " + fileName +
                               " line:" + std::to_string(lineNumber) + ": " + line + "\n";
            OrvJtag_session_sendMessage(handle, SEVERITY_MALFORMED_LINE, text.c_str());
            throw Orv_AbortException();
        }
    }
    // A read error part way must not leave a handler that silently lacks registers.
    if (in.bad()) cannotOpen();
}

bool OrvNebu_RegisterHandler::parseLine(uint32_t lineNumber, const std::string& line) {
    (void)lineNumber;
    std::vector<std::string>& cols = columns_;
    OrvNebu_CsvText::splitCommas(line, cols);
    if (cols.size() < MIN_COLUMNS) return false;
    Orv_Util::unQuote(cols);

    RegisterSlice slice;
    slice.address = Orv_NumberUtil::hexStr2UInt(cols[1]);
    slice.order = static_cast<uint32_t>(OrvNebu_CsvText::decimalToInt32(cols[2]));
    slice.startBit = static_cast<uint32_t>(OrvNebu_CsvText::decimalToInt32(cols[3]));
    slice.endBit = static_cast<uint32_t>(OrvNebu_CsvText::decimalToInt32(cols[4]));
    if (cols[8].find('n') != std::string::npos) return true;

    // A word has bits 0 to 31 and the bus 17 address bits: anything else cannot be moved.
    if (slice.startBit > HIGHEST_WORD_BIT || slice.endBit > HIGHEST_WORD_BIT) {
        throw UnusableLine("Register bit out of range 0 to 31: start bit " + cols[3] +
                           ", end bit " + cols[4]);
    }
    if (slice.address > MAX_BUS_ADDRESS) {
        throw UnusableLine("Register address out of range 0 to 1ffff: " + cols[1]);
    }

    slice.readable = cols[6].find('r') != std::string::npos;
    slice.writable = cols[6].find('w') != std::string::npos;
    slice.included = true;
    if (cols.size() >= MIN_COLUMNS + 1) slice.trailer = line.substr(line.rfind(','));
    slice.registerName = std::move(cols[0]);
    slice.text6 = std::move(cols[5]);
    slice.text8 = std::move(cols[7]);
    slices_.push_back(std::move(slice));
    RegisterSlice* s = &slices_.back();

    // A line without a name belongs to no register: it is kept for the file image only,
    // since no call can ever name it.
    if (!s->registerName.empty()) {
        Register& reg = registerMap_[s->registerName];
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
    return true;
}

void OrvNebu_RegisterHandler::print(uint32_t handle, std::ostream& out) const {
    (void)handle;
    out << header_ << '\n' << std::flush;
    for (const RegisterSlice& s : slices_) {
        out << s.registerName << ',';
        if (s.address >= 10 && s.address <= 15) out << '0';
        out << hexText(s.address) << ',' << s.order << ',' << s.startBit << ',' << s.endBit << ','
            << s.text6 << ',' << (s.readable ? "r" : "") << (s.writable ? "w" : "") << ','
            << s.text8 << ',' << (s.included ? "y" : "n") << s.trailer << '\n'
            << std::flush;
    }
}

void OrvNebu_RegisterHandler::checkRegisterNames(uint32_t handle,
                                                 const Orv_HashMapCStr& registers) const {
    for (const auto& entry : registers) {
        if (findRegisterMutable(entry.first) == nullptr) {
            std::string text = "Invalid Register Name: " + entry.first + "\n";
            OrvJtag_session_sendMessage(handle, SEVERITY_ERROR, text.c_str());
            throw Orv_AbortException();
        }
    }
}

void OrvNebu_RegisterHandler::toDigits(const std::string& value, const Register& reg,
                                       std::string& digits) {
    Orv_NumberUtil::hexStr2BinStr(value, reg.totalWidth, digits);
    if (digits.size() != reg.totalWidth) {
        throw std::logic_error("Invalid value for register " + reg.name + ": " + value);
    }
}

OrvNebu_RegisterHandler* OrvNebu_RegisterHandler::findInCache(Cache& cache,
                                                              const std::string& regFilename) {
    if (regFilename.empty()) return nullptr;
    std::lock_guard<std::mutex> guard(cache.mutex);
    auto it = cache.storage.find(regFilename);
    return it == cache.storage.end() ? nullptr : it->second;
}

void OrvNebu_RegisterHandler::releaseToCache(Cache& cache) {
    std::lock_guard<std::mutex> guard(cache.mutex);
    if (cache.handlerCount != 0) {
        uint32_t before = cache.handlerCount--;
        if (before != 1) return;
    }
    for (auto& entry : cache.storage) delete entry.second;
    cache.storage.clear();
}

}  // namespace OrvRT
