// Fuzzes the exported functions as a host would call them: a random sequence of calls with
// fuzzed slave references, register and parameter names and values, raw reads and writes and
// bus-level calls, sessions ended in between, against a small board with the demo data. Every call
// must return OK or FAILED with a report, and a successful raw read must hand back its digits.
#include <fuzzer/FuzzedDataProvider.h>

#include <cctype>
#include <cstring>
#include <string>
#include <vector>

#include "FuzzSupport.h"
#include "host/OrvCore.h"
#include "orvnebu/orvnebu.h"

namespace {

// The demo board cut down to four slave positions on each of its two buses: the control,
// counter and GPIO slaves, then an M3Qrc dual, two chained R2Qra duals and an R3Qrb quad.
const char* const BOARD =
    R"({"devices":[{"trellom":false,"chains":{"1":{"cores":[{"type":3},{"type":14,"master":{"slaveCount)"
    R"(":4,"periodInt":10,"periodFrc":0,"dclkHasReset":true,"resetPolls":2,"clockPolls":2,"clockRunning)"
    R"(":true,"busErrors":0,"slaves":{"0":{"slaveType":"0x11","driverVersion":1,"coreType":1,"cgVersion)"
    R"(":"0x0203","edaVersion":"0x0A01","memory":{"0x0000":["0x0001","0x0000","0x00FF","0x1234"],"0x000)"
    R"(4":["0x0035","0xBEEF","0x9A05"],"0x0010":["0xABCD","0x0012"]}},"1":{"slaveType":"0x12","driverVe)"
    R"(rsion":1,"coreType":2,"cgVersion":"0x0203","edaVersion":"0x0A01","memory":{"0x0000":["0x0100","0)"
    R"(x0200","0x0300","0x0400"],"0x0100":"0x5A5A"}},"2":{"slaveType":"0x13","driverVersion":1,"coreTyp)"
    R"(e":3,"cgVersion":"0x0104","edaVersion":"0x0A02","memory":{"0x0000":["0xCAFE","0xBEEF"],"0x1FFEF")"
    R"(:"0x0042"}}}}}]},"2":{"cores":[{"type":3},{"type":14,"master":{"slaveCount":4,"periodInt":10,"pe)"
    R"(riodFrc":0,"dclkHasReset":true,"resetPolls":1,"clockPolls":1,"clockRunning":true,"busErrors":0,")"
    R"(slaves":{"0":{"slaveType":"0x44","driverVersion":1,"coreType":5,"cgVersion":"0x0301","edaVersion)"
    R"(":"0x0A01","memory":{"0x0000":["0x0003","0x001A","0xF900","0x9502","0x030B","0x035C"],"0x0010":[)"
    R"("0xDABE","0xAF00","0xC7FD","0xFFFF","0xDABE","0xAF00","0xC7FD","0xFFFF","0xDABE","0xAF00","0xC7F)"
    R"(D","0xFFFF","0x9FFD","0xFFFF","0x63FD","0xFFFF","0xDABE","0xAF00","0xC7FD","0xFFFF","0x9FFD","0x)"
    R"(FFFF","0x63FD","0xFFFF"]}},"1":{"slaveType":"0x42","driverVersion":1,"coreType":6,"cgVersion":"0)"
    R"(x0301","edaVersion":"0x0A01","nextSlave":1,"memory":{"0x0000":["0x0004","0x0012","0x0123","0x210)"
    R"(4"],"0x0010":["0x30D4","0x3E80","0x186A","0x3E80","0x186A","0x3E80","0x0C35","0x3E80","0x30D4",")"
    R"(0x3E80","0x186A","0x3E80","0x186A","0x3E80","0x0C35","0x3E80"]}},"2":{"slaveType":"0x42","driver)"
    R"(Version":1,"coreType":6,"cgVersion":"0x0301","edaVersion":"0x0A01","memory":{"0x0000":["0x0006",)"
    R"("0x0014","0x0101","0x2104"],"0x0010":["0x30D4","0x3E80","0x186A","0x3E80","0x186A","0x3E80","0x0)"
    R"(C35","0x3E80","0x30D4","0x3E80","0x186A","0x3E80","0x186A","0x3E80","0x0C35","0x3E80"]}},"3":{"s)"
    R"(laveType":"0x45","driverVersion":1,"coreType":8,"cgVersion":"0x0301","edaVersion":"0x0A01","memo)"
    R"(ry":{"0x0000":["0x0002","0x0030"],"0x0010":["0xC7FD","0xFFFF","0xC7FD","0xFFFF","0xC7FD","0xFFFF)"
    R"(","0xC7FD","0xFFFF","0xC7FD","0xFFFF"]}}}}}]}}}]})";

using Map = OrvRT::Orv_HashMapCStr;

