// The slave base: identity, the parameter operations it lacks, and the chain along
// next_slave, loops included.
#include "host/OrvCore.h"
#include "slave/OrvNebu_DefaultSlave.h"
#include "support/RegsFixture.h"

using OrvRT::Orv_Core;
using OrvRT::Orv_CoreList;
using OrvRT::Orv_HashMapCStr;
using OrvRT::OrvNebu_DefaultSlave;
using OrvRT::OrvNebu_Slave;

namespace {

class SlaveChainTest : public RegsFixture {
protected:
    OrvNebu_Slave* slaveAt(uint32_t index) {
        ORV_SLAVE_REF r = ref(index);
        return dynamic_cast<OrvNebu_Slave*>(Orv_CoreList::getSlave(HANDLE, &r));
    }

    // Registers a slave object at the index with this next_slave text (none when null).
    OrvNebu_Slave* addSlave(uint32_t index, const char* nextSlave) {
        Orv_HashMapCStr info{{"slave_type", "19"}, {"orv_drv_ver", "1"}};
        if (nextSlave != nullptr) info["next_slave"] = nextSlave;
        ORV_CORE_INFO coreInfo{{1, 0x13, 0, 0, 0}};
        OrvNebu_Slave* s = OrvNebu_DefaultSlave::create(HANDLE, coreInfo, ref(index), info,
                                                        data_.path("chain.csv"), "");
        if (s != nullptr) Orv_CoreList::addCore(HANDLE, s);
        return s;
    }
};

// The demo chain of duals is in the transceiver_slaves transcript; here the links it lacks.
TEST_F(SlaveChainTest, LinksThatLeadNowhereOrBack) {
    ASSERT_EQ(initialize(3), ORVNEBU_OK);  // next_slave 2
    ASSERT_EQ(initialize(5), ORVNEBU_OK);
    ASSERT_EQ(terminate(5), ORVNEBU_OK);
    EXPECT_EQ(slaveAt(3)->getNextSlave(), nullptr) << "no slave object at the link";
    ASSERT_EQ(terminate(3), ORVNEBU_OK);

    // Each with slaves one and two further on, which a wrong reading would reach.
    uint32_t index = 10;
    for (const char* text : {(const char*)nullptr, "", "0", "abc", " 0x2"}) {
        OrvNebu_Slave* s = addSlave(index, text);
        addSlave(index + 1, nullptr);
        addSlave(index + 2, nullptr);
        EXPECT_EQ(s->getNextSlave(), nullptr) << (text ? text : "(absent)");
        index += 3;
    }
    OrvNebu_Slave* a = addSlave(3, "2");
    OrvNebu_Slave* b = addSlave(5, "-2");
    OrvNebu_Slave* c = addSlave(6, " +0");
    EXPECT_EQ(a->getNextSlave(), b);
    EXPECT_EQ(b->getNextSlave(), a);
    EXPECT_EQ(a->getPreviousSlave(), b);
    EXPECT_EQ(b->getPreviousSlave(), a);
    EXPECT_EQ(c->getPreviousSlave(), nullptr);
    EXPECT_EQ(a->getParamFromOtherSlave(nullptr, "refclk", "GREFCLK"), "GREFCLK");
}

}  // namespace
