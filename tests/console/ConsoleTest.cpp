// The console's interpreter driven line by line against a stand-in plug-in whose functions
// record how they were called and answer with known outputs, messages and return codes.
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdio>
#include <memory>
#include <sstream>
#include <string>
#include <vector>

#include "Console.h"
#include "host/OrvJtag.h"
#include "hostsim/Sim.h"
#include "hostsim/board/Board.h"
#include "support/TestHost.h"

namespace nebu {
namespace {

std::vector<std::string> g_calls;
uint32_t g_rc = ORVNEBU_OK;

std::string refText(ORV_SLAVE_REF r) {
    return std::to_string(r.device) + "," + std::to_string(r.userChain) + "," +
           std::to_string(r.slaveIndex);
}
void record(uint32_t handle, const std::string& what) {
    g_calls.push_back("h" + std::to_string(handle) + " " + what);
}
OrvRT::Orv_HashMapCStr& mapOf(ORV_HASHMAP_HANDLE* handle) {
    return *static_cast<OrvRT::Orv_HashMapCStr*>(*handle);
}
std::string keysOf(ORV_HASHMAP_HANDLE* handle) {
    std::vector<std::string> keys;
    for (const auto& entry : mapOf(handle)) keys.push_back(entry.first + "=" + entry.second);
    std::sort(keys.begin(), keys.end());
    std::string text;
    for (const auto& k : keys) text += " " + k;
    return text;
}
std::string ptr(const void* p) { return p != nullptr ? "set" : "null"; }

uint32_t fakeInitialize(uint32_t h, ORV_SLAVE_REF r) {
    record(h, "initialize " + refText(r));
    return g_rc;
}
uint32_t fakeTerminate(uint32_t h, ORV_SLAVE_REF r) {
    record(h, "terminate " + refText(r));
    return ORVNEBU_OK;
}
uint32_t fakeGetBusInfo(uint32_t h, uint32_t d, uint32_t c, ORV_HASHMAP_HANDLE* info) {
    record(h, "getBusInfo " + std::to_string(d) + "," + std::to_string(c));
    OrvJtag_session_sendMessage(h, 256, "bus\tinfo\nsecond line");
    mapOf(info)["zeta"] = "last";
    mapOf(info)["Alpha"] = "tab\there";
    mapOf(info)["alpha"] = "back\\slash";
    return g_rc;
}
uint32_t fakeGetSlaveCount(uint32_t h, uint32_t d, uint32_t c, uint32_t* count) {
    record(h, "getSlaveCount " + std::to_string(d) + "," + std::to_string(c));
    *count = (d == 0 && c == 1) ? 2 : 0;
    return ORVNEBU_OK;
}
uint32_t fakeGetSlaveHandles(uint32_t h, uint32_t d, uint32_t c, uint32_t* handles, uint32_t n) {
    record(h, "getSlaveHandles " + std::to_string(d) + "," + std::to_string(c) + " " +
                  ptr(handles) + " " + std::to_string(n));
    if (handles != nullptr && n > 1) handles[0] = 0;  // leaves the rest as preset
    return g_rc;
}
uint32_t fakeGetSlaveInfo(uint32_t h, ORV_SLAVE_REF r, ORV_HASHMAP_HANDLE* info) {
    record(h, "getSlaveInfo " + refText(r) + keysOf(info));
    if (r.slaveIndex == 1) {
        OrvJtag_session_sendMessage(h, 256, "slave 1 does not answer");
        return ORVNEBU_FAILED;
    }
    mapOf(info)["slave_type"] = "17";
    mapOf(info)["cg_ver"] = "2.3";
    mapOf(info)["cg_ver.major"] = "2";
    mapOf(info)["next_slave"] = "1";
    return ORVNEBU_OK;
}
uint32_t fakeGetRegisters(uint32_t h, ORV_SLAVE_REF r, ORV_HASHMAP_HANDLE* regs) {
    record(h, "getRegisters " + refText(r) + keysOf(regs));
    if (mapOf(regs).empty()) {
        mapOf(regs)["STATUS"] = "8000";
        mapOf(regs)["CTRL"] = "0001";
    }
    return g_rc;
}
uint32_t fakeSetRegisters(uint32_t h, ORV_SLAVE_REF r, ORV_HASHMAP_HANDLE* regs) {
    record(h, "setRegisters " + refText(r) + keysOf(regs));
    return g_rc;
}
uint32_t fakeGetParameters(uint32_t h, ORV_SLAVE_REF r, ORV_HASHMAP_HANDLE* params) {
    record(h, "getParameters " + refText(r) + keysOf(params));
    mapOf(params)["line_rate"] = "10.3125";
    return g_rc;
}
uint32_t fakeSetParameters(uint32_t h, ORV_SLAVE_REF r, ORV_HASHMAP_HANDLE* params) {
    record(h, "setParameters " + refText(r) + keysOf(params));
    return g_rc;
}
uint32_t fakeGetParameterChoices(uint32_t h, ORV_SLAVE_REF r, ORV_HASHMAP_HANDLE* params,
                                 ORV_STRINGLIST_HANDLE* choices) {
    record(h, "getParameterChoices " + refText(r) + keysOf(params));
    auto& list = *static_cast<std::vector<std::string>*>(*choices);
    list.push_back("10.3125 Gbps, 2 lanes");
    list.push_back("with\nfeed");
    return g_rc;
}
uint32_t fakeRead(uint32_t h, ORV_SLAVE_REF r, uint32_t address, uint32_t size, char* data) {
    record(h, "read " + refText(r) + " " + std::to_string(address) + " " + std::to_string(size));
    if (size == 0) return ORVNEBU_FAILED;
    for (uint32_t i = 0; i < size; ++i)
        std::snprintf(data + 4 * i, 5, "%04X", (size - i) & 0xFFFFu);
    return g_rc;
}
uint32_t fakeWrite(uint32_t h, ORV_SLAVE_REF r, uint32_t address, uint32_t size, const char* data) {
    record(h, "write " + refText(r) + " " + std::to_string(address) + " " + std::to_string(size) +
                  " " + data);
    return g_rc;
}
uint32_t fakeGetBusErrorStatus(uint32_t h, uint32_t d, uint32_t c, uint32_t* status, uint32_t n) {
    record(h, "getBusErrorStatus " + std::to_string(d) + "," + std::to_string(c) + " " +
                  ptr(status) + " " + std::to_string(n));
    if (status != nullptr) status[0] = 5;
    return status != nullptr ? g_rc : ORVNEBU_FAILED;
}
uint32_t fakeTestSlaveInterface(uint32_t h, ORV_SLAVE_REF r, uint32_t* result) {
    record(h, "testSlaveInterface " + refText(r));
    *result = 3;
    return g_rc;
}
uint32_t fakeSingleSlaveRead(uint32_t h, ORV_SLAVE_REF r, uint32_t address, uint32_t* buffer,
                             uint32_t* status) {
    record(h, "singleSlaveRead " + refText(r) + " " + std::to_string(address) + " status " +
                  ptr(status));
    *buffer = 0xBEEF;
    if (status != nullptr) *status = 4;
    return g_rc;
}
uint32_t fakeSingleSlaveWriteAndInspect(uint32_t h, ORV_SLAVE_REF r, uint32_t address,
                                        uint32_t value, uint32_t* rdBuf, uint32_t* status) {
    record(h, "singleSlaveWriteAndInspect " + refText(r) + " " + std::to_string(address) + " " +
                  std::to_string(value) + " status " + ptr(status));
    *rdBuf = value & 0xFF;
    if (status != nullptr) *status = 0;
    return g_rc;
}
uint32_t fakeSingleSlaveReadModifyWrite(uint32_t h, ORV_SLAVE_REF r, uint32_t address,
                                        uint32_t value, uint32_t mask, uint32_t* status) {
    record(h, "singleSlaveReadModifyWrite " + refText(r) + " " + std::to_string(address) + " " +
                  std::to_string(value) + " " + std::to_string(mask) + " status " + ptr(status));
    if (status != nullptr) *status = 1;
    return g_rc;
}
uint32_t fakeBurstSlaveRead(uint32_t h, ORV_SLAVE_REF r, uint32_t address, uint32_t incr,
                            uint32_t* buffer, uint32_t n, uint32_t* status) {
    record(h, "burstSlaveRead " + refText(r) + " " + std::to_string(address) + " " +
                  std::to_string(incr) + " " + ptr(buffer) + " " + std::to_string(n));
    // Fills all but the last word, as a transfer that broke off would.
    for (uint32_t i = 0; i + 1 < n; ++i) buffer[i] = address + i;
    if (status != nullptr) *status = 2;
    return g_rc;
}
uint32_t fakeBurstSlaveWrite(uint32_t h, ORV_SLAVE_REF r, uint32_t address, uint32_t incr,
                             const uint32_t* buffer, uint32_t n, uint32_t* status) {
    std::string words;
    for (uint32_t i = 0; i < n; ++i) words += " " + std::to_string(buffer[i]);
    record(h, "burstSlaveWrite " + refText(r) + " " + std::to_string(address) + " " +
                  std::to_string(incr) + " " + ptr(buffer) + " " + std::to_string(n) + words);
    if (status != nullptr) *status = 0;
    return g_rc;
}
uint32_t fakeBroadcastSingleWrite(uint32_t h, uint32_t d, uint32_t c, uint32_t address,
                                  uint32_t value, uint32_t* status) {
    record(h, "broadcastSingleWrite " + std::to_string(d) + "," + std::to_string(c) + " " +
                  std::to_string(address) + " " + std::to_string(value) + " status " + ptr(status));
    if (status != nullptr) *status = 0;
    return g_rc;
}

PluginApi fakeApi() {
    PluginApi api;
    api.initialize = fakeInitialize;
    api.terminate = fakeTerminate;
    api.getBusInfo = fakeGetBusInfo;
    api.getSlaveCount = fakeGetSlaveCount;
    api.getSlaveHandles = fakeGetSlaveHandles;
    api.getSlaveInfo = fakeGetSlaveInfo;
    api.getRegisters = fakeGetRegisters;
    api.setRegisters = fakeSetRegisters;
    api.getParameters = fakeGetParameters;
    api.setParameters = fakeSetParameters;
    api.getParameterChoices = fakeGetParameterChoices;
    api.read = fakeRead;
    api.write = fakeWrite;
    api.getBusErrorStatus = fakeGetBusErrorStatus;
    api.testSlaveInterface = fakeTestSlaveInterface;
    api.singleSlaveRead = fakeSingleSlaveRead;
    api.singleSlaveReadModifyWrite = fakeSingleSlaveReadModifyWrite;
    api.singleSlaveWriteAndInspect = fakeSingleSlaveWriteAndInspect;
    api.burstSlaveRead = fakeBurstSlaveRead;
    api.burstSlaveWrite = fakeBurstSlaveWrite;
    api.broadcastSingleWrite = fakeBroadcastSingleWrite;
    return api;  // resetBus and the others stay missing
}

// The console replaces the fixture's message sink with its own, which prints.
class ConsoleTest : public TestHost {
protected:
    void SetUp() override {
        TestHost::SetUp();
        g_calls.clear();
        g_rc = ORVNEBU_OK;
        console_ = std::make_unique<Console>(fakeApi(), out_, err_, 1);
        console_->installSinks(false);
    }
    void TearDown() override {
        console_->finish();
        console_.reset();
        TestHost::TearDown();
    }
    // Runs the lines and returns what they printed on standard output.
    std::string run(std::initializer_list<const char*> lines) {
        out_.str("");
        err_.str("");
        for (const char* line : lines) console_->runLine(line);
        return out_.str();
    }
    std::string err() const { return err_.str(); }
    int status() const { return console_->exitStatus(); }

