// The console's print commands on a file that changes while the console runs (the images and
// the readers' messages are in the cli_print transcript).
#include <gtest/gtest.h>

#include <memory>
#include <sstream>

#include "Console.h"
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

TEST_F(PrintCommandsTest, ParameterFileIsPrintedAsItIsNow) {
    const std::string path = dir_.path("p.csv");
    dir_.write("p.csv", "h\nM,0,a,R=01\n");
    EXPECT_EQ(run("printParameterFile " + path),
              "> printParameterFile " + path + "\nh\nM,0,a,R=01\n");
    // Changed within the same run: the new text is printed, not a remembered one.
    dir_.write("p.csv", "H\nN,0,b,\nN,1,c,S=1\n");
    EXPECT_EQ(run("printParameterFile " + path),
              "> printParameterFile " + path + "\nH\nN,0,b\nN,1,c,S=1\n");
    EXPECT_EQ(console_->exitStatus(), 0);
}

}  // namespace
}  // namespace nebu
