// Parameter definition files: reading, checks, the printed image.
#include "base/OrvNebu_ParamFile.h"

#include <cctype>
#include <climits>
#include <exception>
#include <fstream>

#include "base/OrvNebu_CsvText.h"
#include "host/OrvUtil.h"

namespace OrvRT {

namespace {

// A choice index field read like atoi, except that a number beyond the int range saturates
// instead of being undefined; such an index is never in order anyway.
uint32_t readChoiceIndex(const std::string& text) {
    size_t i = 0;
    while (i < text.size() && std::isspace(static_cast<unsigned char>(text[i]))) ++i;
    bool negative = false;
    if (i < text.size() && (text[i] == '+' || text[i] == '-')) negative = text[i++] == '-';
    int64_t value = 0;
    for (; i < text.size() && text[i] >= '0' && text[i] <= '9'; ++i) {
        value = value * 10 + (text[i] - '0');
        if (value > static_cast<int64_t>(INT_MAX) + 1) value = static_cast<int64_t>(INT_MAX) + 1;
    }
    if (negative) value = -value;
    if (value > INT_MAX) value = INT_MAX;
    return static_cast<uint32_t>(static_cast<int32_t>(value));
}

uint32_t priorityOf(uint32_t lineNumber) {
    const uint32_t start = OrvNebu_ParamFile::START_PRIORITY;
    return lineNumber > UINT32_MAX - start ? UINT32_MAX : start + lineNumber;
}

// Whether a length does not fit the 32-bit register width; only possible where size_t is wider
// than 32 bits (the host itself is a 32-bit process).
template <typename Size>
bool exceedsUint32(Size length) {
    if constexpr (sizeof(Size) > sizeof(uint32_t)) {
        return static_cast<uint64_t>(length) > UINT32_MAX;
    } else {
        static_cast<void>(length);
        return false;
    }
}

}  // namespace

uint32_t OrvNebu_ParamFile::Parameter::registerWidth(const std::string& registerName) const {
    for (const Choice& choice : choices) {
        for (const Setting& setting : choice.settings) {
            if (setting.registerName == registerName) return setting.width;
        }
    }
    return 0;
}

OrvNebu_ParamFile::OrvNebu_ParamFile(const std::string& path, Reading reading) : path_(path) {
    std::ifstream in;
    OrvNebu_CsvText::openFile(in, path_);
    if (in) readLines(in, reading);
    if (!opened_) {
        parameters_.clear();
        problems_.clear();
        problems_.push_back(OrvNebu_FileProblem::unreadable(
            path_, "Unable to open OrvNebu parameter file: " + path_));
    }
}

void OrvNebu_ParamFile::readLines(std::istream& in, Reading reading) {
    std::getline(in, header_);
    if (reading == EVERY_PROBLEM) checkFirstLine(header_);
    Orv_Util::stripEndingCR(header_);
    uint32_t lineNumber = 1;
    std::string line;
    while (std::getline(in, line)) {
        if (lineNumber < UINT32_MAX) ++lineNumber;
        Orv_Util::stripEndingCR(line);
        if (!parseLine(lineNumber, line) && reading == FIRST_REFUSAL) break;
    }
    // A path that opens but cannot be read (a directory) must not pass for an empty file.
    opened_ = !in.bad();
}

bool OrvNebu_ParamFile::parseLine(uint32_t lineNumber, const std::string& line) {
    std::vector<std::string> fields;
    OrvNebu_CsvText::splitCommas(line, fields);
    Orv_Util::unQuote(fields);
    if (fields.size() < 4) {
        refuseLine(lineNumber, line, 0, OrvNebu_FileProblem::SEVERITY_MALFORMED_LINE,
                   "row of " + std::to_string(fields.size()) +
                       (fields.size() == 1 ? " field" : " fields") +
                       ": a row needs 4 (parameter, choice index, choice, settings)");
        return false;
    }
    const std::string& name = fields[0];
    // Further rows of a parameter refused before would only repeat its problem.
    if (!refusedName_.empty() && name == refusedName_) return true;
    refusedName_.clear();
    if (parameters_.empty() || name != parameters_.back().name) {
        if (parameters_.empty() && name.empty()) {
            // An empty name on the first row: there is no parameter to take the choice.
            refuseLine(lineNumber, line, 1, OrvNebu_FileProblem::SEVERITY_MALFORMED_LINE,
                       "row without a parameter name");
            return false;
        }
        parameters_.push_back(Parameter{name, lineNumber, priorityOf(lineNumber), {}});
    }
    Parameter& parameter = parameters_.back();
    if (readChoiceIndex(fields[1]) != parameter.choices.size()) {
        refuseLine(lineNumber, line, 2, OrvNebu_FileProblem::SEVERITY_ERROR, INDEX_OUT_OF_ORDER);
        dropRefusedRows();
        return false;
    }
    Choice choice{fields[2], lineNumber, {}};
    if (!parseSettings(lineNumber, line, fields, choice)) {
        dropRefusedRows();
        return false;
    }
    parameter.choices.push_back(std::move(choice));
    return true;
}

bool OrvNebu_ParamFile::parseSettings(uint32_t lineNumber, const std::string& line,
                                      const std::vector<std::string>& fields, Choice& choice) {
    for (size_t i = 3; i < fields.size(); ++i) {
        const std::string& setting = fields[i];
        if (setting.empty()) continue;
        const uint32_t column = static_cast<uint32_t>(i + 1);
        const size_t eq = setting.find('=');
        const std::string bits = eq == std::string::npos ? std::string() : setting.substr(eq + 1);
        if (setting.size() < 3 || eq == std::string::npos || exceedsUint32(bits.size())) {
            refuseLine(lineNumber, line, column, OrvNebu_FileProblem::SEVERITY_MALFORMED_LINE,
                       "setting " + setting + " is not of the form REGISTER=bits");
            return false;
        }
        Setting parsed{setting.substr(0, eq), static_cast<uint32_t>(bits.size()), std::string(),
                       column};
        try {
            Orv_NumberUtil::binStr2HexStr(bits, parsed.value);
        } catch (const std::exception& e) {
            refuseLine(lineNumber, line, column, OrvNebu_FileProblem::SEVERITY_ERROR, e.what());
            return false;
        }
        choice.settings.push_back(std::move(parsed));
    }
    return true;
}

void OrvNebu_ParamFile::refuseLine(uint32_t lineNumber, const std::string& line, uint32_t column,
                                   uint32_t severity, const std::string& text) {
    OrvNebu_FileProblem problem{path_, lineNumber, column, severity, text, {}};
    if (severity == OrvNebu_FileProblem::SEVERITY_ERROR)
        problem.messages.push_back({severity, text});
    problem.messages.push_back(
        {OrvNebu_FileProblem::SEVERITY_MALFORMED_LINE,
         "Unable to parse file: " + path_ + " line:" + std::to_string(lineNumber) + ": " + line});
    problems_.push_back(std::move(problem));
}

void OrvNebu_ParamFile::dropRefusedRows() {
    refusedName_ = parameters_.back().name;
    // A parameter whose first row is refused has no choices to offer.
    if (parameters_.back().choices.empty()) parameters_.pop_back();
}

void OrvNebu_ParamFile::checkFirstLine(const std::string& line) {
    if (OrvNebu_CsvText::hasInnerCR(line)) {
        warn(1,
             "line ends are carriage returns alone: the plug-in reads the whole file as one "
             "header line and finds no parameters");
        return;
    }
    std::string first = line;
    Orv_Util::stripEndingCR(first);
    std::vector<std::string> fields;
    OrvNebu_CsvText::splitCommas(first, fields);
    Orv_Util::unQuote(fields);
    if (fields.size() < 4 || fields[1].empty() ||
        fields[1].find_first_not_of("0123456789") != std::string::npos) {
        return;
    }
    for (size_t i = 3; i < fields.size(); ++i) {
        const size_t eq = fields[i].find('=');
        if (!fields[i].empty() &&
            (eq == std::string::npos || eq == 0 ||
             fields[i].find_first_not_of("01", eq + 1) != std::string::npos)) {
            return;
        }
    }
    warn(1,
         "the first line is a parameter row, but the first line of a parameter file is its "
         "header: choice " +
             fields[2] + " of parameter " + fields[0] + " is lost");
}

void OrvNebu_ParamFile::warn(uint32_t line, const std::string& text) {
    problems_.push_back({path_, line, 0, OrvNebu_FileProblem::SEVERITY_WARNING, text, {}});
}

void OrvNebu_ParamFile::print(std::ostream& out) const {
    out << header_ << std::endl;
    std::string bits;
    for (const Parameter& parameter : parameters_) {
        for (size_t i = 0; i < parameter.choices.size(); ++i) {
            const Choice& choice = parameter.choices[i];
            out << parameter.name << ',' << i << ',' << choice.name;
            for (const Setting& setting : choice.settings) {
                // A setting of no bits has no digits to convert.
                const uint32_t width = parameter.registerWidth(setting.registerName);
                bits.clear();
                if (width != 0) Orv_NumberUtil::hexStr2BinStr(setting.value, width, bits);
                out << ',' << setting.registerName << '=' << bits;
            }
            out << std::endl;
        }
    }
}

}  // namespace OrvRT
