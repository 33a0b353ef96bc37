// Cable-time estimate of the console's stats command and the parsing of its two figures.
#include "CableModel.h"

#include <cctype>
#include <cmath>
#include <cstdio>
#include <cstdlib>

#include "UsageError.h"

namespace nebu {

std::string cableMicroseconds(const OrvSim::JtagStats& stats, const CableModel& cable) {
    // long double keeps 64-bit counters exact; the sum of two of them may pass 2^64.
    const long double bits =
        static_cast<long double>(stats.writeBits) + static_cast<long double>(stats.readBits);
    const long double us =
        bits / static_cast<long double>(cable.tckMhz) +
        static_cast<long double>(stats.roundTrips) * static_cast<long double>(cable.roundTripUs);
    // %.0Lf rounds halves to even; the estimate rounds them up.
    const long double rounded = std::floor(us + 0.5L);
    const int length = std::snprintf(nullptr, 0, "%.0Lf", rounded);
    if (length <= 0) return "0";
    std::string text(static_cast<size_t>(length) + 1, '\0');
    std::snprintf(&text[0], text.size(), "%.0Lf", rounded);
    text.resize(static_cast<size_t>(length));
    return text;
}

double parseCableFigure(const std::string& word, const std::string& option, bool zeroAllowed) {
    const std::string bad = "bad number '" + word + "' for " + option;
    // strtod would also take blanks, hexadecimal, "inf" and "nan": a figure is plain decimal.
    for (char c : word) {
        if (!(std::isdigit(static_cast<unsigned char>(c)) || c == '.' || c == 'e' || c == 'E' ||
              c == '+' || c == '-')) {
            throw UsageError(bad);
        }
    }
    // No sign: a negative figure is as wrong as text.
    if (word.empty() || !(std::isdigit(static_cast<unsigned char>(word[0])) || word[0] == '.')) {
        throw UsageError(bad);
    }
    char* end = nullptr;
    const double value = std::strtod(word.c_str(), &end);
    if (end != word.c_str() + word.size() || !std::isfinite(value)) throw UsageError(bad);
    if (value < 0.0 || (value == 0.0 && !zeroAllowed)) {
        throw UsageError(option + " must be " + (zeroAllowed ? "0 or more" : "above 0") + ", not " +
                         word);
    }
    return value;
}

}  // namespace nebu
