// The model of `nebu doc` from the library's definition-file reader, the one the plug-in and
// lint use, and from the slave factory's own table of classes.
#include "DocReader.h"

#include <algorithm>
#include <cstdint>
#include <exception>
#include <map>
#include <set>
#include <string>
#include <vector>

#include "base/OrvNebu_DataDirectory.h"
#include "host/OrvUtil.h"

namespace nebu {
namespace doc {

namespace {

using OrvRT::OrvNebu_DataDirectory;
using OrvRT::OrvNebu_FileProblem;
using OrvRT::OrvNebu_ParamFile;
using OrvRT::OrvNebu_RegisterFile;
typedef OrvRT::OrvNebu_SlaveClassTable Classes;

bool refuses(const OrvRT::OrvNebu_FileProblems& problems) {
    return OrvNebu_FileProblem::firstRefusal(problems) != nullptr;
}

// Every line the reader parsed, and the registers in the order of their first line; the
// register bits of each slice follow the reader's order of the slices, lowest first.
RegisterFile registerModel(const std::string& name, const OrvNebu_RegisterFile& reader) {
    RegisterFile file;
    file.name = name;
    file.path = reader.path();
    file.refused = refuses(reader.problems());
    std::map<const OrvNebu_RegisterFile::RegisterSlice*, size_t> index;
    for (const OrvNebu_RegisterFile::RegisterSlice& line : reader.lines()) {
        index[&line] = file.slices.size();
        Slice slice;
        static_cast<OrvNebu_RegisterFile::RegisterSlice&>(slice) = line;
        file.slices.push_back(slice);
    }
    std::set<std::string> seen;
    for (size_t i = 0; i < file.slices.size(); ++i) {
        const Slice& first = file.slices[i];
        const OrvNebu_RegisterFile::Register* reg =
            first.included ? reader.findRegister(first.registerName) : nullptr;
        if (reg == nullptr || !seen.insert(reg->name).second) continue;
        Register model;
        model.name = reg->name;
        model.width = reg->totalWidth;
        uint32_t low = 0;
        for (const OrvNebu_RegisterFile::RegisterSlice* s : reg->slices) {
            const size_t at = index.at(s);
            file.slices[at].registerLow = low;
            low += s->width();
            model.slices.push_back(at);
        }
        file.registers.push_back(model);
    }
    return file;
}

// The bits the plug-in writes for a setting: the register's width of the value's low bits,
// slice by slice as its register handler takes them.
void placeSetting(const OrvNebu_RegisterFile* reader, Setting& setting) {
    try {
        OrvRT::Orv_NumberUtil::hexStr2BinStr(setting.value, setting.width, setting.digits);
        const OrvNebu_RegisterFile::Register* reg =
            reader != nullptr ? reader->findRegister(setting.registerName) : nullptr;
        if (reg == nullptr) {
            setting.problem = reader == nullptr ? "no register file to place it"
                                                : "not a register of " + reader->path();
            return;
        }
        OrvRT::Orv_NumberUtil::hexStr2BinStr(setting.value, reg->totalWidth, setting.digits);
        size_t pos = 0;
        for (auto it = reg->slices.rbegin(); it != reg->slices.rend(); ++it) {
            const OrvNebu_RegisterFile::RegisterSlice& s = **it;
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
    } catch (const std::exception& e) {
        setting.problem = e.what();
    }
}

ParameterFile parameterModel(const std::string& name, const OrvNebu_ParamFile& reader,
                             int registerIndex, const OrvNebu_RegisterFile* registers) {
    ParameterFile file;
    file.name = name;
    file.path = reader.path();
    file.refused = refuses(reader.problems());
    file.registerFile = registerIndex;
    for (const OrvNebu_ParamFile::Parameter& p : reader.parameters()) {
        Parameter parameter;
        parameter.name = p.name;
        parameter.line = p.line;
        for (const OrvNebu_ParamFile::Choice& c : p.choices) {
            Choice choice;
            choice.line = c.line;
            choice.name = c.name;
            for (const OrvNebu_ParamFile::Setting& s : c.settings) {
                Setting setting;
                static_cast<OrvNebu_ParamFile::Setting&>(setting) = s;
                placeSetting(registers, setting);
                choice.settings.push_back(setting);
            }
            parameter.choices.push_back(choice);
        }
        file.parameters.push_back(parameter);
    }
    return file;
}

ClassSpan classSpan(Classes::SlaveClass slaveClass, int32_t low, int32_t high) {
    const Classes::ClassInfo& info = Classes::info(slaveClass);
    ClassSpan span;
    span.minVersion = low;
    span.maxVersion = high;
    span.className = *info.family == '\0' ? std::string("default slave")
                                          : std::string(info.family) + " transceiver";
    span.transceiver = info.isTransceiver();
    span.computed = &info.actions;
    return span;
}

// The classes the factory makes over a row's driver versions, split where its records start
// and end.
std::vector<ClassSpan> classSpans(int32_t type, int32_t minVersion, int32_t maxVersion) {
    std::vector<ClassSpan> spans;
    if (minVersion > maxVersion) return spans;
    std::set<int64_t> starts{minVersion};
    for (const Classes::Record& record : Classes::records()) {
        if (record.slaveType != type) continue;
        for (int64_t edge :
             {int64_t{record.minDriverVersion}, int64_t{record.maxDriverVersion} + 1}) {
            if (edge > minVersion && edge <= maxVersion) starts.insert(edge);
        }
    }
    for (auto it = starts.begin(); it != starts.end(); ++it) {
        const auto next = std::next(it);
        const int32_t low = static_cast<int32_t>(*it);
        const int32_t high = next == starts.end() ? maxVersion : static_cast<int32_t>(*next - 1);
        const Classes::SlaveClass slaveClass = Classes::find(type, low);
        if (!spans.empty() && spans.back().computed == &Classes::info(slaveClass).actions) {
            spans.back().maxVersion = high;
        } else {
            spans.push_back(classSpan(slaveClass, low, high));
        }
    }
    return spans;
}

// The transceiver classes of the rows that name the parameter file.
void addClassUses(const std::vector<DirectoryRow>& rows, int index, ParameterFile& file) {
    for (const DirectoryRow& row : rows) {
        if (row.parameterIndex != index) continue;
        for (const ClassSpan& span : row.classes) {
            if (!span.transceiver) continue;
            auto use = std::find_if(file.classes.begin(), file.classes.end(),
                                    [&](const ClassUse& u) { return u.computed == span.computed; });
            if (use == file.classes.end()) {
                file.classes.push_back(ClassUse{span.className, {}, span.computed});
                use = file.classes.end() - 1;
            }
            if (use->slaveTypes.empty() || use->slaveTypes.back() != row.slaveType) {
                use->slaveTypes.push_back(row.slaveType);
            }
        }
    }
}

}  // namespace

Site readSite(const std::string& dataDir) {
    const OrvNebu_DataDirectory data(dataDir);
    Site site;
    site.dataDir = dataDir;
    site.directoryPath = data.directory().path();
    site.problems = data.problems();
    // By file and line; in the order found within a line, as lint prints them.
    std::stable_sort(site.problems.begin(), site.problems.end(),
                     [](const Problem& a, const Problem& b) {
                         return a.file != b.file ? a.file < b.file : a.line < b.line;
                     });
    std::map<const void*, int> indexOf;
    for (const OrvNebu_DataDirectory::Row& r : data.directory().rows()) {
        DirectoryRow row;
        static_cast<OrvNebu_DataDirectory::Row&>(row) = r;
        row.classes = classSpans(r.slaveType, r.minDriverVersion, r.maxDriverVersion);
        // A file that cannot be opened gets no page: its row shows why.
        const OrvNebu_RegisterFile* registers = data.registerFile(r);
        if (registers != nullptr && !registers->opened()) registers = nullptr;
        const OrvNebu_ParamFile* params = data.paramFile(r);
        if (params != nullptr && !params->opened()) params = nullptr;
        if (registers != nullptr) {
            auto known = indexOf.emplace(registers, static_cast<int>(site.registerFiles.size()));
            if (known.second) site.registerFiles.push_back(registerModel(r.registers, *registers));
            row.registerIndex = known.first->second;
        }
        if (params != nullptr) {
            auto known = indexOf.emplace(params, static_cast<int>(site.parameterFiles.size()));
            // Settings are drawn on the register file of the first row naming the file.
            if (known.second) {
                site.parameterFiles.push_back(
                    parameterModel(r.parameters, *params, row.registerIndex, registers));
            }
            row.parameterIndex = known.first->second;
        }
        site.rows.push_back(row);
    }
    for (size_t i = 0; i < site.parameterFiles.size(); ++i) {
        addClassUses(site.rows, static_cast<int>(i), site.parameterFiles[i]);
    }
    return site;
}

}  // namespace doc
}  // namespace nebu
