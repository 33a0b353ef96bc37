// The exported slave calls where the console cannot reach them: null arguments, host cores
// under a slave reference, and raw sizes past 32 bits.
#include "host/OrvCore.h"
#include "registers/OrvNebu_DefaultRegisterHandler.h"
#include "support/RegsFixture.h"

using OrvRT::Orv_Core;
using OrvRT::Orv_CoreList;
using OrvRT::OrvNebu_DefaultRegisterHandler;

namespace {

class SlaveCallsTest : public RegsFixture {
protected:
    size_t slavesOnBus() {
        std::vector<Orv_Core*> cores;
        Orv_CoreList::getSlaves(HANDLE, 0, 1, cores);
        return cores.size();
    }
    // Registers a plain host core (not a bus slave) under the reference.
    void addHostCore(uint32_t index) {
        Orv_CoreList::addCore(HANDLE, new Orv_Core(HANDLE, ORV_CORE_REF{0, 1, index},
                                                   ORV_CORE_INFO{{1, 3, 0, 0, 0}}, nullptr, 0));
    }
    Orv_Core* coreAt(uint32_t index) {
        ORV_SLAVE_REF r = ref(index);
        return Orv_CoreList::getSlave(HANDLE, &r);
    }
};

TEST_F(SlaveCallsTest, OneSlaveObjectPerReferenceAndHostCoresLeftToTheHost) {
    ASSERT_EQ(initialize(0), ORVNEBU_OK);
    ASSERT_EQ(initialize(0), ORVNEBU_OK);
    EXPECT_EQ(slavesOnBus(), 1u);
    EXPECT_EQ(OrvNebu_DefaultRegisterHandler::getHandlerCount(), 1u);
    ASSERT_EQ(terminate(0), ORVNEBU_OK);
    EXPECT_EQ(slavesOnBus(), 0u);
    // A core that is no bus slave: terminate leaves it, initialize of a bad index too.
    addHostCore(1);
    addHostCore(8);
    EXPECT_EQ(terminate(1), ORVNEBU_OK);
    EXPECT_NE(coreAt(1), nullptr);
    EXPECT_NO_MESSAGES();
    EXPECT_EQ(initialize(8), ORVNEBU_FAILED);
    EXPECT_NE(coreAt(8), nullptr);
    // Under a valid reference the slave object replaces it.
    ASSERT_EQ(initialize(1), ORVNEBU_OK);
    ASSERT_NE(coreAt(1), nullptr);
    EXPECT_TRUE(coreAt(1)->isOrvNebuSlave());
}

TEST_F(SlaveCallsTest, NullArgumentsAreRefusedOnceTheSlaveIsResolved) {
    ORV_HASHMAP_HANDLE none = nullptr;
    // The slave information checks its map before the bus.
    EXPECT_EQ(OrvNebu_getSlaveInfo(HANDLE, ref(0, 0, 2), nullptr), ORVNEBU_FAILED);
    EXPECT_LAST_MESSAGE(256, "OrvNebu_getSlaveInfo() argument checking failed:slaveInfoHash != 0");
    EXPECT_EQ(OrvNebu_getSlaveInfo(HANDLE, ref(0), &none), ORVNEBU_FAILED);
    EXPECT_LAST_MESSAGE(256, "OrvNebu_getSlaveInfo() argument checking failed:slaveInfoHash != 0");
    EXPECT_EQ(OrvNebu_getRegisters(HANDLE, ref(2), nullptr), ORVNEBU_FAILED);
    EXPECT_LAST_MESSAGE(256,
                        "Data structures not initialized for OrvNebu slave Device:0, user chain "
                        "number/bus:1, slave index:2.");
    ASSERT_EQ(initialize(2), ORVNEBU_OK);
    EXPECT_EQ(OrvNebu_getRegisters(HANDLE, ref(2), &none), ORVNEBU_FAILED);
    EXPECT_LAST_MESSAGE(256, "OrvNebu_getRegisters() argument checking failed:(registers != 0)");
    EXPECT_EQ(OrvNebu_setRegisters(HANDLE, ref(2), nullptr), ORVNEBU_FAILED);
    EXPECT_LAST_MESSAGE(256, "OrvNebu_setRegisters() argument checking failed:(registers != 0)");
    addHostCore(3);
    ORV_HASHMAP_HANDLE map = makeMap();
    EXPECT_EQ(OrvNebu_getRegisters(HANDLE, ref(3), &map), ORVNEBU_FAILED);
    EXPECT_LAST_MESSAGE(256,
                        "Data structures not initialized for OrvNebu slave Device:0, user chain "
                        "number/bus:1, slave index:3.");
    EXPECT_EQ(OrvNebu_write(HANDLE, ref(1), 0, 2, nullptr), ORVNEBU_FAILED);
    EXPECT_LAST_MESSAGE(256, "OrvNebu_write() argument checking failed:(data != 0) && (size != 0)");
    // Sizes whose character count does not fit 32 bits: refused, nothing written or read.
    char text[8];
    watchBus();
    EXPECT_EQ(OrvNebu_read(HANDLE, ref(1), 0, 0x40000000u, text), ORVNEBU_FAILED);
    EXPECT_LAST_MESSAGE(256, "OrvNebu_read() argument checking failed:size*4+1 overflows 32 bits");
    EXPECT_EQ(OrvNebu_write(HANDLE, ref(1), 0, 0x40000000u, ""), ORVNEBU_FAILED);
    EXPECT_LAST_MESSAGE(256, "OrvNebu_write() argument checking failed:size*4+1 overflows 32 bits");
    EXPECT_TRUE(trace().empty());
}

}  // namespace
