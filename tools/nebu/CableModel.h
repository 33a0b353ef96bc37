// The console's estimate of how long a session's JTAG traffic would take on a real cable.
#pragma once

#include <string>

#include "hostsim/Sim.h"

namespace nebu {

struct CableModel {
    double tckMhz = 30.0;        // test clock, MHz: bits shifted per microsecond
    double roundTripUs = 125.0;  // what one wait for the cable costs, microseconds
};

// (writeBits + readBits) / TCK + roundTrips x round trip, in microseconds, rounded to the
// nearest integer and given as decimal text (any size: the counters are 64-bit).
std::string cableMicroseconds(const OrvSim::JtagStats& stats, const CableModel& cable);

// Parses the value of --tck-mhz (finite, above 0) or --round-trip-us (finite, 0 or more):
// a decimal number, fraction and exponent allowed. Throws UsageError naming the option.
double parseCableFigure(const std::string& word, const std::string& option, bool zeroAllowed);

}  // namespace nebu
