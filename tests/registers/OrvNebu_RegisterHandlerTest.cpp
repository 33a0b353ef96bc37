// Register definition files: format edges, the printed image, every failure with its
// messages, severities and line numbers, and the reference-counted handler cache.
#include <sstream>

#include "registers/OrvNebu_DefaultRegisterHandler.h"
#include "support/RegsFixture.h"

using OrvRT::OrvNebu_DefaultRegisterHandler;
using OrvRT::OrvNebu_RegisterHandler;

namespace {

class RegisterFileTest : public RegsFixture {
protected:
    // The printed image of a file with this text.
    std::string image(const std::string& text) {
        data_.write("print.csv", text);
        std::ostringstream out;
        OrvNebu_DefaultRegisterHandler::readAndPrint(HANDLE, data_.path("print.csv"), out);
        return out.str();
    }

    // Initializes slave 0 with this register file; returns the call's code.
    uint32_t initializeWith(const std::string& text) {
        data_.write("regs.csv", text);
        clearMessages();
        return initialize(0);
    }

    std::string parseError(uint32_t line, const std::string& text) {
        return "512 Unable to parse file: " + data_.path("regs.csv") +
               " line:" + std::to_string(line) + ": " + text + "\n";
    }
};

TEST_F(RegisterFileTest, PrintedImageNormalisesTheColumns) {
    const std::pair<const char*, const char*> rows[] = {
        {"name,addr,order,start,end,t6,acc,t8,inc\n"
         "A,10,0,0,7,x,rw,y,y,extra,more\nB,0b,1,3,0,,wr,,\nC,a0,2,0,0,,read/write,,N\n"
         "D,5,0,0,0,,,,yes\nE,0000f,0,1,1,,r,,y\nF,1,0,0,0,,w,,y\n",
         "name,addr,order,start,end,t6,acc,t8,inc\n"
         "A,10,0,0,7,x,rw,y,y,more\nB,0b,1,3,0,,rw,,y\nC,a0,2,0,0,,rw,,y\n"
         "D,5,0,0,0,,,,y\nE,0f,0,1,1,,r,,y\nF,1,0,0,0,,w,,y\n"},
        // 'n' anywhere in column 9 drops the line.
        {"h\nA,1,0,0,0,,,,n\nB,2,0,0,0,,,,no\nC,3,0,0,0,,,,yn\nD,4,0,0,0,,,,y\n",
         "h\nD,4,0,0,0,,,,y\n"},
        // Quotes are removed after the split; a quoted comma still splits.
        {"h\n\"Q\",\"5\",\"0\",0,3,\"txt\",\"rw\",,y\n", "h\nQ,5,0,0,3,txt,rw,,y\n"},
        {"h\nQ,5,0,0,3,\"a,b\",rw,,y\n", "h\nQ,5,0,0,3,\"a,,rw,y,y\n"},
        // CR LF, and a last line without a line end, read the same.
        {"h\r\nA,1,0,0,0,,rw,,y\r\nB,2,0,0,0,,rw,,y\r\n",
         "h\nA,1,0,0,0,,rw,,y\nB,2,0,0,0,,rw,,y\n"},
        {"h\nA,1,0,0,0,,rw,,y\nB,2,0,0,0,,rw,,y", "h\nA,1,0,0,0,,rw,,y\nB,2,0,0,0,,rw,,y\n"},
        {"A,1,0,0,0,,rw,,y\n", "A,1,0,0,0,,rw,,y\n"},  // the first line is never parsed
        {"h\nA,9,0,0,0,,rw,,y\n", "h\nA,9,0,0,0,,rw,,y\n"},
        // Ctrl-Z, the end of a text file to old Windows programs, is a character like any other.
        {"h\nA,1,0,0,0,\x1a,rw,,y\nB,2,0,0,0,,rw,,y\n",
         "h\nA,1,0,0,0,\x1a,rw,,y\nB,2,0,0,0,,rw,,y\n"},
        {"", "\n"},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.first);
        EXPECT_EQ(image(row.first), row.second);
    }
    EXPECT_NO_MESSAGES();

    data_.write("empty.csv", "");
    OrvNebu_RegisterHandler* h =
        OrvNebu_DefaultRegisterHandler::getRegisterHandler(HANDLE, data_.path("empty.csv"));
    EXPECT_EQ(h->getRegisterCount(), 0u);
    EXPECT_EQ(h->getMinAddress(), 0xFFFFFFFFu);
    EXPECT_EQ(h->getMaxAddress(), 0u);
    OrvNebu_DefaultRegisterHandler::releaseRegisterHandler(h);
}

TEST_F(RegisterFileTest, BadLinesAreReportedWithTheirLineNumbers) {
    struct Row {
        std::string file;
        std::string reason;  // the message before the line, if any
        uint32_t line;
        std::string text;
    };
    const Row rows[] = {
        {"h\nA,1,0,0,0,,rw,,y\n\nB,2,0,0,0,,rw,,y\n", "", 3, ""},
        {"h\nX,1,0,-1,3,,rw,,y\n", "256 Register bit out of range 0 to 31: start bit -1, end bit 3",
         2, "X,1,0,-1,3,,rw,,y"},
    };
    for (const Row& row : rows) {
        EXPECT_EQ(initializeWith(row.file), ORVNEBU_FAILED);
        std::vector<std::string> got,
            want{parseError(row.line, row.text), "32768 Orv abort command"};
        if (!row.reason.empty()) want.insert(want.begin(), row.reason);
        for (const auto& m : messages()) got.push_back(std::to_string(m.severity) + " " + m.text);
        EXPECT_EQ(got, want);
    }
    // No slave object was made: the reference has none.
    clearMessages();
    ORV_HASHMAP_HANDLE map = makeMap();
    EXPECT_EQ(getRegs(0, map), ORVNEBU_FAILED);
    EXPECT_LAST_MESSAGE(256,
                        "Data structures not initialized for OrvNebu slave Device:0, user chain "
                        "number/bus:1, slave index:0.");
    // An excluded line is not looked at.
    EXPECT_EQ(initializeWith("h\nX,1,0,0,99,,rw,,n\n"), ORVNEBU_OK);
}