const char* const NAMES[] = {
    "CTRL_ENABLE",     "CTRL_MODE",     "CTRL_CLK_DIV",     "SCRATCH",
    "EVENT_COUNT",     "GPIO_OUT",      "GPIO_IN_MIRRORED", "PLL_DIVSEL_FB0",
    "PLL_DIVSEL_REF0", "MAX_LINERATE",  "LANE_MAP",         "TXUSRCLK_FREQ_TUNE0",
    "DUAL_NUMBER",     "mode",          "clock_divider",    "loopback0",
    "line_rate0",      "line_rate1",    "line_rate",        "refclk_freq0",
    "refclk_freq1",    "refclk_freq",   "sysclk_freq",      "txusrclk0_freq",
    "rxrecclk0_freq",  "refclk_source", "tx_data_width0",   "test_pattern",
    "refclk_input",    "slave_type",    "orv_drv_ver",      ""};
const char* const VALUES[] = {"0",
                              "1",
                              "FFFF",
                              "0x12",
                              "",
                              "run",
                              "off",
                              "self_test",
                              "2500.000 FB=2, REF=1, DIVSEL=1",
                              "1250.000 FB=4, REF=2, DIVSEL=2",
                              "125",
                              "50",
                              "156.25",
                              "-1",
                              "1e400",
                              "G",
                              "0xFFFFFFFFFFFFFFFFF",
                              "FFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFF",
                              " 12 ",
                              "20",
                              "3125"};

class Sequence {
public:
    Sequence(FuzzedDataProvider& in, nebufuzz::HostRun& run) : in_(in), run_(run) {}

    void step();

private:
    template <size_t N>
    std::string pick(const char* const (&list)[N]) {
        if (in_.ConsumeIntegralInRange<int>(0, 7) == 0) return in_.ConsumeRandomLengthString(40);
        return list[in_.ConsumeIntegralInRange<size_t>(0, N - 1)];
    }
    uint32_t handle() { return in_.ConsumeIntegralInRange<uint32_t>(0, 3) == 0 ? 2u : 1u; }
    uint32_t device() { return small(2); }
    uint32_t chain() { return small(3); }
    uint32_t slave() { return small(9); }
    // Mostly small, sometimes any 32-bit value.
    uint32_t small(uint32_t max) {
        if (in_.ConsumeIntegralInRange<int>(0, 15) == 0) return in_.ConsumeIntegral<uint32_t>();
        return in_.ConsumeIntegralInRange<uint32_t>(0, max);
    }
    ORV_SLAVE_REF ref() { return ORV_SLAVE_REF{device(), chain(), slave()}; }
    uint32_t address() {
        switch (in_.ConsumeIntegralInRange<int>(0, 3)) {
            case 0:
                return in_.ConsumeIntegralInRange<uint32_t>(0, 0x40);
            case 1:
                return in_.ConsumeIntegralInRange<uint32_t>(0x1FFE0, 0x1FFFF);
            case 2:
                return in_.ConsumeIntegralInRange<uint32_t>(0, 0x1FFFF);
            default:
                return in_.ConsumeIntegral<uint32_t>();
        }
    }
    uint32_t* status(uint32_t& word) { return in_.ConsumeBool() ? &word : nullptr; }
    // A host map of up to four entries; names only when withValues is false.
    Map map(bool withValues) {
        Map m(100);
        const int n = in_.ConsumeIntegralInRange<int>(0, 4);
        for (int i = 0; i < n; ++i) {
            m[pick(NAMES)] = withValues || in_.ConsumeIntegralInRange<int>(0, 3) == 0
                                 ? pick(VALUES)
                                 : std::string();
        }
        return m;
    }
    bool check(uint32_t rc) { return run_.check(rc); }

    FuzzedDataProvider& in_;
    nebufuzz::HostRun& run_;
};

struct HostMap {
    ORV_HASHMAP_HANDLE handle = OrvContainer_hashmapCStr_new();
    explicit HostMap(const Map& entries) { *static_cast<Map*>(handle) = entries; }
    ~HostMap() { OrvContainer_hashmapCStr_delete(handle); }
    HostMap(const HostMap&) = delete;
    HostMap& operator=(const HostMap&) = delete;
};

