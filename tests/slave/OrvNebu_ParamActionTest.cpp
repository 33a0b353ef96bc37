// Entering an action in an actions map under each of its names.
#include <gtest/gtest.h>

#include <string>
#include <utility>
#include <vector>

#include "params/OrvNebu_ParamAction.h"
#include "params/OrvNebu_ParamChoiceAction.h"

using OrvRT::OrvNebu_ActionsMap;
using OrvRT::OrvNebu_ParamAction;

namespace {

// An action serving a fixed list of names; nothing else is asked of it here.
class NamedAction : public OrvNebu_ParamAction {
public:
    explicit NamedAction(std::vector<std::string> names) : names_(std::move(names)) {}
    const std::string& getParamName() override { return names_.front(); }
    const std::vector<std::string>* getParamNames() override { return &names_; }
    uint32_t getPriority() override { return 5000; }
    void getRegsToRead(OrvRT::Orv_HashMapCStr&) override {}
    void readRegsAndUpdateParams(bool, OrvRT::Orv_HashMapCStr&, OrvRT::Orv_HashMapCStr&) override {}
    void setParams(OrvRT::Orv_HashMapCStr&, OrvRT::Orv_HashMapCStr&) override {}

private:
    std::vector<std::string> names_;
};

}  // namespace

TEST(ParamAction, EnteredUnderEveryNameReplacingOnlyThoseNames) {
    NamedAction first({"rate", "rate_0", "rate_1"});
    NamedAction second({"rate_1", "extra"});
    OrvNebu_ActionsMap actions;
    OrvNebu_ParamAction::addActionToHashMap(actions, &first);
    EXPECT_EQ((OrvNebu_ActionsMap{{"rate", &first}, {"rate_0", &first}, {"rate_1", &first}}),
              actions);
    OrvNebu_ParamAction::addActionToHashMap(actions, &second);
    EXPECT_EQ((OrvNebu_ActionsMap{
                  {"rate", &first}, {"rate_0", &first}, {"rate_1", &second}, {"extra", &second}}),
              actions);

    // The base answers: no choice parameter, no choices.
    EXPECT_FALSE(first.isChoiceParam());
    std::vector<std::string> choices{"kept"};
    first.getChoices(nullptr, choices);
    EXPECT_EQ(std::vector<std::string>{"kept"}, choices);
    OrvRT::OrvNebu_ParamChoiceAction choice("mode", 10002);
    EXPECT_TRUE(choice.isChoiceParam());
}
