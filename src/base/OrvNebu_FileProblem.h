// A problem the definition-file readers found: where it is, how the plug-in takes it, and the
// session messages the plug-in sends when it refuses the file because of it.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

namespace OrvRT {

struct OrvNebu_FileProblem {
    // The plug-in reads on: the file is used as written, which may not be what was meant.
    static constexpr uint32_t SEVERITY_WARNING = 0;
    static constexpr uint32_t SEVERITY_ERROR = 256;
    static constexpr uint32_t SEVERITY_MALFORMED_LINE = 512;

    struct Message {
        uint32_t severity;
        std::string text;
    };

    std::string file;
    uint32_t line = 0;    // 1 is the first line; 0 the file as a whole
    uint32_t column = 0;  // 1 is the first column of the line; 0 when not known
    uint32_t severity = SEVERITY_WARNING;
    std::string text;  // the problem, for a person
    // What the plug-in sends, in order, when it refuses the file here; empty for a warning.
    std::vector<Message> messages;

    bool refusesFile() const { return !messages.empty(); }

    // A file the plug-in cannot read at all: it sends the text alone, as an error.
    static OrvNebu_FileProblem unreadable(const std::string& file, const std::string& text);
    // The first problem that refuses its file, or null.
    static const OrvNebu_FileProblem* firstRefusal(const std::vector<OrvNebu_FileProblem>& all);
    // Sends the problem's messages on the session channel.
    static void send(uint32_t handle, const OrvNebu_FileProblem& problem);
};

typedef std::vector<OrvNebu_FileProblem> OrvNebu_FileProblems;

}  // namespace OrvRT
