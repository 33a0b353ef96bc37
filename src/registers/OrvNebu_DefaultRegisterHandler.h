// The default register handler: moves the words the named registers cover as one block, one
// burst read per call and, for a write, one burst write of the merged block.
#pragma once

#include <cstdint>
#include <ostream>
#include <string>
#include <vector>

#include "registers/OrvNebu_RegisterHandler.h"

namespace OrvRT {

class OrvNebu_Transaction;

class OrvNebu_DefaultRegisterHandler : public OrvNebu_RegisterHandler {
public:
    // Reads the file now; reports and throws as readRegistersFromFile.
    OrvNebu_DefaultRegisterHandler(uint32_t handle, const std::string& regFilename);
    ~OrvNebu_DefaultRegisterHandler() override;

    void getRegisters(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                      Orv_HashMapCStr* registers) override;
    void setRegisters(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                      Orv_HashMapCStr* registers) override;

    // The cached handler for the file, read on first use; counts one reference even when
    // reading fails (release it all the same).
    static OrvNebu_RegisterHandler* getRegisterHandler(uint32_t handle,
                                                       const std::string& regFilename);
    // The cached handler or null; counts nothing.
    static OrvNebu_RegisterHandler* findRegisterHandler(uint32_t handle,
                                                        const std::string& regFilename);
    // Releases one reference; the last one destroys every handler of this class.
    static void releaseRegisterHandler(OrvNebu_RegisterHandler* handler);
    // Reads the file outside the cache and prints its image; reading failures propagate.
    static void readAndPrint(uint32_t handle, const std::string& regFilename, std::ostream& out);
    // References handed out and not yet released.
    static uint32_t getHandlerCount();

private:
    // A local copy of consecutive words of one slave.
    struct WordBlock {
        uint32_t firstAddress = 0xFFFFFFFFu;
        uint32_t lastAddress = 0;
        std::vector<uint32_t> words;
        uint32_t word(uint32_t address) const { return words[address - firstAddress]; }
        uint32_t& word(uint32_t address) { return words[address - firstAddress]; }
    };

    static Cache& cache();
    // Sizes the block and fills it with one burst read; throws std::logic_error naming the file
    // and the span when that is longer than one burst.
    void readBlock(uint32_t handle, const ORV_SLAVE_REF& slaveRef, OrvNebu_Transaction& bus,
                   WordBlock& block) const;
    // Widens first/last to the registers named in the map.
    void getAddressRange(uint32_t* firstAddress, uint32_t* lastAddress,
                         const Orv_HashMapCStr* registers) const;
    static std::string getValue(const Register& reg, const WordBlock& block);
    static void setValue(const Register& reg, WordBlock& block, const std::string& digits);
};

}  // namespace OrvRT
