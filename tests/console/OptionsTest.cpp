// The console's command-line options.
#include <gtest/gtest.h>

#include "Options.h"
#include "UsageError.h"

namespace nebu {
namespace {

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

TEST(OptionsTest, CableFiguresArePlainDecimalNumbers) {
    Options o = parseOptions({"--tck-mhz", "12.5", "--round-trip-us=0"});
    EXPECT_EQ(o.cable.tckMhz, 12.5);
    EXPECT_EQ(o.cable.roundTripUs, 0.0);
    o = parseOptions({"--tck-mhz=1e1", "--round-trip-us", ".5"});
    EXPECT_EQ(o.cable.tckMhz, 10.0);
    EXPECT_EQ(o.cable.roundTripUs, 0.5);

    const std::vector<std::pair<std::vector<std::string>, std::string>> bad = {
        {{"--tck-mhz", "0"}, "--tck-mhz must be above 0, not 0"},
        {{"--tck-mhz", "0.0e5"}, "--tck-mhz must be above 0, not 0.0e5"},
        {{"--tck-mhz", "1e-999"}, "--tck-mhz must be above 0, not 1e-999"},
        {{"--tck-mhz", "-3"}, "bad number '-3' for --tck-mhz"},
        {{"--tck-mhz", "1e999"}, "bad number '1e999' for --tck-mhz"},
        {{"--tck-mhz", "inf"}, "bad number 'inf' for --tck-mhz"},
        {{"--tck-mhz", "nan"}, "bad number 'nan' for --tck-mhz"},
        {{"--tck-mhz", "0x10"}, "bad number '0x10' for --tck-mhz"},
        {{"--tck-mhz", " 30"}, "bad number ' 30' for --tck-mhz"},
        {{"--tck-mhz", "30MHz"}, "bad number '30MHz' for --tck-mhz"},
        {{"--tck-mhz="}, "bad number '' for --tck-mhz"},
        {{"--round-trip-us", "."}, "bad number '.' for --round-trip-us"},
        {{"--round-trip-us", "1.2.3"}, "bad number '1.2.3' for --round-trip-us"},
        {{"--round-trip-us", "-0"}, "bad number '-0' for --round-trip-us"},
        {{"--round-trip-us"}, "option --round-trip-us needs an argument"},
    };
    for (const auto& [args, text] : bad) {
        try {
            parseOptions(args);
            ADD_FAILURE() << "no error for " << args.back();
        } catch (const UsageError& e) {
            EXPECT_EQ(e.what(), text);
        }
    }
}

}  // namespace
}  // namespace nebu
