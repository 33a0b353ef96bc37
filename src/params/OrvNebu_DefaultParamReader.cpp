// Parameter definition files: reading, the per-session cache and printing.
#include "params/OrvNebu_DefaultParamReader.h"

#include <mutex>
#include <stdexcept>

#include "base/OrvNebu_ParamFile.h"
#include "base/Orv_AbortException.h"

namespace OrvRT {

OrvNebu_DefaultParamReader::SessionEndListener& OrvNebu_DefaultParamReader::sessionListener() {
    // Never destroyed: the host keeps what it is given. Made once even when two sessions read
    // their first files at the same time.
    static SessionEndListener* const listener = new SessionEndListener();
    return *listener;
}

OrvNebu_DefaultParamReader::ParamStorage& OrvNebu_DefaultParamReader::paramStorage() {
    static ParamStorage storage;
    return storage;
}

// Sessions are serialised by their own target locks only, so two sessions may reach the
// process-wide cache at once (one reading a file while another ends).
static std::mutex& storageMutex() {
    static std::mutex mutex;
    return mutex;
}

void OrvNebu_DefaultParamReader::SessionEndListener::sessionNotice(uint32_t handle) {
    (void)handle;
}

void OrvNebu_DefaultParamReader::SessionEndListener::sessionEnded(uint32_t handle) {
    std::lock_guard<std::mutex> guard(storageMutex());
    ParamStorage& storage = paramStorage();
    const std::string lowest;
    auto it = storage.lower_bound(ParamListLess::Key(handle, &lowest));
    while (it != storage.end() && it->handle == handle) it = storage.erase(it);
}

OrvNebu_DefaultParamReader::OrvNebu_DefaultParamReader(uint32_t handle, const std::string& fileName)
    : handle_(handle), fileName_(fileName) {}

size_t OrvNebu_DefaultParamReader::cachedFileCount(uint32_t handle) {
    std::lock_guard<std::mutex> guard(storageMutex());
    size_t count = 0;
    for (const ParamList& entry : paramStorage()) count += entry.handle == handle ? 1 : 0;
    return count;
}

OrvNebu_DefaultParamReader::ChoiceActions* OrvNebu_DefaultParamReader::getFromStorage(
    uint32_t handle, const std::string& fileName) {
    if (fileName.empty()) return nullptr;
    std::lock_guard<std::mutex> guard(storageMutex());
    ParamStorage& storage = paramStorage();
    auto it = storage.find(ParamListLess::Key(handle, &fileName));
    if (it == storage.end()) return nullptr;
    header_ = it->header;
    return it->choiceActions.get();
}

OrvNebu_DefaultParamReader::ChoiceActions* OrvNebu_DefaultParamReader::addToStorage(
    uint32_t handle, const std::string& fileName, std::unique_ptr<ChoiceActions> actions) {
    // Like the bus list, register whenever the cache starts afresh: a host that forgot the
    // listener must hear of it again. Not under the cache's lock, which the host's session
    // end takes while the host may hold its own registry.
    bool empty;
    {
        std::lock_guard<std::mutex> guard(storageMutex());
        empty = paramStorage().empty();
    }
    if (empty) addSessionMessageListener(&sessionListener());
    // An entry already there keeps its actions (slaves may refer to them).
    std::lock_guard<std::mutex> guard(storageMutex());
    return paramStorage()
        .emplace(handle, fileName, std::move(actions), header_)
        .first->choiceActions.get();
}

std::unique_ptr<OrvNebu_DefaultParamReader::ChoiceActions>
OrvNebu_DefaultParamReader::readParamsFromFile() {
    const OrvNebu_ParamFile file(fileName_);
    const OrvNebu_FileProblem* refusal = OrvNebu_FileProblem::firstRefusal(file.problems());
    if (refusal != nullptr) {
        OrvNebu_FileProblem::send(handle_, *refusal);
        if (!file.opened()) throw std::logic_error(refusal->messages.front().text);
        throw Orv_AbortException();
    }
    header_ = file.header();
    std::unique_ptr<ChoiceActions> actions(new ChoiceActions());
    for (const OrvNebu_ParamFile::Parameter& parameter : file.parameters()) {
        actions->push_back(OrvNebu_ParamChoiceAction(parameter.name, parameter.priority));
        OrvNebu_ParamChoiceAction& action = actions->back();
        for (size_t index = 0; index < parameter.choices.size(); ++index) {
            const OrvNebu_ParamFile::Choice& choice = parameter.choices[index];
            action.addChoice(choice.name, static_cast<uint32_t>(index));
            for (const OrvNebu_ParamFile::Setting& setting : choice.settings) {
                action.addChoiceRegSetting(static_cast<uint32_t>(index), setting.width,
                                           setting.registerName, setting.value);
            }
        }
    }
    return actions;
}

OrvNebu_DefaultParamReader::ChoiceActions* OrvNebu_DefaultParamReader::getParams() {
    ChoiceActions* cached = getFromStorage(handle_, fileName_);
    if (cached != nullptr) return cached;
    return addToStorage(handle_, fileName_, readParamsFromFile());
}

void OrvNebu_DefaultParamReader::addToHashMap(uint32_t handle, const std::string& paramFile,
                                              OrvNebu_ActionsMap& actions) {
    OrvNebu_DefaultParamReader reader(handle, paramFile);
    ChoiceActions* choiceActions = reader.getParams();
    for (OrvNebu_ParamChoiceAction& action : *choiceActions) {
        actions.emplace(action.getParamName(), &action);
    }
}

void OrvNebu_DefaultParamReader::readAndPrint(const std::string& paramFile, std::ostream& out) {
    OrvNebu_DefaultParamReader reader(0, paramFile);
    ChoiceActions* choiceActions = reader.getParams();
    out << reader.header_ << std::endl;
    for (OrvNebu_ParamChoiceAction& action : *choiceActions) action.toCSVFile(out);
}

}  // namespace OrvRT
