// The single-register handler chosen by ZAN_ORV_SWITCH_REG_HANDLER: one single transfer per
// slice, only the words of named registers, highest order first, its own cache.
#include "registers/OrvNebu_DefaultRegisterHandler.h"
#include "registers/OrvNebu_SingleRegisterHandler.h"
#include "support/RegsFixture.h"

using OrvRT::OrvNebu_DefaultRegisterHandler;
using OrvRT::OrvNebu_SingleRegisterHandler;

namespace {

class SingleRegisterHandlerTest : public RegsFixture {
protected:
    void SetUp() override {
        RegsFixture::SetUp();
        nebutest::setEnv("ZAN_ORV_SWITCH_REG_HANDLER", "1");
        ASSERT_EQ(initialize(0), ORVNEBU_OK);
        watchBus();
    }
};

TEST_F(SingleRegisterHandlerTest, TheVariableChoosesAndEachClassKeepsItsOwnCache) {
    const std::string file = data_.path("regs.csv");
    EXPECT_NE(OrvNebu_SingleRegisterHandler::findRegisterHandler(HANDLE, file), nullptr);
    EXPECT_EQ(OrvNebu_DefaultRegisterHandler::findRegisterHandler(HANDLE, file), nullptr);
    // The value is not looked at: "0" selects the single-register handler too.
    nebutest::setEnv("ZAN_ORV_SWITCH_REG_HANDLER", "0");
    ASSERT_EQ(initialize(2), ORVNEBU_OK);
    EXPECT_EQ(OrvNebu_SingleRegisterHandler::getHandlerCount(), 2u);
    EXPECT_EQ(OrvNebu_DefaultRegisterHandler::getHandlerCount(), 0u);

    // An empty value counts as unset: the next slave takes the default handler.
    nebutest::setEnv("ZAN_ORV_SWITCH_REG_HANDLER", "");
    ASSERT_EQ(initialize(1), ORVNEBU_OK);
    EXPECT_NE(OrvNebu_DefaultRegisterHandler::findRegisterHandler(HANDLE, file), nullptr);
    EXPECT_NE(OrvNebu_DefaultRegisterHandler::findRegisterHandler(HANDLE, file),
              OrvNebu_SingleRegisterHandler::findRegisterHandler(HANDLE, file));
    EXPECT_EQ(OrvNebu_DefaultRegisterHandler::getHandlerCount(), 1u);
    for (uint32_t slave : {2u, 1u}) {
        clearTrace();
        ORV_HASHMAP_HANDLE map = makeMap({{"A", ""}, {"B", ""}});
        ASSERT_EQ(getRegs(slave, map), ORVNEBU_OK);
        ASSERT_EQ(transfers().size(), slave == 1 ? 1u : 2u);
        EXPECT_EQ(transfers()[0].burst, slave == 1);
    }

    // Each slave gives its reference back to the class that supplied it, whatever the
    // variable says by then.
    nebutest::setEnv("ZAN_ORV_SWITCH_REG_HANDLER", "1");
    ASSERT_EQ(terminate(1), ORVNEBU_OK);
    EXPECT_EQ(OrvNebu_DefaultRegisterHandler::getHandlerCount(), 0u);
    EXPECT_EQ(OrvNebu_DefaultRegisterHandler::findRegisterHandler(HANDLE, file), nullptr);
    EXPECT_NE(OrvNebu_SingleRegisterHandler::findRegisterHandler(HANDLE, file), nullptr);
    ASSERT_EQ(terminate(0), ORVNEBU_OK);
    ASSERT_EQ(terminate(2), ORVNEBU_OK);
    EXPECT_EQ(OrvNebu_SingleRegisterHandler::getHandlerCount(), 0u);
    EXPECT_EQ(OrvNebu_SingleRegisterHandler::findRegisterHandler(HANDLE, file), nullptr);
}

}  // namespace
