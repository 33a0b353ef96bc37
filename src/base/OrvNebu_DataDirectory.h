// A data directory read as a whole for the file tools: the directory file, every register and
// parameter file it names (each read once, every problem found), the classes its rows build,
// and the problems that lie between files (settings of registers a register file lacks, what
// a transceiver class needs of its files).
#pragma once

#include <cstddef>
#include <map>
#include <memory>
#include <string>
#include <vector>

#include "base/OrvNebu_DirectoryFile.h"
#include "base/OrvNebu_FileProblem.h"
#include "base/OrvNebu_ParamFile.h"
#include "base/OrvNebu_RegisterFile.h"
#include "base/OrvNebu_SlaveClassTable.h"

namespace OrvRT {

class OrvNebu_DataDirectory {
public:
    typedef OrvNebu_DirectoryFile::Row Row;

    // dataDir ends with a separator, as the host's data directory does.
    explicit OrvNebu_DataDirectory(const std::string& dataDir);

    const OrvNebu_DirectoryFile& directory() const { return directory_; }
    // The files a row names, by the full path the plug-in opens; null when it names none.
    const OrvNebu_RegisterFile* registerFile(const Row& row) const;
    const OrvNebu_ParamFile* paramFile(const Row& row) const;
    // The classes the factory builds for the row's versions, in record order; the default
    // slave is among them when some version of the range has no record of its own.
    static std::vector<OrvNebu_SlaveClassTable::SlaveClass> classesOf(const Row& row);

    // Every problem of every file, in the order found. A file that cannot be opened is
    // reported on the first directory row that names it.
    const OrvNebu_FileProblems& problems() const { return problems_; }
    // The definition files that could be opened.
    size_t filesRead() const;

private:
    const OrvNebu_RegisterFile* readRegisterFile(const Row& row);
    const OrvNebu_ParamFile* readParamFile(const Row& row);
    // Adds the problems of a file read for the row: its own, or its failure to open.
    void takeProblems(const Row& row, const std::string& name, const OrvNebu_FileProblems& own,
                      bool opened);
    std::string blankHint(const std::string& name) const;
    void checkSettings(const OrvNebu_RegisterFile& registers, const OrvNebu_ParamFile& params);
    void checkTransceiverNeeds(const Row& row, const OrvNebu_RegisterFile* registers,
                               const OrvNebu_ParamFile* params);
    void add(const Row& row, const std::string& text);

    std::string dataDir_;
    OrvNebu_DirectoryFile directory_;
    std::map<std::string, std::unique_ptr<OrvNebu_RegisterFile>> registerFiles_;
    std::map<std::string, std::unique_ptr<OrvNebu_ParamFile>> paramFiles_;
    OrvNebu_FileProblems problems_;
};

}  // namespace OrvRT
