// The model of `nebu doc` from lint's findings and the library's readers: the register handler's
// line parser and register model, the parameter reader's choice actions, the slave factory's
// table, and the transceiver classes' own actions for their computed parameters.
#include "DocReader.h"

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <map>
#include <memory>
#include <set>
#include <stdexcept>
#include <string>
#include <vector>

#include "Lint.h"
#include "base/OrvNebu_CsvText.h"
#include "host/OrvUtil.h"
#include "hostsim/Sim.h"
#include "params/OrvNebu_DefaultParamReader.h"
#include "params/OrvNebu_ParamChoiceAction.h"
#include "registers/OrvNebu_RegisterHandler.h"
#include "slave/OrvNebu_DefaultSlave.h"
#include "slave/OrvNebu_SlaveFactory.h"
#include "transceiver/OrvNebu_VanduM3Qrc.h"
#include "transceiver/OrvNebu_VanduR2Qra.h"
#include "transceiver/OrvNebu_VanduR3Qra.h"
#include "transceiver/OrvNebu_VanduR3Qrb.h"

namespace nebu {
namespace doc {

namespace {

using OrvRT::OrvNebu_RegisterHandler;
using OrvRT::OrvNebu_SlaveFactory;

// The session doc's readers report on; no plug-in session ever has it.
constexpr uint32_t DOC_SESSION = 0x444F4353u;

bool isDirectory(const std::string& path) {
    std::error_code error;
    return std::filesystem::is_directory(path, error);
}

bool canOpen(const std::string& path) { return !isDirectory(path) && std::ifstream(path).good(); }

// A register file read line by line with the handler's own line parser, going on after a line
// the plug-in refuses so that the rest can still be shown.
class RegisterFileReader : public OrvNebu_RegisterHandler {
public:
    explicit RegisterFileReader(const std::string& path)
        : OrvNebu_RegisterHandler(DOC_SESSION, path) {}

    void read(RegisterFile& file) {
        std::ifstream in(regFilename_, std::ios::in);
        std::string line;
        if (!in.is_open() || isDirectory(regFilename_)) return;
        file.opened = true;
        if (!std::getline(in, line)) return;
        uint32_t lineNumber = 1;
        while (std::getline(in, line)) {
            ++lineNumber;
            OrvRT::Orv_Util::stripEndingCR(line);
            const size_t before = slices_.size();
            bool parsed = false;
            try {
                parsed = parseLine(lineNumber, line);
            } catch (const std::exception&) {
            }
            if (!parsed) {
                file.refused = true;
                continue;
            }
            Slice slice;
            slice.line = lineNumber;
            if (slices_.size() == before) {
                slice.included = false;
                OrvRT::OrvNebu_CsvText::splitCommas(line, slice.columns);
                slice.registerName = slice.columns.front();
            } else {
                const RegisterSlice& s = slices_.back();
                slice.registerName = s.registerName;
                slice.address = s.address;
                slice.order = s.order;
                slice.startBit = s.startBit;
                slice.endBit = s.endBit;
                slice.access = std::string(s.readable ? "r" : "") + (s.writable ? "w" : "");
                slice.description = s.text6;
                modelIndex_[&s] = file.slices.size();
            }
            file.slices.push_back(slice);
        }
        addRegisters(file);
    }

    // The bits the plug-in writes for a setting, slice by slice as its register handler does.
    void settingBits(const std::string& name, const std::string& value, Setting& setting) const {
        const Register* reg = findRegister(name);
        if (reg == nullptr) {
            setting.problem = "not a register of " + regFilename_;
            return;
        }
        try {
            toDigits(value, *reg, setting.digits);
        } catch (const std::exception& e) {
            setting.problem = e.what();
            return;
        }
        size_t pos = 0;
        for (auto it = reg->slices.rbegin(); it != reg->slices.rend(); ++it) {
            const RegisterSlice& s = **it;
            uint32_t bits = 0;
            uint32_t keep = 0xFFFFFFFFu;
            s.mergeDigits(setting.digits, pos, bits, keep);
            for (uint32_t b = 0; b < 32; ++b) {
                if (((keep >> b) & 1u) == 0) {
                    setting.bits.push_back(BitWrite{s.address, b, ((bits >> b) & 1u) != 0});
                }
            }
            pos += s.width();
        }
    }

