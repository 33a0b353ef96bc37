// A parameter definition file as read: its choice parameters with their choices and the
// register settings each choice stands for, the printed image, and every problem found, as
// data. The parameter reader turns the parameters into choice actions; the console's file
// tools show and check them.
#pragma once

#include <cstdint>
#include <ostream>
#include <string>
#include <vector>

#include "base/OrvNebu_FileProblem.h"

namespace OrvRT {

class OrvNebu_ParamFile {
public:
    // Choice parameters get this plus the file line that starts them as their priority.
    static constexpr uint32_t START_PRIORITY = 10000;
    static constexpr const char* INDEX_OUT_OF_ORDER = "choice_index out-of-order";

    struct Setting {
        std::string registerName;
        uint32_t width = 0;  // the number of binary digits given
        std::string value;   // hexadecimal, as the digits convert
        uint32_t column = 0;
    };
    struct Choice {
        std::string name;
        uint32_t line = 0;
        std::vector<Setting> settings;
    };
    // Consecutive rows of one name; its choices are indexed 0, 1, 2 ... in row order.
    struct Parameter {
        std::string name;
        uint32_t line = 0;  // its first row
        uint32_t priority = 0;
        std::vector<Choice> choices;

        // The width a parameter's choices write to a register: the first one given for it;
        // 0 for a register none of them sets.
        uint32_t registerWidth(const std::string& registerName) const;
    };

    enum Reading {
        // Stop at the first problem that refuses the file (the plug-in).
        FIRST_REFUSAL,
        // Read on after problems, so that every one is found (the file tools).
        EVERY_PROBLEM,
    };

    explicit OrvNebu_ParamFile(const std::string& path, Reading reading = FIRST_REFUSAL);
    OrvNebu_ParamFile(const OrvNebu_ParamFile&) = delete;
    OrvNebu_ParamFile& operator=(const OrvNebu_ParamFile&) = delete;

    const std::string& path() const { return path_; }
    bool opened() const { return opened_; }
    const std::string& header() const { return header_; }
    // In file order; a name may come twice (the plug-in keeps the first).
    const std::vector<Parameter>& parameters() const { return parameters_; }
    const OrvNebu_FileProblems& problems() const { return problems_; }

    // The file image: header, then "parameter,index,choice[,REGISTER=bits]..." per choice, the
    // bits in the width the parameter uses for the register.
    void print(std::ostream& out) const;

private:
    void readLines(std::istream& in, Reading reading);
    // False when the row refuses the file.
    bool parseLine(uint32_t lineNumber, const std::string& line);
    bool parseSettings(uint32_t lineNumber, const std::string& line,
                       const std::vector<std::string>& fields, Choice& choice);
    void refuseLine(uint32_t lineNumber, const std::string& line, uint32_t column,
                    uint32_t severity, const std::string& text);
    void warn(uint32_t line, const std::string& text);
    // The first line is the header: a file without one loses its first row.
    void checkFirstLine(const std::string& line);
    // Forgets the rows of the parameter just refused, and skips its further rows.
    void dropRefusedRows();

    std::string path_;
    bool opened_ = false;
    std::string header_;
    std::vector<Parameter> parameters_;
    OrvNebu_FileProblems problems_;
    // After a refused row of a new parameter, rows of that name belong to no parameter.
    std::string refusedName_;
};

}  // namespace OrvRT
