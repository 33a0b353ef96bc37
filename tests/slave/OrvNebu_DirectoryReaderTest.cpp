// The directory file: header rules, number bases of the key columns, first match wins, and
// each failure with its messages as OrvNebu_initialize reports them.
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

    // Initializes slave 0 (type 0x11, version 1) against a directory file with this text.
    uint32_t initializeWith(const std::string& directory) {
        data_.write("orvnebu_directory.csv", directory);
        clearMessages();
        return initialize(0);
    }
};

TEST_F(DirectoryReaderTest, HeaderInAnyCaseOrderAndSpacing) {
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
    // Key columns anywhere; values are taken as they stand, blanks included.
    EXPECT_EQ(registersFor("registers,x,orv_drv_ver_max,orv_drv_ver_min,slave_type\n"
                           " R.csv ,,9,1,17\n",
                           17, 5),
              " R.csv ");
    // The same header column twice: the leftmost value stays.
    entry.clear();
    ASSERT_TRUE(
        lookup("registers,slave_type,orv_drv_ver_min,orv_drv_ver_max,registers\n"
               "left.csv,1,1,1,right.csv\n",
               1, 1, entry));
    EXPECT_EQ(entry["registers"], "left.csv");
}

TEST_F(DirectoryReaderTest, KeyColumnsInEveryNumberBase) {
    const std::string header = "slave_type,orv_drv_ver_min,orv_drv_ver_max,registers,parameters\n";
    EXPECT_EQ(registersFor(header + "0x15,1,0xFFFF,hex.csv,\n", 21, 7), "hex.csv");
    EXPECT_EQ(registersFor(header + "0X15,1,0XFFFF,hex.csv,\n", 21, 7), "hex.csv");
    EXPECT_EQ(registersFor(header + "025,1,1,oct.csv,\n", 21, 1), "oct.csv");
    EXPECT_EQ(registersFor(header + "21,1,1,dec.csv,\n", 21, 1), "dec.csv");
    EXPECT_EQ(registersFor(header + "  +21abc,1,1,lead.csv,\n", 21, 1), "lead.csv");
    EXPECT_EQ(registersFor(header + "none,-5,-1,neg.csv,\n", 0, -3), "neg.csv");
    EXPECT_EQ(registersFor(header + "99999999999,0,1,big.csv,\n", 2147483647, 1), "big.csv");
    // The version range is inclusive at both ends.
    EXPECT_EQ(registersFor(header + "1,2,4,r.csv,\n", 1, 2), "r.csv");
    EXPECT_EQ(registersFor(header + "1,2,4,r.csv,\n", 1, 4), "r.csv");
    EXPECT_EQ(registersFor(header + "1,2,4,r.csv,\n", 1, 1), "<none>");
    EXPECT_EQ(registersFor(header + "1,2,4,r.csv,\n", 1, 5), "<none>");
}

TEST_F(DirectoryReaderTest, LinesFirstMatchWinsShortLinesSkippedLongLinesCut) {
    EXPECT_EQ(registersFor("a,b,slave_type,orv_drv_ver_min,orv_drv_ver_max,registers\n"
                           "x,y,1,1\n"                    // too short for the key columns
                           "x,y,1,1,1,first.csv,extra\n"  // extra fields ignored
                           "x,y,1,1,1,second.csv\n",
                           1, 1),
              "first.csv");
    Orv_HashMapCStr entry;
    ASSERT_TRUE(
        lookup("slave_type,orv_drv_ver_min,orv_drv_ver_max,registers,parameters\n"
               "1,1,1\n",
               1, 1, entry));
    EXPECT_EQ(entry.size(), 3u);  // a line shorter than the header delivers what it has
    EXPECT_EQ(entry.count("registers"), 0u);
    // CR LF line ends read like LF.
    EXPECT_EQ(registersFor("slave_type,orv_drv_ver_min,orv_drv_ver_max,parameters,registers\r\n"
                           "1,1,1,,r.csv\r\n",
                           1, 1),
              "r.csv");
    EXPECT_NO_MESSAGES();
}

TEST_F(DirectoryReaderTest, UnusableHeaderIsReportedAndAborts) {
    const std::string path = data_.path("orvnebu_directory.csv");
    for (const char* text :
         {"slave_type,orv_drv_ver_min,orv_drv_ver_max,registers\n0x11,1,1,regs.csv\n",
          "slave_type,orv_drv_ver_min,registers,parameters,other\n0x11,1,regs.csv,,\n", ""}) {
        EXPECT_EQ(initializeWith(text), ORVNEBU_FAILED) << text;
        auto m = messages();
        ASSERT_EQ(m.size(), 2u) << text;
        EXPECT_EQ(m[0].severity, 256u);
        EXPECT_EQ(m[0].text, "Unable to parse header of CSV file: " + path);
        EXPECT_EQ(m[1].severity, 32768u);
        EXPECT_EQ(m[1].text, "Orv abort command");
    }
}