    void getRegisters(uint32_t, const ORV_SLAVE_REF&, OrvRT::Orv_HashMapCStr*) override {
        throw std::logic_error("a register file read for pages moves no registers");
    }
    void setRegisters(uint32_t, const ORV_SLAVE_REF&, OrvRT::Orv_HashMapCStr*) override {
        throw std::logic_error("a register file read for pages moves no registers");
    }

private:
    // Registers in the order of their first line; the register bits of each slice follow
    // the handler's own order of the slices, lowest first.
    void addRegisters(RegisterFile& file) const {
        std::set<std::string> seen;
        for (const Slice& slice : file.slices) {
            const Register* reg = slice.included ? findRegister(slice.registerName) : nullptr;
            if (reg == nullptr || !seen.insert(reg->name).second) continue;
            doc::Register model;
            model.name = reg->name;
            model.width = reg->totalWidth;
            uint32_t low = 0;
            for (const RegisterSlice* s : reg->slices) {
                const size_t index = modelIndex_.at(s);
                file.slices[index].registerLow = low;
                low += s->width();
                model.slices.push_back(index);
            }
            file.registers.push_back(model);
        }
    }

    std::map<const RegisterSlice*, size_t> modelIndex_;
};

// What doc's readers send on its session, for the one case lint does not word: a slave class
// that cannot be made.
class MessageLog {
public:
    MessageLog() {
        OrvSim::setMessageSink([this](uint32_t handle, uint32_t, const std::string& text) {
            if (handle == DOC_SESSION && first_.empty()) first_ = text;
        });
    }
    ~MessageLog() { OrvSim::setMessageSink(nullptr); }
    MessageLog(const MessageLog&) = delete;
    MessageLog& operator=(const MessageLog&) = delete;
    std::string take() {
        std::string text;
        text.swap(first_);
        return text;
    }

private:
    std::string first_;  // the first since take(): the reader's own words
};

const char* const DEFAULT_CLASS = "default slave";

std::string className(OrvNebu_SlaveFactory::CreateFunction create) {
    if (create == &OrvRT::OrvNebu_VanduM3Qrc::create) return "M3Qrc transceiver";
    if (create == &OrvRT::OrvNebu_VanduR2Qra::create) return "R2Qra transceiver";
    if (create == &OrvRT::OrvNebu_VanduR3Qra::create) return "R3Qra transceiver";
    if (create == &OrvRT::OrvNebu_VanduR3Qrb::create) return "R3Qrb transceiver";
    return DEFAULT_CLASS;
}

// The classes the factory makes over a row's driver versions, split where its records start
// and end.
std::vector<ClassSpan> classSpans(int32_t type, int32_t minVersion, int32_t maxVersion) {
    std::vector<ClassSpan> spans;
    if (minVersion > maxVersion) return spans;
    std::set<int64_t> starts{minVersion};
    size_t count = 0;
    const OrvNebu_SlaveFactory::CreationRecord* records = OrvNebu_SlaveFactory::records(count);
    for (size_t i = 0; i < count; ++i) {
        if (records[i].slaveType != type) continue;
        for (int64_t edge :
             {int64_t{records[i].minDriverVersion}, int64_t{records[i].maxDriverVersion} + 1}) {
            if (edge > minVersion && edge <= maxVersion) starts.insert(edge);
        }
    }
    for (auto it = starts.begin(); it != starts.end(); ++it) {
        const auto next = std::next(it);
        const int32_t low = static_cast<int32_t>(*it);
        const int32_t high = next == starts.end() ? maxVersion : static_cast<int32_t>(*next - 1);
        const std::string name = className(OrvNebu_SlaveFactory::findCreateFunction(type, low));
        if (!spans.empty() && spans.back().className == name) {
            spans.back().maxVersion = high;
        } else {
            spans.push_back(ClassSpan{low, high, name});
        }
    }
    return spans;
}

// The computed parameters a class adds: an object of it made from the files, asked for its
// actions the way its initialisation adds them.
void listComputed(const DirectoryRow& row, int32_t version, const std::string& registerPath,
                  const std::string& parameterPath, MessageLog& log, ClassUse& use) {
    OrvRT::Orv_HashMapCStr info{{"slave_type", std::to_string(row.slaveType)},
                                {"orv_drv_ver", std::to_string(version)}};
    const ORV_CORE_INFO core{{1, static_cast<uint32_t>(row.slaveType), 0, 0, 0}};
    const ORV_SLAVE_REF ref{0, 0, 0};
    log.take();
    std::unique_ptr<OrvRT::OrvNebu_Slave> slave(OrvNebu_SlaveFactory::findCreateFunction(
        row.slaveType, version)(DOC_SESSION, core, ref, info, registerPath, parameterPath));
    auto* defaultSlave = dynamic_cast<OrvRT::OrvNebu_DefaultSlave*>(slave.get());
    if (defaultSlave == nullptr) {
        const std::string why = log.take();
        use.problem = "The plug-in cannot make this slave from its files" +
                      (why.empty() ? std::string(".") : ": " + why);
        return;
    }
    OrvRT::OrvNebu_ActionsMap actions;
    try {
        defaultSlave->addToActionsHashMap(DOC_SESSION, actions);
    } catch (const std::exception& e) {
        use.problem = e.what();
    }
    std::vector<OrvRT::OrvNebu_ParamAction*> distinct;
    for (const auto& entry : actions) {
        if (std::find(distinct.begin(), distinct.end(), entry.second) == distinct.end()) {
            distinct.push_back(entry.second);
        }
    }
    std::sort(distinct.begin(), distinct.end(),
              [](auto* a, auto* b) { return a->getPriority() < b->getPriority(); });
    for (OrvRT::OrvNebu_ParamAction* action : distinct) {
        ComputedParameter computed;
        computed.names = *action->getParamNames();
        OrvRT::Orv_HashMapCStr registers;
        action->getRegsToRead(registers);
        for (const auto& entry : registers) computed.registers.push_back(entry.first);
        std::sort(computed.registers.begin(), computed.registers.end());
        use.computed.push_back(computed);
    }
}

void readParameters(ParameterFile& file, const RegisterFileReader* registers) {
    OrvRT::OrvNebu_ActionsMap actions;
    try {
        OrvRT::OrvNebu_DefaultParamReader::addToHashMap(DOC_SESSION, file.path, actions);
    } catch (const std::exception&) {
        return;
    }
    file.read = true;
    std::vector<OrvRT::OrvNebu_ParamChoiceAction*> choiceActions;
    for (const auto& entry : actions) {
        auto* action = dynamic_cast<OrvRT::OrvNebu_ParamChoiceAction*>(entry.second);
        if (action != nullptr) choiceActions.push_back(action);
    }
    std::sort(choiceActions.begin(), choiceActions.end(),
              [](auto* a, auto* b) { return a->getPriority() < b->getPriority(); });
    for (OrvRT::OrvNebu_ParamChoiceAction* action : choiceActions) {
        Parameter parameter;
        parameter.name = action->getParamName();
        // Each row adds one choice, so choice i sits i rows below the parameter's first.
        const uint32_t firstLine =
            action->getPriority() - OrvRT::OrvNebu_ParamChoiceAction::START_PRIORITY;
        for (const OrvRT::OrvNebu_ParamChoice& c : action->getChoiceList()) {
            Choice choice;
            choice.line = firstLine + static_cast<uint32_t>(parameter.choices.size());
            choice.name = c.getChoiceName();
            for (const auto& regValue : c.getRegValueList()) {
                Setting setting;
                setting.registerName = regValue.first;
                if (registers != nullptr) {
                    registers->settingBits(regValue.first, regValue.second, setting);
                } else {
                    setting.digits = regValue.second;
                    setting.problem = "no register file to place it";
                }
                choice.settings.push_back(setting);
            }
            parameter.choices.push_back(choice);
        }
        file.parameters.push_back(parameter);
    }
}

class SiteReader {
public:
    explicit SiteReader(const std::string& dataDir) { site_.dataDir = dataDir; }

