// Parameter definition files: reading, the per-session cache and printing.
#include "params/OrvNebu_DefaultParamReader.h"

#include <boost/algorithm/string/classification.hpp>
#include <boost/algorithm/string/split.hpp>
#include <cctype>
#include <climits>
#include <fstream>
#include <mutex>
#include <stdexcept>

#include "base/OrvNebu_CsvText.h"
#include "base/Orv_AbortException.h"
#include "host/OrvUtil.h"

namespace OrvRT {

namespace {

constexpr uint32_t SEVERITY_ERROR = 256;
constexpr uint32_t SEVERITY_MALFORMED_LINE = 512;

// A choice index field read like atoi, except that a number beyond the int range saturates
// instead of being undefined; such an index is never in order anyway.
uint32_t readChoiceIndex(const std::string& text) {
    size_t i = 0;
    while (i < text.size() && std::isspace(static_cast<unsigned char>(text[i]))) ++i;
    bool negative = false;
    if (i < text.size() && (text[i] == '+' || text[i] == '-')) negative = text[i++] == '-';
    int64_t value = 0;
    for (; i < text.size() && text[i] >= '0' && text[i] <= '9'; ++i) {
        value = value * 10 + (text[i] - '0');
        if (value > static_cast<int64_t>(INT_MAX) + 1) value = static_cast<int64_t>(INT_MAX) + 1;
    }
    if (negative) value = -value;
    if (value > INT_MAX) value = INT_MAX;
    return static_cast<uint32_t>(static_cast<int32_t>(value));
}

uint32_t priorityOf(uint32_t lineNumber) {
    const uint32_t start = OrvNebu_ParamChoiceAction::START_PRIORITY;
    return lineNumber > UINT32_MAX - start ? UINT32_MAX : start + lineNumber;
}

// Whether a length does not fit the 32-bit register width; only possible where size_t is wider
// than 32 bits (the host itself is a 32-bit process).
template <typename Size>
bool exceedsUint32(Size length) {
    if constexpr (sizeof(Size) > sizeof(uint32_t)) {
        return static_cast<uint64_t>(length) > UINT32_MAX;
    } else {
        static_cast<void>(length);
        return false;
    }
}

}  // namespace

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

bool OrvNebu_DefaultParamReader::parseLine(ChoiceActions* actions, uint32_t lineNumber,
                                           const std::string& line) {
    std::vector<std::string> fields;
    boost::algorithm::split(fields, line, boost::algorithm::is_any_of(","),
                            boost::algorithm::token_compress_off);
    Orv_Util::unQuote(fields);
    if (fields.size() < 4) return false;

    const std::string& paramName = fields[0];
    const std::string currentName =
        actions->empty() ? std::string() : actions->back().getParamName();
    if (paramName != currentName) {
        actions->push_back(OrvNebu_ParamChoiceAction(paramName, priorityOf(lineNumber)));
    } else if (actions->empty()) {
        // An empty name on the first row: there is no parameter to take the choice.
        return false;
    }
    OrvNebu_ParamChoiceAction& action = actions->back();
    const uint32_t index = readChoiceIndex(fields[1]);
    action.addChoice(fields[2], index);

    std::string value;
    for (size_t i = 3; i < fields.size(); ++i) {
        const std::string& setting = fields[i];
        if (setting.empty()) continue;
        const size_t eq = setting.find('=');
        if (setting.size() < 3 || eq == std::string::npos) return false;
        const std::string bits = setting.substr(eq + 1);
        if (exceedsUint32(bits.size())) return false;
        Orv_NumberUtil::binStr2HexStr(bits, value);
        action.addChoiceRegSetting(index, static_cast<uint32_t>(bits.size()), setting.substr(0, eq),
                                   value);
    }
    return true;
}

std::unique_ptr<OrvNebu_DefaultParamReader::ChoiceActions>
OrvNebu_DefaultParamReader::readParamsFromFile() {
    std::unique_ptr<ChoiceActions> actions(new ChoiceActions());
    std::ifstream in;
    OrvNebu_CsvText::openFile(in, fileName_);
    if (!in) {
        const std::string text = "Unable to open OrvNebu parameter file: " + fileName_;
        OrvJtag_session_sendMessage(handle_, SEVERITY_ERROR, text.c_str());
        throw std::logic_error(text);
    }
    header_.clear();
    std::getline(in, header_);
    Orv_Util::stripEndingCR(header_);

    uint32_t lineNumber = 1;
    std::string line;
    while (std::getline(in, line)) {
        if (lineNumber < UINT32_MAX) ++lineNumber;
        Orv_Util::stripEndingCR(line);
        bool taken = false;
        try {
            taken = parseLine(actions.get(), lineNumber, line);
        } catch (const std::exception& e) {
            OrvJtag_session_sendMessage(handle_, SEVERITY_ERROR, e.what());
        }
        if (!taken) {
            const std::string text = "Unable to parse file: " + fileName_ +
                                     " line:" + std::to_string(lineNumber) + ": " + line;
            OrvJtag_session_sendMessage(handle_, SEVERITY_MALFORMED_LINE, text.c_str());
            throw Orv_AbortException();
        }
    }
    // A path that opens but cannot be read (a directory) must not pass for an empty file.
    if (in.bad()) {
        const std::string text = "Unable to open OrvNebu parameter file: " + fileName_;
        OrvJtag_session_sendMessage(handle_, SEVERITY_ERROR, text.c_str());
        throw std::logic_error(text);
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
