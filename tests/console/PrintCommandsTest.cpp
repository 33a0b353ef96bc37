// The console's print commands: the file image as the library's reader reads it, and a file
// that cannot be read reported on the session channel with exit status 1.
#include <gtest/gtest.h>

#include <memory>
#include <sstream>

#include "Console.h"
#include "TextFormat.h"
#include "support/TempDataDir.h"
#include "support/TestHost.h"

namespace nebu {
namespace {

class PrintCommandsTest : public TestHost {
protected:
    void SetUp() override {
        TestHost::SetUp();
        console_ = std::make_unique<Console>(PluginApi(), out_, err_, 1);
        console_->installSinks(false);
    }
    void TearDown() override {
        console_->finish();
        console_.reset();
        TestHost::TearDown();
    }
    std::string run(const std::string& line) {
        out_.str("");
        console_->runLine(line);
        return out_.str();
    }

    TempDataDir dir_;
    std::ostringstream out_;
    std::ostringstream err_;
    std::unique_ptr<Console> console_;
};

TEST_F(PrintCommandsTest, PrintsTheImageOrTheReadersMessages) {
    dir_.write("r.csv", "h\r\nA,0b,0,3,0,x,wr,,y,extra,more\r\nB,1,0,0,0,,,,n\r\n");
    const std::string path = dir_.path("r.csv");
    EXPECT_EQ(run("printRegisterFile " + path),
              "> printRegisterFile " + path + "\nh\nA,0b,0,3,0,x,rw,,y,more\n");
    EXPECT_EQ(console_->exitStatus(), 0);

    dir_.write("bad.csv", "h\n\n");
    // Message texts are escaped: a Windows path shows its backslashes doubled.
    EXPECT_EQ(run("printRegisterFile " + dir_.path("bad.csv")),
              "> printRegisterFile " + dir_.path("bad.csv") +
                  "\nmessage 512: Unable to parse file: " + escapeText(dir_.path("bad.csv")) +
                  " line:2: \\n\n");
    EXPECT_EQ(run("printRegisterFile " + dir_.path("none.csv")),
              "> printRegisterFile " + dir_.path("none.csv") +
                  "\nmessage 256: Unable to open OrvNebu register file: " +
                  escapeText(dir_.path("none.csv")) + "\n");
    EXPECT_EQ(console_->exitStatus(), 1);
    EXPECT_EQ(err_.str(), "");
}

TEST_F(PrintCommandsTest, ParameterFileIsPrintedAsItIsNow) {
    const std::string path = dir_.path("p.csv");
    dir_.write("p.csv", "h\nM,0,a,R=01\n");
    EXPECT_EQ(run("printParameterFile " + path), "> printParameterFile " + path + "\nh\nM,0,a,R=01\n");
    // Changed within the same run: the new text is printed, not a remembered one.
    dir_.write("p.csv", "H\nN,0,b,\nN,1,c,S=1\n");
    EXPECT_EQ(run("printParameterFile " + path),
              "> printParameterFile " + path + "\nH\nN,0,b\nN,1,c,S=1\n");
    EXPECT_EQ(console_->exitStatus(), 0);
}

}  // namespace
}  // namespace nebu
