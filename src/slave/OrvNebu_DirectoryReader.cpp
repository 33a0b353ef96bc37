// The directory file reader: header columns in any order, first matching line wins.
#include "slave/OrvNebu_DirectoryReader.h"

#include <algorithm>
#include <cctype>
#include <fstream>
#include <stdexcept>

#include "base/OrvNebu_CsvText.h"
#include "base/Orv_AbortException.h"
#include "host/OrvJtag.h"
#include "host/OrvUtil.h"

namespace OrvRT {

namespace {

// Files written on Windows end their lines in CR LF; the host there reads them in text mode.
void stripCR(std::string& line) {
    if (!line.empty() && line.back() == '\r') line.pop_back();
}

}  // namespace

OrvNebu_DirectoryReader::OrvNebu_DirectoryReader(uint32_t handle, const std::string& fileName,
                                                 int32_t slaveType, int32_t driverVersion)
    : handle_(handle), fileName_(fileName), slaveType_(slaveType), driverVersion_(driverVersion) {}

bool OrvNebu_DirectoryReader::getEntry(uint32_t handle, const std::string& fileName,
                                       int32_t slaveType, int32_t driverVersion,
                                       Orv_HashMapCStr& entry) {
    OrvNebu_DirectoryReader reader(handle, fileName, slaveType, driverVersion);
    return reader.getResult(entry);
}

bool OrvNebu_DirectoryReader::parseHeader(const std::string& line) {
    std::string lower = line;
    std::transform(lower.begin(), lower.end(), lower.begin(),
                   [](unsigned char c) { return static_cast<char>(std::tolower(c)); });
    OrvNebu_CsvText::splitCommas(lower, headerFields_);
    if (headerFields_.size() < 5) return false;
    slaveTypeColumn_ = minimumColumn_ = maximumColumn_ = -1;
    for (size_t i = headerFields_.size(); i-- > 0;) {
        headerFields_[i] = Orv_Util::trimWhitespace(headerFields_[i]);
        const int32_t column = static_cast<int32_t>(i);
        if (Orv_Util::stricmp(headerFields_[i], "slave_type") == 0) {
            slaveTypeColumn_ = column;
        } else if (Orv_Util::stricmp(headerFields_[i], "orv_drv_ver_min") == 0) {
            minimumColumn_ = column;
        } else if (Orv_Util::stricmp(headerFields_[i], "orv_drv_ver_max") == 0) {
            maximumColumn_ = column;
        }
    }
    highestKeyColumn_ = std::max(slaveTypeColumn_, std::max(minimumColumn_, maximumColumn_));
    return slaveTypeColumn_ >= 0 && minimumColumn_ >= 0 && maximumColumn_ >= 0;
}

bool OrvNebu_DirectoryReader::parseLine(uint32_t lineNumber, const std::string& line,
                                        Orv_HashMapCStr& entry) {
    (void)lineNumber;
    OrvNebu_CsvText::splitCommas(line, fields_);
    if (static_cast<int64_t>(fields_.size()) <= highestKeyColumn_) return false;
    if (OrvNebu_CsvText::autoBaseToInt32(fields_[slaveTypeColumn_]) != slaveType_ ||
        OrvNebu_CsvText::autoBaseToInt32(fields_[minimumColumn_]) > driverVersion_ ||
        OrvNebu_CsvText::autoBaseToInt32(fields_[maximumColumn_]) < driverVersion_) {
        return false;
    }
    const size_t n = std::min(headerFields_.size(), fields_.size());
    // From the right, so that of two equal column names the leftmost value stays.
    for (size_t i = n; i-- > 0;) entry[headerFields_[i]] = fields_[i];
    return true;
}

bool OrvNebu_DirectoryReader::getResult(Orv_HashMapCStr& entry) {
    std::ifstream in;
    OrvNebu_CsvText::openFile(in, fileName_);
    std::string line;
    bool haveHeader = in.is_open() && static_cast<bool>(std::getline(in, line));
    // A path that opens but cannot be read (a directory on POSIX systems; Windows does not open
    // it at all) is one that cannot be opened, not one with a bad header.
    if (!in.is_open() || in.bad()) {
        std::string text = "Unable to open " + fileName_;
        OrvJtag_session_sendMessage(handle_, SEVERITY_ERROR, text.c_str());
        throw Orv_AbortException();
    }
    if (haveHeader) stripCR(line);
    if (!haveHeader || !parseHeader(line)) {
        std::string text = "Unable to parse header of CSV file: " + fileName_;
        OrvJtag_session_sendMessage(handle_, SEVERITY_ERROR, text.c_str());
        throw Orv_AbortException();
    }
    uint32_t lineNumber = 1;
    while (std::getline(in, line)) {
        ++lineNumber;
        stripCR(line);
        try {
            if (parseLine(lineNumber, line, entry)) return true;
        } catch (const std::exception& e) {
            OrvJtag_session_sendMessage(handle_, SEVERITY_ERROR, e.what());
            std::string text = "Unable to parse file: " + fileName_ +
                               " line:" + std::to_string(lineNumber) + ": " + line;
            OrvJtag_session_sendMessage(handle_, SEVERITY_ERROR, text.c_str());
            throw Orv_AbortException();
        }
    }
    return false;
}

}  // namespace OrvRT
