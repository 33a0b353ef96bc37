// Base of every slave object: a host core registered under its slave reference, with the
// slave's identification map and its place in the slave chain.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "host/OrvCore.h"
#include "host/OrvTypes.h"

namespace OrvRT {

class OrvNebu_Slave : public Orv_Core {
public:
    static constexpr int32_t NOT_INITIALIZED_PREVIOUS_SLAVE_VALUE = 9999;
    // A bus has at most 255 slaves, so a walk along next_slave links that takes more steps
    // than this has gone round a loop; the reference-clock questions stop there.
    static constexpr uint32_t MAX_CHAIN_STEPS = 255;

    OrvNebu_Slave(uint32_t handle, const ORV_SLAVE_REF& slaveRef, const ORV_CORE_INFO& coreInfo,
                  const Orv_HashMapCStr& slaveInfo);
    ~OrvNebu_Slave() override;

    bool initFromStatusWord(uint32_t statusWord) override;
    bool isOrvNebuSlave() override;

    // Reads the definition files; throws when they cannot be used.
    virtual void init(uint32_t handle, const std::string& registerFile,
                      const std::string& parameterFile) = 0;
    virtual void getRegisters(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                              Orv_HashMapCStr* registers) = 0;
    virtual void setRegisters(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                              Orv_HashMapCStr* registers) = 0;
    // The base throws: this slave type has no parameters.
    virtual void setParameters(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                               Orv_HashMapCStr* params);
    virtual void getParameters(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                               Orv_HashMapCStr* params);
    virtual void getParameterChoices(uint32_t handle, const ORV_SLAVE_REF& slaveRef,
                                     Orv_HashMapCStr* params, std::vector<std::string>* choices);

    uint32_t getOwnerHandle() const { return ownerHandle_; }
    uint32_t getSlaveIndex() const { return getCoreIndex(); }
    ORV_SLAVE_REF getSlaveRef() const;

    // The slave next_slave points to, or null.
    OrvNebu_Slave* getNextSlave();
    // The slave whose next_slave points here, or null.
    OrvNebu_Slave* getPreviousSlave();
    // The value of a parameter as another slave computes it; def when other is null or
    // leaves the value alone.
    std::string getParamFromOtherSlave(OrvNebu_Slave* other, const char* name,
                                       const std::string& def);

private:
    void initSlaveChain(uint32_t device, uint32_t userChain);

    Orv_HashMapCStr slaveInfo_;
    int32_t previousSlaveOffset_;
    uint32_t ownerHandle_;
};

}  // namespace OrvRT
