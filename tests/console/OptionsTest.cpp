// The console's command-line options.
#include <gtest/gtest.h>

#include "Options.h"
#include "UsageError.h"

namespace nebu {
namespace {

TEST(OptionsTest, DefaultsLeaveTheLocationsToTheProgram) {
    const Options o = parseOptions({});
    EXPECT_TRUE(o.boardFile.empty());
    EXPECT_TRUE(o.dataDir.empty());
    EXPECT_TRUE(o.pluginPath.empty());
    EXPECT_EQ(o.session, 1u);
    EXPECT_FALSE(o.trace);
    EXPECT_FALSE(o.help);
    EXPECT_TRUE(o.commands.empty());
    EXPECT_TRUE(o.script.empty());
}

TEST(OptionsTest, EveryOptionInBothSpellings) {
    const Options o =
        parseOptions({"--board", "b.json", "--data-dir=/d", "--session", "0x10", "--trace",
                      "--plugin=/p.so", "-e", "stats", "-e", "peek 0 1 0 0x10", "tour.nebu"});
    EXPECT_EQ(o.boardFile, "b.json");
    EXPECT_EQ(o.dataDir, "/d");
    EXPECT_EQ(o.session, 16u);
    EXPECT_TRUE(o.trace);
    EXPECT_EQ(o.pluginPath, "/p.so");
    EXPECT_EQ(o.commands, (std::vector<std::string>{"stats", "peek 0 1 0 0x10"}));
    EXPECT_EQ(o.script, "tour.nebu");

    const Options later = parseOptions({"--board=a.json", "--board", "c.json", "--", "-x"});
    EXPECT_EQ(later.boardFile, "c.json");
    EXPECT_EQ(later.script, "-x");
    EXPECT_TRUE(parseOptions({"--help"}).help);
}

TEST(OptionsTest, MistakesAreUsageErrors) {
    const std::vector<std::vector<std::string>> bad = {
        {"--bogus"},         {"-x"},
        {"--board"},         {"-e"},
        {"--session", "1x"}, {"--session"},
        {"--trace=yes"},     {"a.nebu", "b.nebu"},
        {"--board="},        {"--session", "4294967296"},
        {"--", "a", "b"}};
    for (const auto& args : bad) {
        EXPECT_THROW(parseOptions(args), UsageError) << args[0];
    }
    try {
        parseOptions({"--frobnicate"});
        FAIL() << "no error";
    } catch (const UsageError& e) {
        EXPECT_STREQ(e.what(), "unknown option '--frobnicate'");
    }
}

}  // namespace
}  // namespace nebu
