// The single-register handler: reads every slice with its own single-word read and writes it
// with its own read-modify-write, never touching words of registers not named.
#pragma once

#include <cstdint>
#include <ostream>
#include <string>

#include "registers/OrvNebu_RegisterHandler.h"

namespace OrvRT {

class OrvNebu_Transaction;

class OrvNebu_SingleRegisterHandler : public OrvNebu_RegisterHandler {
public:
    OrvNebu_SingleRegisterHandler(uint32_t handle, const std::string& regFilename);
    ~OrvNebu_SingleRegisterHandler() override;

    void getRegisters(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                      Orv_HashMapCStr* registers) override;
    void setRegisters(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                      Orv_HashMapCStr* registers) override;

    // The same cache operations as the default handler, on this class's own cache.
    static OrvNebu_RegisterHandler* getRegisterHandler(uint32_t handle,
                                                       const std::string& regFilename);
    static OrvNebu_RegisterHandler* findRegisterHandler(uint32_t handle,
                                                        const std::string& regFilename);
    static void releaseRegisterHandler(OrvNebu_RegisterHandler* handler);
    static void readAndPrint(uint32_t handle, const std::string& regFilename, std::ostream& out);
    static uint32_t getHandlerCount();

private:
    static Cache& cache();
    static std::string getValue(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                                OrvNebu_Transaction& bus, const Register& reg);
    static void setValue(uint32_t handle, const ORV_SLAVE_REF& slaveRef, OrvNebu_Transaction& bus,
                         const Register& reg, const std::string& digits);
};

}  // namespace OrvRT
