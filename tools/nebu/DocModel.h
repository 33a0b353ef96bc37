// What `nebu doc` draws: a data directory as plain records, filled by DocReader from the
// library's definition-file readers and turned into pages by DocSite. Nothing here reads files.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

namespace nebu {
namespace doc {

struct Problem {
    std::string file;   // as lint names it: data directory + the name the directory file gives
    uint32_t line = 0;  // 0: the file as a whole
    std::string text;
};

// One line of a register file after the header.
struct Slice {
    uint32_t line = 0;
    std::string registerName;
    bool included = true;
    // Included lines: as the plug-in holds them.
    uint32_t address = 0;
    uint32_t order = 0;
    uint32_t startBit = 0;     // word bit of the slice's least significant bit
    uint32_t endBit = 0;       // word bit of the slice's most significant bit
    uint32_t registerLow = 0;  // register bit carried by startBit
    std::string access;        // "r", "w", "rw" or ""
    std::string description;
    // Excluded lines: the columns as they stand.
    std::vector<std::string> columns;

    uint32_t low() const { return startBit < endBit ? startBit : endBit; }
    uint32_t high() const { return startBit < endBit ? endBit : startBit; }
    uint32_t width() const { return high() - low() + 1; }
    bool reversed() const { return startBit > endBit; }
};

struct Register {
    std::string name;
    uint32_t width = 0;
    std::vector<size_t> slices;  // into RegisterFile::slices, lowest order first
};

struct RegisterFile {
    std::string name;  // as the directory file gives it
    std::string path;  // as problems name it
    std::string page;  // file name of its page
    bool opened = false;
    bool refused = false;             // a line the plug-in refuses, so it refuses the whole file
    std::vector<Slice> slices;        // lines the plug-in can read, in file order
    std::vector<Register> registers;  // in order of first line
};

// A bit a setting writes.
struct BitWrite {
    uint32_t address = 0;
    uint32_t bit = 0;
    bool one = false;
};

struct Setting {
    std::string registerName;
    std::string digits;  // the register's value, most significant first, as written
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
    std::vector<Choice> choices;  // in index order
};

// A parameter a slave class computes instead of taking it from the parameter file.
struct ComputedParameter {
    std::vector<std::string> names;             // the names it answers to
    std::vector<std::string> registers;         // what it reads (or writes)
    std::vector<std::string> choiceParameters;  // of the parameter file, that it works through
};

// The slave class the factory makes for some directory rows naming the parameter file.
struct ClassUse {
    std::string className;
    std::vector<int32_t> slaveTypes;
    std::vector<ComputedParameter> computed;
    std::string problem;  // why its computed parameters could not be listed
};

struct ParameterFile {
    std::string name;
    std::string path;
    std::string page;
    bool read = false;                  // the plug-in reads it
    int registerFile = -1;              // index of the register file its settings are drawn on
    std::vector<Parameter> parameters;  // in file order
    std::vector<ClassUse> classes;      // transceiver classes only
};

// Driver versions minVersion to maxVersion of a row get an object of this class.
struct ClassSpan {
    int32_t minVersion = 0;
    int32_t maxVersion = 0;
    std::string className;
};

struct DirectoryRow {
    uint32_t line = 0;
    int32_t slaveType = 0;
    int32_t minVersion = 0;
    int32_t maxVersion = 0;
    std::vector<ClassSpan> classes;
    std::string registerFile;  // as the row gives them
    std::string parameterFile;
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
