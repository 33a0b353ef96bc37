// The four transceiver test slave classes: their computed actions as the class table says, what a
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
    explicit Registered(const std::set<std::string>& choiceNames)
        : V(1, ORV_SLAVE_REF{0, 2, 3}, ORV_CORE_INFO{{1, 0x44, 0, 0, 0}}, Orv_HashMapCStr{}) {
        for (const std::string& name : choiceNames) {
            choices_.push_back(std::make_unique<OrvRT::OrvNebu_ParamChoiceAction>(name, 10002));
            OrvNebu_ParamAction::addActionToHashMap(this->actions_, choices_.back().get());
        }
    }
    void registerActions() { this->addToActionsHashMap(1, this->actions_); }
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
    std::vector<std::unique_ptr<OrvRT::OrvNebu_ParamChoiceAction>> choices_;
};

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
    Registered<V> slave(choices);
    slave.registerActions();
    EXPECT_EQ(choices.size() + info.actions.size(), slave.distinctActions());
    for (size_t i = 0; i < info.actions.size(); ++i) {
        const auto& described = info.actions[i];
        OrvNebu_ParamAction* action = slave.getParamAction(described.parameters.front());
        ASSERT_NE(action, nullptr) << described.className;
        EXPECT_EQ(described.parameters.front(), action->getParamName());
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
