// The directory file: header rules, number bases of the key columns, first match wins, and
// each failure with its messages as OrvNebu_initialize reports them.
#include <memory>
#include <typeinfo>

#include "slave/OrvNebu_DefaultSlave.h"
#include "slave/OrvNebu_DirectoryReader.h"
#include "slave/OrvNebu_SlaveFactory.h"
#include "support/RegsFixture.h"
#include "transceiver/OrvNebu_TransceiverClasses.h"
#include "transceiver/OrvNebu_VanduM3Qrc.h"
#include "transceiver/OrvNebu_VanduR2Qra.h"
#include "transceiver/OrvNebu_VanduR3Qra.h"
#include "transceiver/OrvNebu_VanduR3Qrb.h"

using OrvRT::Orv_HashMapCStr;
using OrvRT::OrvNebu_DirectoryReader;
using OrvRT::OrvNebu_SlaveFactory;

namespace {

class DirectoryReaderTest : public RegsFixture {
protected:
    // Looks up type and version in a directory file with this text.
    bool lookup(const std::string& text, int32_t type, int32_t version, Orv_HashMapCStr& entry) {
        data_.write("dir.csv", text);
        return OrvNebu_DirectoryReader::getEntry(HANDLE, data_.path("dir.csv"), type, version,
                                                 entry);
    }
    std::string registersFor(const std::string& text, int32_t type, int32_t version) {
        Orv_HashMapCStr entry;
        if (!lookup(text, type, version, entry)) return "<none>";
        return entry["registers"];
    }

