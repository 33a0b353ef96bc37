// The four transceiver test slave classes: their computed actions and priorities, what a
// missing choice parameter does to the registration, and the creation that reports failures.
#include <gtest/gtest.h>

#include <algorithm>
#include <memory>
#include <set>
#include <stdexcept>
#include <string>
#include <vector>

#include "base/OrvNebu_SlaveClassTable.h"
#include "support/TestHost.h"
#include "transceiver/OrvNebu_VanduM3Qrc.h"
#include "transceiver/OrvNebu_VanduR2Qra.h"
#include "transceiver/OrvNebu_VanduR3Qra.h"
#include "transceiver/OrvNebu_VanduR3Qrb.h"
#include "transceiver/XcvrTestSlave.h"

using namespace OrvRT;

namespace {

// A slave of class V whose actions map the test fills with choice actions before the class
// adds its computed ones.
template <class V>
class Registered : public V {
public:
    explicit Registered(std::initializer_list<const char*> choiceNames)
        : V(1, ORV_SLAVE_REF{0, 2, 3}, ORV_CORE_INFO{{1, 0x44, 0, 0, 0}}, Orv_HashMapCStr{}) {
        for (const char* name : choiceNames) {
            choices_.push_back(std::make_unique<xcvrtest::ChoiceAction>(name, name, 10002));
            OrvNebu_ParamAction::addActionToHashMap(this->actions_, choices_.back().get());
        }
    }
    void registerActions() { this->addToActionsHashMap(1, this->actions_); }
    void addAction(OrvNebu_ParamAction* action) {
        OrvNebu_ParamAction::addActionToHashMap(this->actions_, action);
    }
    // The priority of the action under name, or 0 when there is none.
    uint32_t priorityOf(const std::string& name) {
        OrvNebu_ParamAction* action = this->getParamAction(name);
        return action == nullptr ? 0 : action->getPriority();
    }
    size_t distinctActions() const {
        std::vector<OrvNebu_ParamAction*> seen;
        for (const auto& entry : this->actions_) {
            if (std::find(seen.begin(), seen.end(), entry.second) == seen.end()) {
                seen.push_back(entry.second);
            }
        }
        return seen.size();
    }

private:
    std::vector<std::unique_ptr<xcvrtest::ChoiceAction>> choices_;
};

const std::initializer_list<const char*> M3QRC_CHOICES{
    "pll_divsel_fb_0", "pll_divsel_ref_0", "pll_txdivsel_out_0", "tx_data_width0",
    "pll_divsel_fb_1", "pll_divsel_ref_1", "pll_txdivsel_out_1", "tx_data_width1"};

}  // namespace

TEST(VanduSlaves, ComputedActionsAndTheirPriorities) {
    Registered<OrvNebu_VanduM3Qrc> m3(M3QRC_CHOICES);
    m3.registerActions();
    EXPECT_EQ(8u + 4u, m3.distinctActions());
    EXPECT_EQ(5000u, m3.priorityOf("txoutclk0_freq"));
    EXPECT_EQ(5000u, m3.priorityOf("rxusrclk21_freq"));
    EXPECT_EQ(5001u, m3.priorityOf("line_rate0"));
    EXPECT_EQ(5001u, m3.priorityOf("refclk_freq0"));
    EXPECT_EQ(5002u, m3.priorityOf("line_rate1"));
    EXPECT_EQ(5003u, m3.priorityOf("sysclk_freq"));
    EXPECT_EQ(10002u, m3.priorityOf("pll_divsel_fb_1"));
    EXPECT_TRUE(m3.getParamAction("line_rate1")->isChoiceParam());

    Registered<OrvNebu_VanduR3Qrb> r3b({});
    r3b.registerActions();
    EXPECT_EQ(2u, r3b.distinctActions());
    EXPECT_EQ(5000u, r3b.priorityOf("rxuserclkout_freq3"));
    EXPECT_EQ(5001u, r3b.priorityOf("sysclk_freq"));
    EXPECT_EQ(0u, r3b.priorityOf("line_rate0")) << "no line-rate action on a quad";

    Registered<OrvNebu_VanduR3Qra> r3a(
        {"txpll_divsel_fb", "txpll_divsel45_fb", "txpll_divsel_ref", "txpll_divsel_out"});
    r3a.registerActions();
    EXPECT_EQ(4u + 3u, r3a.distinctActions());
    EXPECT_EQ(5000u, r3a.priorityOf("rxrecclk_freq"));
    EXPECT_EQ(5001u, r3a.priorityOf("line_rate"));
    EXPECT_EQ(5002u, r3a.priorityOf("sysclk_freq"));

    Registered<OrvNebu_VanduR2Qra> r2(
        {"pll_divsel_fb", "pll_divsel_ref", "pll_rxdivsel_out_0", "pll_rxdivsel_out_1"});
    r2.registerActions();
    EXPECT_EQ(4u + 3u, r2.distinctActions());
    EXPECT_EQ(5000u, r2.priorityOf("sysclk_freq")) << "the clock action answers to it";
    EXPECT_EQ(5001u, r2.priorityOf("refclk_freq"));
    EXPECT_EQ(5002u, r2.priorityOf("internal_param_NORTH_DRIVER"));
    EXPECT_FALSE(r2.getParamAction("refclk_source")->isChoiceParam());
}

