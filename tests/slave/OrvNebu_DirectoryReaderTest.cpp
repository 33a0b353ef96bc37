// The directory file as the plug-in looks a slave up in it, the table of slave classes, and
// the chain of slaves along next_slave, loops included.
#include "base/OrvNebu_SlaveClassTable.h"
#include "base/Orv_AbortException.h"
#include "host/OrvCore.h"
#include "slave/OrvNebu_DefaultSlave.h"
#include "slave/OrvNebu_DirectoryReader.h"
#include "support/RegsFixture.h"

using OrvRT::Orv_CoreList;
using OrvRT::Orv_HashMapCStr;
using OrvRT::OrvNebu_DefaultSlave;
using OrvRT::OrvNebu_Slave;

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

TEST_F(DirectoryReaderTest, RegisterFileNameKeepsItsBlanks) {
    // Windows would open regs.csv for the last two names: the plug-in does not, there either.
    for (const std::string name : {" regs.csv", "regs.csv  ", "regs.csv."}) {
        data_.write("orvnebu_directory.csv",
                    "slave_type,orv_drv_ver_min,orv_drv_ver_max,registers,parameters\n0x11,1,1," +
                        name + ",\n");
        EXPECT_EQ(initialize(0), ORVNEBU_FAILED);
        EXPECT_MESSAGE(256, "Unable to open OrvNebu register file: " + data_.dir() + name);
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

class SlaveChainTest : public RegsFixture {
protected:
    // Registers a slave object at the index with this next_slave text (none when null).
    OrvNebu_Slave* addSlave(uint32_t index, const char* nextSlave) {
        Orv_HashMapCStr info{{"slave_type", "19"}, {"orv_drv_ver", "1"}};
        if (nextSlave != nullptr) info["next_slave"] = nextSlave;
        ORV_CORE_INFO coreInfo{{1, 0x13, 0, 0, 0}};
        OrvNebu_Slave* s = OrvNebu_DefaultSlave::create(HANDLE, coreInfo, ref(index), info,
                                                        data_.path("chain.csv"), "");
        if (s != nullptr) Orv_CoreList::addCore(HANDLE, s);
        return s;
    }
};

// The demo chain of duals is in the transceiver_slaves transcript; here the links it lacks.
TEST_F(SlaveChainTest, LinksThatLeadNowhereOrBack) {
    ASSERT_EQ(initialize(3), ORVNEBU_OK);  // next_slave 2
    ASSERT_EQ(initialize(5), ORVNEBU_OK);
    ASSERT_EQ(terminate(5), ORVNEBU_OK);
    ORV_SLAVE_REF three = ref(3);
    OrvNebu_Slave* made = dynamic_cast<OrvNebu_Slave*>(Orv_CoreList::getSlave(HANDLE, &three));
    EXPECT_EQ(made->getNextSlave(), nullptr) << "no slave object at the link";
    // The core record and the status word check the host asks of the slave object.
    const uint32_t* word = made->getCoreInfo().word;
    EXPECT_EQ(std::vector<uint32_t>(word, word + 5), (std::vector<uint32_t>{1, 0x13, 0, 0, 0}));
    EXPECT_TRUE(made->initFromStatusWord(0));
    ASSERT_EQ(terminate(3), ORVNEBU_OK);

    // Each with slaves one and two further on, which a wrong reading would reach.
    uint32_t index = 10;
    for (const char* text : {(const char*)nullptr, "", "0", "abc", " 0x2"}) {
        OrvNebu_Slave* s = addSlave(index, text);
        addSlave(index + 1, nullptr);
        addSlave(index + 2, nullptr);
        EXPECT_EQ(s->getNextSlave(), nullptr) << (text ? text : "(absent)");
        index += 3;
    }
    OrvNebu_Slave* a = addSlave(3, "2");
    OrvNebu_Slave* b = addSlave(5, "-2");
    OrvNebu_Slave* c = addSlave(6, " +0");
    EXPECT_EQ(a->getNextSlave(), b);
    EXPECT_EQ(b->getNextSlave(), a);
    EXPECT_EQ(a->getPreviousSlave(), b);
    EXPECT_EQ(b->getPreviousSlave(), a);
    EXPECT_EQ(c->getPreviousSlave(), nullptr);
    EXPECT_EQ(a->getParamFromOtherSlave(nullptr, "refclk", "GREFCLK"), "GREFCLK");
}

}  // namespace
