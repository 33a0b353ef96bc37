// A register definition file as read: its lines, the registers they form, the printed image,
// and every problem found, as data. The register handlers move these registers over the bus;
// the console's file tools show and check them.
#pragma once

#include <cstdint>
#include <deque>
#include <ostream>
#include <string>
#include <unordered_map>
#include <vector>

#include "base/OrvNebu_FileProblem.h"

namespace OrvRT {

class OrvNebu_RegisterFile {
public:
    // Bus addresses are 17 bits wide; one burst moves at most this many words.
    static constexpr uint32_t MAX_BUS_ADDRESS = 0x1FFFF;
    static constexpr uint32_t MAX_BURST_WORDS = 0x1FFFF;
    static constexpr uint32_t HIGHEST_WORD_BIT = 31;
    // Slave data words carry 16 bits; higher bits of a word never cross the bus.
    static constexpr uint32_t BUS_WORD_BITS = 16;
    static constexpr size_t MIN_COLUMNS = 9;

    // One line after the header that parsed, included or not.
    struct RegisterSlice {
        std::string registerName;
        uint32_t address = 0;
        uint32_t order = 0;
        uint32_t startBit = 0;  // word bit of the slice's least significant bit
        uint32_t endBit = 0;    // word bit of the slice's most significant bit
        std::string text6;
        bool readable = false;
        bool writable = false;
        std::string text8;
        bool included = true;  // false: column 9 holds an "n"; the line belongs to no register
        std::string trailer;   // ",..." from the line's last comma when it has 10+ columns
        uint32_t line = 0;     // the file line, the header being line 1

        uint32_t width() const {
            return (endBit > startBit ? endBit - startBit : startBit - endBit) + 1;
        }
        uint32_t lowBit() const { return startBit < endBit ? startBit : endBit; }
        uint32_t highBit() const { return startBit < endBit ? endBit : startBit; }
        // The slice's bits stand in the word in reverse: its most significant bit is the lower.
        bool bitReversed() const { return startBit > endBit; }
        // Appends the slice's digits taken from word: bit endBit first, bit startBit last.
        void appendDigits(uint32_t word, std::string& digits) const;
        // Takes width() digits from digits[pos...] into value bits and clears their bits in
        // keepMask, with the same mapping.
        void mergeDigits(const std::string& digits, size_t pos, uint32_t& value,
                         uint32_t& keepMask) const;
    };

    // All included lines of one name; slices in ascending order (equal orders in file order).
    struct Register {
        std::string name;
        std::vector<const RegisterSlice*> slices;
        uint32_t totalWidth = 0;
        uint32_t minAddress = 0xFFFFFFFFu;
        uint32_t maxAddress = 0;
    };

    enum Reading {
        // Stop at the first problem that refuses the file; look for nothing else (the plug-in).
        FIRST_REFUSAL,
        // Read every line and check the registers against each other (the file tools).
        EVERY_PROBLEM,
    };

    // Reads the file now; whatever goes wrong is among problems().
    explicit OrvNebu_RegisterFile(const std::string& path, Reading reading = FIRST_REFUSAL);
    OrvNebu_RegisterFile(const OrvNebu_RegisterFile&) = delete;
    OrvNebu_RegisterFile& operator=(const OrvNebu_RegisterFile&) = delete;

    const std::string& path() const { return path_; }
    // False when the file could not be opened or read at all.
    bool opened() const { return opened_; }
    // Every line that parsed, in file order, excluded ones too.
    const std::deque<RegisterSlice>& lines() const { return lines_; }
    const std::unordered_map<std::string, Register>& registers() const { return registers_; }
    // Null for an empty or unknown name.
    const Register* findRegister(const std::string& name) const;
    // Lowest and highest address of all included lines (0xFFFFFFFF and 0 for none).
    uint32_t minAddress() const { return minAddress_; }
    uint32_t maxAddress() const { return maxAddress_; }
    const OrvNebu_FileProblems& problems() const { return problems_; }

    // The file image: header, then one line per included slice in file order.
    void print(std::ostream& out) const;

private:
    void readLines(std::istream& in, Reading reading);
    // False when the line refuses the file.
    bool parseLine(uint32_t lineNumber, const std::string& line);
    void addSlice(RegisterSlice&& slice);
    void refuseLine(uint32_t lineNumber, const std::string& line, uint32_t column,
                    uint32_t severity, const std::string& text);
    void warn(uint32_t line, uint32_t column, const std::string& text);
    // Checks that need the whole file: header, slices against each other, the span.
    void checkFirstLine(const std::string& line);
    void checkSlices();
    void checkSpan();

    std::string path_;
    bool opened_ = false;
    std::string header_;
    // A deque keeps the lines where they are as it grows: registers point at them.
    std::deque<RegisterSlice> lines_;
    std::unordered_map<std::string, Register> registers_;
    uint32_t minAddress_ = 0xFFFFFFFFu;
    uint32_t maxAddress_ = 0;
    OrvNebu_FileProblems problems_;
    // Scratch of parseLine, kept to spare allocations on long files.
    std::vector<std::string> columns_;
};

}  // namespace OrvRT
