// Inputs the board fuzzer found that the board file loader mishandled, kept as regressions.
#include <gtest/gtest.h>

#include <string>

#include "hostsim/board/Board.h"

namespace {

// The loader's error for the text, or "" when it loads.
std::string loadError(const std::string& json, const std::string& name) {
    try {
        OrvSim::Board::loadText(json, name);
        return std::string();
    } catch (const OrvSim::BoardError& e) {
        return e.what();
    }
}

std::string repeat(const std::string& part, size_t times) {
    std::string text;
    text.reserve(part.size() * times);
    for (size_t i = 0; i < times; ++i) text += part;
    return text;
}

TEST(BoardFindings, NumbersTooLargeForTheJsonParserAreABoardError) {
    // The parser reports such numbers as out of range, not as a parse error; the loader let
    // that escape, so the console would not have named the file.
    const std::string cut = R"({"devices":[{"trellom":false,"chainc":222222222e2222222true,)";
    EXPECT_EQ(loadError(cut, "found.json")
                  .rfind("found.json: not valid JSON: number overflow parsing '222222222e2222222'",
                         0),
              0u)
        << loadError(cut, "found.json");
    // The same number in a well-formed file.
    EXPECT_EQ(loadError(R"({"devices": [], "x": 1e999})", "big.json"),
              "big.json: not valid JSON: number overflow parsing '1e999'");
    // A number JSON can hold but the board cannot is still the reader's own message.
    EXPECT_NE(loadError(R"({"devices": [{"chains": {"1": {"cores": [{"type": 1e300}]}}}]})",
                        "range.json"),
              "");
}

TEST(BoardFindings, NestingOfAnyDepthIsOneBoardError) {
    // Printing the offending value recursed once per level and ran out of stack.
    for (size_t depth : {33u, 100000u}) {
        const std::string arrays = std::string(depth, '[') + std::string(depth, ']');
        const std::string objects = R"({"devices": [{"chains": {"1": )" +
                                    repeat(R"({"x": )", depth) + "0" + repeat("}", depth + 2) +
                                    "]}";
        for (const std::string& text : {arrays, objects}) {
            const std::string error = loadError(text, "deep.json");
            EXPECT_NE(error.find(": nested deeper than 32 levels"), std::string::npos)
                << error.substr(0, 200);
        }
    }
}

}  // namespace
