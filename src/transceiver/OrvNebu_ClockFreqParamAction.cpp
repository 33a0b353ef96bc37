// Measured clock frequencies of the clocks of an R2Qra dual, in whole numbers.
#include "transceiver/OrvNebu_ClockFreqParamAction.h"

#include <cstdint>
#include <stdexcept>
#include <string>

#include "transceiver/OrvNebu_XcvrNumber.h"

namespace OrvRT {

namespace {
std::logic_error outOfRange(const OrvNebu_CounterFreqParamAction::Param2Reg& row) {
    return std::logic_error(std::string("Cannot calculate ") + row.paramName +
                            ", since the result does not fit in 64 bits.");
}
}  // namespace

OrvNebu_ClockFreqParamAction::OrvNebu_ClockFreqParamAction(OrvNebu_DefaultSlave* slave,
                                                           uint32_t priority)
    : OrvNebu_CounterFreqParamAction(slave, priority, OUT_PARAM_2_REG, OUT_PARAM_COUNT, true) {}

std::string OrvNebu_ClockFreqParamAction::frequencyText(const Param2Reg& row,
                                                        const std::string& sysclkText,
                                                        uint64_t count, uint64_t tune) {
    // ((count * sysclk) * 4) / tune exactly, sign kept: a product past 64 bits is refused
    // rather than wrapped into a plausible-looking number.
    if (tune == 0) return "0";
    const int64_t sysclk = OrvNebu_XcvrNumber::readLld(sysclkText);
    uint64_t product = 0;
    if (!OrvNebu_XcvrNumber::multiply(count, OrvNebu_XcvrNumber::magnitude(sysclk), product) ||
        !OrvNebu_XcvrNumber::multiply(product, 4u, product)) {
        throw outOfRange(row);
    }
    const uint64_t frequency = product / tune;
    if (frequency > static_cast<uint64_t>(INT64_MAX)) throw outOfRange(row);
    const int64_t value = static_cast<int64_t>(frequency);
    return OrvNebu_XcvrNumber::formatLld(sysclk < 0 ? -value : value);
}

}  // namespace OrvRT
