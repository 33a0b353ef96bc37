// The four transceiver slave classes register the computed actions the slave class table
// describes: under its names, in its priority order, reading only registers it lists.
#include <gtest/gtest.h>

#include <algorithm>
#include <memory>
#include <set>
#include <string>
#include <vector>

#include "base/OrvNebu_SlaveClassTable.h"
#include "params/OrvNebu_ParamChoiceAction.h"
#include "transceiver/OrvNebu_VanduM3Qrc.h"
#include "transceiver/OrvNebu_VanduR2Qra.h"
#include "transceiver/OrvNebu_VanduR3Qra.h"
#include "transceiver/OrvNebu_VanduR3Qrb.h"

using namespace OrvRT;
using Table = OrvNebu_SlaveClassTable;

namespace {

// A slave of class V with choice actions of the given names, then the class's own actions.
template <class V>
struct Registered : V {
    explicit Registered(const std::set<std::string>& choiceNames)
        : V(1, ORV_SLAVE_REF{0, 2, 3}, ORV_CORE_INFO{{1, 0x44, 0, 0, 0}}, Orv_HashMapCStr{}) {
        for (const std::string& name : choiceNames) {
            choices.push_back(std::make_unique<OrvNebu_ParamChoiceAction>(name, 10002));
            OrvNebu_ParamAction::addActionToHashMap(this->actions_, choices.back().get());
        }
        this->addToActionsHashMap(1, this->actions_);
    }
    size_t distinctActions() const {
        std::set<OrvNebu_ParamAction*> seen;
        for (const auto& entry : this->actions_) seen.insert(entry.second);
        return seen.size();
    }
    std::vector<std::unique_ptr<OrvNebu_ParamChoiceAction>> choices;
};

template <class V>
void expectAsTheTableSays(Table::SlaveClass slaveClass) {
    const auto& info = Table::info(slaveClass);
    SCOPED_TRACE(info.className);
    std::set<std::string> choices;
    for (const auto& action : info.actions) {
        choices.insert(action.choiceParameters.begin(), action.choiceParameters.end());
    }
    Registered<V> slave(choices);
    EXPECT_EQ(choices.size() + info.actions.size(), slave.distinctActions());
    for (size_t i = 0; i < info.actions.size(); ++i) {
        const auto& described = info.actions[i];
        OrvNebu_ParamAction* action = slave.getParamAction(described.parameters.front());
        ASSERT_NE(action, nullptr) << described.className;
        EXPECT_EQ(described.parameters.front(), action->getParamName());
        EXPECT_EQ(Table::START_PRIORITY + i, action->getPriority());
        EXPECT_EQ(std::set<std::string>(described.parameters.begin(), described.parameters.end()),
                  std::set<std::string>(action->getParamNames()->begin(),
                                        action->getParamNames()->end()));
        Orv_HashMapCStr read;
        action->getRegsToRead(read);
        for (const auto& entry : read) {
            EXPECT_TRUE(std::count(described.registers.begin(), described.registers.end(),
                                   entry.first) != 0 ||
                        choices.count(entry.first) != 0)
                << described.className << " reads " << entry.first;
        }
    }
}

}  // namespace

TEST(VanduSlaves, TheSlaveClassTableDescribesEachClassAsItRegisters) {
    expectAsTheTableSays<OrvNebu_VanduM3Qrc>(Table::VANDU_M3QRC);
    expectAsTheTableSays<OrvNebu_VanduR2Qra>(Table::VANDU_R2QRA);
    expectAsTheTableSays<OrvNebu_VanduR3Qra>(Table::VANDU_R3QRA);
    expectAsTheTableSays<OrvNebu_VanduR3Qrb>(Table::VANDU_R3QRB);
}
