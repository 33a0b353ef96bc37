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

TEST_F(SingleRegisterHandlerTest, EachSliceIsOneReadModifyWriteOfItsWord) {
    const struct {
        std::string name, value;                          // an empty value: a read
        std::vector<std::pair<uint32_t, uint64_t>> wire;  // address and data, in order
    } rows[] = {
        // Only the words of the named registers; data of reads as the board holds them.
        {"A", "1234", {{2, 0x1002}, {2, 0x1234}}},
        {"B", "AB", {{8, 0xF00F}, {8, 0xFABF}}},
        // Each write carries the word as it stands after that slice's merge.
        {"TRIPLE",
         "ABC",
         {{0x30, 0xF0},
          {0x30, 0xA0F0},
          {0x30, 0xA0F0},
          {0x30, 0xABF0},
          {0x30, 0xABF0},
          {0x30, 0xABFC}}},
        {"WIDE", "", {{0x11, 0x00AB}, {0x10, 0xCDEF}}},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.name);
        const bool write = !row.value.empty();
        for (uint32_t a = 2; a <= 7; ++a) poke(0, a, static_cast<uint16_t>(0x1000 + a));
        poke(0, 8, 0xF00F);
        poke(0, 0x30, 0x00F0);
        poke(0, 0x10, 0xCDEF);
        poke(0, 0x11, 0x00AB);
        clearTrace();
        ORV_HASHMAP_HANDLE map = makeMap({{row.name, row.value}});
        ASSERT_EQ(write ? setRegs(0, map) : getRegs(0, map), ORVNEBU_OK);
        const auto t = transfers();
        ASSERT_EQ(t.size(), row.wire.size());
        for (size_t i = 0; i < t.size(); ++i) {
            EXPECT_FALSE(t[i].burst);
            EXPECT_EQ(t[i].count, 0u);
            EXPECT_EQ(t[i].write, write && i % 2 == 1) << i;
            EXPECT_EQ(t[i].address, row.wire[i].first) << i;
            EXPECT_EQ(t[i].data, row.wire[i].second) << i;
        }
    }
    for (uint32_t a = 3; a <= 7; ++a) EXPECT_EQ(peek(0, a), 0x1000 + a);
    EXPECT_NO_MESSAGES();
}

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
