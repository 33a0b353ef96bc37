// The directory file: header columns in any order, rows, the first matching row, checks.
#include "base/OrvNebu_DirectoryFile.h"

#include <algorithm>
#include <cctype>
#include <fstream>

#include "base/OrvNebu_CsvText.h"
#include "host/OrvUtil.h"

namespace OrvRT {

namespace {

const char* const KEY_COLUMNS[] = {"slave_type", "orv_drv_ver_min", "orv_drv_ver_max"};
const char* const BYTE_ORDER_MARK = "\xEF\xBB\xBF";

std::string typeText(int32_t type) {
    return "0x" + OrvNebu_CsvText::hexText(static_cast<uint32_t>(type));
}

}  // namespace

OrvNebu_DirectoryFile::OrvNebu_DirectoryFile(const std::string& path, Reading reading)
    : path_(path) {
    std::ifstream in;
    OrvNebu_CsvText::openFile(in, path_);
    std::string line;
    // A directory in the file's place opens, but reading it fails.
    if (!in.is_open() || (!std::getline(in, line) && in.bad())) {
        problems_.push_back(OrvNebu_FileProblem::unreadable(path_, "Unable to open " + path_));
        return;
    }
    readHeader(line, reading);
    if (!usable_) return;
    uint32_t lineNumber = 1;
    while (std::getline(in, line)) {
        ++lineNumber;
        // Files written on Windows end their lines in CR LF; they are read in binary.
        Orv_Util::stripEndingCR(line);
        readRow(lineNumber, line, reading);
    }
    if (reading == EVERY_PROBLEM) checkRows();
}

void OrvNebu_DirectoryFile::readHeader(std::string line, Reading reading) {
    if (reading == EVERY_PROBLEM) {
        if (line.compare(0, 3, BYTE_ORDER_MARK) == 0) {
            warn(1, 1,
                 "byte-order mark before the header: it is read as part of the first "
                 "column's name");
        }
        if (OrvNebu_CsvText::hasInnerCR(line)) {
            warn(1, 0,
                 "line ends are carriage returns alone: the whole file is read as one "
                 "header line");
        }
    }
    Orv_Util::stripEndingCR(line);
    std::transform(line.begin(), line.end(), line.begin(),
                   [](unsigned char c) { return static_cast<char>(std::tolower(c)); });
    OrvNebu_CsvText::splitCommas(line, headerFields_);
    for (size_t i = headerFields_.size(); i-- > 0;) {
        headerFields_[i] = Orv_Util::trimWhitespace(headerFields_[i]);
        const int32_t column = static_cast<int32_t>(i);
        const std::string& name = headerFields_[i];
        if (Orv_Util::stricmp(name, KEY_COLUMNS[0]) == 0) {
            slaveTypeColumn_ = column;
        } else if (Orv_Util::stricmp(name, KEY_COLUMNS[1]) == 0) {
            minimumColumn_ = column;
        } else if (Orv_Util::stricmp(name, KEY_COLUMNS[2]) == 0) {
            maximumColumn_ = column;
        } else if (name == "registers") {
            registersColumn_ = column;
        } else if (name == "parameters") {
            parametersColumn_ = column;
        }
    }
    highestKeyColumn_ = std::max(slaveTypeColumn_, std::max(minimumColumn_, maximumColumn_));
    const std::string fault = headerFault();
    if (!fault.empty()) {
        refuse(1, "Unable to parse header of CSV file: " + path_, fault);
        return;
    }
    usable_ = true;
    if (reading == EVERY_PROBLEM && registersColumn_ < 0) {
        warn(1, 0, "the header has no registers column: no slave can be created");
    }
}

std::string OrvNebu_DirectoryFile::headerFault() const {
    if (headerFields_.size() < 5) {
        return "it has " + std::to_string(headerFields_.size()) +
               (headerFields_.size() == 1 ? " column" : " columns") + ", at least 5 are needed";
    }
    const int32_t columns[] = {slaveTypeColumn_, minimumColumn_, maximumColumn_};
    for (size_t i = 0; i < 3; ++i) {
        if (columns[i] < 0) return std::string("it has no ") + KEY_COLUMNS[i] + " column";
    }
    return std::string();
}

void OrvNebu_DirectoryFile::readRow(uint32_t lineNumber, const std::string& line, Reading reading) {
    Row row;
    row.line = lineNumber;
    OrvNebu_CsvText::splitCommas(line, row.fields);
    if (static_cast<int64_t>(row.fields.size()) <= highestKeyColumn_) {
        // Such lines are passed over; only a blank one can be meant so.
        if (reading == EVERY_PROBLEM && line.find_first_not_of(" \t") != std::string::npos) {
            warn(lineNumber, 0,
                 "line of " + std::to_string(row.fields.size()) +
                     " fields is never used: the key columns need " +
                     std::to_string(highestKeyColumn_ + 1));
        }
        return;
    }
    row.slaveType = OrvNebu_CsvText::autoBaseToInt32(row.fields[slaveTypeColumn_]);
    row.minDriverVersion = OrvNebu_CsvText::autoBaseToInt32(row.fields[minimumColumn_]);
    row.maxDriverVersion = OrvNebu_CsvText::autoBaseToInt32(row.fields[maximumColumn_]);
    auto field = [&row](int32_t column) {
        return column >= 0 && static_cast<size_t>(column) < row.fields.size()
                   ? row.fields[static_cast<size_t>(column)]
                   : std::string();
    };
    row.registers = field(registersColumn_);
    row.parameters = field(parametersColumn_);
    rows_.push_back(std::move(row));
}

void OrvNebu_DirectoryFile::checkRows() {
    for (size_t i = 0; i < rows_.size(); ++i) {
        const Row& d = rows_[i];
        const std::string type = "slave type " + typeText(d.slaveType);
        if (d.minDriverVersion > d.maxDriverVersion) {
            warn(d.line, static_cast<uint32_t>(minimumColumn_ + 1),
                 type + ": driver versions " + std::to_string(d.minDriverVersion) + " to " +
                     std::to_string(d.maxDriverVersion) + " is an empty range");
        } else {
            for (size_t j = 0; j < i; ++j) {
                const Row& e = rows_[j];
                const int32_t low = std::max(d.minDriverVersion, e.minDriverVersion);
                const int32_t high = std::min(d.maxDriverVersion, e.maxDriverVersion);
                if (e.slaveType != d.slaveType || low > high) continue;
                warn(d.line, static_cast<uint32_t>(minimumColumn_ + 1),
                     type + ": driver versions " + std::to_string(low) + " to " +
                         std::to_string(high) + " are already covered by line " +
                         std::to_string(e.line) + ", which wins");
                break;
            }
        }
        if (d.registers.empty() && registersColumn_ >= 0) {
            warn(d.line, static_cast<uint32_t>(registersColumn_ + 1),
                 type + " has no register file: its slaves cannot be created");
        }
    }
}

const OrvNebu_DirectoryFile::Row* OrvNebu_DirectoryFile::findRow(int32_t slaveType,
                                                                 int32_t driverVersion) const {
    for (const Row& row : rows_) {
        if (row.covers(slaveType, driverVersion)) return &row;
    }
    return nullptr;
}

void OrvNebu_DirectoryFile::fillEntry(const Row& row, Orv_HashMapCStr& entry) const {
    const size_t n = std::min(headerFields_.size(), row.fields.size());
    // From the right, so that of two equal column names the leftmost value stays.
    for (size_t i = n; i-- > 0;) entry[headerFields_[i]] = row.fields[i];
}

void OrvNebu_DirectoryFile::warn(uint32_t line, uint32_t column, const std::string& text) {
    problems_.push_back({path_, line, column, OrvNebu_FileProblem::SEVERITY_WARNING, text, {}});
}

void OrvNebu_DirectoryFile::refuse(uint32_t line, const std::string& message,
                                   const std::string& detail) {
    problems_.push_back({path_,
                         line,
                         0,
                         OrvNebu_FileProblem::SEVERITY_ERROR,
                         message + ": " + detail,
                         {{OrvNebu_FileProblem::SEVERITY_ERROR, message}}});
}

}  // namespace OrvRT
