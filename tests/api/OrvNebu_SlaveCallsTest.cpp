// The exported slave calls: identity words, initialize/terminate, the frame's checks, and raw
// reads and writes as hexadecimal text.

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

TEST_F(SlaveCallsTest, SlaveInfoTextOfTheIdentificationWords) {
    watchBus();
    ORV_HASHMAP_HANDLE info = makeMap({{"mine", "stays"}, {"slave_type", "replaced"}});
    ASSERT_EQ(OrvNebu_getSlaveInfo(HANDLE, ref(0), &info), ORVNEBU_OK);
    EXPECT_EQ(mapOf(info), (OrvRT::Orv_HashMapCStr{{"mine", "stays"},
                                                   {"slave_type", "17"},
                                                   {"orv_drv_ver", "1"},
                                                   {"core_type", "5"},
                                                   {"cg_ver", "2.3"},
                                                   {"cg_ver.major", "2"},
                                                   {"cg_ver.minor", "3"},
                                                   {"cg_alpha_ver", "7"},
                                                   {"eda_ver", "10.1"},
                                                   {"eda_ver.major", "10"},
                                                   {"eda_ver.minor", "1"},
                                                   {"next_slave", "0"}}));
    auto t = transfers();
    ASSERT_EQ(t.size(), 1u);
    EXPECT_TRUE(t[0].burst && t[0].increment && !t[0].write);
    EXPECT_EQ(t[0].address, 0x1FFF0u);
    EXPECT_EQ(t[0].count, 8u);

    ORV_HASHMAP_HANDLE none = nullptr;
    EXPECT_EQ(OrvNebu_getSlaveInfo(HANDLE, ref(0), &none), ORVNEBU_FAILED);
    EXPECT_LAST_MESSAGE(256, "OrvNebu_getSlaveInfo() argument checking failed:slaveInfoHash != 0");
    // The argument is checked before the bus is looked up.
    EXPECT_EQ(OrvNebu_getSlaveInfo(HANDLE, ref(0, 0, 2), nullptr), ORVNEBU_FAILED);
    EXPECT_LAST_MESSAGE(256, "OrvNebu_getSlaveInfo() argument checking failed:slaveInfoHash != 0");
}

TEST_F(SlaveCallsTest, InitializeTwiceLeavesOneSlaveAndTerminateRemovesIt) {
    ASSERT_EQ(initialize(0), ORVNEBU_OK);
    ASSERT_EQ(initialize(0), ORVNEBU_OK);
    EXPECT_EQ(slavesOnBus(), 1u);
    EXPECT_EQ(OrvNebu_DefaultRegisterHandler::getHandlerCount(), 1u);
    ASSERT_EQ(terminate(0), ORVNEBU_OK);
    EXPECT_EQ(slavesOnBus(), 0u);
    EXPECT_EQ(coreAt(0), nullptr);
    // Nothing there, or a core that is no bus slave: left alone, no message.
    EXPECT_EQ(terminate(0), ORVNEBU_OK);
    addHostCore(1);
    EXPECT_EQ(terminate(1), ORVNEBU_OK);
    EXPECT_NE(coreAt(1), nullptr);
    EXPECT_NO_MESSAGES();
    // A host core under a valid reference is replaced by the slave object.
    ASSERT_EQ(initialize(1), ORVNEBU_OK);
    ASSERT_NE(coreAt(1), nullptr);
    EXPECT_TRUE(coreAt(1)->isOrvNebuSlave());
}