    std::ostringstream out_;
    std::ostringstream err_;
    std::unique_ptr<Console> console_;
};

TEST_F(ConsoleTest, EchoThenMessagesThenReturnCodeThenSortedEscapedMap) {
    EXPECT_EQ(run({"getBusInfo 0 1   # with a comment"}),
              "> getBusInfo 0 1   # with a comment\n"
              "message 256: bus\\tinfo\\nsecond line\n"
              "rc=0x00000000\n"
              "Alpha=tab\\there\n"
              "alpha=back\\\\slash\n"
              "zeta=last\n");
    EXPECT_EQ(g_calls, (std::vector<std::string>{"h1 getBusInfo 0,1"}));
    EXPECT_EQ(err(), "");
    EXPECT_EQ(status(), 0);
}

TEST_F(ConsoleTest, FailedCallPrintsItsOutputsAndSetsExitStatusOne) {
    g_rc = ORVNEBU_FAILED;
    EXPECT_EQ(run({"getSlaveHandles 0 1 3"}),
              "> getSlaveHandles 0 1 3\nrc=0x80000000\n"
              "slaveHandles=0 4294967295 4294967295\n");
    EXPECT_EQ(status(), 1);
    g_rc = ORVNEBU_OK;
    // A later success does not clear the failure, and empty lines are not echoed.
    EXPECT_EQ(run({"", "   ", "# note", "getSlaveCount 0 1"}),
              "> getSlaveCount 0 1\nrc=0x00000000\ncount=2\n");
    EXPECT_EQ(status(), 1);
}

TEST_F(ConsoleTest, ZeroCountsPassNullArrays) {
    EXPECT_EQ(run({"getSlaveHandles 0 1 0", "getBusErrorStatus 0 1 0", "burstSlaveRead 0 1 2 3 1 0",
                   "burstSlaveWrite 0 1 2 3 1"}),
              "> getSlaveHandles 0 1 0\nrc=0x00000000\nslaveHandles=\n"
              "> getBusErrorStatus 0 1 0\nrc=0x80000000\nerrorStatus=\n"
              "> burstSlaveRead 0 1 2 3 1 0\nrc=0x00000000\nbuffer=\nstatus=2\n"
              "> burstSlaveWrite 0 1 2 3 1\nrc=0x00000000\nstatus=0\n");
    EXPECT_EQ(g_calls,
              (std::vector<std::string>{
                  "h1 getSlaveHandles 0,1 null 0", "h1 getBusErrorStatus 0,1 null 0",
                  "h1 burstSlaveRead 0,1,2 3 1 null 0", "h1 burstSlaveWrite 0,1,2 3 1 null 0"}));
}

TEST_F(ConsoleTest, BusWordsInHexCountsAndStatusInDecimal) {
    EXPECT_EQ(run({"singleSlaveRead 0 1 2 0x1FFF0", "burstSlaveRead 0 1 2 0x10 1 3",
                   "singleSlaveWriteAndInspect 0 1 2 16 0x1234",
                   "singleSlaveReadModifyWrite 0 1 2 16 0x0F 0xF0",
                   "burstSlaveWrite 0 1 2 16 0 1 0x2 3", "broadcastSingleWrite 0 1 0x20 7",
                   "getBusErrorStatus 0 1 2", "testSlaveInterface 0 1 2"}),
              "> singleSlaveRead 0 1 2 0x1FFF0\nrc=0x00000000\nbuffer=0xBEEF\nstatus=4\n"
              "> burstSlaveRead 0 1 2 0x10 1 3\nrc=0x00000000\n"
              "buffer=0x0010 0x0011 0xFFFFFFFF\nstatus=2\n"
              "> singleSlaveWriteAndInspect 0 1 2 16 0x1234\nrc=0x00000000\nrdBuf=0x0034\n"
              "status=0\n"
              "> singleSlaveReadModifyWrite 0 1 2 16 0x0F 0xF0\nrc=0x00000000\nstatus=1\n"
              "> burstSlaveWrite 0 1 2 16 0 1 0x2 3\nrc=0x00000000\nstatus=0\n"
              "> broadcastSingleWrite 0 1 0x20 7\nrc=0x00000000\nstatus=0\n"
              "> getBusErrorStatus 0 1 2\nrc=0x00000000\nerrorStatus=5 4294967295\n"
              "> testSlaveInterface 0 1 2\nrc=0x00000000\nresult=3\n");
    EXPECT_EQ(g_calls[0], "h1 singleSlaveRead 0,1,2 131056 status set");
    EXPECT_EQ(g_calls[2], "h1 singleSlaveWriteAndInspect 0,1,2 16 4660 status set");
    EXPECT_EQ(g_calls[3], "h1 singleSlaveReadModifyWrite 0,1,2 16 15 240 status set");
    EXPECT_EQ(g_calls[4], "h1 burstSlaveWrite 0,1,2 16 0 set 3 1 2 3");
    EXPECT_EQ(g_calls[5], "h1 broadcastSingleWrite 0,1 32 7 status set");
}

TEST_F(ConsoleTest, StatusOffPassesNullAndPrintsNoStatusLine) {
    EXPECT_EQ(run({"status off", "singleSlaveRead 0 1 2 5", "broadcastSingleWrite 0 1 1 2",
                   "status on", "singleSlaveRead 0 1 2 5"}),
              "> status off\n"
              "> singleSlaveRead 0 1 2 5\nrc=0x00000000\nbuffer=0xBEEF\n"
              "> broadcastSingleWrite 0 1 1 2\nrc=0x00000000\n"
              "> status on\n"
              "> singleSlaveRead 0 1 2 5\nrc=0x00000000\nbuffer=0xBEEF\nstatus=4\n");
    EXPECT_EQ(g_calls, (std::vector<std::string>{"h1 singleSlaveRead 0,1,2 5 status null",
                                                 "h1 broadcastSingleWrite 0,1 1 2 status null",
                                                 "h1 singleSlaveRead 0,1,2 5 status set"}));
}

TEST_F(ConsoleTest, MapArgumentsAndChoices) {
    EXPECT_EQ(
        run({"getRegisters 0 1 2", "getRegisters 0 1 2 CTRL \"MODE\"",
             "setRegisters 0 1 2 CTRL=0x1 \"LABEL=a b, c\" EXPR=x=y CTRL=2",
             "getParameterChoices 0 1 2 line_rate refclk=125", "getSlaveInfo 0 1 0 mine=kept"}),
        "> getRegisters 0 1 2\nrc=0x00000000\nCTRL=0001\nSTATUS=8000\n"
        "> getRegisters 0 1 2 CTRL \"MODE\"\nrc=0x00000000\nCTRL=\nMODE=\n"
        "> setRegisters 0 1 2 CTRL=0x1 \"LABEL=a b, c\" EXPR=x=y CTRL=2\nrc=0x00000000\n"
        "> getParameterChoices 0 1 2 line_rate refclk=125\nrc=0x00000000\n"
        "choice=10.3125 Gbps, 2 lanes\nchoice=with\\nfeed\n"
        "> getSlaveInfo 0 1 0 mine=kept\nrc=0x00000000\ncg_ver=2.3\ncg_ver.major=2\n"
        "mine=kept\nnext_slave=1\nslave_type=17\n");
    EXPECT_EQ(g_calls, (std::vector<std::string>{
                           "h1 getRegisters 0,1,2", "h1 getRegisters 0,1,2 CTRL= MODE=",
                           "h1 setRegisters 0,1,2 CTRL=2 EXPR=x=y LABEL=a b, c",
                           "h1 getParameterChoices 0,1,2 line_rate= refclk=125",
                           "h1 getSlaveInfo 0,1,0 mine=kept"}));
}

TEST_F(ConsoleTest, RawReadAndWriteText) {
    EXPECT_EQ(run({"read 0 1 2 0x10 2", "read 0 1 2 0x10 0", "write 0 1 2 16 2 00020001"}),
              "> read 0 1 2 0x10 2\nrc=0x00000000\ndata=00020001\n"
              "> read 0 1 2 0x10 0\nrc=0x80000000\ndata=\n"
              "> write 0 1 2 16 2 00020001\nrc=0x00000000\n");
    EXPECT_EQ(g_calls.back(), "h1 write 0,1,2 16 2 00020001");
}

TEST_F(ConsoleTest, SessionHandleGoesToEveryCall) {
    run({"getSlaveCount 0 1", "session 0x20", "getSlaveCount 0 1", "session 7", "read 0 1 2 3 1"});
    EXPECT_EQ(g_calls, (std::vector<std::string>{"h1 getSlaveCount 0,1", "h32 getSlaveCount 0,1",
                                                 "h7 read 0,1,2 3 1"}));
    EXPECT_EQ(console_->session(), 7u);
}

TEST_F(ConsoleTest, UsageErrorsAreReportedAndTheConsoleGoesOn) {
    const std::string out = run({"frobnicate 1", "resetBus 0 1", "getSlaveCount 0", "peek 0 1",
                                 "singleSlaveRead 0 1 2 0x1G", "getSlaveHandles 0 1 0x20001",
                                 "read 0 1 2 0 4294967295", "status maybe", "session",
                                 "getRegisters 0 1 \"2", "frob\rnicate", "getSlaveCount 0 1"});
    EXPECT_EQ(out,
              "> frobnicate 1\n> resetBus 0 1\n> getSlaveCount 0\n> peek 0 1\n"
              "> singleSlaveRead 0 1 2 0x1G\n> getSlaveHandles 0 1 0x20001\n"
              "> read 0 1 2 0 4294967295\n> status maybe\n> session\n> getRegisters 0 1 \"2\n"
              "> frob\rnicate\n> getSlaveCount 0 1\nrc=0x00000000\ncount=2\n");
    EXPECT_EQ(err(),
              "nebu: unknown command 'frobnicate'\n"
              "nebu: unknown command 'resetBus' (the plug-in does not export OrvNebu_resetBus)\n"
              "nebu: usage: getSlaveCount D C\n"
              "nebu: usage: peek D C S ADDRESS [COUNT]\n"
              "nebu: bad number '0x1G' for ADDRESS\n"
              "nebu: COUNT 0x20001 is more than the console allows (131072)\n"
              "nebu: SIZE 4294967295 is more than the console allows (131072)\n"
              "nebu: usage: status on|off\n"
              "nebu: usage: session N\n"
              "nebu: unterminated quote in: getRegisters 0 1 \"2\n"
              "nebu: unknown command 'frob\\rnicate'\n");
    EXPECT_EQ(g_calls, (std::vector<std::string>{"h1 getSlaveCount 0,1"}));
    EXPECT_EQ(status(), 2);
}

TEST_F(ConsoleTest, ALowerWordBoundAppliesToCountsAndValueLists) {
    console_->setMaxCommandWords(2);
    run({"getSlaveHandles 0 1 2", "getSlaveHandles 0 1 3", "burstSlaveWrite 0 1 0 0 1 5 6 7",
         "burstSlaveWrite 0 1 0 0 1 5 6"});
    EXPECT_EQ(err(),
              "nebu: COUNT 3 is more than the console allows (2)\n"
              "nebu: more than 2 words\n");
    EXPECT_EQ(g_calls, (std::vector<std::string>{"h1 getSlaveHandles 0,1 set 2",
                                                 "h1 burstSlaveWrite 0,1,0 0 1 set 2 5 6"}));
    // It can only lower the bound.
    console_->setMaxCommandWords(0xFFFFFFFFu);
    run({"getSlaveHandles 0 1 0x20001"});
    EXPECT_EQ(err(), "nebu: COUNT 0x20001 is more than the console allows (131072)\n");
}

TEST_F(ConsoleTest, DumpInitializesOnlyWhatThisConsoleHasNotInitialized) {
    EXPECT_EQ(run({"dump 0 1 0 refclk_freq=125"}),
              "> dump 0 1 0 refclk_freq=125\n"
              "initialize: rc=0x00000000\n"
              "registers: rc=0x00000000\n  CTRL=0001\n  STATUS=8000\n"
              "parameters: rc=0x00000000\n  line_rate=10.3125\n  refclk_freq=125\n");
    run({"dump 0 1 0", "initialize 0 1 1", "dump 0 1 1", "terminate 0 1 0", "dump 0 1 0",
         "endSession", "dump 0 1 1"});
    EXPECT_EQ(g_calls,
              (std::vector<std::string>{
                  "h1 initialize 0,1,0", "h1 getRegisters 0,1,0",
                  // inputs go with every parameter the slave names for an empty request
                  "h1 getParameters 0,1,0", "h1 getParameters 0,1,0 line_rate= refclk_freq=125",
                  // second dump: no initialize
                  "h1 getRegisters 0,1,0", "h1 getParameters 0,1,0", "h1 initialize 0,1,1",
                  "h1 getRegisters 0,1,1", "h1 getParameters 0,1,1", "h1 terminate 0,1,0",
                  "h1 initialize 0,1,0", "h1 getRegisters 0,1,0", "h1 getParameters 0,1,0",
                  // the session ended: its slave objects are gone
                  "h1 initialize 0,1,1", "h1 getRegisters 0,1,1", "h1 getParameters 0,1,1"}));
    EXPECT_EQ(status(), 0);
}

TEST_F(ConsoleTest, DumpStopsWhenInitializeFails) {
    g_rc = ORVNEBU_FAILED;
    EXPECT_EQ(run({"dump 0 1 4"}), "> dump 0 1 4\ninitialize: rc=0x80000000\n");
    EXPECT_EQ(status(), 1);
    g_rc = ORVNEBU_OK;
    run({"dump 0 1 4"});  // tried again: the failure left no slave object behind
    EXPECT_EQ(g_calls.size(), 4u);
    EXPECT_EQ(g_calls[1], "h1 initialize 0,1,4");
}

TEST_F(ConsoleTest, ScanWalksEveryChainOfTheBoard) {
    loadBoard(R"({"devices": [
        {"chains": {"1": {"cores": [{"type": 3}, {"type": 14, "master": {"slaveCount": 2}}]},
                    "2": {"cores": []}}},
        {"trellom": true, "chains": {}}]})");
    EXPECT_EQ(run({"scan"}),
              "> scan\n"
              "device 0 chain 1: 2 slaves\n"
              "  slave 0: slave_type=17 cg_ver=2.3 next_slave=1\n"
              "message 256: slave 1 does not answer\n"
              "  slave 1: getSlaveInfo failed, rc=0x80000000\n"
              "device 0 chain 2: no bus\n"
              "device 1: no chains\n");
    EXPECT_EQ(status(), 1);
}

