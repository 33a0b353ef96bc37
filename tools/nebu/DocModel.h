// What `nebu doc` draws: a data directory as the library's definition-file reader gives it
// (OrvNebu_DataDirectory), with what the pages need on top: the register bits of each slice, the
// bits each choice writes, the classes over a row's versions. Filled by DocReader, turned into
// pages by DocSite. Nothing here reads files.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "base/OrvNebu_DirectoryFile.h"
#include "base/OrvNebu_FileProblem.h"
#include "base/OrvNebu_ParamFile.h"
#include "base/OrvNebu_RegisterFile.h"
#include "base/OrvNebu_SlaveClassTable.h"

namespace nebu {
namespace doc {

typedef OrvRT::OrvNebu_FileProblem Problem;

// One line of a register file after the header that the reader could parse, as it holds it.
struct Slice : OrvRT::OrvNebu_RegisterFile::RegisterSlice {
    uint32_t registerLow = 0;  // register bit carried by startBit (included lines)

    std::string access() const { return std::string(readable ? "r" : "") + (writable ? "w" : ""); }
};

struct Register {
    std::string name;
    uint32_t width = 0;
    std::vector<size_t> slices;  // into RegisterFile::slices, lowest order first
};

struct RegisterFile {
    std::string name;                 // as the directory file gives it
    std::string path;                 // as problems name it
    std::string page;                 // file name of its page
    bool refused = false;             // a line the plug-in refuses, so it refuses the whole file
    std::vector<Slice> slices;        // lines the reader could parse, in file order
    std::vector<Register> registers;  // in order of first line
};

// A bit a setting writes.
struct BitWrite {
    uint32_t address = 0;
    uint32_t bit = 0;
    bool one = false;
};

// A register value a choice writes, and the bits the plug-in writes for it.
struct Setting : OrvRT::OrvNebu_ParamFile::Setting {
    std::string digits;  // the register's value, most significant first, as the plug-in takes it
    std::vector<BitWrite> bits;
    std::string problem;  // why it cannot be shown on the register's bits
};

struct Choice {
    uint32_t line = 0;
    std::string name;
    std::vector<Setting> settings;
};

struct Parameter {
    std::string name;
    uint32_t line = 0;
    std::vector<Choice> choices;  // in index order
};

// A transceiver class the factory makes for some directory rows naming the parameter file,
// and the parameters it computes instead of taking them from the file.
struct ClassUse {
    std::string className;
    std::vector<int32_t> slaveTypes;
    const std::vector<OrvRT::OrvNebu_SlaveClassTable::ComputedAction>* computed = nullptr;
};

struct ParameterFile {
    std::string name;
    std::string path;
    std::string page;
    bool refused = false;               // a row the plug-in refuses, so it refuses the whole file
    int registerFile = -1;              // index of the register file its settings are drawn on
    std::vector<Parameter> parameters;  // those the reader could read, in file order
    std::vector<ClassUse> classes;      // transceiver classes only
};

// Driver versions minVersion to maxVersion of a row get an object of this class.
struct ClassSpan {
    int32_t minVersion = 0;
    int32_t maxVersion = 0;
    std::string className;
    bool transceiver = false;
    const std::vector<OrvRT::OrvNebu_SlaveClassTable::ComputedAction>* computed = nullptr;
};

struct DirectoryRow : OrvRT::OrvNebu_DirectoryFile::Row {
    std::vector<ClassSpan> classes;
    int registerIndex = -1;  // into Site::registerFiles, -1 when not opened or not given
    int parameterIndex = -1;
};

struct Site {
    std::string dataDir;        // ends in a separator
    std::string directoryPath;  // as problems name it
    std::vector<DirectoryRow> rows;
    std::vector<RegisterFile> registerFiles;
    std::vector<ParameterFile> parameterFiles;
    std::vector<Problem> problems;  // every file's, sorted by file and line
};

}  // namespace doc
}  // namespace nebu
