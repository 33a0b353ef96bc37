// Register handlers: the file read and its refusal reported, names checked, the handler caches.
#include "registers/OrvNebu_RegisterHandler.h"

#include <stdexcept>

#include "base/Orv_AbortException.h"
#include "host/OrvJtag.h"
#include "host/OrvUtil.h"

namespace OrvRT {

OrvNebu_RegisterHandler::OrvNebu_RegisterHandler(uint32_t handle, const std::string& regFilename)
    : regFilename_(regFilename) {
    (void)handle;
}

OrvNebu_RegisterHandler::~OrvNebu_RegisterHandler() = default;

void OrvNebu_RegisterHandler::readRegistersFromFile(uint32_t handle) {
    file_.reset(new OrvNebu_RegisterFile(getRegFilename()));
    const OrvNebu_FileProblem* refusal = OrvNebu_FileProblem::firstRefusal(file_->problems());
    if (refusal == nullptr) return;
    OrvNebu_FileProblem::send(handle, *refusal);
    if (!file_->opened()) throw std::logic_error(refusal->messages.front().text);
    throw Orv_AbortException();
}

void OrvNebu_RegisterHandler::print(uint32_t handle, std::ostream& out) const {
    (void)handle;
    file_->print(out);
}

void OrvNebu_RegisterHandler::checkRegisterNames(uint32_t handle,
                                                 const Orv_HashMapCStr& registers) const {
    for (const auto& entry : registers) {
        if (findRegister(entry.first) == nullptr) {
            std::string text = "Invalid Register Name: " + entry.first + "\n";
            OrvJtag_session_sendMessage(handle, SEVERITY_ERROR, text.c_str());
            throw Orv_AbortException();
        }
    }
}

void OrvNebu_RegisterHandler::toDigits(const std::string& value, const Register& reg,
                                       std::string& digits) {
    Orv_NumberUtil::hexStr2BinStr(value, reg.totalWidth, digits);
    if (digits.size() != reg.totalWidth) {
        throw std::logic_error("Invalid value for register " + reg.name + ": " + value);
    }
}

OrvNebu_RegisterHandler* OrvNebu_RegisterHandler::findInCache(Cache& cache,
                                                              const std::string& regFilename) {
    if (regFilename.empty()) return nullptr;
    std::lock_guard<std::mutex> guard(cache.mutex);
    auto it = cache.storage.find(regFilename);
    return it == cache.storage.end() ? nullptr : it->second;
}

void OrvNebu_RegisterHandler::releaseToCache(Cache& cache) {
    std::lock_guard<std::mutex> guard(cache.mutex);
    if (cache.handlerCount != 0) {
        uint32_t before = cache.handlerCount--;
        if (before != 1) return;
    }
    for (auto& entry : cache.storage) delete entry.second;
    cache.storage.clear();
}

}  // namespace OrvRT
