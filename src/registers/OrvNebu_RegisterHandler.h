// Base of the register handlers: a register definition file read into its register model
// (the file and its model are the definition-file reader's), the reading failures reported on
// the session channel, and the reference-counted handler caches keyed by file name.
#pragma once

#include <cstdint>
#include <memory>
#include <mutex>
#include <ostream>
#include <string>
#include <unordered_map>

#include "base/OrvNebu_RegisterFile.h"
#include "host/OrvTypes.h"

namespace OrvRT {

class OrvNebu_RegisterHandler {
public:
    static constexpr uint32_t SEVERITY_ERROR = 256;

    typedef OrvNebu_RegisterFile::RegisterSlice RegisterSlice;
    typedef OrvNebu_RegisterFile::Register Register;

    virtual ~OrvNebu_RegisterHandler();

    // Fills the values of the named registers; an empty map asks for every register.
    virtual void getRegisters(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                              Orv_HashMapCStr* registers) = 0;
    // Writes every named register with its value text (hexadecimal).
    virtual void setRegisters(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                              Orv_HashMapCStr* registers) = 0;
    virtual std::string getRegFilename() const { return regFilename_; }

    size_t getRegisterCount() const { return file_->registers().size(); }
    // Lowest and highest address of all included lines (0xFFFFFFFF and 0 for none).
    uint32_t getMinAddress() const { return file_->minAddress(); }
    uint32_t getMaxAddress() const { return file_->maxAddress(); }
    // Null for an empty or unknown name.
    const Register* findRegister(const std::string& name) const {
        return file_->findRegister(name);
    }

    OrvNebu_RegisterHandler(const OrvNebu_RegisterHandler&) = delete;
    OrvNebu_RegisterHandler& operator=(const OrvNebu_RegisterHandler&) = delete;

protected:
    // One handler class's cache: file name to handler (owned), and the references handed out.
    // The caches are process-wide and sessions run on their own threads, hence the guard.
    struct Cache {
        std::mutex mutex;
        std::unordered_map<std::string, OrvNebu_RegisterHandler*> storage;
        uint32_t handlerCount = 0;
    };

    // Stores the name only; the derived constructor reads the file.
    OrvNebu_RegisterHandler(uint32_t handle, const std::string& regFilename);

    // Reads the file named by regFilename_. Reports and throws: a logic error when the file
    // cannot be opened, Orv_AbortException after a parse error.
    void readRegistersFromFile(uint32_t handle);
    // Writes the file image back: header, then one line per slice in file order.
    void print(uint32_t handle, std::ostream& out) const;
    // Reports the first key that names no register and throws Orv_AbortException.
    void checkRegisterNames(uint32_t handle, const Orv_HashMapCStr& registers) const;
    // The value text as exactly totalWidth binary digits; throws std::logic_error for text
    // that is not hexadecimal.
    static void toDigits(const std::string& value, const Register& reg, std::string& digits);

    // The cached handler for the name, or a new one of class Handler (counted either way).
    template <class Handler>
    static OrvNebu_RegisterHandler* getFromCache(Cache& cache, uint32_t handle,
                                                 const std::string& regFilename) {
        std::lock_guard<std::mutex> guard(cache.mutex);
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
    static OrvNebu_RegisterHandler* findInCache(Cache& cache, const std::string& regFilename);
    // One reference fewer; the last one (or a release at 0) destroys every cached handler.
    static void releaseToCache(Cache& cache);

    std::string regFilename_;
    std::unique_ptr<const OrvNebu_RegisterFile> file_;
};

}  // namespace OrvRT
