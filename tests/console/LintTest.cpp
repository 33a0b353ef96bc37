// `nebu lint` run as a user runs it: on the demo data, and on broken copies of it, one per
// kind of problem, checking the exact report lines and the exit status.
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <functional>
#include <string>
#include <vector>

#include "support/NebuRun.h"

namespace {

namespace fs = std::filesystem;

using nebutest::readFile;
using nebutest::Result;

class LintTest : public ::testing::Test {
protected:
    void SetUp() override {
        root_ = nebutest::makeTempDir("nebu_lint_test_");
        std::ofstream(root_ / "stdin.txt").close();
        data_ = root_ / "data";
    }
    void TearDown() override { fs::remove_all(root_); }

    // A fresh copy of the demo data directory.
    void copyDemoData() {
        fs::remove_all(data_);
        fs::copy(NEBU_TEST_DATA_DIR, data_, fs::copy_options::recursive);
    }
    // A file of the copy as lint names it: the directory as given, '/', the name.
    std::string file(const std::string& name) const { return data_.string() + "/" + name; }
    void append(const std::string& name, const std::string& text) {
        std::ofstream(data_ / name, std::ios::binary | std::ios::app) << text;
    }
    // Replaces the first occurrence of from in the file (which must hold it).
    void replace(const std::string& name, const std::string& from, const std::string& to) {
        std::string text = readFile(data_ / name);
        const size_t at = text.find(from);
        ASSERT_NE(at, std::string::npos) << name << " lacks " << from;
        text.replace(at, from.size(), to);
        std::ofstream(data_ / name, std::ios::binary | std::ios::trunc) << text;
    }

    void replaceAll(const std::string& name, const std::string& from, const std::string& to) {
        std::string text = readFile(data_ / name);
        for (size_t at = text.find(from); at != std::string::npos;
             at = text.find(from, at + to.size()))
            text.replace(at, from.size(), to);
        std::ofstream(data_ / name, std::ios::binary | std::ios::trunc) << text;
    }

    Result run(const std::vector<std::string>& args) {
        return nebutest::runNebu(args, root_ / "stdin.txt", root_ / "stderr.txt");
    }
    Result lint() { return run({"lint", data_.string()}); }

    // The summary line of a lint of the copy.
    std::string summary(size_t lines, size_t files, size_t problems) const {
        return "lint " + data_.string() + "/: " + std::to_string(lines) + " directory lines, " +
               std::to_string(files) + " definition files, " +
               (problems == 0
                    ? std::string("no problems")
                    : std::to_string(problems) + (problems == 1 ? " problem" : " problems")) +
               "\n";
    }

