// The directory file as the plug-in looks a slave up in it, and the table of slave classes.
#include "base/OrvNebu_SlaveClassTable.h"
#include "base/Orv_AbortException.h"
#include "slave/OrvNebu_DirectoryReader.h"
#include "support/RegsFixture.h"

using OrvRT::Orv_HashMapCStr;

namespace {

class DirectoryReaderTest : public RegsFixture {
protected:
    // Looks up type and version in a directory file with this text.
    bool lookup(const std::string& text, int32_t type, int32_t version, Orv_HashMapCStr& entry) {
        data_.write("dir.csv", text);
        return OrvRT::OrvNebu_DirectoryReader::getEntry(HANDLE, data_.path("dir.csv"), type,
                                                        version, entry);
    }
};

TEST_F(DirectoryReaderTest, HeaderNamesInAnyCaseAndTheFiveKeyColumns) {
    const std::string file =
        " Slave_Type ,ORV_DRV_VER_MIN,orv_drv_ver_max,parameters,Registers\r\n0x11,1,2,P,R\r\n";
    Orv_HashMapCStr entry;
    ASSERT_TRUE(lookup(file, 0x11, 2, entry));
    EXPECT_EQ(entry, (Orv_HashMapCStr{{"slave_type", "0x11"},
                                      {"orv_drv_ver_min", "1"},
                                      {"orv_drv_ver_max", "2"},
                                      {"registers", "R"},
                                      {"parameters", "P"}}));
    EXPECT_FALSE(lookup(file, 0x11, 3, entry));
    // A header without all five key columns, or none at all, is refused.
    for (const char* text :
         {"slave_type,orv_drv_ver_min,orv_drv_ver_max,registers\n1,1,1,r\n", ""}) {
        clearMessages();
        EXPECT_THROW(lookup(text, 1, 1, entry), OrvRT::Orv_AbortException) << text;
        EXPECT_LAST_MESSAGE(256, "Unable to parse header of CSV file: " + data_.path("dir.csv"));
    }
}

TEST(SlaveClassTable, FourteenRecordsSortedWithTheirVersionRanges) {
    using T = OrvRT::OrvNebu_SlaveClassTable;
    const T::Record expected[14] = {
        {0x00, 0, 0xFFFF, T::DEFAULT_SLAVE}, {0x01, 1, 1, T::VANDU_M3QRC},
        {0x11, 1, 0xFFFF, T::DEFAULT_SLAVE}, {0x12, 1, 0xFFFF, T::DEFAULT_SLAVE},
        {0x13, 1, 0xFFFF, T::DEFAULT_SLAVE}, {0x14, 1, 0xFFFF, T::DEFAULT_SLAVE},
        {0x15, 1, 0xFFFF, T::VANDU_R3QRA},   {0x21, 1, 0xFFFF, T::DEFAULT_SLAVE},
        {0x31, 1, 0xFFFF, T::DEFAULT_SLAVE}, {0x41, 1, 1, T::DEFAULT_SLAVE},
        {0x42, 1, 1, T::VANDU_R2QRA},        {0x43, 1, 1, T::VANDU_R3QRA},
        {0x44, 1, 1, T::VANDU_M3QRC},        {0x45, 1, 1, T::VANDU_R3QRB}};
    const std::vector<T::Record>& r = T::records();
    ASSERT_EQ(r.size(), 14u);
    for (size_t i = 0; i < r.size(); ++i) {
        SCOPED_TRACE(i);
        EXPECT_EQ(r[i].slaveType, expected[i].slaveType);
        EXPECT_EQ(r[i].minDriverVersion, expected[i].minDriverVersion);
        EXPECT_EQ(r[i].maxDriverVersion, expected[i].maxDriverVersion);
        EXPECT_EQ(r[i].slaveClass, expected[i].slaveClass);
        // Found at both ends of its own range.
        EXPECT_EQ(T::find(r[i].slaveType, r[i].minDriverVersion), r[i].slaveClass);
        EXPECT_EQ(T::find(r[i].slaveType, r[i].maxDriverVersion), r[i].slaveClass);
    }
    // Outside every record: the default slave.
    for (const auto& u : std::vector<std::pair<int32_t, int32_t>>{
             {0x44, 2}, {0x42, 2}, {0x01, 0}, {0x41, 2}, {0x99, 1}})
        EXPECT_EQ(T::find(u.first, u.second), T::DEFAULT_SLAVE) << u.first << " " << u.second;
}

}  // namespace
