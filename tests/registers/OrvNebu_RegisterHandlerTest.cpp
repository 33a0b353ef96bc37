// Register definition files: the printed image and the reference-counted handler cache.
#include <sstream>

#include "registers/OrvNebu_DefaultRegisterHandler.h"
#include "support/RegsFixture.h"

using H = OrvRT::OrvNebu_DefaultRegisterHandler;
using OrvRT::OrvNebu_RegisterHandler;

namespace {

TEST_F(RegsFixture, PrintedImageNormalisesTheColumns) {
    const std::pair<const char*, const char*> rows[] = {
        {"name,addr,order,start,end,t6,acc,t8,inc\n"
         "A,10,0,0,7,x,rw,y,y,extra,more\nB,0b,1,3,0,,wr,,\nC,a0,2,0,0,,read/write,,N\n"
         "D,5,0,0,0,,,,yes\nE,0000f,0,1,1,,r,,y\nF,1,0,0,0,,w,,y\n",
         "name,addr,order,start,end,t6,acc,t8,inc\n"
         "A,10,0,0,7,x,rw,y,y,more\nB,0b,1,3,0,,rw,,y\nC,a0,2,0,0,,rw,,y\n"
         "D,5,0,0,0,,,,y\nE,0f,0,1,1,,r,,y\nF,1,0,0,0,,w,,y\n"},
        // Quotes are removed after the split; CR LF reads as LF.
        {"h\r\n\"Q\",\"5\",\"0\",0,3,\"txt\",\"rw\",,y\r\n", "h\nQ,5,0,0,3,txt,rw,,y\n"},
    };
    for (const auto& row : rows) {
        data_.write("print.csv", row.first);
        std::ostringstream out;
        H::readAndPrint(HANDLE, data_.path("print.csv"), out);
        EXPECT_EQ(out.str(), row.second);
    }
    EXPECT_NO_MESSAGES();
}

TEST_F(RegsFixture, OneHandlerPerFileSharedUntilTheLastSlaveGoes) {
    const std::string file = data_.path("regs.csv");
    // Printing counts nothing.
    std::ostringstream out;
    H::readAndPrint(HANDLE, file, out);
    EXPECT_EQ(out.str(), REGS);
    EXPECT_EQ(H::getHandlerCount(), 0u);
    EXPECT_EQ(H::findRegisterHandler(HANDLE, file), nullptr);
    EXPECT_EQ(H::findRegisterHandler(HANDLE, ""), nullptr);
    ASSERT_EQ(initialize(0), ORVNEBU_OK);
    OrvNebu_RegisterHandler* shared = H::findRegisterHandler(HANDLE, file);
    ASSERT_NE(shared, nullptr);
    EXPECT_EQ(shared->getMinAddress(), 2u);
    ASSERT_EQ(initialize(1), ORVNEBU_OK);
    ASSERT_EQ(initialize(2), ORVNEBU_OK);  // another slave type naming the same file
    EXPECT_EQ(H::findRegisterHandler(HANDLE, file), shared);
    EXPECT_EQ(H::getHandlerCount(), 3u);

    // A file that cannot be opened: reported, and only its own reference given back.
    clearMessages();
    EXPECT_EQ(initialize(6), ORVNEBU_FAILED);
    EXPECT_MESSAGE(256, "Unable to open OrvNebu register file: " + data_.path("missing.csv"));
    EXPECT_LAST_MESSAGE(32768, "Orv abort command");
    EXPECT_EQ(H::getHandlerCount(), 3u);
    EXPECT_THROW(H::readAndPrint(HANDLE, data_.path("missing.csv"), out), std::logic_error);

    // A changed file is not read while any slave of the class still holds a handler.
    data_.write("regs.csv", "h\nNEW,2,0,0,15,,rw,,y\n");
    ASSERT_EQ(terminate(0), ORVNEBU_OK);
    ASSERT_EQ(terminate(1), ORVNEBU_OK);
    EXPECT_EQ(H::findRegisterHandler(HANDLE, file), shared);
    ASSERT_EQ(initialize(0), ORVNEBU_OK);
    poke(2, 2, 0x2222);
    ORV_HASHMAP_HANDLE old = makeMap({{"A", ""}});
    ASSERT_EQ(getRegs(2, old), ORVNEBU_OK);
    EXPECT_EQ(mapOf(old)["A"], "2222");

    ASSERT_EQ(terminate(2), ORVNEBU_OK);
    ASSERT_EQ(terminate(0), ORVNEBU_OK);
    EXPECT_EQ(H::getHandlerCount(), 0u);
    EXPECT_EQ(H::findRegisterHandler(HANDLE, file), nullptr);

    ASSERT_EQ(initialize(0), ORVNEBU_OK);
    ASSERT_EQ(initialize(1), ORVNEBU_OK);
    poke(0, 2, 0x0BAD);
    ORV_HASHMAP_HANDLE fresh = makeMap({{"NEW", ""}});
    ASSERT_EQ(getRegs(0, fresh), ORVNEBU_OK);
    EXPECT_EQ(mapOf(fresh)["NEW"], "0BAD");
    // Ending the session removes its slaves, which give their references back.
    OrvSim::endSession(HANDLE);
    EXPECT_EQ(H::getHandlerCount(), 0u);
    EXPECT_EQ(H::findRegisterHandler(HANDLE, file), nullptr);
}

}  // namespace
