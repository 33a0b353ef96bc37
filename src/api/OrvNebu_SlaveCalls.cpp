// Exported calls on slaves: identity, creation and removal of slave objects, named registers,
// and raw runs of bus words as hexadecimal text.
#include <cstring>
#include <memory>
#include <stdexcept>
#include <string>
#include <vector>

#include "api/OrvNebu_Frame.h"
#include "base/Orv_AbortException.h"
#include "host/OrvCore.h"
#include "host/OrvUtil.h"
#include "orvnebu/orvnebu.h"
#include "slave/OrvNebu_Slave.h"
#include "slave/OrvNebu_SlaveFactory.h"
#include "transceiver/OrvNebu_TransceiverClasses.h"

using namespace OrvRT;

namespace {

constexpr uint32_t SLAVE_ID_ADDRESS = 0x1FFF0;
constexpr uint32_t SLAVE_ID_WORDS = 8;
// 4 characters per word and a terminating zero must stay countable in 32 bits.
constexpr uint32_t MAX_RAW_WORDS = (0xFFFFFFFFu - 1u) / 4u;

std::string dec(uint32_t value) { return std::to_string(value); }

std::string slaveText(const ORV_SLAVE_REF& ref) {
    return "Device:" + dec(ref.device) + ", user chain number:" + dec(ref.userChain) +
           ", slave index:" + dec(ref.slaveIndex);
}

Orv_HashMapCStr& mapOf(ORV_HASHMAP_HANDLE* handle) {
    return *static_cast<Orv_HashMapCStr*>(*handle);
}

void validateSlaveIndex(uint32_t handle, const ORV_SLAVE_REF& ref) {
    const OrvNebu_TransactionPtr bus = busOf(handle, ref.device, ref.userChain);
    const uint32_t count = bus->getSlaveCount(handle, ref.device, ref.userChain);
    std::vector<uint32_t> handles(count, 0);
    bus->getSlaveHandles(handle, ref.device, ref.userChain, count != 0 ? handles.data() : nullptr,
                         count);
    for (uint32_t h : handles) {
        if (h == ref.slaveIndex) return;
    }
    throw std::logic_error(slaveText(ref) + ", does not have a valid OrvNebu slave index.\n");
}

struct MapDeleter {
    void operator()(void* map) const { OrvContainer_hashmapCStr_delete(map); }
};

}  // namespace

