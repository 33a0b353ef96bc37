// Problems of definition files, and how the plug-in reports the one that refuses a file.
#include "base/OrvNebu_FileProblem.h"

#include "host/OrvJtag.h"

namespace OrvRT {

OrvNebu_FileProblem OrvNebu_FileProblem::unreadable(const std::string& file,
                                                    const std::string& text) {
    return {file, 0, 0, SEVERITY_ERROR, text, {{SEVERITY_ERROR, text}}};
}

const OrvNebu_FileProblem* OrvNebu_FileProblem::firstRefusal(
    const std::vector<OrvNebu_FileProblem>& all) {
    for (const OrvNebu_FileProblem& problem : all) {
        if (problem.refusesFile()) return &problem;
    }
    return nullptr;
}

void OrvNebu_FileProblem::send(uint32_t handle, const OrvNebu_FileProblem& problem) {
    for (const Message& message : problem.messages) {
        OrvJtag_session_sendMessage(handle, message.severity, message.text.c_str());
    }
}

}  // namespace OrvRT