void Sequence::step() {
    uint32_t word = 0;
    switch (in_.ConsumeIntegralInRange<int>(0, 27)) {
        case 0:
            check(OrvNebu_initialize(handle(), ref()));
            break;
        case 1:
            check(OrvNebu_terminate(handle(), ref()));
            break;
        case 2: {
            HostMap m(map(true));
            check(OrvNebu_getBusInfo(handle(), device(), chain(), &m.handle));
            break;
        }
        case 3:
            check(OrvNebu_getSlaveCount(handle(), device(), chain(), &word));
            break;
        case 4: {
            const uint32_t n = in_.ConsumeIntegralInRange<uint32_t>(0, 10);
            std::vector<uint32_t> handles(n, 0xFFFFFFFFu);
            check(OrvNebu_getSlaveHandles(handle(), device(), chain(),
                                          n == 0 ? nullptr : handles.data(), n));
            break;
        }
        case 5: {
            HostMap m(map(true));
            check(OrvNebu_getSlaveInfo(handle(), ref(), &m.handle));
            break;
        }
        case 6: {
            HostMap m(map(false));
            check(OrvNebu_getRegisters(handle(), ref(), &m.handle));
            break;
        }
        case 7: {
            HostMap m(map(true));
            check(OrvNebu_setRegisters(handle(), ref(), &m.handle));
            break;
        }
        case 8: {
            HostMap m(map(false));
            check(OrvNebu_getParameters(handle(), ref(), &m.handle));
            break;
        }
        case 9: {
            HostMap m(map(true));
            check(OrvNebu_setParameters(handle(), ref(), &m.handle));
            break;
        }
        case 10: {
            HostMap m(map(in_.ConsumeBool()));
            std::vector<std::string> choices;
            ORV_STRINGLIST_HANDLE list = &choices;
            check(OrvNebu_getParameterChoices(handle(), ref(), &m.handle, &list));
            break;
        }
        case 11: {
            const uint32_t size = in_.ConsumeIntegralInRange<uint32_t>(0, 40);
            std::vector<char> data(size * 4u + 1u, 'X');
            if (check(OrvNebu_read(handle(), ref(), address(), size, data.data()))) {
                NEBU_FUZZ_CHECK(data[size * 4u] == '\0');
                for (uint32_t i = 0; i < size * 4u; ++i) {
                    NEBU_FUZZ_CHECK(std::isxdigit(static_cast<unsigned char>(data[i])));
                }
            }
            break;
        }
        case 12: {
            const uint32_t size = in_.ConsumeIntegralInRange<uint32_t>(0, 40);
            std::string text = in_.ConsumeBool() ? std::string(size * 4u, 'A')
                                                 : in_.ConsumeRandomLengthString(size * 4u + 2u);
            check(OrvNebu_write(handle(), ref(), address(), size, text.c_str()));
            break;
        }
        case 13: {
            const uint32_t n = in_.ConsumeIntegralInRange<uint32_t>(0, 12);
            std::vector<uint32_t> errors(n, 0xFFFFFFFFu);
            check(OrvNebu_getBusErrorStatus(handle(), device(), chain(),
                                            n == 0 ? nullptr : errors.data(), n));
            break;
        }
        case 14:
            check(OrvNebu_clearBusErrorStatus(handle(), device(), chain()));
            break;
        case 15:
            check(OrvNebu_resetBus(handle(), device(), chain()));
            break;
        case 16:
            check(OrvNebu_testSlaveInterface(handle(), ref(), &word));
            break;
        case 17:
            check(OrvNebu_resetSlave(handle(), ref()));
            break;
        case 18:
            check(OrvNebu_disableSlave(handle(), ref()));
            break;
        case 19:
            check(OrvNebu_enableSlave(handle(), ref()));
            break;
        case 20: {
            uint32_t buffer = 0;
            check(OrvNebu_singleSlaveRead(handle(), ref(), address(), &buffer, status(word)));
            break;
        }
        case 21:
            check(OrvNebu_singleSlaveWrite(handle(), ref(), address(),
                                           in_.ConsumeIntegral<uint32_t>(), status(word)));
            break;
        case 22:
            check(OrvNebu_singleSlaveReadModifyWrite(
                handle(), ref(), address(), in_.ConsumeIntegral<uint32_t>(),
                in_.ConsumeIntegral<uint32_t>(), status(word)));
            break;
        case 23: {
            uint32_t rd = 0;
            check(OrvNebu_singleSlaveWriteAndInspect(
                handle(), ref(), address(), in_.ConsumeIntegral<uint32_t>(), &rd, status(word)));
            break;
        }
        case 24: {
            const uint32_t n = in_.ConsumeIntegralInRange<uint32_t>(0, 64);
            const uint32_t incr = small(1);
            std::vector<uint32_t> buffer(n, 0);
            check(OrvNebu_burstSlaveRead(handle(), ref(), address(), incr,
                                         n == 0 ? nullptr : buffer.data(), n, status(word)));
            break;
        }
        case 25: {
            const uint32_t n = in_.ConsumeIntegralInRange<uint32_t>(0, 64);
            const uint32_t incr = small(1);
            std::vector<uint32_t> buffer(n);
            for (auto& w : buffer) w = in_.ConsumeIntegral<uint32_t>();
            check(OrvNebu_burstSlaveWrite(handle(), ref(), address(), incr,
                                          n == 0 ? nullptr : buffer.data(), n, status(word)));
            break;
        }
        case 26:
            check(OrvNebu_broadcastSingleWrite(handle(), device(), chain(), address(),
                                               in_.ConsumeIntegral<uint32_t>(), status(word)));
            break;
        default:
            // The host ends a session between calls: the plug-in drops its objects.
            OrvSim::endSession(handle());
            break;
    }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    using namespace nebufuzz;
    FuzzedDataProvider in(data, size);
    HostRun run(BOARD, demoDataDir());
    Sequence sequence(in, run);
    for (int n = 0; n < 32 && in.remaining_bytes() > 0; ++n) sequence.step();
    return 0;
}