TEST_F(RegisterFileTest, AccessLettersRefuseNoReadOrWriteAndUnnamedRegistersHide) {
    ASSERT_EQ(initializeWith("h\nRO,1,0,0,15,,r,,y\nWO,2,0,0,15,,w,,y\nNONE,3,0,0,15,,,,y\n"
                             ",4,0,0,7,,rw,,y\n"),
              ORVNEBU_OK);
    ORV_HASHMAP_HANDLE set = makeMap({{"RO", "1111"}, {"WO", "2222"}, {"NONE", "3333"}});
    ASSERT_EQ(setRegs(0, set), ORVNEBU_OK);
    EXPECT_EQ(peek(0, 1), 0x1111);
    EXPECT_EQ(peek(0, 3), 0x3333);
    ORV_HASHMAP_HANDLE all = makeMap();
    ASSERT_EQ(getRegs(0, all), ORVNEBU_OK);
    EXPECT_EQ(mapOf(all),
              (OrvRT::Orv_HashMapCStr{{"RO", "1111"}, {"WO", "2222"}, {"NONE", "3333"}}));
    EXPECT_NO_MESSAGES();
}

class RegisterCacheTest : public RegsFixture {};

TEST_F(RegisterCacheTest, OneHandlerPerFileSharedUntilTheLastSlaveGoes) {
    const std::string file = data_.path("regs.csv");
    // Printing counts nothing.
    std::ostringstream out;
    OrvNebu_DefaultRegisterHandler::readAndPrint(HANDLE, file, out);
    EXPECT_EQ(out.str(), REGS);
    EXPECT_EQ(OrvNebu_DefaultRegisterHandler::getHandlerCount(), 0u);
    EXPECT_EQ(OrvNebu_DefaultRegisterHandler::findRegisterHandler(HANDLE, file), nullptr);
    EXPECT_EQ(OrvNebu_DefaultRegisterHandler::findRegisterHandler(HANDLE, ""), nullptr);
    ASSERT_EQ(initialize(0), ORVNEBU_OK);
    OrvNebu_RegisterHandler* shared =
        OrvNebu_DefaultRegisterHandler::findRegisterHandler(HANDLE, file);
    ASSERT_NE(shared, nullptr);
    ASSERT_EQ(initialize(1), ORVNEBU_OK);
    ASSERT_EQ(initialize(2), ORVNEBU_OK);  // another slave type naming the same file
    EXPECT_EQ(OrvNebu_DefaultRegisterHandler::findRegisterHandler(HANDLE, file), shared);
    EXPECT_EQ(OrvNebu_DefaultRegisterHandler::getHandlerCount(), 3u);

    // A file that cannot be opened: reported, and only its own reference given back.
    clearMessages();
    EXPECT_EQ(initialize(6), ORVNEBU_FAILED);
    EXPECT_MESSAGE(256, "Unable to open OrvNebu register file: " + data_.path("missing.csv"));
    EXPECT_LAST_MESSAGE(32768, "Orv abort command");
    EXPECT_EQ(OrvNebu_DefaultRegisterHandler::getHandlerCount(), 3u);
    EXPECT_THROW(
        OrvNebu_DefaultRegisterHandler::readAndPrint(HANDLE, data_.path("missing.csv"), out),
        std::logic_error);

    // A changed file is not read while any slave of the class still holds a handler.
    data_.write("regs.csv", "h\nNEW,2,0,0,15,,rw,,y\n");
    ASSERT_EQ(terminate(0), ORVNEBU_OK);
    ASSERT_EQ(terminate(1), ORVNEBU_OK);
    EXPECT_EQ(OrvNebu_DefaultRegisterHandler::findRegisterHandler(HANDLE, file), shared);
    ASSERT_EQ(initialize(0), ORVNEBU_OK);
    poke(2, 2, 0x2222);
    ORV_HASHMAP_HANDLE old = makeMap({{"A", ""}});
    ASSERT_EQ(getRegs(2, old), ORVNEBU_OK);
    EXPECT_EQ(mapOf(old)["A"], "2222");

    ASSERT_EQ(terminate(2), ORVNEBU_OK);
    ASSERT_EQ(terminate(0), ORVNEBU_OK);
    EXPECT_EQ(OrvNebu_DefaultRegisterHandler::getHandlerCount(), 0u);
    EXPECT_EQ(OrvNebu_DefaultRegisterHandler::findRegisterHandler(HANDLE, file), nullptr);

    ASSERT_EQ(initialize(0), ORVNEBU_OK);
    ASSERT_EQ(initialize(1), ORVNEBU_OK);
    poke(0, 2, 0x0BAD);
    ORV_HASHMAP_HANDLE fresh = makeMap({{"NEW", ""}});
    ASSERT_EQ(getRegs(0, fresh), ORVNEBU_OK);
    EXPECT_EQ(mapOf(fresh)["NEW"], "0BAD");
    // Ending the session removes its slaves, which give their references back.
    OrvSim::endSession(HANDLE);
    EXPECT_EQ(OrvNebu_DefaultRegisterHandler::getHandlerCount(), 0u);
    EXPECT_EQ(OrvNebu_DefaultRegisterHandler::findRegisterHandler(HANDLE, file), nullptr);
}

}  // namespace
