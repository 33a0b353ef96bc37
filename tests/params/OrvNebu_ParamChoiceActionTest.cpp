// Choice parameters: building, matching register values, setting choices, listing, printing.
#include <gtest/gtest.h>

#include <functional>
#include <stdexcept>
#include <string>
#include <vector>

#include "params/OrvNebu_ParamChoiceAction.h"

using OrvRT::Orv_HashMapCStr;
using OrvRT::OrvNebu_ParamChoiceAction;

namespace {

std::string logicErrorOf(const std::function<void()>& f) {
    try {
        f();
    } catch (const std::logic_error& e) {
        return e.what();
    }
    return "<nothing thrown>";
}

// MODE: Off (EN=0), On (EN=1, SEL=01), Fast (EN=1, SEL=10), Same (EN=1, SEL=01 again).
OrvNebu_ParamChoiceAction makeMode() {
    OrvNebu_ParamChoiceAction mode("MODE", 10002);
    const char* const names[] = {"Off", "On", "Fast", "Same"};
    for (uint32_t i = 0; i < 4; ++i) {
        mode.addChoice(names[i], i);
        mode.addChoiceRegSetting(i, 1, "EN", i == 0 ? "0" : "1");
        if (i != 0) mode.addChoiceRegSetting(i, 2, "SEL", i == 2 ? "2" : "1");
    }
    return mode;
}

std::string readMode(OrvNebu_ParamChoiceAction& action, Orv_HashMapCStr registers) {
    Orv_HashMapCStr params;
    params[action.getParamName()] = "stale";
    action.readRegsAndUpdateParams(false, registers, params);
    EXPECT_EQ(1u, params.size());
    return params[action.getParamName()];
}

}  // namespace

TEST(ParamChoiceAction, ChoiceIndexesMustRunInOrder) {
    OrvNebu_ParamChoiceAction a("P", 10002);
    // A setting before any choice has no last choice to go to.
    EXPECT_EQ("choice_index corrupt",
              logicErrorOf([&] { a.addChoiceRegSetting(0xFFFFFFFFu, 1, "R", "1"); }));
    EXPECT_EQ("choice_index corrupt", logicErrorOf([&] { a.addChoiceRegSetting(0, 1, "R", "1"); }));
    EXPECT_EQ("choice_index out-of-order", logicErrorOf([&] { a.addChoice("B", 1); }));
    EXPECT_TRUE(a.getChoiceList().empty());

    a.addChoice("A", 0);
    EXPECT_EQ("choice_index out-of-order", logicErrorOf([&] { a.addChoice("A2", 0); }));
    a.addChoice("B", 1);
    EXPECT_EQ("choice_index corrupt", logicErrorOf([&] { a.addChoiceRegSetting(0, 4, "R", "F"); }));
    EXPECT_EQ("choice_index corrupt", logicErrorOf([&] { a.addChoiceRegSetting(2, 4, "R", "F"); }));
    // The failed calls left nothing behind.
    ASSERT_EQ(2u, a.getChoiceList().size());
    EXPECT_TRUE(a.getChoiceList()[0].getRegValueList().empty());
    EXPECT_TRUE(a.getChoiceList()[1].getRegValueList().empty());
    EXPECT_EQ(0u, a.getRegWidth("R"));

    a.addChoiceRegSetting(1, 4, "R", "F");
    EXPECT_EQ(4u, a.getRegWidth("R"));
    // Asking for a register no choice sets does not make it one to read.
    EXPECT_EQ(0u, a.getRegWidth("UNKNOWN"));
    OrvRT::Orv_HashMapCStr registers;
    a.getRegsToRead(registers);
    EXPECT_EQ((OrvRT::Orv_HashMapCStr{{"R", ""}}), registers);
}

TEST(ParamChoiceAction, HexValueComparison) {
    struct Case {
        const char* a;
        const char* b;
        bool equal;
    };
    const Case cases[] = {{"0x001F", "1f", true}, {"0x001F", "001F", true}, {"1f", "001F", true},
                          {"0X1f", "0x1F", true}, {"0", "", true},          {"0x0", "", true},
                          {"000", "0", true},     {"0x", "", true},         {"1", "01", true},
                          {"1", "10", false},     {"1f", "1e", false},      {" 1", "1", false},
                          {"0x0x1", "1", false},  {"00x1", "1", false},     {"ABC", "abc", true}};
    for (const Case& c : cases) {
        SCOPED_TRACE(std::string(c.a) + " vs " + c.b);
        EXPECT_EQ(c.equal, OrvNebu_ParamChoiceAction::hexValuesEqual(c.a, c.b));
        EXPECT_EQ(c.equal, OrvNebu_ParamChoiceAction::hexValuesEqual(c.b, c.a));
    }
}

// The board-level engine tests cover the common cases; these are the corners.
TEST(ParamChoiceAction, ReadingCorners) {
    OrvNebu_ParamChoiceAction mode = makeMode();
    // A register missing from the map reads as empty, which equals 0.
    EXPECT_EQ("Off", readMode(mode, {}));
    EXPECT_EQ("On", readMode(mode, {{"EN", "0x1"}, {"SEL", "0x0001"}}));

    // A parameter without choices reads as empty and lists none (clearing the list).
    OrvNebu_ParamChoiceAction none("N", 10002);
    EXPECT_EQ("", readMode(none, {}));
    std::vector<std::string> choices{"left", "over"};
    none.getChoices(nullptr, choices);
    EXPECT_TRUE(choices.empty());
}

TEST(ParamChoiceAction, SettingCorners) {
    OrvNebu_ParamChoiceAction mode = makeMode();
    Orv_HashMapCStr registers{{"EN", "1"}};
    // An absent entry counts as empty: nothing is set, the entry is made.
    Orv_HashMapCStr other{{"X", "On"}};
    mode.setParams(other, registers);
    EXPECT_EQ((Orv_HashMapCStr{{"EN", "1"}}), registers);
    EXPECT_EQ(1u, other.count("MODE"));
    // Blanks are part of the name.
    Orv_HashMapCStr params{{"MODE", " On"}};
    EXPECT_EQ("Setting Parameter 'MODE' to value ' On' is not a valid choice.",
              logicErrorOf([&] { mode.setParams(params, registers); }));
    EXPECT_EQ((Orv_HashMapCStr{{"EN", "1"}}), registers);
}