TEST_F(SlaveCallsTest, InitializeRefusesIndicesTheBusDoesNotList) {
    addHostCore(8);
    EXPECT_EQ(OrvNebu_initialize(HANDLE, ref(8)), ORVNEBU_FAILED);
    EXPECT_LAST_MESSAGE(256,
                        "Device:0, user chain number:1, slave index:8, does not have a valid "
                        "OrvNebu slave index.\n");
    EXPECT_EQ(messages().size(), 1u);
    EXPECT_NE(coreAt(8), nullptr);  // untouched

    // A chain without a bus fails in the bus list before any core is touched.
    clearMessages();
    EXPECT_EQ(OrvNebu_initialize(HANDLE, ref(0, 0, 2)), ORVNEBU_FAILED);
    EXPECT_EQ(messages().size(), 1u);
    EXPECT_EQ(lastMessage().severity, 256u);
}

TEST_F(SlaveCallsTest, FailedInitializeReportsAndLeavesNoSlave) {
    // The old object goes first, then the new one cannot read its file.
    data_.write("missing.csv", "h\nX,0,0,0,15,,rw,,y\n");
    ASSERT_EQ(initialize(6), ORVNEBU_OK);
    std::remove(data_.path("missing.csv").c_str());
    clearMessages();
    EXPECT_EQ(initialize(6), ORVNEBU_FAILED);
    auto m = messages();
    ASSERT_EQ(m.size(), 2u);
    EXPECT_EQ(m[0].text, "Unable to open OrvNebu register file: " + data_.path("missing.csv"));
    EXPECT_EQ(m[0].severity, 256u);
    EXPECT_EQ(m[1].text, "Orv abort command");
    EXPECT_EQ(m[1].severity, 32768u);
    EXPECT_EQ(coreAt(6), nullptr);
    EXPECT_EQ(OrvNebu_DefaultRegisterHandler::getHandlerCount(), 0u);

    // An empty position reads identification words of 0: no directory entry for type 0.
    clearMessages();
    EXPECT_EQ(initialize(4), ORVNEBU_FAILED);
    EXPECT_LAST_MESSAGE(256,
                        "No OrvNebu register file specified for OrvNebu slave type: 0, orv "
                        "driver version: 0");
    EXPECT_EQ(coreAt(4), nullptr);
}

TEST_F(SlaveCallsTest, RegisterCallsResolveTheSlaveBeforeCheckingTheMap) {
    EXPECT_EQ(OrvNebu_getRegisters(HANDLE, ref(2), nullptr), ORVNEBU_FAILED);
    EXPECT_LAST_MESSAGE(256,
                        "Data structures not initialized for OrvNebu slave Device:0, user chain "
                        "number/bus:1, slave index:2.");
    ASSERT_EQ(initialize(2), ORVNEBU_OK);
    ORV_HASHMAP_HANDLE none = nullptr;
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
}

// Raw reads and writes themselves are in the trace transcript.
TEST_F(SlaveCallsTest, RawCallsCheckTheirArguments) {
    char text[8];
    EXPECT_EQ(OrvNebu_read(HANDLE, ref(1), 0, 1, nullptr), ORVNEBU_FAILED);
    EXPECT_LAST_MESSAGE(256, "OrvNebu_read() argument checking failed:(data != 0) && (size != 0)");
    EXPECT_EQ(OrvNebu_write(HANDLE, ref(1), 0, 2, nullptr), ORVNEBU_FAILED);
    EXPECT_LAST_MESSAGE(256, "OrvNebu_write() argument checking failed:(data != 0) && (size != 0)");

    // Sizes whose character count does not fit 32 bits: refused, nothing written or read.
    watchBus();
    EXPECT_EQ(OrvNebu_read(HANDLE, ref(1), 0, 0x40000000u, text), ORVNEBU_FAILED);
    EXPECT_LAST_MESSAGE(256, "OrvNebu_read() argument checking failed:size*4+1 overflows 32 bits");
    EXPECT_EQ(OrvNebu_write(HANDLE, ref(1), 0, 0x40000000u, ""), ORVNEBU_FAILED);
    EXPECT_LAST_MESSAGE(256, "OrvNebu_write() argument checking failed:size*4+1 overflows 32 bits");
    EXPECT_TRUE(trace().empty());
}

}  // namespace