    fs::path root_;
    fs::path data_;
};

TEST_F(LintTest, UsageErrors) {
    copyDemoData();
    Result r = run({"lint", data_.string(), data_.string()});
    EXPECT_EQ(r.status, 2);
    EXPECT_EQ(r.out, "");
    EXPECT_EQ(r.err, "nebu: lint takes one data directory, not also '" + data_.string() + "'\n");

    r = run({"lint", "--strict", data_.string()});
    EXPECT_EQ(r.status, 2);
    EXPECT_EQ(r.err, "nebu: unknown lint option '--strict'\n");

    r = run({"lint", "--help"});
    EXPECT_EQ(r.status, 0);
    EXPECT_EQ(r.out.rfind("usage: nebu lint [DATA_DIR]\n", 0), 0u) << r.out;

    r = run({"lint", (root_ / "absent").string()});
    EXPECT_EQ(r.status, 2);
    EXPECT_EQ(r.err, "nebu: lint: no data directory '" + (root_ / "absent").string() + "'\n");
}

TEST_F(LintTest, DirectoryFileMissingOrWithoutUsableHeader) {
    fs::create_directories(data_);
    Result r = lint();
    const std::string dir = file("orvnebu_directory.csv");
    EXPECT_EQ(r.status, 1);
    EXPECT_EQ(r.out, dir + ": Unable to open " + dir + "\n" + summary(0, 0, 1));

    copyDemoData();
    replace("orvnebu_directory.csv", "orv_drv_ver_max,", "orv_drv_max,");
    r = lint();
    EXPECT_EQ(r.status, 1);
    EXPECT_EQ(r.out, dir + ":1: Unable to parse header of CSV file: " + dir +
                         ": it has no orv_drv_ver_max column\n" + summary(0, 0, 1));

    // Header names in any case and with blanks around them are read as the plug-in reads them.
    copyDemoData();
    replace("orvnebu_directory.csv", "slave_type,orv_drv_ver_min", " Slave_Type ,ORV_DRV_VER_MIN");
    r = lint();
    EXPECT_EQ(r.status, 0);
    EXPECT_EQ(r.out, summary(9, 12, 0));
    // Given with the platform's separator at its end ('\\' on Windows), it gets no second one.
    const std::string separated = (data_ / "").string();
    r = run({"lint", separated});
    EXPECT_EQ(r.out,
              "lint " + separated + ": 9 directory lines, 12 definition files, no problems\n");
}

TEST_F(LintTest, ProblemsOfSeveralFilesAreAllReportedInFileAndLineOrder) {
    copyDemoData();
    append("gpio_regs.csv", "A,0,0,0\nB,0,0,0\n");
    append("ctrl_regs.csv", "WIDE,9,0,0,16,x,rw,0,y\n");
    append("orvnebu_directory.csv", "0x13,0,1,gpio_regs.csv,,again\n");
    Result r = lint();
    EXPECT_EQ(r.status, 1);
    const std::string tail = ": a register line needs 9 columns (the plug-in refuses the file)\n";
    EXPECT_EQ(r.out, file("ctrl_regs.csv") +
                         ":19: register WIDE: bits 0 to 16 of word 0x9 lie beyond the 16-bit bus "
                         "word\n" +
                         file("gpio_regs.csv") + ":8: line of 4 columns" + tail +
                         file("gpio_regs.csv") + ":9: line of 4 columns" + tail +
                         file("orvnebu_directory.csv") +
                         ":11: slave type 0x13: driver versions 1 to 1 are already covered by "
                         "line 4, which wins\n" +
                         summary(10, 12, 4));
}

TEST_F(LintTest, DemoDataIsClean) {
    copyDemoData();
    Result r = lint();
    EXPECT_EQ(r.status, 0);
    EXPECT_EQ(r.out, summary(9, 12, 0));
    EXPECT_EQ(r.err, "");

    // Windows line ends are read as the plug-in reads them.
    for (const char* name : {"orvnebu_directory.csv", "ctrl_regs.csv", "ctrl_params.csv"}) {
        std::string text = readFile(data_ / name);
        std::string crlf;
        for (char c : text) crlf += c == '\n' ? std::string("\r\n") : std::string(1, c);
        std::ofstream(data_ / name, std::ios::binary | std::ios::trunc) << crlf;
    }
    r = lint();
    EXPECT_EQ(r.status, 0);
    EXPECT_EQ(r.out, summary(9, 12, 0));
}

TEST_F(LintTest, EachKindOfProblemIsReportedWithItsFileAndLine) {
    struct Case {
        const char* what;
        std::function<void()> breakIt;
        std::function<std::string()> expected;  // the problem lines
        size_t files;                           // definition files read
        size_t lines = 9;                       // directory lines used
    };
    const std::string dir = file("orvnebu_directory.csv");
    const std::vector<Case> cases = {
        {"register file missing",
         [&] { replace("orvnebu_directory.csv", "gpio_regs.csv", "gpio_registers.csv"); },
         [&] {
             return dir +
                    ":4: Unable to open OrvNebu register file: " + file("gpio_registers.csv") +
                    "\n";
         },
         11},
        {"register file name with a blank after it",
         [&] { replace("orvnebu_directory.csv", "gpio_regs.csv", "gpio_regs.csv "); },
         [&] {
             return dir + ":4: Unable to open OrvNebu register file: " + file("gpio_regs.csv ") +
                    " (blanks around the name are part of it)\n";
         },
         11},
        {"parameter file missing",
         [&] { replace("orvnebu_directory.csv", "ctrl_params.csv", "ctrl_param.csv"); },
         [&] {
             return dir + ":2: Unable to open OrvNebu parameter file: " + file("ctrl_param.csv") +
                    "\n";
         },
         11},
        {"register line too short", [&] { append("counter_regs.csv", "EXTRA,5,0,0,3\n"); },
         [&] {
             return file("counter_regs.csv") +
                    ":11: line of 5 columns: a register line needs 9 columns (the plug-in "
                    "refuses the file)\n";
         },
         12},
        {"parameter row that does not parse",
         [&] { replace("ctrl_params.csv", "mode,2,run", "mode,3,run"); },
         [&] {
             return file("ctrl_params.csv") +
                    ":4: choice_index out-of-order (the plug-in refuses the file)\n";
         },
         12},
        {"parameter row too short",
         [&] { replace("ctrl_params.csv", "mode,4,custom,", "mode,4,custom"); },
         [&] {
             return file("ctrl_params.csv") +
                    ":6: row of 3 fields: a row needs 4 (parameter, choice index, choice, "
                    "settings) (the plug-in refuses the file)\n";
         },
         12},
        {"register address that is not hexadecimal",
         [&] { append("counter_regs.csv", "BAD,1g,0,0,3,x,rw,0,y\n"); },
         [&] {
             return file("counter_regs.csv") +
                    ":11: Invalid hexadecimal number \"1g\". (the plug-in refuses the file)\n";
         },
         12},
        {"register line without a name", [&] { append("gpio_regs.csv", ",8,0,0,3,x,rw,0,y\n"); },
         [&] {
             return file("gpio_regs.csv") +
                    ":8: slice without a register name: no call can reach it\n";
         },
         12},
        {"setting with digits other than 0 and 1",
         [&] { replace("ctrl_params.csv", "CTRL_MODE=001", "CTRL_MODE=021"); },
         [&] {
             return file("ctrl_params.csv") +
                    ":4: Invalid binary number \"021\". (the plug-in refuses the file)\n";
         },
         12},
        {"overlapping version ranges",
         [&] { append("orvnebu_directory.csv", "0x12,3,4,gpio_regs.csv,,again\n"); },
         [&] {
             return dir +
                    ":11: slave type 0x12: driver versions 3 to 4 are already covered by "
                    "line 3, which wins\n";
         },
         12, 10},
        {"empty version range",
         [&] { append("orvnebu_directory.csv", "0x31,5,4,gpio_regs.csv,,reversed\n"); },
         [&] { return dir + ":11: slave type 0x31: driver versions 5 to 4 is an empty range\n"; },
         12, 10},
        {"directory line without a register file",
         [&] { append("orvnebu_directory.csv", "0x31,1,1,,,nothing\n"); },
         [&] {
             return dir +
                    ":11: slave type 0x31 has no register file: its slaves cannot be "
                    "created\n";
         },
         12, 10},
        {"directory line too short to be used",
         [&] { append("orvnebu_directory.csv", "0x31,1\n"); },
         [&] { return dir + ":11: line of 2 fields is never used: the key columns need 3\n"; }, 12},
        {"slices of two registers on the same bits",
         [&] { append("ctrl_regs.csv", "CTRL_EXTRA,0,0,3,5,x,rw,0,y\n"); },
         [&] {
             const std::string f = file("ctrl_regs.csv");
             return f +
                    ":19: register CTRL_EXTRA overlaps register CTRL_MODE (line 3) in bit 3 "
                    "of word 0x0\n" +
                    f +
                    ":19: register CTRL_EXTRA overlaps register CTRL_LOOPBACK (line 4) in "
                    "bit 4 of word 0x0\n";
         },
         12},
        {"slice beyond the bus word",
         [&] { append("gpio_regs.csv", "WIDE,1f,0,20,12,x,rw,0,y\n"); },
         [&] {
             return file("gpio_regs.csv") +
                    ":8: register WIDE: bits 12 to 20 of word 0x1f lie beyond the 16-bit bus "
                    "word\n";
         },
         12},
        {"slice beyond the 32-bit word and address beyond the bus",
         [&] { append("gpio_regs.csv", "HUGE,3,0,40,0,x,rw,0,y\nFAR,20000,0,0,3,x,rw,0,y\n"); },
         [&] {
             const std::string f = file("gpio_regs.csv");
             return f +
                    ":8: Register bit out of range 0 to 31: start bit 40, end bit 0 (the "
                    "plug-in refuses the file)\n" +
                    f +
                    ":9: Register address out of range 0 to 1ffff: 20000 (the plug-in "
                    "refuses the file)\n";
         },
         12},
        {"register file without its header line",
         [&] {
             replace("gpio_regs.csv",
                     "name,address,order,start_bit,end_bit,description,access,"
                     "reset,include\n",
                     "");
         },
         [&] {
             return file("gpio_regs.csv") +
                    ":1: the first line is a register line, but the first line of a register "
                    "file is its header: register GPIO_OUT is lost\n";
         },
         12},
        {"parameter file without its header line",
         [&] { replace("ctrl_params.csv", "parameter,choice_index,choice,settings\n", ""); },
         [&] {
             const std::string f = file("ctrl_params.csv");
             return f +
                    ":1: the first line is a parameter row, but the first line of a parameter "
                    "file is its header: choice off of parameter mode is lost\n" +
                    f + ":2: choice_index out-of-order (the plug-in refuses the file)\n";
         },
         12},
        {"line ends of carriage returns alone", [&] { replaceAll("counter_regs.csv", "\n", "\r"); },
         [&] {
             return file("counter_regs.csv") +
                    ":1: line ends are carriage returns alone: the plug-in reads the whole file "
                    "as one header line and finds no registers\n";
         },
         12},
        {"byte-order mark before the directory header",
         [&] { replace("orvnebu_directory.csv", "slave_type", "\xEF\xBB\xBFslave_type"); },
         [&] {
             return dir +
                    ":1: byte-order mark before the header: it is read as part of the first "
                    "column's name\n" +
                    dir + ":1: Unable to parse header of CSV file: " + dir +
                    ": it has no slave_type column\n";
         },
         0, 0},
        {"slices of one register on the same bits",
         [&] { append("ctrl_regs.csv", "CTRL_MODE,0,1,2,3,x,rw,0,y\n"); },
         [&] {
             return file("ctrl_regs.csv") +
                    ":19: register CTRL_MODE holds bits 2 to 3 of word 0x0 twice (also on line "
                    "3): a value written does not read back\n";
         },
         12},
        {"registers spanning more than one burst",
         [&] { append("gpio_regs.csv", "FAR,1ffff,0,0,3,x,rw,0,y\n"); },
         [&] {
             return file("gpio_regs.csv") +
                    ":8: registers span words 0x0 (line 2) to 0x1ffff (line 8): 131072 words, "
                    "more than one burst moves (131071), so a read of every register fails\n";
         },
         12},
        {"setting of a register the register file lacks",
         [&] { replace("ctrl_params.csv", "CTRL_LOOPBACK=1", "CTRL_LOOP=1"); },
         [&] {
             return file("ctrl_params.csv") +
                    ":5: parameter mode, choice self_test: register CTRL_LOOP is not in " +
                    file("ctrl_regs.csv") + "\n";
         },
         12},
        {"setting value wider than its register",
         [&] { replace("ctrl_params.csv", "CTRL_MODE=001", "CTRL_MODE=1001"); },
         [&] {
             return file("ctrl_params.csv") +
                    ":4: parameter mode, choice run: value 0x9 of register CTRL_MODE needs 4 "
                    "bits, the register has 3\n";
         },
         12},
        {"transceiver register missing",
         [&] {
             replace("vandu_r3qrb_regs.csv", "RXUSERCLKOUT_FREQ_CNT2,", "RXUSERCLKOUT_FREQ_CNT_2,");
         },
         [&] {
             return dir +
                    ":10: slave type 0x45 (R3Qrb transceiver) needs register "
                    "RXUSERCLKOUT_FREQ_CNT2, which " +
                    file("vandu_r3qrb_regs.csv") + " lacks\n";
         },
         12},
        {"transceiver parameter missing",
         [&] { replaceAll("vandu_r2qra_params.csv", "pll_divsel_ref,", "pll_divsel_rf,"); },
         [&] {
             return dir +
                    ":7: slave type 0x42 (R2Qra transceiver) needs parameter "
                    "pll_divsel_ref, which " +
                    file("vandu_r2qra_params.csv") + " lacks\n";
         },
         12},
        {"transceiver without a parameter file",
         [&] {
             replace("orvnebu_directory.csv", "vandu_r3qrb_regs.csv,vandu_r3qrb_params.csv",
                     "vandu_r3qrb_regs.csv,");
         },
         [&] {
             return dir +
                    ":10: slave type 0x45 (R3Qrb transceiver) has no parameter file, so "
                    "none of its computed parameters\n";
         },
         11},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.what);
        copyDemoData();
        c.breakIt();
        const std::string expected = c.expected();
        const size_t problems =
            static_cast<size_t>(std::count(expected.begin(), expected.end(), '\n'));
        Result r = lint();
        EXPECT_EQ(r.status, 1);
        EXPECT_EQ(r.out, expected + summary(c.lines, c.files, problems));
        EXPECT_EQ(r.err, "");
    }
}

