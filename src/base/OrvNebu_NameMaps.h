// Name-value maps the plug-in makes for its own use.
#pragma once

#include <cstddef>

namespace OrvRT {

// Every such map starts with this many buckets.
constexpr std::size_t ORVNEBU_MAP_BUCKETS = 100;

}  // namespace OrvRT
