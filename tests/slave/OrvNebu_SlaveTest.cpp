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

TEST_F(SlaveChainTest, NextAndPreviousAlongTheBoardsLinks) {
    ASSERT_EQ(initialize(3), ORVNEBU_OK);  // next_slave 2
    ASSERT_EQ(initialize(5), ORVNEBU_OK);
    OrvNebu_Slave* three = slaveAt(3);
    OrvNebu_Slave* five = slaveAt(5);
    ASSERT_NE(three, nullptr);
    ASSERT_NE(five, nullptr);

    EXPECT_EQ(three->getNextSlave(), five);
    EXPECT_EQ(five->getNextSlave(), nullptr);
    EXPECT_EQ(five->getPreviousSlave(), three);
    EXPECT_EQ(three->getPreviousSlave(), nullptr);

    // A link to a position with no slave object gives null.
    ASSERT_EQ(terminate(5), ORVNEBU_OK);
    EXPECT_EQ(three->getNextSlave(), nullptr);
}

TEST_F(SlaveChainTest, LinksThatAreNoNumberOrZeroLeadNowhere) {
    const char* texts[] = {nullptr, "", "0", "abc", " 0x2"};
    uint32_t index = 0;
    for (const char* text : texts) {
        OrvNebu_Slave* s = addSlave(index, text);
        ASSERT_NE(s, nullptr);
        addSlave(index + 2, nullptr);
        EXPECT_EQ(s->getNextSlave(), nullptr) << (text ? text : "(absent)");
        ++index;
    }
}

TEST_F(SlaveChainTest, LoopingLinksLeadBackAndHaveNoStart) {
    OrvNebu_Slave* a = addSlave(3, "2");
    OrvNebu_Slave* b = addSlave(5, "-2");
    OrvNebu_Slave* c = addSlave(6, " +0");
    ASSERT_TRUE(a && b && c);
    EXPECT_EQ(a->getNextSlave(), b);
    EXPECT_EQ(b->getNextSlave(), a);
    EXPECT_EQ(a->getPreviousSlave(), b);
    EXPECT_EQ(b->getPreviousSlave(), a);
    EXPECT_EQ(c->getPreviousSlave(), nullptr);
}

TEST_F(SlaveChainTest, ParameterFromNoOtherSlaveIsTheDefault) {
    OrvNebu_Slave* a = addSlave(0, nullptr);
    ASSERT_NE(a, nullptr);
    EXPECT_EQ(a->getParamFromOtherSlave(nullptr, "refclk", "GREFCLK"), "GREFCLK");

    EXPECT_EQ(dynamic_cast<OrvNebu_DefaultSlave*>(a)->getParamAction("anything"), nullptr);
}

}  // namespace
