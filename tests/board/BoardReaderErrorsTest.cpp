// One clear error per malformed board file: the file, the place in it and the problem.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "hostsim/board/Board.h"

using OrvSim::Board;
using OrvSim::BoardError;
namespace {

std::string errorOf(const std::string& json, const std::string& name = "boards/x.json") {
    try {
        Board::loadText(json, name);
    } catch (const BoardError& e) {
        return e.what();
    }
    return "(no error)";
}

// A board whose device 0, chain 1, core 1 has the given master body.
std::string withMaster(const std::string& master) {
    return R"({"devices":[{"chains":{"1":{"cores":[{"type":3},{"type":14,"master":{)" + master +
           "}}]}}}]}";
}

TEST(BoardReaderErrors, MessagesNameTheFileThePlaceAndTheProblem) {
    struct Case {
        std::string json;
        std::string message;
    };
    const std::string M = "boards/x.json: devices[0].chains.1.cores[1].master.";
    const std::vector<Case> cases = {
        {"[]", "boards/x.json: expected a JSON object, got []"},
        {"{}", "boards/x.json: \"devices\" is missing"},
        {R"({"devices": [], "boards": 1})",
         "boards/x.json: boards: unknown key (known keys: devices)"},
        {R"({"devices": [{"chains": {"1": {"cores": [{"type": -3}]}}}]})",
         "boards/x.json: devices[0].chains.1.cores[0].type: -3 is out of range 0..4294967295"},
        {R"({"devices": [{"chains": {"1": {"cores": [{"type": 3, "failingCommands": [1, 8]}]}}}]})",
         "boards/x.json: devices[0].chains.1.cores[0].failingCommands[1]: 8 is out of range 1..7"},
        {withMaster(R"("slaveCount": 300)"), M + "slaveCount: 300 is out of range 0..255"},
        {withMaster(R"("slaveCount": 2, "slaves": {"2": {}})"),
         M + "slaves.2: slave index 2 is not below slaveCount 2"},
        {withMaster(R"("slaveCount": 2, "slaves": {"1": {}, "0x1": {}})"),
         M + "slaves.1: slave 1 is given twice"},
        {withMaster(R"("slaveCount": 1, "slaves": {"0": {"memory": {"0x1FFFE": [1, 2, 3]}}})"),
         M + "slaves.0.memory.0x1FFFE: 3 words from 0x1FFFE run past 0x1FFFF"},
        {withMaster(R"("slaveCount": 1, "slaves": {"0": {"memory": {"0x1FFE0": [0,0,0,0,0,0,0,0,
                       0,0,0,0,0,0,0,0,0]}}})"),
         M + "slaves.0.memory.0x1FFE0: address 0x1FFF0 holds an identification word "
             "(slaveType ... nextSlave)"},
        {R"({"devices": [], "devices": []})",
         "boards/x.json: devices: key \"devices\" is given twice"},
    };
    for (const Case& c : cases) EXPECT_EQ(errorOf(c.json), c.message) << c.json;

    // Found by the fuzzer: a number too large for the parser is the file's error, not an
    // escaped exception; nesting of any depth is refused without running out of stack.
    EXPECT_EQ(errorOf(R"({"devices": [], "x": 1e999})", "big.json"),
              "big.json: not valid JSON: number overflow parsing '1e999'");
    EXPECT_NE(errorOf(R"({"devices": [{"chains": {"1": {"cores": [{"type": 1e300}]}}}]})"),
              "(no error)");
    const size_t depth = 100000;
    std::string objects = R"({"devices": [{"chains": {"1": )";
    for (size_t i = 0; i < depth; ++i) objects += R"({"x": )";
    objects += "0" + std::string(depth + 2, '}') + "]}";
    for (const std::string& text : {std::string(depth, '[') + std::string(depth, ']'), objects}) {
        EXPECT_NE(errorOf(text).find(": nested deeper than 32 levels"), std::string::npos);
    }

    const std::string bad = errorOf("{\"devices\": [\n{,}]}", "broken.json");
    EXPECT_EQ(bad.rfind("broken.json: not valid JSON: parse error at line 2, column 2", 0), 0u)
        << bad;
    EXPECT_EQ(errorOf("", "empty.json").rfind("empty.json: not valid JSON: ", 0), 0u);
}

}  // namespace
