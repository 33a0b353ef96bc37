// A data directory as a whole: each named file read once, and the checks across files.
#include "base/OrvNebu_DataDirectory.h"

#include <algorithm>
#include <cctype>
#include <cstdint>
#include <fstream>
#include <set>
#include <utility>

#include "base/OrvNebu_CsvText.h"
#include "host/OrvUtil.h"

namespace OrvRT {

namespace {

typedef OrvNebu_SlaveClassTable Classes;

std::string typeText(int32_t type) {
    return "0x" + OrvNebu_CsvText::hexText(static_cast<uint32_t>(type));
}

// Bits needed by a hexadecimal value text (as the reader converts the binary digits).
uint32_t significantBits(const std::string& hexText) {
    size_t i = 0;
    while (i < hexText.size() && hexText[i] == '0') ++i;
    if (i == hexText.size()) return 0;
    const char c = static_cast<char>(std::toupper(static_cast<unsigned char>(hexText[i])));
    const uint32_t digit = static_cast<uint32_t>(c >= 'A' ? c - 'A' + 10 : c - '0') & 0xFu;
    uint32_t top = 0;
    while ((digit >> top) > 1u) ++top;
    const uint64_t bits = static_cast<uint64_t>(hexText.size() - i - 1) * 4u + top + 1u;
    return bits > UINT32_MAX ? UINT32_MAX : static_cast<uint32_t>(bits);
}

bool canRead(const std::string& path) {
    std::ifstream in;
    OrvNebu_CsvText::openFile(in, path);
    std::string line;
    return in.is_open() && (std::getline(in, line) || !in.bad());
}

}  // namespace

OrvNebu_DataDirectory::OrvNebu_DataDirectory(const std::string& dataDir)
    : dataDir_(dataDir),
      directory_(dataDir + OrvNebu_DirectoryFile::FILE_NAME, OrvNebu_DirectoryFile::EVERY_PROBLEM) {
    problems_ = directory_.problems();
    std::set<std::pair<const void*, const void*>> settingsChecked;
    for (const Row& row : directory_.rows()) {
        const OrvNebu_RegisterFile* registers = readRegisterFile(row);
        const OrvNebu_ParamFile* params = readParamFile(row);
        const bool registersClean = registers != nullptr && OrvNebu_FileProblem::firstRefusal(
                                                                registers->problems()) == nullptr;
        const bool paramsClean =
            params != nullptr && OrvNebu_FileProblem::firstRefusal(params->problems()) == nullptr;
        if (registersClean && paramsClean && settingsChecked.emplace(registers, params).second) {
            checkSettings(*registers, *params);
        }
        checkTransceiverNeeds(row, registersClean ? registers : nullptr,
                              paramsClean ? params : nullptr);
    }
}

const OrvNebu_RegisterFile* OrvNebu_DataDirectory::registerFile(const Row& row) const {
    auto it = registerFiles_.find(dataDir_ + row.registers);
    return row.registers.empty() || it == registerFiles_.end() ? nullptr : it->second.get();
}

const OrvNebu_ParamFile* OrvNebu_DataDirectory::paramFile(const Row& row) const {
    auto it = paramFiles_.find(dataDir_ + row.parameters);
    return row.parameters.empty() || it == paramFiles_.end() ? nullptr : it->second.get();
}

const OrvNebu_RegisterFile* OrvNebu_DataDirectory::readRegisterFile(const Row& row) {
    if (row.registers.empty()) return nullptr;
    const std::string path = dataDir_ + row.registers;
    std::unique_ptr<OrvNebu_RegisterFile>& file = registerFiles_[path];
    if (file == nullptr) {
        file.reset(new OrvNebu_RegisterFile(path, OrvNebu_RegisterFile::EVERY_PROBLEM));
        takeProblems(row, row.registers, file->problems(), file->opened());
    }
    return file->opened() ? file.get() : nullptr;
}

const OrvNebu_ParamFile* OrvNebu_DataDirectory::readParamFile(const Row& row) {
    if (row.parameters.empty()) return nullptr;
    const std::string path = dataDir_ + row.parameters;
    std::unique_ptr<OrvNebu_ParamFile>& file = paramFiles_[path];
    if (file == nullptr) {
        file.reset(new OrvNebu_ParamFile(path, OrvNebu_ParamFile::EVERY_PROBLEM));
        takeProblems(row, row.parameters, file->problems(), file->opened());
    }
    return file->opened() ? file.get() : nullptr;
}

void OrvNebu_DataDirectory::takeProblems(const Row& row, const std::string& name,
                                         const OrvNebu_FileProblems& own, bool opened) {
    if (opened) {
        problems_.insert(problems_.end(), own.begin(), own.end());
        return;
    }
    // The plug-in meets the file when it builds a slave of the row.
    for (OrvNebu_FileProblem problem : own) {
        problem.text += blankHint(name);
        problem.file = directory_.path();
        problem.line = row.line;
        problems_.push_back(std::move(problem));
    }
}

// Directory values are used as they stand; blanks around a name are a common slip.
std::string OrvNebu_DataDirectory::blankHint(const std::string& name) const {
    const std::string trimmed = Orv_Util::trimWhitespace(name);
    if (trimmed == name || trimmed.empty() || !canRead(dataDir_ + trimmed)) return "";
    return " (blanks around the name are part of it)";
}

void OrvNebu_DataDirectory::checkSettings(const OrvNebu_RegisterFile& registers,
                                          const OrvNebu_ParamFile& params) {
    for (const OrvNebu_ParamFile::Parameter& parameter : params.parameters()) {
        for (const OrvNebu_ParamFile::Choice& choice : parameter.choices) {
            const std::string where =
                "parameter " + parameter.name + ", choice " + choice.name + ": ";
            for (const OrvNebu_ParamFile::Setting& setting : choice.settings) {
                const OrvNebu_RegisterFile::Register* reg =
                    registers.findRegister(setting.registerName);
                const uint32_t bits = significantBits(setting.value);
                std::string text;
                if (reg == nullptr) {
                    text = where + "register " + setting.registerName + " is not in " +
                           registers.path();
                } else if (bits > reg->totalWidth) {
                    text = where + "value 0x" + setting.value + " of register " +
                           setting.registerName + " needs " + std::to_string(bits) +
                           " bits, the register has " + std::to_string(reg->totalWidth);
                } else {
                    continue;
                }
                problems_.push_back({params.path(),
                                     choice.line,
                                     setting.column,
                                     OrvNebu_FileProblem::SEVERITY_WARNING,
                                     text,
                                     {}});
            }
        }
    }
}

void OrvNebu_DataDirectory::checkTransceiverNeeds(const Row& row,
                                                  const OrvNebu_RegisterFile* registers,
                                                  const OrvNebu_ParamFile* params) {
    for (Classes::SlaveClass slaveClass : classesOf(row)) {
        const Classes::ClassInfo& info = Classes::info(slaveClass);
        if (!info.isTransceiver()) continue;
        const std::string what =
            "slave type " + typeText(row.slaveType) + " (" + info.family + " transceiver)";
        if (row.parameters.empty()) {
            add(row,
                what +
                    " has no parameter file, so its slaves have none of their computed parameters");
        }
        std::set<std::string> registersSeen, paramsSeen;
        for (const Classes::ComputedAction& action : info.actions) {
            for (const std::string& name : action.registers) {
                if (registers != nullptr && registers->findRegister(name) == nullptr &&
                    registersSeen.insert(name).second) {
                    add(row, what + " needs register " + name + ", which " + registers->path() +
                                 " lacks");
                }
            }
            for (const std::string& name : action.choiceParameters) {
                if (params == nullptr || !paramsSeen.insert(name).second) continue;
                const auto& all = params->parameters();
                if (std::none_of(
                        all.begin(), all.end(),
                        [&](const OrvNebu_ParamFile::Parameter& p) { return p.name == name; })) {
                    add(row,
                        what + " needs parameter " + name + ", which " + params->path() + " lacks");
                }
            }
        }
    }
}

void OrvNebu_DataDirectory::add(const Row& row, const std::string& text) {
    problems_.push_back(
        {directory_.path(), row.line, 0, OrvNebu_FileProblem::SEVERITY_WARNING, text, {}});
}

std::vector<Classes::SlaveClass> OrvNebu_DataDirectory::classesOf(const Row& row) {
    std::vector<Classes::SlaveClass> classes;
    auto addClass = [&classes](Classes::SlaveClass c) {
        if (std::find(classes.begin(), classes.end(), c) == classes.end()) classes.push_back(c);
    };
    // The records are sorted by type and, within a type, by version, and never overlap.
    int64_t next = row.minDriverVersion;
    for (const Classes::Record& record : Classes::records()) {
        if (record.slaveType != row.slaveType || record.maxDriverVersion < next ||
            record.minDriverVersion > row.maxDriverVersion) {
            continue;
        }
        if (record.minDriverVersion > next) addClass(Classes::DEFAULT_SLAVE);
        addClass(record.slaveClass);
        next = static_cast<int64_t>(record.maxDriverVersion) + 1;
    }
    if (next <= row.maxDriverVersion) addClass(Classes::DEFAULT_SLAVE);
    return classes;
}

size_t OrvNebu_DataDirectory::filesRead() const {
    size_t n = 0;
    for (const auto& f : registerFiles_) n += f.second->opened() ? 1 : 0;
    for (const auto& f : paramFiles_) n += f.second->opened() ? 1 : 0;
    return n;
}

}  // namespace OrvRT
