// Map arguments of console commands.
#include "HostMap.h"

#include "CommandLine.h"

namespace nebu {

void HostMap::addWords(const std::vector<std::string>& words, size_t first) {
    for (size_t i = first; i < words.size(); ++i) {
        auto entry = splitMapWord(words[i]);
        map()[entry.first] = std::move(entry.second);
    }
}

}  // namespace nebu
