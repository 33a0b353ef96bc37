// The commands of the plug-in's exported functions: arguments in the order of the C
// function, out-parameters made by the console and printed after the return code, also when
// the call failed.
#include <string>
#include <vector>

#include "Console.h"
#include "HostMap.h"
#include "TextFormat.h"
#include "UsageError.h"

namespace nebu {

void Console::cmdInitialize(const Words& args) {
    const ORV_SLAVE_REF ref = slaveRef(args, 0);
    useSession();
    const uint32_t rc = api_.initialize(session_, ref);
    reportRc(rc);
    // A failed initialize may already have removed an older object.
    if (rc == ORVNEBU_OK) {
        initialized_.insert(key(ref));
    } else {
        initialized_.erase(key(ref));
    }
}

void Console::cmdTerminate(const Words& args) {
    const ORV_SLAVE_REF ref = slaveRef(args, 0);
    useSession();
    reportRc(api_.terminate(session_, ref));
    initialized_.erase(key(ref));
}

void Console::cmdGetBusInfo(const Words& args) {
    const uint32_t device = number(args, 0, "D");
    const uint32_t chain = number(args, 1, "C");
    HostMap map;
    useSession();
    reportRc(api_.getBusInfo(session_, device, chain, map.address()));
    printMap(map.map());
}

void Console::cmdGetSlaveCount(const Words& args) {
    const uint32_t device = number(args, 0, "D");
    const uint32_t chain = number(args, 1, "C");
    uint32_t n = 0;
    useSession();
    reportRc(api_.getSlaveCount(session_, device, chain, &n));
    print("count=" + std::to_string(n));
}

void Console::cmdGetSlaveHandles(const Words& args) {
    const uint32_t device = number(args, 0, "D");
    const uint32_t chain = number(args, 1, "C");
    const uint32_t n = count(args, 2, "COUNT");
    std::vector<uint32_t> handles(n, 0xFFFFFFFFu);
    useSession();
    reportRc(api_.getSlaveHandles(session_, device, chain, n != 0 ? handles.data() : nullptr, n));
    print(formatDecimalWords("slaveHandles", handles));
}

void Console::cmdGetSlaveInfo(const Words& args) {
    const ORV_SLAVE_REF ref = slaveRef(args, 0);
    HostMap map;
    map.addWords(args, 3);
    useSession();
    reportRc(api_.getSlaveInfo(session_, ref, map.address()));
    printMap(map.map());
}

void Console::cmdGetRegisters(const Words& args) {
    const ORV_SLAVE_REF ref = slaveRef(args, 0);
    HostMap map;
    map.addWords(args, 3);
    useSession();
    reportRc(api_.getRegisters(session_, ref, map.address()));
    printMap(map.map());
}

void Console::cmdSetRegisters(const Words& args) {
    const ORV_SLAVE_REF ref = slaveRef(args, 0);
    HostMap map;
    map.addWords(args, 3);
    useSession();
    reportRc(api_.setRegisters(session_, ref, map.address()));
}

void Console::cmdGetParameters(const Words& args) {
    const ORV_SLAVE_REF ref = slaveRef(args, 0);
    HostMap map;
    map.addWords(args, 3);
    useSession();
    reportRc(api_.getParameters(session_, ref, map.address()));
    printMap(map.map());
}

void Console::cmdSetParameters(const Words& args) {
    const ORV_SLAVE_REF ref = slaveRef(args, 0);
    HostMap map;
    map.addWords(args, 3);
    useSession();
    reportRc(api_.setParameters(session_, ref, map.address()));
}

void Console::cmdGetParameterChoices(const Words& args) {
    const ORV_SLAVE_REF ref = slaveRef(args, 0);
    HostMap map;
    map.addWords(args, 3);
    std::vector<std::string> choices;
    ORV_STRINGLIST_HANDLE list = &choices;
    useSession();
    reportRc(api_.getParameterChoices(session_, ref, map.address(), &list));
    for (const auto& choice : choices) print("choice=" + escapeText(choice));
}

void Console::cmdRead(const Words& args) {
    const ORV_SLAVE_REF ref = slaveRef(args, 0);
    const uint32_t address = number(args, 3, "ADDRESS");
    const uint32_t size = count(args, 4, "SIZE");
    // 4 digits a word and the terminating zero, plus one zero of our own in case the
    // plug-in leaves the text unterminated.
    std::vector<char> data(static_cast<size_t>(size) * 4 + 2, '\0');
    useSession();
    reportRc(api_.read(session_, ref, address, size, data.data()));
    print("data=" + escapeText(std::string(data.data())));
}

void Console::cmdWrite(const Words& args) {
    const ORV_SLAVE_REF ref = slaveRef(args, 0);
    const uint32_t address = number(args, 3, "ADDRESS");
    const uint32_t size = number(args, 4, "SIZE");
    useSession();
    reportRc(api_.write(session_, ref, address, size, args[5].c_str()));
}

void Console::cmdGetBusErrorStatus(const Words& args) {
    const uint32_t device = number(args, 0, "D");
    const uint32_t chain = number(args, 1, "C");
    const uint32_t len = count(args, 2, "LEN");
    std::vector<uint32_t> status(len, 0xFFFFFFFFu);
    useSession();
    reportRc(
        api_.getBusErrorStatus(session_, device, chain, len != 0 ? status.data() : nullptr, len));
    print(formatDecimalWords("errorStatus", status));
}

void Console::cmdClearBusErrorStatus(const Words& args) {
    const uint32_t device = number(args, 0, "D");
    const uint32_t chain = number(args, 1, "C");
    useSession();
    reportRc(api_.clearBusErrorStatus(session_, device, chain));
}

void Console::cmdResetBus(const Words& args) {
    const uint32_t device = number(args, 0, "D");
    const uint32_t chain = number(args, 1, "C");
    useSession();
    reportRc(api_.resetBus(session_, device, chain));
}

void Console::cmdTestSlaveInterface(const Words& args) {
    const ORV_SLAVE_REF ref = slaveRef(args, 0);
    uint32_t result = 0;
    useSession();
    reportRc(api_.testSlaveInterface(session_, ref, &result));
    print("result=" + std::to_string(result));
}

void Console::cmdResetSlave(const Words& args) {
    const ORV_SLAVE_REF ref = slaveRef(args, 0);
    useSession();
    reportRc(api_.resetSlave(session_, ref));
}

void Console::cmdDisableSlave(const Words& args) {
    const ORV_SLAVE_REF ref = slaveRef(args, 0);
    useSession();
    reportRc(api_.disableSlave(session_, ref));
}

void Console::cmdEnableSlave(const Words& args) {
    const ORV_SLAVE_REF ref = slaveRef(args, 0);
    useSession();
    reportRc(api_.enableSlave(session_, ref));
}

void Console::cmdSingleSlaveRead(const Words& args) {
    const ORV_SLAVE_REF ref = slaveRef(args, 0);
    const uint32_t address = number(args, 3, "ADDRESS");
    uint32_t buffer = 0;
    uint32_t status = 0;
    useSession();
    reportRc(api_.singleSlaveRead(session_, ref, address, &buffer, statusPointer(status)));
    print("buffer=" + formatDataWord(buffer));
    printStatus(status);
}

void Console::cmdSingleSlaveWrite(const Words& args) {
    const ORV_SLAVE_REF ref = slaveRef(args, 0);
    const uint32_t address = number(args, 3, "ADDRESS");
    const uint32_t value = number(args, 4, "VALUE");
    uint32_t status = 0;
    useSession();
    reportRc(api_.singleSlaveWrite(session_, ref, address, value, statusPointer(status)));
    printStatus(status);
}

void Console::cmdSingleSlaveReadModifyWrite(const Words& args) {
    const ORV_SLAVE_REF ref = slaveRef(args, 0);
    const uint32_t address = number(args, 3, "ADDRESS");
    const uint32_t value = number(args, 4, "VALUE");
    const uint32_t mask = number(args, 5, "MASK");
    uint32_t status = 0;
    useSession();
    reportRc(api_.singleSlaveReadModifyWrite(session_, ref, address, value, mask,
                                             statusPointer(status)));
    printStatus(status);
}

void Console::cmdSingleSlaveWriteAndInspect(const Words& args) {
    const ORV_SLAVE_REF ref = slaveRef(args, 0);
    const uint32_t address = number(args, 3, "ADDRESS");
    const uint32_t value = number(args, 4, "VALUE");
    uint32_t rdBuf = 0;
    uint32_t status = 0;
    useSession();
    reportRc(api_.singleSlaveWriteAndInspect(session_, ref, address, value, &rdBuf,
                                             statusPointer(status)));
    print("rdBuf=" + formatDataWord(rdBuf));
    printStatus(status);
}

void Console::cmdBurstSlaveRead(const Words& args) {
    const ORV_SLAVE_REF ref = slaveRef(args, 0);
    const uint32_t address = number(args, 3, "ADDRESS");
    const uint32_t incr = number(args, 4, "INCR");
    const uint32_t n = count(args, 5, "COUNT");
    std::vector<uint32_t> buffer(n, 0xFFFFFFFFu);
    uint32_t status = 0;
    useSession();
    reportRc(api_.burstSlaveRead(session_, ref, address, incr, n != 0 ? buffer.data() : nullptr, n,
                                 statusPointer(status)));
    print(formatDataWords("buffer", buffer));
    printStatus(status);
}

void Console::cmdBurstSlaveWrite(const Words& args) {
    const ORV_SLAVE_REF ref = slaveRef(args, 0);
    const uint32_t address = number(args, 3, "ADDRESS");
    const uint32_t incr = number(args, 4, "INCR");
    checkValueCount(args, 5);
    std::vector<uint32_t> values;
    for (size_t i = 5; i < args.size(); ++i) values.push_back(number(args, i, "VALUE"));
    const auto n = static_cast<uint32_t>(values.size());
    uint32_t status = 0;
    useSession();
    reportRc(api_.burstSlaveWrite(session_, ref, address, incr, n != 0 ? values.data() : nullptr, n,
                                  statusPointer(status)));
    printStatus(status);
}

void Console::cmdBroadcastSingleWrite(const Words& args) {
    const uint32_t device = number(args, 0, "D");
    const uint32_t chain = number(args, 1, "C");
    const uint32_t address = number(args, 2, "ADDRESS");
    const uint32_t value = number(args, 3, "VALUE");
    uint32_t status = 0;
    useSession();
    reportRc(
        api_.broadcastSingleWrite(session_, device, chain, address, value, statusPointer(status)));
    printStatus(status);
}

}  // namespace nebu