    static constexpr const char* DIR = "orvnebu_directory.csv";
};

TEST_F(DirectoryReaderTest, HeaderKeyColumnsAndLines) {
    Orv_HashMapCStr entry;
    ASSERT_TRUE(
        lookup(" Slave_Type ,ORV_DRV_VER_MIN,orv_drv_ver_max,Registers,parameters\n"
               "0x11,1,2,R.csv,P.csv\n",
               0x11, 1, entry));
    EXPECT_EQ(entry, (Orv_HashMapCStr{{"slave_type", "0x11"},
                                      {"orv_drv_ver_min", "1"},
                                      {"orv_drv_ver_max", "2"},
                                      {"registers", "R.csv"},
                                      {"parameters", "P.csv"}}));
    const std::string h = "slave_type,orv_drv_ver_min,orv_drv_ver_max,registers,parameters\n";
    const struct {
        std::string text;
        int32_t type, version;
        const char* registers;
    } rows[] = {
        // Key columns anywhere; values taken as they stand; the leftmost of a twice column.
        {"registers,x,orv_drv_ver_max,orv_drv_ver_min,slave_type\n R.csv ,,9,1,17\n", 17, 5,
         " R.csv "},
        {"registers,slave_type,orv_drv_ver_min,orv_drv_ver_max,registers\nl.csv,1,1,1,r.csv\n", 1,
         1, "l.csv"},
        // Hexadecimal keys; the version range is inclusive at both ends.
        {h + "0x15,1,0xFFFF,hex.csv,\n", 21, 7, "hex.csv"},
        {h + "1,2,4,r.csv,\n", 1, 2, "r.csv"},
        {h + "1,2,4,r.csv,\n", 1, 4, "r.csv"},
        {h + "1,2,4,r.csv,\n", 1, 1, "<none>"},
        {h + "1,2,4,r.csv,\n", 1, 5, "<none>"},
        // First match wins, lines too short for the keys are skipped, extra fields ignored.
        {"a,b,slave_type,orv_drv_ver_min,orv_drv_ver_max,registers\n"
         "x,y,1,1\nx,y,1,1,1,first.csv,extra\nx,y,1,1,1,second.csv\n",
         1, 1, "first.csv"},
        {"slave_type,orv_drv_ver_min,orv_drv_ver_max,parameters,registers\r\n1,1,1,,r.csv\r\n", 1,
         1, "r.csv"},
        // Ctrl-Z, the end of a text file to old Windows programs, is a character like any other.
        {h + "2,1,1,\x1a.csv,\n1,1,1,after.csv,\n", 1, 1, "after.csv"},
    };
    for (const auto& row : rows) {
        EXPECT_EQ(registersFor(row.text, row.type, row.version), row.registers) << row.text;
    }
    // A line shorter than the header delivers what it has.
    entry.clear();
    ASSERT_TRUE(lookup(h + "1,1,1\n", 1, 1, entry));
    EXPECT_EQ(entry.size(), 3u);
    EXPECT_NO_MESSAGES();
}

TEST_F(DirectoryReaderTest, FailuresOfInitialize) {
    const std::string h = "slave_type,orv_drv_ver_min,orv_drv_ver_max,registers,parameters\n",
                      header = "256 Unable to parse header of CSV file: " + data_.path(DIR),
                      open = "256 Unable to open OrvNebu register file: " + data_.dir();
    const std::pair<std::string, std::vector<std::string>> rows[] = {
        {"slave_type,orv_drv_ver_min,orv_drv_ver_max,registers\n0x11,1,1,regs.csv\n", {header}},
        {"slave_type,orv_drv_ver_min,registers,parameters,other\n0x11,1,regs.csv,,\n", {header}},
        {"", {header}},
        {h + "0x11,2,3,regs.csv,\n0x11,1,1,,\n",
         {"256 No OrvNebu register file specified for OrvNebu slave type: 17, orv driver version: "
          "1"}},
        // The register file name keeps its blanks; Windows would open regs.csv for the last
        // two names: the plug-in does not, there either.
        {h + "0x11,1,1, regs.csv,\n", {open + " regs.csv"}},
        {h + "0x11,1,1,regs.csv  ,\n", {open + "regs.csv  "}},
        {h + "0x11,1,1,regs.csv.,\n", {open + "regs.csv."}},
    };
    for (const auto& row : rows) {
        data_.write(DIR, row.first);
        clearMessages();
        EXPECT_EQ(initialize(0), ORVNEBU_FAILED) << row.first;
        std::vector<std::string> got, want = row.second;
        if (want.size() == 1 && want[0] != rows[3].second[0])
            want.push_back("32768 Orv abort command");
        for (const auto& m : messages()) got.push_back(std::to_string(m.severity) + " " + m.text);
        EXPECT_EQ(got, want);
    }
    setDataDir(data_.path("nowhere"));
    EXPECT_EQ(initialize(0), ORVNEBU_FAILED);
    EXPECT_MESSAGE(256, "Unable to open " + data_.path("nowhere") + "/orvnebu_directory.csv");
}

// The class of the slave a creation function builds from the demo files of that class.
class SlaveFactoryRecords : public TestHost {
protected:
    std::string built(OrvNebu_SlaveFactory::CreateFunction create, const std::string& files) {
        const std::string base = std::string(NEBU_TEST_DATA_DIR) + "/" + files;
        std::unique_ptr<OrvRT::OrvNebu_Slave> slave(
            create(HANDLE, ORV_CORE_INFO{{1, 0, 0, 0, 0}}, ORV_SLAVE_REF{0, 1, 0},
                   Orv_HashMapCStr(), base + "_regs.csv", base + "_params.csv"));
        return slave ? typeid(*slave).name() : "<none>";
    }
};

TEST_F(SlaveFactoryRecords, FourteenRecordsSortedWithTheirVersionRangesAndClasses) {
    using Table = OrvRT::OrvNebu_SlaveClassTable;
    const OrvNebu_SlaveFactory::SlaveClasses& classes =
        OrvRT::OrvNebu_TransceiverClasses::slaveClasses();
    auto find = [&classes](int32_t type, int32_t version) {
        return OrvNebu_SlaveFactory::findCreateFunction(type, version, classes);
    };
    const std::string plain = typeid(OrvRT::OrvNebu_DefaultSlave).name();
    const std::string m3qrc = typeid(OrvRT::OrvNebu_VanduM3Qrc).name();
    const std::string r2qra = typeid(OrvRT::OrvNebu_VanduR2Qra).name();
    const std::string r3qra = typeid(OrvRT::OrvNebu_VanduR3Qra).name();
    const std::string r3qrb = typeid(OrvRT::OrvNebu_VanduR3Qrb).name();
    const struct {
        int32_t type, min, max;
        std::string cls;
        const char* files;  // demo files the class can read
    } expected[14] = {{0x00, 0, 0xFFFF, plain, "ctrl"},        {0x01, 1, 1, m3qrc, "vandu_m3qrc"},
                      {0x11, 1, 0xFFFF, plain, "ctrl"},        {0x12, 1, 0xFFFF, plain, "ctrl"},
                      {0x13, 1, 0xFFFF, plain, "ctrl"},        {0x14, 1, 0xFFFF, plain, "ctrl"},
                      {0x15, 1, 0xFFFF, r3qra, "vandu_r3qra"}, {0x21, 1, 0xFFFF, plain, "ctrl"},
                      {0x31, 1, 0xFFFF, plain, "ctrl"},        {0x41, 1, 1, plain, "ctrl"},
                      {0x42, 1, 1, r2qra, "vandu_r2qra"},      {0x43, 1, 1, r3qra, "vandu_r3qra"},
                      {0x44, 1, 1, m3qrc, "vandu_m3qrc"},      {0x45, 1, 1, r3qrb, "vandu_r3qrb"}};
    // The factory's table, with the creation functions the layer above enters.
    const std::vector<Table::Record>& r = Table::records();
    ASSERT_EQ(r.size(), 14u);
    for (size_t i = 0; i < r.size(); ++i) {
        EXPECT_EQ(r[i].slaveType, expected[i].type) << i;
        EXPECT_EQ(r[i].minDriverVersion, expected[i].min) << i;
        EXPECT_EQ(r[i].maxDriverVersion, expected[i].max) << i;
        const OrvNebu_SlaveFactory::CreateFunction create = classes.create[r[i].slaveClass];
        EXPECT_EQ(built(create, expected[i].files), expected[i].cls) << i;
        // The table names the class that is built (the file tools read the name).
        EXPECT_NE(expected[i].cls.find(Table::info(r[i].slaveClass).className), std::string::npos)
            << i;
        // Every record is found for its own range, and only for it.
        EXPECT_EQ(find(r[i].slaveType, r[i].minDriverVersion), create);
        EXPECT_EQ(find(r[i].slaveType, r[i].maxDriverVersion), create);
    }
    // Outside every record the default slave is built, whatever files come with it.
    const struct {
        int32_t type, version;
        const char* files;
    } uncovered[] = {{0x44, 2, "vandu_m3qrc"},
                     {0x42, 2, "vandu_r2qra"},
                     {0x01, 0, "vandu_m3qrc"},
                     {0x41, 2, "ctrl"},
                     {0x99, 1, "ctrl"}};
    for (const auto& u : uncovered) {
        EXPECT_EQ(built(find(u.type, u.version), u.files), plain) << u.type << " " << u.version;
    }
    EXPECT_EQ(built(find(0x15, 7), "vandu_r3qra"), r3qra);
    EXPECT_TRUE(noMessages());
}

}  // namespace