// The worked example of the reference page, run as the page shows it: its output must stand
// in the page word for word.
TEST_F(LintTest, WorkedExampleOfTheReferencePageIsRealOutput) {
    const fs::path source = fs::path(NEBU_TEST_DATA_DIR).parent_path();
    const fs::path example = source / "doc" / "example";
    std::string page = readFile(source / "doc" / "REFERENCE.md");
    ASSERT_FALSE(page.empty());
    auto indented = [](const std::string& text) {
        std::string block;
        size_t start = 0;
        while (start < text.size()) {
            size_t end = text.find('\n', start);
            if (end == std::string::npos) end = text.size();
            block += "    " + text.substr(start, end - start) + "\n";
            start = end + 1;
        }
        return block;
    };
    // In the page's own relative names: the data directory is "mydata".
    auto inRoot = [&](const std::vector<std::string>& args) {
        return nebutest::runNebu(args, root_ / "stdin.txt", root_ / "out.txt", root_, true);
    };

    fs::copy(NEBU_TEST_DATA_DIR, root_ / "mydata", fs::copy_options::recursive);
    data_ = root_ / "mydata";
    fs::copy(example / "fan_regs.csv", data_);
    fs::copy(example / "fan_params.csv", data_);
    append("orvnebu_directory.csv", "0x21,1,0xFFFF,fan_regs.csv,fan_params.csv,fan controller\n");

    Result r = inRoot({"--board", (example / "fan_board.json").string(), "--data-dir", "mydata",
                       "-e", "initialize 0 1 0", "-e", "getRegisters 0 1 0", "-e",
                       "getParameterChoices 0 1 0 fan_mode", "-e",
                       "setParameters 0 1 0 fan_mode=quiet", "-e", "getParameters 0 1 0", "-e",
                       "peek 0 1 0 0x0000 4", "-e", "getRegisters 0 1 0 FAN_TEMP"});
    EXPECT_EQ(r.status, 1);
    EXPECT_NE(page.find(indented(r.out + "exit status 1")), std::string::npos) << r.out;

    r = inRoot({"lint", "mydata"});
    EXPECT_EQ(r.status, 0);
    EXPECT_NE(page.find(indented(r.out + "exit status 0")), std::string::npos) << r.out;

    replace("fan_params.csv", "fan_mode,2,full,FAN_ENABLE=1,FAN_SPEED=1111",
            "fan_mode,2,full,FAN_ENABEL=1,FAN_SPEED=10000");
    append("fan_regs.csv", "FAN_BOOST,0,0,7,8,boost,rw,0,y\n");
    append("orvnebu_directory.csv", "0x21,2,3,fan_regs.csv,,fan controller again\n");
    r = inRoot({"lint", "mydata"});
    EXPECT_EQ(r.status, 1);
    EXPECT_NE(page.find(indented(r.out + "exit status 1")), std::string::npos) << r.out;
}

}  // namespace