    Site read() {
        site_.directoryPath = site_.dataDir + OrvNebu_SlaveFactory::DIRECTORY_FILE_NAME;
        const LintResult lint = lintDataDir(site_.dataDir);
        // Lint had its own sink for the readers' messages until now.
        log_ = std::make_unique<MessageLog>();
        for (const LintProblem& p : lint.problems) {
            site_.problems.push_back(Problem{p.file, p.line, p.text});
        }
        for (const LintDirectoryLine& d : lint.directoryLines) {
            DirectoryRow row;
            row.line = d.line;
            row.slaveType = d.slaveType;
            row.minVersion = d.minVersion;
            row.maxVersion = d.maxVersion;
            row.classes = classSpans(d.slaveType, d.minVersion, d.maxVersion);
            row.registerFile = d.registers;
            row.parameterFile = d.parameters;
            row.registerIndex = registerFile(d.registers);
            row.parameterIndex = parameterFile(d.parameters);
            site_.rows.push_back(row);
        }
        for (size_t i = 0; i < site_.parameterFiles.size(); ++i) fillParameters(i);
        // The parameter reader keeps doc's files cached under its session until it ends.
        OrvSim::endSession(DOC_SESSION);
        return site_;
    }

private:
    int registerFile(const std::string& name) {
        if (name.empty()) return -1;
        auto known = registerIndex_.find(name);
        if (known != registerIndex_.end()) return known->second;
        RegisterFile file;
        file.name = name;
        file.path = site_.dataDir + name;
        auto reader = std::make_unique<RegisterFileReader>(file.path);
        reader->read(file);
        int index = -1;
        if (file.opened) {
            index = static_cast<int>(site_.registerFiles.size());
            site_.registerFiles.push_back(file);
            readers_.push_back(std::move(reader));
        }
        return registerIndex_[name] = index;
    }