namespace {

// Registers class V's actions with the choice parameters the table names, and checks each
// computed action of the table against the one registered: its priority, the names it
// answers, and the registers it reads (which the table lists, among those it also writes).
template <class V>
void expectAsTheTableSays(OrvRT::OrvNebu_SlaveClassTable::SlaveClass slaveClass) {
    const auto& info = OrvRT::OrvNebu_SlaveClassTable::info(slaveClass);
    SCOPED_TRACE(info.className);
    std::set<std::string> choices;
    for (const auto& action : info.actions) {
        choices.insert(action.choiceParameters.begin(), action.choiceParameters.end());
    }
    std::vector<std::unique_ptr<xcvrtest::ChoiceAction>> owned;
    Registered<V> slave({});
    for (const std::string& name : choices) {
        owned.push_back(std::make_unique<xcvrtest::ChoiceAction>(name, name, 10002));
        slave.addAction(owned.back().get());
    }
    slave.registerActions();
    EXPECT_EQ(choices.size() + info.actions.size(), slave.distinctActions());
    for (size_t i = 0; i < info.actions.size(); ++i) {
        const auto& described = info.actions[i];
        OrvNebu_ParamAction* action = slave.getParamAction(described.parameters.front());
        ASSERT_NE(action, nullptr) << described.className;
        EXPECT_EQ(OrvRT::OrvNebu_SlaveClassTable::START_PRIORITY + i, action->getPriority());
        EXPECT_EQ(std::set<std::string>(described.parameters.begin(), described.parameters.end()),
                  std::set<std::string>(action->getParamNames()->begin(),
                                        action->getParamNames()->end()));
        Orv_HashMapCStr read;
        action->getRegsToRead(read);
        for (const auto& entry : read) {
            const bool listed = std::count(described.registers.begin(), described.registers.end(),
                                           entry.first) != 0;
            EXPECT_TRUE(listed || choices.count(entry.first) != 0)
                << described.className << " reads " << entry.first;
        }
    }
}

}  // namespace

TEST(VanduSlaves, TheSlaveClassTableDescribesEachClassAsItRegisters) {
    using Table = OrvRT::OrvNebu_SlaveClassTable;
    expectAsTheTableSays<OrvNebu_VanduM3Qrc>(Table::VANDU_M3QRC);
    expectAsTheTableSays<OrvNebu_VanduR2Qra>(Table::VANDU_R2QRA);
    expectAsTheTableSays<OrvNebu_VanduR3Qra>(Table::VANDU_R3QRA);
    expectAsTheTableSays<OrvNebu_VanduR3Qrb>(Table::VANDU_R3QRB);
}

TEST(VanduSlaves, MissingChoiceParameterStopsTheRegistrationAfterEarlierActions) {
    Registered<OrvNebu_VanduM3Qrc> m3(
        {"pll_divsel_fb_0", "pll_divsel_ref_0", "pll_txdivsel_out_0", "tx_data_width0"});
    try {
        m3.registerActions();
        FAIL() << "channel 1 has no dividers";
    } catch (const std::logic_error& e) {
        EXPECT_STREQ(
            "Internal error: During init linerate choice, cannot find parameter: pll_divsel_fb_1",
            e.what());
    }
    // The clock action and channel 0 stay with the slave (and go with it).
    EXPECT_EQ(5000u, m3.priorityOf("txusrclk1_freq"));
    EXPECT_EQ(5001u, m3.priorityOf("line_rate0"));
    EXPECT_EQ(0u, m3.priorityOf("line_rate1"));
    EXPECT_EQ(0u, m3.priorityOf("sysclk_freq"));

    Registered<OrvNebu_VanduR2Qra> r2({"pll_divsel_fb"});
    EXPECT_THROW(r2.registerActions(), std::logic_error);
    EXPECT_EQ(0u, r2.priorityOf("refclk_source"));
}

namespace {
class VanduCreate : public TestHost {};
}  // namespace

TEST_F(VanduCreate, FailedInitIsReportedAndGivesNull) {
    const std::string missing = std::string(NEBU_TEST_DATA_DIR) + "/no_such_regs.csv";
    const ORV_CORE_INFO info{{1, 0x44, 0, 0, 0}};
    const ORV_SLAVE_REF ref{0, 2, 1};
    const Orv_HashMapCStr slaveInfo{{"slave_type", "68"}, {"orv_drv_ver", "1"}};
    using Create =
        OrvNebu_Slave* (*)(uint32_t, const ORV_CORE_INFO&, const ORV_SLAVE_REF&,
                           const Orv_HashMapCStr&, const std::string&, const std::string&);
    for (Create create : {&OrvNebu_VanduM3Qrc::create, &OrvNebu_VanduR3Qra::create,
                          &OrvNebu_VanduR3Qrb::create, &OrvNebu_VanduR2Qra::create}) {
        clearMessages();
        EXPECT_EQ(nullptr, create(HANDLE, info, ref, slaveInfo, missing, ""));
        // The register file reader's own report, then the text once more from the creation.
        const std::string text = "Unable to open OrvNebu register file: " + missing;
        ASSERT_EQ(2u, messages().size());
        EXPECT_EQ(256u, messages()[0].severity);
        EXPECT_EQ(text, messages()[0].text);
        EXPECT_LAST_MESSAGE(SEVERITY_ERROR, text);
    }
}
