// The definition-file reader as the file tools use it: what a data directory holds (rows, the
// classes they build, registers with their slices, choices with their settings), with lines and
// columns, and reading on after a line the plug-in refuses. What the plug-in makes of the files
// is tested through the exported functions; lint's report through the console.
#include <gtest/gtest.h>

#include <map>
#include <sstream>
#include <vector>

#include "base/OrvNebu_CsvText.h"
#include "base/OrvNebu_DataDirectory.h"
#include "base/OrvNebu_DirectoryFile.h"
#include "base/OrvNebu_ParamFile.h"
#include "support/TempDataDir.h"

namespace {

using OrvRT::OrvNebu_DataDirectory;
using OrvRT::OrvNebu_FileProblem;
using OrvRT::OrvNebu_RegisterFile;
using Classes = OrvRT::OrvNebu_SlaveClassTable;

TEST(DataDirectory, DemoRowsTheirClassesAndTheirFiles) {
    const OrvNebu_DataDirectory data(NEBU_TEST_DATA_DIR "/");
    EXPECT_TRUE(data.problems().empty());
    ASSERT_EQ(data.directory().rows().size(), 9u);
    const OrvNebu_DataDirectory::Row& ctrl = data.directory().rows()[0];
    EXPECT_EQ(ctrl.line, 2u);
    EXPECT_EQ(OrvNebu_DataDirectory::classesOf(ctrl),
              std::vector<Classes::SlaveClass>{Classes::DEFAULT_SLAVE});
    EXPECT_EQ(OrvNebu_DataDirectory::classesOf(data.directory().rows()[7]),
              std::vector<Classes::SlaveClass>{Classes::VANDU_M3QRC});

    const OrvRT::OrvNebu_ParamFile* params = data.paramFile(ctrl);
    ASSERT_NE(params, nullptr);
    ASSERT_EQ(params->parameters().size(), 3u);
    EXPECT_EQ(params->parameters()[0].choices[2].name, "run");
    const OrvNebu_RegisterFile* registers = data.registerFile(ctrl);
    ASSERT_NE(registers, nullptr);
    EXPECT_NE(registers->findRegister("CTRL_MODE"), nullptr);
    EXPECT_EQ(data.filesRead(), 12u);
    OrvNebu_DataDirectory::Row foreign;  // a row of some other directory: none of its files
    foreign.registers = foreign.parameters = "other.csv";
    EXPECT_EQ(data.registerFile(foreign), nullptr);
    EXPECT_EQ(data.paramFile(foreign), nullptr);
}

TEST(DataDirectory, ARowBuildsTheClassOfEachOfItsVersions) {
    using C = std::vector<Classes::SlaveClass>;
    const struct {
        int32_t type, min, max;
        C classes;
    } rows[] = {{0x44, 1, 2, C{Classes::VANDU_M3QRC, Classes::DEFAULT_SLAVE}},
                {0x44, 2, 9, C{Classes::DEFAULT_SLAVE}},
                {0x15, 0, 7, C{Classes::DEFAULT_SLAVE, Classes::VANDU_R3QRA}},
                {0x42, 1, 1, C{Classes::VANDU_R2QRA}},
                {0x99, 1, 1, C{Classes::DEFAULT_SLAVE}},
                {0x41, 0, 2, C{Classes::DEFAULT_SLAVE}},
                {0x45, 5, 4, C{}}};
    for (const auto& r : rows) {
        OrvNebu_DataDirectory::Row row;
        row.slaveType = r.type;
        row.minDriverVersion = r.min;
        row.maxDriverVersion = r.max;
        EXPECT_EQ(OrvNebu_DataDirectory::classesOf(row), r.classes) << r.type << " " << r.min;
        // The row's first and last version build what the factory finds for them.
        if (r.classes.empty()) continue;
        EXPECT_EQ(Classes::find(r.type, r.min), r.classes.front()) << r.type << " " << r.min;
        EXPECT_EQ(Classes::find(r.type, r.max), r.classes.back()) << r.type << " " << r.max;
    }
    EXPECT_EQ(Classes::info(Classes::SLAVE_CLASS_COUNT).slaveClass, Classes::DEFAULT_SLAVE);
    // A line rate writes its own registers and the window registers of its channel's clocks.
    auto registersOf = [](Classes::SlaveClass c) {
        std::string all;
        for (const std::string& r : Classes::info(c).actions.at(1).registers) all += r + ' ';
        return all;
    };
    EXPECT_EQ(registersOf(Classes::VANDU_M3QRC),
              "MAX_LINERATE TXOUTCLK_FREQ_TUNE0 RXRECCLK_FREQ_TUNE0 TXUSRCLK_FREQ_TUNE0 "
              "TXUSRCLK2_FREQ_TUNE0 RXUSRCLK_FREQ_TUNE0 RXUSRCLK2_FREQ_TUNE0 ");
    EXPECT_EQ(registersOf(Classes::VANDU_R3QRA),
              "MAX_LINERATE TX_OVERSAMPLE_MODE TXUSRCLK_FREQ_TUNE TXUSRCLK2_FREQ_TUNE "
              "RXUSRCLK_FREQ_TUNE RXUSRCLK2_FREQ_TUNE TXOUTCLK_FREQ_TUNE RXRECCLK_FREQ_TUNE ");
}

// Number fields as the readers take them: C-style prefixes, saturation, no overflow.
TEST(CsvText, NumberReadings) {
    const struct {
        const char* text;
        int32_t decimal, autoBase;
    } rows[] = {{"0x1", 0, 1},
                {"0xa", 0, 10},
                {"0XA", 0, 10},
                {"0xf", 0, 15},
                {"0x", 0, 0},
                {"0xg", 0, 0},
                {"017", 17, 15},
                {"019", 19, 1},
                {" \t-12z", -12, -12},
                {"+9", 9, 9},
                {"12.5", 12, 12},
                {"7a", 7, 7},
                {"08", 8, 0},
                {"-0x10", 0, -16},
                {"2147483647", INT32_MAX, INT32_MAX},
                {"2147483648", INT32_MAX, INT32_MAX},
                {"-2147483648", INT32_MIN, INT32_MIN},
                {"-99999999999", INT32_MIN, INT32_MIN},
                {"", 0, 0}};
    for (const auto& r : rows) {
        EXPECT_EQ(r.decimal, OrvRT::OrvNebu_CsvText::decimalToInt32(r.text)) << r.text;
        EXPECT_EQ(r.autoBase, OrvRT::OrvNebu_CsvText::autoBaseToInt32(r.text)) << r.text;
    }
}

// What the readers make of a file, both ways: each problem as line:column:severity text, then
// what was kept (register lines; parameters with their priority, choices and settings; rows).
std::string readAs(char kind, const std::string& path, bool every) {
    std::ostringstream out;
    auto problems = [&out](const OrvRT::OrvNebu_FileProblems& all) {
        for (const OrvNebu_FileProblem& p : all) {
            out << p.line << ':' << p.column << ':' << p.severity << ' ' << p.text;
            for (const auto& m : p.messages) out << " +" << m.severity;
            out << '\n';
        }
    };
    if (kind == 'r') {
        const OrvNebu_RegisterFile f(path, every ? OrvNebu_RegisterFile::EVERY_PROBLEM
                                                 : OrvNebu_RegisterFile::FIRST_REFUSAL);
        problems(f.problems());
        out << "lines";
        for (const auto& s : f.lines())
            out << ' ' << s.line << (s.included ? "" : "x") << (s.bitReversed() ? "r" : "");
        const std::map<std::string, OrvNebu_RegisterFile::Register> sorted(f.registers().begin(),
                                                                           f.registers().end());
        for (const auto& r : sorted) out << ' ' << r.second.name << '/' << r.second.totalWidth;
    } else if (kind == 'p') {
        const OrvRT::OrvNebu_ParamFile f(path, every ? OrvRT::OrvNebu_ParamFile::EVERY_PROBLEM
                                                     : OrvRT::OrvNebu_ParamFile::FIRST_REFUSAL);
        problems(f.problems());
        out << "params";
        for (const auto& p : f.parameters()) {
            out << ' ' << p.name << '@' << p.line << '#' << p.priority;
            for (const auto& c : p.choices) {
                out << " [" << c.name << '@' << c.line;
                for (const auto& s : c.settings)
                    out << ' ' << s.registerName << ':' << s.width << ':' << s.value << '@'
                        << s.column;
                out << ']';
            }
        }
    } else {
        const OrvRT::OrvNebu_DirectoryFile f(path,
                                             every ? OrvRT::OrvNebu_DirectoryFile::EVERY_PROBLEM
                                                   : OrvRT::OrvNebu_DirectoryFile::FIRST_REFUSAL);
        problems(f.problems());
        out << "rows";
        for (const auto& r : f.rows())
            out << ' ' << r.line << ':' << r.slaveType << ':' << r.minDriverVersion << '-'
                << r.maxDriverVersion << ':' << r.registers << ':' << r.parameters;
    }
    return out.str();
}

TEST(DefinitionFiles, ProblemsWherePlacedAndWhatIsKept) {
    const char* const SAME = "(as every problem)";
    const struct {
        char kind;  // r(egisters), p(arameters), d(irectory)
        const char* text;
        const char* every;  // every problem (the file tools)
        const char* first;  // up to the first refusal (the plug-in)
    } rows[] = {
        {'r', nullptr,
         "0:0:256 Unable to open OrvNebu register file: F +256\n"
         "lines",
         SAME},
        {'p', nullptr,
         "0:0:256 Unable to open OrvNebu parameter file: F +256\n"
         "params",
         SAME},
        {'d', nullptr,
         "0:0:256 Unable to open F +256\n"
         "rows",
         SAME},
        {'r', "h\nOFF,5,0,0,3,,rw,,n\nW,10,1,0,7,,r,,y\nBAD,zz,0,0,3,,rw,,y\nW,11,0,15,8,,rw,,y\n",
         "4:2:256 Invalid hexadecimal number \"zz\". +256 +512\n"
         "lines 2x 3 5r W/16",
         "4:2:256 Invalid hexadecimal number \"zz\". +256 +512\n"
         "lines 2x 3 W/8"},
        {'r', "A,1,0,0,3,,rw,,y\nB,2,0,0,3,,rw,,y\n",
         "1:0:0 the first line is a register line, but the first line of a register file is its "
         "header: register A is lost\n"
         "lines 2 B/4",
         "lines 2 B/4"},
        // First lines that are not register lines, and one that is.
        {'r', "A,zz,0,0,3,,rw,,y\nB,2,0,0,3,,rw,,y\n", "lines 2 B/4", SAME},
        {'r', "A,1,x,0,3,,rw,,y\nB,2,0,0,3,,rw,,y\n", "lines 2 B/4", SAME},
        {'r', "A, ,0,0,3,,rw,,y\nB,2,0,0,3,,rw,,y\n", "lines 2 B/4", SAME},
        {'r', "A,1,0,x,3,,rw,,y\nB,2,0,0,3,,rw,,y\n", "lines 2 B/4", SAME},
        {'r', "A,1,.,0,3,,rw,,y\nB,2,0,0,3,,rw,,y\n", "lines 2 B/4", SAME},
        {'r', "A,1,0,3,x,,rw,,y\nB,2,0,0,3,,rw,,y\n", "lines 2 B/4", SAME},
        {'r', "A,1,9,9,9,,rw,,y\nB,2,0,0,3,,rw,,y\n",
         "1:0:0 the first line is a register line, but the first line of a register file is its "
         "header: register A is lost\nlines 2 B/4",
         "lines 2 B/4"},
        {'r', "A,1,+5,0,3,,rw,,y\nB,2,0,0,3,,rw,,y\n",
         "1:0:0 the first line is a register line, but the first line of a register file is its "
         "header: register A is lost\n"
         "lines 2 B/4",
         "lines 2 B/4"},
        {'r', "h\rx\nA,1,0,0,3,,rw,,y\n",
         "1:0:0 line ends are carriage returns alone: the plug-in reads the whole file as one "
         "header line and finds no registers\n"
         "lines 2 A/4",
         "lines 2 A/4"},
        {'r',
         "h\nA,1,0,32,3,,rw,,y\nB,1,0,31,33,,rw,,y\nC,20000,0,0,3,,rw,,y\nD,1ffff,0,0,0,,rw,,y\n",
         "2:4:256 Register bit out of range 0 to 31: start bit 32, end bit 3 +256 +512\n"
         "3:5:256 Register bit out of range 0 to 31: start bit 31, end bit 33 +256 +512\n"
         "4:2:256 Register address out of range 0 to 1ffff: 20000 +256 +512\n"
         "lines 5 D/1",
         "2:4:256 Register bit out of range 0 to 31: start bit 32, end bit 3 +256 +512\n"
         "lines"},
        {'r', "h\nC,20000,0,0,3,,rw,,y\nD,1,0,0,0,,rw,,y\n",
         "2:2:256 Register address out of range 0 to 1ffff: 20000 +256 +512\nlines 3 D/1",
         "2:2:256 Register address out of range 0 to 1ffff: 20000 +256 +512\nlines"},
        {'r', "h\nA,1,0\n\nB,2,0,0,0,,rw,,y\n",
         "2:0:512 line of 3 columns: a register line needs 9 columns +512\n"
         "3:0:512 empty line: a register line needs 9 columns +512\n"
         "lines 4 B/1",
         "2:0:512 line of 3 columns: a register line needs 9 columns +512\n"
         "lines"},
        {'r',
         "h\n,1,0,0,0,,rw,,y\nA,1,0,20,17,,rw,,y\nA,2,0,0,3,,rw,,y\nA,2,1,3,3,,rw,,y\n"
         "B,2,0,0,1,,rw,,y\nC,3,0,0,31,,r,,y\nD,3,0,31,0,,r,,y\nE,3,0,4,4,,w,,y\n"
         "F,4,0,0,30,,rw,,y\nG,4,0,31,31,,rw,,y\nJ,1ffff,0,0,0,,r,,y\nI,1fffe,0,0,0,,r,,y\n"
         "H,0,0,0,0,,r,,y\n",
         "2:1:0 slice without a register name: no call can reach it\n"
         "3:4:0 register A: bits 17 to 20 of word 0x1 lie beyond the 16-bit bus word\n"
         "5:4:0 register A holds bit 3 of word 0x2 twice (also on line 4): a value written does "
         "not read back\n"
         "6:4:0 register B overlaps register A (line 4) in bits 0 to 1 of word 0x2\n"
         "7:4:0 register C: bits 0 to 31 of word 0x3 lie beyond the 16-bit bus word\n"
         "8:4:0 register D: bits 0 to 31 of word 0x3 lie beyond the 16-bit bus word\n"
         "9:4:0 register E overlaps register C (line 7) in bit 4 of word 0x3\n"
         "9:4:0 register E overlaps register D (line 8) in bit 4 of word 0x3\n"
         "10:4:0 register F: bits 0 to 30 of word 0x4 lie beyond the 16-bit bus word\n"
         "11:4:0 register G: bit 31 of word 0x4 lie beyond the 16-bit bus word\n"
         "14:2:0 registers span words 0x0 (line 14) to 0x1ffff (line 12): 131072 words, more than "
         "one burst moves (131071), so a read of every register fails\n"
         "lines 2 3r 4 5 6 7 8r 9 10 11 12 13 14 A/9 B/2 C/32 D/32 E/1 F/31 G/1 H/1 I/1 J/1",
         "lines 2 3r 4 5 6 7 8r 9 10 11 12 13 14 A/9 B/2 C/32 D/32 E/1 F/31 G/1 H/1 I/1 J/1"},
        {'p', "MODE,0,Off,EN=0\nMODE,1,On,EN=1\n",
         "1:0:0 the first line is a parameter row, but the first line of a parameter file is its "
         "header: choice Off of parameter MODE is lost\n"
         "2:2:256 choice_index out-of-order +256 +512\n"
         "params",
         "2:2:256 choice_index out-of-order +256 +512\n"
         "params"},
        {'p', "A,,b,R=1\n", "params", SAME},
        {'p', "A,0,b\n", "params", SAME},
        {'p', "A,0,b,R=21\n", "params", SAME},
        {'p', "A,0,b,=1\n", "params", SAME},
        {'p', "A,0,b,R=1\r\n",
         "1:0:0 the first line is a parameter row, but the first line of a parameter file is its "
         "header: choice b of parameter A is lost\n"
         "params",
         "params"},
        {'p', "\"A\",\"0\",b,R=1\n",
         "1:0:0 the first line is a parameter row, but the first line of a parameter file is its "
         "header: choice b of parameter A is lost\n"
         "params",
         "params"},
        {'p', "h\rx\nA,0,b,R=1\n",
         "1:0:0 line ends are carriage returns alone: the plug-in reads the whole file as one "
         "header line and finds no parameters\n"
         "params A@2#10002 [b@2 R:1:1@4]",
         "params A@2#10002 [b@2 R:1:1@4]"},
        {'p', "h\n,0,Off,EN=0\nB,0,b,\n",
         "2:1:512 row without a parameter name +512\n"
         "params B@3#10003 [b@3]",
         "2:1:512 row without a parameter name +512\n"
         "params"},
        {'p', "h\n\"\",0,Off,EN=0\n",
         "2:1:512 row without a parameter name +512\n"
         "params",
         SAME},
        {'p', "h\nB,0,\"On,Fast\",EN=1\nC,0,c,E=\nD,99999999999999999999999,d,\n",
         "2:4:512 setting Fast\" is not of the form REGISTER=bits +512\n"
         "3:4:512 setting E= is not of the form REGISTER=bits +512\n"
         "4:2:256 choice_index out-of-order +256 +512\n"
         "params",
         "2:4:512 setting Fast\" is not of the form REGISTER=bits +512\n"
         "params"},
        {'p', "h\nR,-4294967296,x,\nS,0,s,\nS,-1,t,\n",
         "2:2:256 choice_index out-of-order +256 +512\n"
         "4:2:256 choice_index out-of-order +256 +512\n"
         "params S@3#10003 [s@3]",
         "2:2:256 choice_index out-of-order +256 +512\n"
         "params"},
        {'p',
         "h\nMODE,0,Off,EN=0\nMODE,1,On,EN=1,,SEL=01\n\"LEVEL\",0,Low,LVL=0000\nX,0\nY\n"
         "LEVEL,0,dup,\nM,1,a,\nM,2,b,\nZ,0,z,,EN=\r\nM,0,y,\nN,0,n,E=2\nN,1,m,\nK,0,k,E1\n"
         "Q,0,a,\nQ, +1,b,\nQ,11,c,\n",
         "5:0:512 row of 2 fields: a row needs 4 (parameter, choice index, choice, settings) +512\n"
         "6:0:512 row of 1 field: a row needs 4 (parameter, choice index, choice, settings) +512\n"
         "7:2:256 choice_index out-of-order +256 +512\n"
         "8:2:256 choice_index out-of-order +256 +512\n"
         "12:4:256 Invalid binary number \"2\". +256 +512\n"
         "14:4:512 setting E1 is not of the form REGISTER=bits +512\n"
         "17:2:256 choice_index out-of-order +256 +512\n"
         "params MODE@2#10002 [Off@2 EN:1:0@4] [On@3 EN:1:1@4 SEL:2:1@6] LEVEL@4#10004 [Low@4 "
         "LVL:4:0@4] Z@10#10010 [z@10 EN:0:0@5] M@11#10011 [y@11] Q@15#10015 [a@15] [b@16]",
         "5:0:512 row of 2 fields: a row needs 4 (parameter, choice index, choice, settings) +512\n"
         "params MODE@2#10002 [Off@2 EN:1:0@4] [On@3 EN:1:1@4 SEL:2:1@6] LEVEL@4#10004 [Low@4 "
         "LVL:4:0@4]"},
        {'d',
         "\xEF\xBB\xBFslave_type,orv_drv_ver_min,orv_drv_ver_max,registers,parameters\n1,1,1,r,\n",
         "1:1:0 byte-order mark before the header: it is read as part of the first column's name\n"
         "1:0:256 Unable to parse header of CSV file: F: it has no slave_type column +256\n"
         "rows",
         "1:0:256 Unable to parse header of CSV file: F: it has no slave_type column +256\n"
         "rows"},
        {'d', "slave_type,orv_drv_ver_min,orv_drv_ver_max,registers,parameters\rx\n",
         "1:0:0 line ends are carriage returns alone: the whole file is read as one header line\n"
         "rows",
         "rows"},
        {'d', "slave_type,orv_drv_ver_min,orv_drv_ver_max,a,b\n1,1,1,x,y\n",
         "1:0:0 the header has no registers column: no slave can be created\n"
         "rows 2:1:1-1::",
         "rows 2:1:1-1::"},
        {'d', "slave_type,orv_drv_ver_min,a,b,c\n",
         "1:0:256 Unable to parse header of CSV file: F: it has no orv_drv_ver_max column +256\n"
         "rows",
         SAME},
        {'d', "a\n",
         "1:0:256 Unable to parse header of CSV file: F: it has 1 column, at least 5 are needed "
         "+256\n"
         "rows",
         SAME},
        {'d', "a,b\n",
         "1:0:256 Unable to parse header of CSV file: F: it has 2 columns, at least 5 are needed "
         "+256\n"
         "rows",
         SAME},
        {'d', "registers,slave_type,orv_drv_ver_min,orv_drv_ver_max,p\nr,1,1,1,\n,2,1,1,\n",
         "3:1:0 slave type 0x2 has no register file: its slaves cannot be created\n"
         "rows 2:1:1-1:r: 3:2:1-1::",
         "rows 2:1:1-1:r: 3:2:1-1::"},
        {'d',
         "slave_type,orv_drv_ver_min,orv_drv_ver_max,registers,parameters\n3,1,1,,\n1,1,3,r,p\n"
         "1,2,5,s,\n1,5,4,t,\n1,2\n \n0x10,1,0xFFFF,u\n",
         "6:0:0 line of 2 fields is never used: the key columns need 3\n"
         "2:4:0 slave type 0x3 has no register file: its slaves cannot be created\n"
         "4:2:0 slave type 0x1: driver versions 2 to 3 are already covered by line 3, which wins\n"
         "5:2:0 slave type 0x1: driver versions 5 to 4 is an empty range\n"
         "rows 2:3:1-1:: 3:1:1-3:r:p 4:1:2-5:s: 5:1:5-4:t: 8:16:1-65535:u:",
         "rows 2:3:1-1:: 3:1:1-3:r:p 4:1:2-5:s: 5:1:5-4:t: 8:16:1-65535:u:"},
    };
    TempDataDir dir;
    for (const auto& r : rows) {
        SCOPED_TRACE(r.text != nullptr ? r.text : "(no file)");
        if (r.text != nullptr) dir.write("f.csv", r.text);
        const std::string path = dir.path(r.text != nullptr ? "f.csv" : "missing.csv");
        std::string every = readAs(r.kind, path, true), first = readAs(r.kind, path, false);
        for (std::string* s : {&every, &first}) {
            for (size_t at; (at = s->find(path)) != std::string::npos;)
                s->replace(at, path.size(), "F");
        }
        EXPECT_EQ(r.every, every);
        EXPECT_EQ(r.first == SAME ? r.every : r.first, first);
    }
    // A parameter far down the file still comes after those above it.
    dir.write("f.csv", "h" + std::string(9999, '\n') + "B,0,b,\n");
    const OrvRT::OrvNebu_ParamFile far(dir.path("f.csv"), OrvRT::OrvNebu_ParamFile::EVERY_PROBLEM);
    EXPECT_EQ(far.parameters().at(0).priority, 20000u);
}

}  // namespace