    int parameterFile(const std::string& name) {
        if (name.empty()) return -1;
        auto known = parameterIndex_.find(name);
        if (known != parameterIndex_.end()) return known->second;
        ParameterFile file;
        file.name = name;
        file.path = site_.dataDir + name;
        int index = -1;
        if (canOpen(file.path)) {
            index = static_cast<int>(site_.parameterFiles.size());
            site_.parameterFiles.push_back(file);
        }
        return parameterIndex_[name] = index;
    }

    void fillParameters(size_t index) {
        ParameterFile& file = site_.parameterFiles[index];
        std::map<std::string, size_t> uses;
        for (const DirectoryRow& row : site_.rows) {
            if (row.parameterIndex != static_cast<int>(index)) continue;
            if (file.registerFile < 0) file.registerFile = row.registerIndex;
            for (const ClassSpan& span : row.classes) {
                if (span.className == DEFAULT_CLASS) continue;
                auto it = uses.find(span.className);
                if (it == uses.end()) {
                    it = uses.emplace(span.className, file.classes.size()).first;
                    file.classes.push_back(ClassUse{span.className, {}, {}, {}});
                    if (row.registerIndex >= 0) {
                        listComputed(row, span.minVersion,
                                     site_.registerFiles[row.registerIndex].path, file.path, *log_,
                                     file.classes.back());
                    } else {
                        file.classes.back().problem = "The row's register file cannot be read.";
                    }
                }
                file.classes[it->second].slaveTypes.push_back(row.slaveType);
            }
        }
        readParameters(file, file.registerFile >= 0 ? readers_[file.registerFile].get() : nullptr);
    }

    Site site_;
    std::unique_ptr<MessageLog> log_;
    std::map<std::string, int> registerIndex_;
    std::map<std::string, int> parameterIndex_;
    std::vector<std::unique_ptr<RegisterFileReader>> readers_;  // by register file index
};

}  // namespace

Site readSite(const std::string& dataDir) { return SiteReader(dataDir).read(); }

}  // namespace doc
}  // namespace nebu
