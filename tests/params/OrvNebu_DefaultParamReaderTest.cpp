// Parameter definition files: messages, the per-session cache, printing; choice parameters:
// building, matching register values, listing.
#include <functional>
#include <sstream>
#include <stdexcept>

#include "base/Orv_AbortException.h"
#include "params/OrvNebu_DefaultParamReader.h"
#include "support/TempDataDir.h"
#include "support/TestHost.h"

using OrvRT::OrvNebu_ParamChoiceAction;
using OrvRT::Orv_AbortException;
using OrvRT::Orv_HashMapCStr;
using OrvRT::OrvNebu_ActionsMap;
using Reader = OrvRT::OrvNebu_DefaultParamReader;
using Strings = std::vector<std::string>;

namespace {

constexpr uint32_t S = 41, OTHER = 42;
const char* const MODE_FILE =
    "h\nMODE,0,Off,EN=0\nMODE,1,On,EN=1,SEL=01\nLEVEL,0,Low,LVL=0000\nLEVEL,1,High,LVL=1111\n";

class ParamReader : public TestHost {
protected:
    void TearDown() override {
        for (uint32_t h : {0u, S, OTHER}) OrvSim::endSession(h);
        TestHost::TearDown();
    }
    std::string write(const std::string& name, const std::string& text) {
        data_.write(name, text);
        return data_.path(name);
    }
    static OrvNebu_ActionsMap load(const std::string& path, uint32_t handle = S) {
        OrvNebu_ActionsMap actions;
        Reader::addToHashMap(handle, path, actions);
        return actions;
    }
    static OrvNebu_ParamChoiceAction& choice(OrvNebu_ActionsMap& a, const char* name) {
        return *static_cast<OrvNebu_ParamChoiceAction*>(a.at(name));
    }
    // Every message so far as "session severity text"; clears them.
    Strings said() {
        Strings all;
        for (const Message& m : messages())
            all.push_back(std::to_string(m.handle) + " " + std::to_string(m.severity) + " " +
                          m.text);
        clearMessages();
        return all;
    }
    TempDataDir data_;
};

std::string logicErrorOf(const std::function<void()>& f) {
    try {
        f();
    } catch (const std::logic_error& e) {
        return e.what();
    }
    return "<nothing thrown>";
}

}  // namespace

TEST_F(ParamReader, FailuresAreReportedAndCacheNothing) {
    const std::string bad = write("bad.csv", "h\nMODE,0,Off,EN=0\nMODE,1,On\n");
    EXPECT_THROW(load(bad), Orv_AbortException);
    EXPECT_EQ(Strings{"41 512 Unable to parse file: " + bad + " line:3: MODE,1,On"}, said());
    EXPECT_EQ(0u, Reader::cachedFileCount(S));
    // A failed read caches nothing and is retried.
    EXPECT_EQ(2u, load(write("bad.csv", MODE_FILE)).size());
    for (const std::string& path : {data_.path("absent.csv"), data_.dir()}) {
        const std::string text = "Unable to open OrvNebu parameter file: " + path;
        try {
            load(path);
            ADD_FAILURE() << "no exception for " << path;
        } catch (const Orv_AbortException&) {
            ADD_FAILURE() << "abort instead of the open failure";
        } catch (const std::logic_error& e) {
            EXPECT_EQ(text, e.what());
        }
        EXPECT_EQ(Strings{"41 256 " + text}, said());
    }
    EXPECT_EQ(1u, Reader::cachedFileCount(S));
    // A header alone, or nothing at all, is a file without parameters.
    for (const char* content : {"param,index,choice\n", "param,index,choice", ""})
        EXPECT_TRUE(load(write(std::to_string(std::string(content).size()), content)).empty());
    EXPECT_EQ(4u, Reader::cachedFileCount(S));
    EXPECT_NO_MESSAGES();
}