TEST_F(DirectoryReaderTest, MissingFileAndMissingEntry) {
    setDataDir(data_.path("nowhere"));
    clearMessages();
    EXPECT_EQ(initialize(0), ORVNEBU_FAILED);
    auto m = messages();
    ASSERT_EQ(m.size(), 2u);
    EXPECT_EQ(m[0].severity, 256u);
    EXPECT_EQ(m[0].text, "Unable to open " + data_.path("nowhere") + "/orvnebu_directory.csv");
    EXPECT_EQ(m[1].severity, 32768u);

    setDataDir(data_.dir());

    EXPECT_EQ(initializeWith("slave_type,orv_drv_ver_min,orv_drv_ver_max,registers,parameters\n"
                             "0x11,2,3,regs.csv,\n"
                             "0x11,1,1,,\n"),
              ORVNEBU_FAILED);
    m = messages();
    ASSERT_EQ(m.size(), 1u);
    EXPECT_EQ(m[0].severity, 256u);
    EXPECT_EQ(m[0].text,
              "No OrvNebu register file specified for OrvNebu slave type: 17, orv driver "
              "version: 1");
}

TEST_F(DirectoryReaderTest, RegisterFileNameKeepsItsBlanks) {
    EXPECT_EQ(initializeWith("slave_type,orv_drv_ver_min,orv_drv_ver_max,registers,parameters\n"
                             "0x11,1,1, regs.csv,\n"),
              ORVNEBU_FAILED);
    EXPECT_MESSAGE(256, "Unable to open OrvNebu register file: " + data_.dir() + " regs.csv");
}

TEST(SlaveFactoryRecords, FourteenRecordsSortedWithTheClassEachBuilds) {
    using Table = OrvRT::OrvNebu_SlaveClassTable;
    const std::vector<Table::Record>& r = Table::records();
    ASSERT_EQ(r.size(), 14u);
    const char* const D = "OrvNebu_DefaultSlave";
    const struct {
        int32_t type, min, max;
        const char* className;
    } expected[14] = {{0x00, 0, 0xFFFF, D},
                      {0x01, 1, 1, "OrvNebu_VanduM3Qrc"},
                      {0x11, 1, 0xFFFF, D},
                      {0x12, 1, 0xFFFF, D},
                      {0x13, 1, 0xFFFF, D},
                      {0x14, 1, 0xFFFF, D},
                      {0x15, 1, 0xFFFF, "OrvNebu_VanduR3Qra"},
                      {0x21, 1, 0xFFFF, D},
                      {0x31, 1, 0xFFFF, D},
                      {0x41, 1, 1, D},
                      {0x42, 1, 1, "OrvNebu_VanduR2Qra"},
                      {0x43, 1, 1, "OrvNebu_VanduR3Qra"},
                      {0x44, 1, 1, "OrvNebu_VanduM3Qrc"},
                      {0x45, 1, 1, "OrvNebu_VanduR3Qrb"}};
    const auto& classes = OrvRT::OrvNebu_TransceiverClasses::slaveClasses();
    for (size_t i = 0; i < r.size(); ++i) {
        SCOPED_TRACE(i);
        EXPECT_EQ(r[i].slaveType, expected[i].type);
        EXPECT_EQ(r[i].minDriverVersion, expected[i].min);
        EXPECT_EQ(r[i].maxDriverVersion, expected[i].max);
        EXPECT_STREQ(Table::info(r[i].slaveClass).className, expected[i].className);
        // Every record is found for its own range, and only for it.
        EXPECT_EQ(Table::find(r[i].slaveType, r[i].minDriverVersion), r[i].slaveClass);
        EXPECT_EQ(Table::find(r[i].slaveType, r[i].maxDriverVersion + 1), Table::DEFAULT_SLAVE);
        EXPECT_EQ(OrvNebu_SlaveFactory::findCreateFunction(r[i].slaveType, r[i].minDriverVersion,
                                                           classes),
                  classes.create[r[i].slaveClass]);
    }
    // The factory's creation function of each class is that class's own.
    EXPECT_EQ(classes.create[Table::DEFAULT_SLAVE], &OrvRT::OrvNebu_DefaultSlave::create);
    EXPECT_EQ(classes.create[Table::VANDU_M3QRC], &OrvRT::OrvNebu_VanduM3Qrc::create);
    EXPECT_EQ(classes.create[Table::VANDU_R2QRA], &OrvRT::OrvNebu_VanduR2Qra::create);
    EXPECT_EQ(classes.create[Table::VANDU_R3QRA], &OrvRT::OrvNebu_VanduR3Qra::create);
    EXPECT_EQ(classes.create[Table::VANDU_R3QRB], &OrvRT::OrvNebu_VanduR3Qrb::create);
    EXPECT_EQ(Table::find(0x44, 2), Table::DEFAULT_SLAVE);
    EXPECT_EQ(Table::find(0x15, 7), Table::VANDU_R3QRA);
    EXPECT_EQ(Table::find(0x99, 1), Table::DEFAULT_SLAVE);
}

}  // namespace
