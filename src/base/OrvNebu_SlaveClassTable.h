// The slave classes the library builds and which slave type and driver version builds which:
// the factory's creation records as data, and what each transceiver class adds (its computed
// parameters, the registers they read and write, the choice parameters they work through), so
// that the factory, the transceiver classes and the file tools share one table.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

namespace OrvRT {

class OrvNebu_SlaveClassTable {
public:
    enum SlaveClass : uint32_t {
        DEFAULT_SLAVE,
        VANDU_M3QRC,
        VANDU_R2QRA,
        VANDU_R3QRA,
        VANDU_R3QRB,
        SLAVE_CLASS_COUNT
    };

    struct Record {
        int32_t slaveType;
        int32_t minDriverVersion;
        int32_t maxDriverVersion;
        SlaveClass slaveClass;
    };

    // One row of a clock-frequency action: the output parameter, its counter and window
    // registers.
    struct ClockCounter {
        const char* paramName;
        const char* countRegName;
        const char* tuneRegName;
    };

    // One computed-parameter action of a class, as it is registered.
    struct ComputedAction {
        std::string className;
        std::vector<std::string> parameters;        // the names it answers
        std::vector<std::string> registers;         // registers it reads or writes
        std::vector<std::string> choiceParameters;  // parameter-file parameters it works through
    };

    struct ClassInfo {
        SlaveClass slaveClass;
        const char* className;
        const char* family;  // "M3Qrc" and so on; empty for the default slave
        // In priority order from START_PRIORITY on; none for the default slave.
        std::vector<ComputedAction> actions;

        bool isTransceiver() const { return !actions.empty(); }
    };

    // Computed actions of the transceiver classes get this priority and the next ones.
    static constexpr uint32_t START_PRIORITY = 5000;

    // The 14 creation records, sorted by slave type.
    static const std::vector<Record>& records();
    // The class of the first record past the type, or of the type with a maximum version
    // reaching the version, when that record covers both; the default slave otherwise.
    static SlaveClass find(int32_t slaveType, int32_t driverVersion);
    static const ClassInfo& info(SlaveClass slaveClass);

    // The rows of each family's clock-frequency action.
    static const ClockCounter M3QRC_CLOCKS[];
    static constexpr size_t M3QRC_CLOCK_COUNT = 12;
    static const ClockCounter R2QRA_CLOCKS[];
    static constexpr size_t R2QRA_CLOCK_COUNT = 8;
    static const ClockCounter R3QRA_CLOCKS[];
    static constexpr size_t R3QRA_CLOCK_COUNT = 6;
    static const ClockCounter R3QRB_CLOCKS[];
    static constexpr size_t R3QRB_CLOCK_COUNT = 5;
};

}  // namespace OrvRT