TEST_F(ParamReader, CachedPerSessionUntilItEnds) {
    const std::string a = write("a.csv", MODE_FILE);
    // A new host knows no listener: the first file cached registers again.
    for (int host = 0; host < 2; ++host) {
        OrvSim::resetHost();
        load(a);
        OrvSim::endSession(S);
        EXPECT_EQ(0u, Reader::cachedFileCount(S)) << "host " << host;
    }
    load(write("b.csv", "h\nB,0,x,\n"));
    OrvNebu_ActionsMap first = load(a);
    write("a.csv", "h\nMODE,0,Only,\n");
    const uint64_t registrations = OrvSim::listenerRegistrations();
    OrvNebu_ActionsMap other = load(a, OTHER);
    EXPECT_EQ(registrations, OrvSim::listenerRegistrations()) << "registered once, not per read";
    EXPECT_EQ(1u, choice(other, "MODE").getChoiceList().size());
    EXPECT_EQ(1u, other.size());
    std::ostringstream sink;
    Reader::readAndPrint(a, sink);
    EXPECT_EQ(2u, Reader::cachedFileCount(S));
    EXPECT_EQ(1u, Reader::cachedFileCount(0));

    OrvSim::endSession(S);
    EXPECT_EQ(0u, Reader::cachedFileCount(S));
    EXPECT_EQ(1u, Reader::cachedFileCount(OTHER));
    EXPECT_EQ(1u, Reader::cachedFileCount(0));
    // The next use reads the file afresh; the other session still has its own.
    EXPECT_EQ(1u, choice(first = load(a), "MODE").getChoiceList().size());
    EXPECT_EQ(other, load(a, OTHER));
}

TEST_F(ParamReader, PrintsTheFileBackAndAgainFromTheCache) {
    const std::string path = write("p.csv",
                                   "Param,Index,Choice,Settings\r\nMODE,0,Off,EN=0,ZZ=\n"
                                   "\"MODE\",1,On,EN=1,,SEL=01\nWIDE,0,w,R=000101\nWIDE,1,v,R=11\n"
                                   "EMPTY,0,none,\n");
    const std::string image =
        "Param,Index,Choice,Settings\nMODE,0,Off,EN=0,ZZ=\nMODE,1,On,EN=1,SEL=01\n"
        "WIDE,0,w,R=000101\nWIDE,1,v,R=000011\nEMPTY,0,none\n";
    for (int pass = 0; pass < 2; ++pass) {
        std::ostringstream out;
        Reader::readAndPrint(path, out);
        EXPECT_EQ(image, out.str()) << "pass " << pass;
        // Printed from the cache (session 0): the file is not read again.
        write("p.csv", "Other\nX,0,y,\n");
    }
    EXPECT_NO_MESSAGES();
    // Failures are reported on session 0.
    const std::string bad = write("bad.csv", "h\nM,0,a\n");
    std::ostringstream none;
    EXPECT_THROW(Reader::readAndPrint(bad, none), Orv_AbortException);
    EXPECT_EQ(Strings{"0 512 Unable to parse file: " + bad + " line:2: M,0,a"}, said());
}

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
                          {"0x0x1", "1", false},  {"00x1", "1", false},     {"ABC", "abc", true},
                          {"0x12", "12", true}};
    for (const Case& c : cases) {
        SCOPED_TRACE(std::string(c.a) + " vs " + c.b);
        EXPECT_EQ(c.equal, OrvNebu_ParamChoiceAction::hexValuesEqual(c.a, c.b));
        EXPECT_EQ(c.equal, OrvNebu_ParamChoiceAction::hexValuesEqual(c.b, c.a));
    }
}

// The board-level engine tests cover the common cases; these are the corners.

TEST(ParamChoiceAction, WithoutChoicesItReadsEmptyAndListsNone) {
    OrvNebu_ParamChoiceAction none("N", 10002);
    Orv_HashMapCStr registers, params{{"N", "stale"}};
    none.readRegsAndUpdateParams(false, registers, params);
    EXPECT_EQ((Orv_HashMapCStr{{"N", ""}}), params);
    std::vector<std::string> choices{"left", "over"};
    none.getChoices(nullptr, choices);
    EXPECT_TRUE(choices.empty());
}
