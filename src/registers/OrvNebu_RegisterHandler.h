// Base of the register handlers: the register definition file (format, parsing, messages,
// printed image), the in-memory register model, the bit mapping of slices, and the
// reference-counted handler caches keyed by file name.
#pragma once

#include <cstdint>
#include <deque>
#include <memory>
#include <ostream>
#include <string>
#include <unordered_map>
#include <vector>

#include "host/OrvTypes.h"

namespace OrvRT {

class OrvNebu_RegisterHandler {
public:
    static constexpr uint32_t SEVERITY_ERROR = 256;
    static constexpr uint32_t SEVERITY_MALFORMED_LINE = 512;
    // Bus addresses are 17 bits wide.
    static constexpr uint32_t MAX_BUS_ADDRESS = 0x1FFFF;
    static constexpr uint32_t HIGHEST_WORD_BIT = 31;

    // One included line of a register file.
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
        bool included = true;
        std::string trailer;  // ",..." from the line's last comma when it has 10+ columns

        uint32_t width() const {
            return (endBit > startBit ? endBit - startBit : startBit - endBit) + 1;
        }
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
        std::vector<RegisterSlice*> slices;
        uint32_t totalWidth = 0;
        uint32_t minAddress = 0xFFFFFFFFu;
        uint32_t maxAddress = 0;
    };

    virtual ~OrvNebu_RegisterHandler();

    // Fills the values of the named registers; an empty map asks for every register.
    virtual void getRegisters(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                              Orv_HashMapCStr* registers) = 0;
    // Writes every named register with its value text (hexadecimal).
    virtual void setRegisters(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                              Orv_HashMapCStr* registers) = 0;
    virtual std::string getRegFilename() const { return regFilename_; }

    const std::string& getHeader() const { return header_; }
    size_t getSliceCount() const { return slices_.size(); }
    size_t getRegisterCount() const { return registerMap_.size(); }
    // Lowest and highest address of all included lines (0xFFFFFFFF and 0 for none).
    uint32_t getMinAddress() const { return minAddress_; }
    uint32_t getMaxAddress() const { return maxAddress_; }
    // Null for an empty or unknown name.
    const Register* findRegister(const std::string& name) const;

    OrvNebu_RegisterHandler(const OrvNebu_RegisterHandler&) = delete;
    OrvNebu_RegisterHandler& operator=(const OrvNebu_RegisterHandler&) = delete;

protected:
    // One handler class's cache: file name to handler (owned), and the references handed out.
    struct Cache {
        std::unordered_map<std::string, OrvNebu_RegisterHandler*> storage;
        uint32_t handlerCount = 0;
    };

    // Stores the name only; the derived constructor reads the file.
    OrvNebu_RegisterHandler(uint32_t handle, const std::string& regFilename);

    // Reads the file named by regFilename_. Reports and throws: a logic error when the file
    // cannot be opened, Orv_AbortException after a parse error.
    void readRegistersFromFile(uint32_t handle);
    // False only for a line of fewer than 9 columns. Throws std::logic_error for a line whose
    // numbers cannot be used.
    bool parseLine(uint32_t lineNumber, const std::string& line);
    // Writes the file image back: header, then one line per slice in file order.
    void print(uint32_t handle, std::ostream& out) const;
    // Reports the first key that names no register and throws Orv_AbortException.
    void checkRegisterNames(uint32_t handle, const Orv_HashMapCStr& registers) const;
    Register* findRegisterMutable(const std::string& name) const;
    // The value text as exactly totalWidth binary digits; throws std::logic_error for text
    // that is not hexadecimal.
    static void toDigits(const std::string& value, const Register& reg, std::string& digits);

    // The cached handler for the name, or a new one of class Handler (counted either way).
    template <class Handler>
    static OrvNebu_RegisterHandler* getFromCache(Cache& cache, uint32_t handle,
                                                 const std::string& regFilename) {
        ++cache.handlerCount;
        if (!regFilename.empty()) {
            auto it = cache.storage.find(regFilename);
            if (it != cache.storage.end() && it->second != nullptr) return it->second;
        }
        std::unique_ptr<OrvNebu_RegisterHandler> fresh(new Handler(handle, regFilename));
        OrvNebu_RegisterHandler*& slot = cache.storage[regFilename];
        slot = fresh.release();
        return slot;
    }
    static OrvNebu_RegisterHandler* findInCache(const Cache& cache, const std::string& regFilename);
    // One reference fewer; the last one (or a release at 0) destroys every cached handler.
    static void releaseToCache(Cache& cache);

    std::string regFilename_;
    std::string header_;
    // A deque keeps the slices where they are as it grows: registers point at them.
    std::deque<RegisterSlice> slices_;
    // Nodes stay put as the map grows, so slices may be reached through Register pointers.
    std::unordered_map<std::string, Register> registerMap_;
    uint32_t minAddress_ = 0xFFFFFFFFu;
    uint32_t maxAddress_ = 0;

private:
    // Scratch of parseLine, kept to spare allocations on long files.
    std::vector<std::string> columns_;
};

}  // namespace OrvRT
