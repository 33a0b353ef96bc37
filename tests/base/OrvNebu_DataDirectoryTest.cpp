// The definition-file reader as the file tools use it: what a data directory holds (rows, the
// classes they build, registers with their slices, choices with their settings), with lines and
// columns, and reading on after a line the plug-in refuses. What the plug-in makes of the files
// is tested through the exported functions; lint's report through the console.
#include <gtest/gtest.h>

#include <vector>

#include "base/OrvNebu_DataDirectory.h"
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
    const auto& mode = params->parameters()[0];
    EXPECT_EQ(mode.priority, 10002u);
    ASSERT_EQ(mode.choices.size(), 5u);
    EXPECT_EQ(mode.choices[2].name, "run");
    EXPECT_EQ(mode.choices[2].line, 4u);
    ASSERT_EQ(mode.choices[2].settings.size(), 3u);
    const auto& setting = mode.choices[2].settings[1];
    EXPECT_EQ(setting.registerName, "CTRL_MODE");
    EXPECT_EQ(setting.width, 3u);
    EXPECT_EQ(setting.value, "1");
    EXPECT_EQ(setting.column, 5u);

    const OrvNebu_RegisterFile* registers = data.registerFile(ctrl);
    ASSERT_NE(registers, nullptr);
    const OrvNebu_RegisterFile::Register* reg = registers->findRegister("CTRL_MODE");
    ASSERT_NE(reg, nullptr);
    ASSERT_EQ(reg->slices.size(), 1u);
    EXPECT_EQ(reg->slices[0]->line, 3u);
    EXPECT_EQ(reg->slices[0]->lowBit(), 1u);
    EXPECT_EQ(reg->totalWidth, 3u);
    EXPECT_EQ(data.filesRead(), 12u);
}

TEST(DataDirectory, ARowBuildsTheClassOfEachOfItsVersions) {
    using C = std::vector<Classes::SlaveClass>;
    const struct {
        int32_t type, min, max;
        C classes;
    } rows[] = {{0x44, 1, 3, C{Classes::VANDU_M3QRC, Classes::DEFAULT_SLAVE}},
                {0x44, 2, 9, C{Classes::DEFAULT_SLAVE}},
                {0x15, 0, 7, C{Classes::DEFAULT_SLAVE, Classes::VANDU_R3QRA}},
                {0x42, 1, 1, C{Classes::VANDU_R2QRA}},
                {0x99, 1, 1, C{Classes::DEFAULT_SLAVE}},
                {0x45, 5, 4, C{}}};
    for (const auto& r : rows) {
        OrvNebu_DataDirectory::Row row;
        row.slaveType = r.type;
        row.minDriverVersion = r.min;
        row.maxDriverVersion = r.max;
        EXPECT_EQ(OrvNebu_DataDirectory::classesOf(row), r.classes) << r.type << " " << r.min;
    }
}

TEST(RegisterFile, LinesKeepTheirNumbersExcludedOnesTooAndReadingGoesOn) {
    TempDataDir dir;
    dir.write("r.csv",
              "h\n"
              "OFF,5,0,0,3,,rw,,n\n"
              "W,10,1,0,7,,r,,y\n"
              "BAD,zz,0,0,3,,rw,,y\n"
              "W,11,0,15,8,,rw,,y\n");
    const OrvNebu_RegisterFile file(dir.path("r.csv"), OrvNebu_RegisterFile::EVERY_PROBLEM);
    ASSERT_EQ(file.lines().size(), 3u);
    EXPECT_FALSE(file.lines()[0].included);
    EXPECT_EQ(file.lines()[0].line, 2u);
    const OrvNebu_RegisterFile::Register* w = file.findRegister("W");
    ASSERT_NE(w, nullptr);
    ASSERT_EQ(w->slices.size(), 2u);
    EXPECT_EQ(w->slices[0]->line, 5u);  // order 0 first
    EXPECT_TRUE(w->slices[0]->bitReversed());
    EXPECT_EQ(w->totalWidth, 16u);
    EXPECT_EQ(file.findRegister("OFF"), nullptr);

    ASSERT_EQ(file.problems().size(), 1u);
    const OrvNebu_FileProblem& p = file.problems()[0];
    EXPECT_EQ(p.line, 4u);
    EXPECT_EQ(p.column, 2u);
    EXPECT_EQ(p.severity, OrvNebu_FileProblem::SEVERITY_ERROR);
    ASSERT_EQ(p.messages.size(), 2u);
    EXPECT_EQ(p.messages[1].severity, OrvNebu_FileProblem::SEVERITY_MALFORMED_LINE);

    // The plug-in's reading stops there.
    const OrvNebu_RegisterFile plugin(dir.path("r.csv"));
    EXPECT_EQ(plugin.lines().size(), 2u);
}

}  // namespace