extern "C" {

ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_getSlaveInfo(uint32_t handle, ORV_SLAVE_REF slaveRef,
                                                       ORV_HASHMAP_HANDLE* slaveInfoHash) {
    return lockedFrame(handle, [&] {
        checkArgument(slaveInfoHash != nullptr && *slaveInfoHash != nullptr,
                      "OrvNebu_getSlaveInfo() argument checking failed:slaveInfoHash != 0");
        const OrvNebu_TransactionPtr bus = busOf(handle, slaveRef.device, slaveRef.userChain);
        uint32_t w[SLAVE_ID_WORDS] = {0, 0, 0, 0, 0, 0, 0, 0};
        bus->burstSlaveRead(handle, slaveRef, SLAVE_ID_ADDRESS, 1, w, SLAVE_ID_WORDS, nullptr);
        Orv_HashMapCStr& info = mapOf(slaveInfoHash);
        info["slave_type"] = dec(w[0]);
        info["orv_drv_ver"] = dec(w[1]);
        info["core_type"] = dec(w[2]);
        info["cg_ver"] = dec(w[3] >> 8) + "." + dec(w[3] & 0xFF);
        info["cg_ver.major"] = dec(w[3] >> 8);
        info["cg_ver.minor"] = dec(w[3] & 0xFF);
        info["cg_alpha_ver"] = dec(w[4]);
        info["eda_ver"] = dec(w[5] >> 8) + "." + dec(w[5] & 0xFF);
        info["eda_ver.major"] = dec(w[5] >> 8);
        info["eda_ver.minor"] = dec(w[5] & 0xFF);
        info["next_slave"] = dec(w[7]);
    });
}

ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_terminate(uint32_t handle, ORV_SLAVE_REF slaveRef) {
    return unlockedFrame(handle, [&] {
        Orv_Core* core = Orv_CoreList::getSlave(handle, &slaveRef);
        if (core != nullptr && core->isOrvNebuSlave()) Orv_CoreList::removeCore(handle, &core);
    });
}

ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_initialize(uint32_t handle, ORV_SLAVE_REF slaveRef) {
    return lockedFrame(handle, [&] {
        validateSlaveIndex(handle, slaveRef);

        Orv_Core* old = Orv_CoreList::getSlave(handle, &slaveRef);
        if (old != nullptr) {
            if (old->isOrvNebuSlave()) {
                OrvNebu_terminate(handle, slaveRef);
            } else {
                Orv_CoreList::removeCore(handle, &old);
            }
        }

        OrvNebu_Slave* slave = nullptr;
        {
            std::unique_ptr<void, MapDeleter> info(OrvContainer_hashmapCStr_new());
            ORV_HASHMAP_HANDLE infoHandle = info.get();
            if (OrvNebu_getSlaveInfo(handle, slaveRef, &infoHandle) != ORVNEBU_OK) {
                throw std::logic_error(slaveText(slaveRef) +
                                       ", is not a valid OrvNebu Slave core.");
            }
            slave = OrvNebu_SlaveFactory::create(handle, slaveRef, mapOf(&infoHandle),
                                                 OrvNebu_TransceiverClasses::slaveClasses());
        }
        // The slave's init has reported why it failed; the call must not look successful.
        if (slave == nullptr) throw Orv_AbortException();
        Orv_CoreList::addCore(handle, slave);
    });
}

ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_getRegisters(uint32_t handle, ORV_SLAVE_REF slaveRef,
                                                       ORV_HASHMAP_HANDLE* registers) {
    return lockedFrame(handle, [&] {
        OrvNebu_Slave& slave = resolveSlave(handle, slaveRef);
        checkArgument(registers != nullptr && *registers != nullptr,
                      "OrvNebu_getRegisters() argument checking failed:(registers != 0)");
        slave.getRegisters(handle, slaveRef, &mapOf(registers));
    });
}

ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_setRegisters(uint32_t handle, ORV_SLAVE_REF slaveRef,
                                                       ORV_HASHMAP_HANDLE* registers) {
    return lockedFrame(handle, [&] {
        OrvNebu_Slave& slave = resolveSlave(handle, slaveRef);
        checkArgument(registers != nullptr && *registers != nullptr,
                      "OrvNebu_setRegisters() argument checking failed:(registers != 0)");
        slave.setRegisters(handle, slaveRef, &mapOf(registers));
    });
}

ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_read(uint32_t handle, ORV_SLAVE_REF slaveRef,
                                               uint32_t address, uint32_t size, char* data) {
    uint32_t innerRc = ORVNEBU_OK;
    uint32_t rc = lockedFrame(handle, [&] {
        checkArgument(data != nullptr && size != 0,
                      "OrvNebu_read() argument checking failed:(data != 0) && (size != 0)");
        checkArgument(size <= MAX_RAW_WORDS,
                      "OrvNebu_read() argument checking failed:size*4+1 overflows 32 bits");
        std::vector<uint32_t> words(size, 0);
        if (size == 1) {
            innerRc = OrvNebu_singleSlaveRead(handle, slaveRef, address, &words[0], nullptr);
        } else {
            innerRc =
                OrvNebu_burstSlaveRead(handle, slaveRef, address, 1, words.data(), size, nullptr);
        }
        static const char* const DIGITS = "0123456789ABCDEF";
        char* out = data;
        for (uint32_t i = size; i-- > 0;) {
            const uint32_t w = words[i];
            *out++ = DIGITS[(w >> 12) & 0xF];
            *out++ = DIGITS[(w >> 8) & 0xF];
            *out++ = DIGITS[(w >> 4) & 0xF];
            *out++ = DIGITS[w & 0xF];
        }
        *out = '\0';
    });
    return rc != ORVNEBU_OK ? rc : innerRc;
}

ORVNEBU_API uint32_t ORVNEBU_CALL OrvNebu_write(uint32_t handle, ORV_SLAVE_REF slaveRef,
                                                uint32_t address, uint32_t size, const char* data) {
    uint32_t innerRc = ORVNEBU_OK;
    uint32_t rc = lockedFrame(handle, [&] {
        checkArgument(data != nullptr && size != 0,
                      "OrvNebu_write() argument checking failed:(data != 0) && (size != 0)");
        checkArgument(size <= MAX_RAW_WORDS,
                      "OrvNebu_write() argument checking failed:size*4+1 overflows 32 bits");
        checkArgument(std::strlen(data) == static_cast<uint64_t>(size) * 4u,
                      "OrvNebu_write() argument checking failed:strlen(data) == (size*4)");
        const uint32_t chars = size * 4u;
        // The host converts in place: the last two digits become byte 0.
        Orv_ByteBuffer bytes(chars + 1u, 0, 0);
        std::memcpy(bytes.ptr(), data, chars);
        bytes.hex2Bin(0, bytes.getSize() - 2u);
        const uint8_t* b = bytes.uPtr();
        std::vector<uint32_t> words(size, 0);
        for (uint32_t i = 0; i < size; ++i) {
            words[i] = static_cast<uint32_t>(b[2u * i + 1u]) * 256u + b[2u * i];
        }
        if (size == 1) {
            innerRc = OrvNebu_singleSlaveWrite(handle, slaveRef, address, words[0], nullptr);
        } else {
            innerRc =
                OrvNebu_burstSlaveWrite(handle, slaveRef, address, 1, words.data(), size, nullptr);
        }
    });
    return rc != ORVNEBU_OK ? rc : innerRc;
}

}  // extern "C"
