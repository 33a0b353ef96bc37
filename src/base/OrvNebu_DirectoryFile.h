// The directory file as read: the header's columns, every row that can match a slave (slave
// type, driver version range, register and parameter file names), the entry the plug-in
// delivers for a slave, and every problem found, as data.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "base/OrvNebu_FileProblem.h"
#include "host/OrvTypes.h"

namespace OrvRT {

class OrvNebu_DirectoryFile {
public:
    static constexpr const char* FILE_NAME = "orvnebu_directory.csv";

    struct Row {
        uint32_t line = 0;
        std::vector<std::string> fields;  // as they stand: neither lowercased nor trimmed
        int32_t slaveType = 0;
        int32_t minDriverVersion = 0;
        int32_t maxDriverVersion = 0;
        // The file names as the row gives them; empty without the column.
        std::string registers;
        std::string parameters;

        bool covers(int32_t type, int32_t version) const {
            return slaveType == type && minDriverVersion <= version && maxDriverVersion >= version;
        }
    };

    enum Reading {
        // What the plug-in needs: the rows, and whether the file and its header are usable.
        FIRST_REFUSAL,
        // Also every row that can never match, and rows that hide each other (the file tools).
        EVERY_PROBLEM,
    };

    explicit OrvNebu_DirectoryFile(const std::string& path, Reading reading = FIRST_REFUSAL);

    const std::string& path() const { return path_; }
    // Every line with more fields than the highest key column, in file order.
    const std::vector<Row>& rows() const { return rows_; }
    // The first row that covers the slave type and driver version, or null.
    const Row* findRow(int32_t slaveType, int32_t driverVersion) const;
    // Stores the row's fields under the header's names (of two equal names the leftmost wins).
    void fillEntry(const Row& row, Orv_HashMapCStr& entry) const;
    const OrvNebu_FileProblems& problems() const { return problems_; }

private:
    void readHeader(std::string line, Reading reading);
    // Why the header is unusable, or the empty text.
    std::string headerFault() const;
    void readRow(uint32_t lineNumber, const std::string& line, Reading reading);
    void checkRows();
    void warn(uint32_t line, uint32_t column, const std::string& text);
    void refuse(uint32_t line, const std::string& message, const std::string& detail);

    std::string path_;
    bool usable_ = false;
    std::vector<std::string> headerFields_;
    int32_t slaveTypeColumn_ = -1;
    int32_t minimumColumn_ = -1;
    int32_t maximumColumn_ = -1;
    int32_t highestKeyColumn_ = -1;
    int32_t registersColumn_ = -1;
    int32_t parametersColumn_ = -1;
    std::vector<Row> rows_;
    OrvNebu_FileProblems problems_;
};

}  // namespace OrvRT