TEST_F(ConsoleTest, QuitEndsTheStream) {
    std::istringstream in("getSlaveCount 0 1\n  quit  # done\ngetSlaveCount 0 2\n");
    console_->runStream(in, false);
    EXPECT_EQ(out_.str(), "> getSlaveCount 0 1\nrc=0x00000000\ncount=2\n>   quit  # done\n");
    EXPECT_EQ(g_calls, (std::vector<std::string>{"h1 getSlaveCount 0,1"}));
    EXPECT_TRUE(console_->quitRequested());
}

TEST_F(ConsoleTest, PromptOnlyWhenAsked) {
    std::istringstream in("getSlaveCount 0 1\n");
    console_->runStream(in, true);
    EXPECT_EQ(out_.str(), "nebu> > getSlaveCount 0 1\nrc=0x00000000\ncount=2\nnebu> \n");
}

TEST_F(ConsoleTest, HelpMarksWhatThePluginLacks) {
    const std::string out = run({"help"});
    EXPECT_NE(out.find("\n  singleSlaveRead D C S ADDRESS "), std::string::npos);
    EXPECT_NE(out.find("\n  peek D C S ADDRESS [COUNT] "), std::string::npos);
    EXPECT_NE(out.find("[plug-in lacks OrvNebu_resetBus]"), std::string::npos);
    EXPECT_EQ(out.find("[plug-in lacks OrvNebu_singleSlaveRead]"), std::string::npos);
    EXPECT_EQ(status(), 0);
}

}  // namespace
}  // namespace nebu
