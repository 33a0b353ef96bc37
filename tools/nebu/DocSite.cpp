// The pages of `nebu doc`: the index of the directory file, a page per register file and per
// parameter file, and the one stylesheet they share. Plain HTML with inline SVG: they open from
// the file system, need no script and print on paper.
#include "DocSite.h"

#include <map>
#include <set>
#include <string>
#include <vector>

#include "DocHtml.h"
#include "DocSvg.h"

namespace nebu {
namespace doc {

const char* const MARKER = "written by nebu doc";

namespace {

typedef OrvRT::OrvNebu_SlaveClassTable::ComputedAction ComputedAction;

const char* const STYLE = R"css(
:root {
  --ink: #16202b; --muted: #56606b; --line: #c3c9cf; --soft: #f3f5f7; --accent: #1d4e89;
  --fault: #8a1c1c; --mono: "DejaVu Sans Mono", "Liberation Mono", Menlo, Consolas, monospace;
}
* { box-sizing: border-box; }
body { margin: 0; color: var(--ink); background: #fff;
  font: 15px/1.45 "DejaVu Sans", "Liberation Sans", "Segoe UI", Helvetica, Arial, sans-serif; }
header, main, footer { max-width: 1040px; margin: 0 auto; padding: 0 20px; }
header { padding-top: 14px; border-bottom: 2px solid var(--ink); }
nav { font-size: 13px; color: var(--muted); }
nav a { color: var(--accent); }
h1 { font-size: 24px; margin: 6px 0 4px; }
h2 { font-size: 19px; margin: 28px 0 8px; border-bottom: 1px solid var(--line); padding-bottom: 3px; }
h3 { font-size: 16px; margin: 22px 0 6px; }
.sub { margin: 0 0 12px; color: var(--muted); }
.meta { font-weight: normal; color: var(--muted); font-size: 13px; }
code, .num, td.mono { font-family: var(--mono); font-size: 13px; }
a { color: var(--accent); }
a code { color: inherit; }
table { border-collapse: collapse; margin: 8px 0 14px; font-size: 14px; }
caption { text-align: left; font-size: 13px; color: var(--muted); padding: 0 0 4px; }
th, td { border: 1px solid var(--line); padding: 3px 8px; text-align: left; vertical-align: top; }
thead th { background: var(--soft); font-weight: 600; }
tbody tr:nth-child(even) td { background: #fafbfc; }
td.num { white-space: nowrap; }
table.dir td:nth-child(5), table.dir td:nth-child(6) { white-space: nowrap; }
table.dir td:nth-child(4) { min-width: 14em; }
table.dir .flag { display: block; font-size: 13px; }
table.dir tr.fault-text .flag { display: inline; }
tr.excluded td { color: var(--muted); font-style: italic; }
tr.free td { color: var(--muted); }
tr.claimed td:first-child, tr.fault td:first-child, tr.fault-text td {
  border-left: 6px double var(--fault); }
tr.fault td { border-bottom: 0; }
tbody tr.fault td, tbody tr.fault-text td { background: #fbf3f3; }
tr.fault-text td { border-top: 0; padding-left: 14px; }
.flag { font-weight: 700; color: var(--fault); }
section.problems { border: 2px solid var(--fault); border-left-width: 8px; padding: 4px 14px;
  margin: 14px 0; }
section.problems h2 { border: 0; margin: 6px 0; color: var(--fault); }
section.problems ul { margin: 4px 0 8px; padding-left: 18px; }
section.problems li { margin: 2px 0; }
p.clean { border-left: 8px solid var(--line); padding: 4px 12px; background: var(--soft); }
p.notice { border: 2px dashed var(--fault); padding: 6px 12px; }
figure { margin: 6px 0 4px; break-inside: avoid; page-break-inside: avoid; }
figcaption { font-size: 13px; color: var(--muted); }
svg.bits { display: block; max-width: 100%; height: auto; }
svg.defs { position: absolute; }
.word, .param { break-inside: avoid-page; }
.lbl { fill: var(--ink); }
.nm { font-weight: 700; }
.halo { paint-order: stroke; stroke: #fff; stroke-width: 3px; stroke-linejoin: round; }
.bitno { font-size: 11px; fill: var(--muted); }
.band, .cap, .colhead { font-size: 12px; fill: var(--muted); }
.cap { font-size: 13px; fill: var(--ink); font-family: "DejaVu Sans", "Liberation Sans", Helvetica, Arial, sans-serif; }
.box { fill: #dde6f1; stroke: var(--ink); stroke-width: 1.5; }
.box.rev { fill: url(#p-rev); }
.box.beyond { fill: url(#p-beyond); stroke-dasharray: 5 3; }
.box.idle { fill: #fff; stroke: #8c959f; stroke-width: 1; }
.free { fill: #fff; stroke: #9aa3ad; stroke-width: 1; stroke-dasharray: 3 3; }
.free.beyond { fill: url(#p-beyond); }
.conflict { fill: url(#p-conflict); stroke: var(--ink); stroke-width: 1.5; }
.shared { fill: url(#p-shared); stroke: var(--ink); stroke-width: 1; }
.tag { fill: #fff; stroke: var(--ink); stroke-width: 1; }
.tagtext { font-size: 11px; font-weight: 700; fill: var(--ink); }
.tick { stroke: var(--ink); stroke-width: 1; }
.arrow { stroke: var(--ink); stroke-width: 1.5; fill: none; }
.head { fill: var(--ink); }
.msb { font-size: 9px; fill: var(--ink); }
.edge { stroke: #8c959f; stroke-width: 1; }
.stripe { fill: #f1f3f5; }
.choice { font-size: 12px; fill: var(--ink); }
.one { fill: #2b3540; stroke: #2b3540; }
.zero { fill: #fff; stroke: var(--ink); stroke-width: 1; }
.digit1 { font-size: 12px; font-weight: 700; fill: #fff; }
.digit0 { font-size: 12px; font-weight: 700; fill: var(--ink); }
svg a:focus rect.box, svg a:hover rect.box { stroke-width: 3; }
ul.files { columns: 2; padding-left: 18px; }
footer { margin-top: 28px; padding: 10px 20px 24px; border-top: 1px solid var(--line);
  font-size: 12px; color: var(--muted); }
@media print {
  body { font-size: 10.5pt; }
  header, main, footer { max-width: none; padding: 0; }
  nav, .skip { display: none; }
  a { color: inherit; text-decoration: none; }
  h2, h3 { break-after: avoid; page-break-after: avoid; }
  table, tr { break-inside: avoid; page-break-inside: avoid; }
  tbody tr:nth-child(even) td { background: none; }
}
)css";

std::string versionText(int32_t v) { return v >= 0 && v <= 9 ? std::to_string(v) : hexText(v); }

std::string where(const Problem& p) {
    return p.line == 0 ? p.file : p.file + ":" + std::to_string(p.line);
}

std::string pageStart(const std::string& title, const std::string& crumb,
                      const std::string& heading, const std::string& sub) {
    std::string html = "<!DOCTYPE html>\n<!-- " + std::string(MARKER) +
                       ": nebu doc replaces this file when it runs again -->\n"
                       "<html lang=\"en\">\n<head>\n<meta charset=\"utf-8\">\n"
                       "<meta name=\"viewport\" content=\"width=device-width, initial-scale=1\">\n"
                       "<title>" +
                       esc(title) +
                       "</title>\n<link rel=\"stylesheet\" href=\"style.css\">\n</head>\n<body>\n"
                       "<header>\n";
    if (!crumb.empty()) html += "<nav>" + crumb + "</nav>\n";
    return html + "<h1>" + heading + "</h1>\n<p class=\"sub\">" + sub + "</p>\n</header>\n<main>\n";
}

std::string pageEnd(const Site& site) {
    return "</main>\n<footer>Written by <code>nebu doc</code> from <code>" + esc(site.dataDir) +
           "</code>. The pictures carry no fact alone: each has its table.</footer>\n</body>\n"
           "</html>\n";
}

std::string problemsSection(const Site& site, const std::string& path) {
    std::string items;
    size_t count = 0;
    for (const Problem& p : site.problems) {
        if (p.file != path) continue;
        ++count;
        items +=
            "<li><code>" + esc(where(p)) + "</code>: " + esc(p.text) +
            (p.refusesFile() ? " <span class=\"flag\">(the plug-in refuses the file)</span>" : "") +
            "</li>\n";
    }
    if (count == 0) return "<p class=\"clean\">Lint finds no problem in this file.</p>\n";
    return "<section class=\"problems\" aria-labelledby=\"problems\">\n<h2 id=\"problems\">" +
           std::to_string(count) + (count == 1 ? " problem" : " problems") +
           " found by lint</h2>\n<ul>\n" + items + "</ul>\n</section>\n";
}

size_t problemCount(const Site& site, const std::string& path) {
    size_t n = 0;
    for (const Problem& p : site.problems) n += p.file == path ? 1 : 0;
    return n;
}

std::string fileLink(const std::string& page, const std::string& name, size_t problems) {
    std::string html = "<a href=\"" + esc(page) + "\"><code>" + esc(name) + "</code></a>";
    if (problems != 0) {
        html += " <span class=\"flag\">" + std::to_string(problems) +
                (problems == 1 ? " problem" : " problems") + "</span>";
    }
    return html;
}

std::string classText(const DirectoryRow& row) {
    if (row.classes.empty()) return "none: the version range is empty";
    if (row.classes.size() == 1) return esc(row.classes.front().className);
    std::string text;
    for (const ClassSpan& span : row.classes) {
        if (!text.empty()) text += "<br>";
        text += esc(span.className) +
                (span.minVersion == span.maxVersion ? " (version " : " (versions ") +
                versionText(span.minVersion) +
                (span.minVersion == span.maxVersion ? "" : " to " + versionText(span.maxVersion)) +
                ")";
    }
    return text;
}

// "slave type 0x11 (line 2), ..." for the rows naming a file.
std::string usedBy(const Site& site, bool registers, int index) {
    std::string text;
    for (const DirectoryRow& row : site.rows) {
        if ((registers ? row.registerIndex : row.parameterIndex) != index) continue;
        text += (text.empty() ? "" : ", ") + std::string("<code>") + typeText(row.slaveType) +
                "</code> (line " + std::to_string(row.line) + ")";
    }
    return text.empty() ? "no directory row" : "slave types " + text;
}

std::string indexPage(const Site& site) {
    std::string html =
        pageStart("Data directory " + site.dataDir, "",
                  "Data directory <code>" + esc(site.dataDir) + "</code>",
                  std::to_string(site.rows.size()) + " directory rows, " +
                      std::to_string(site.registerFiles.size()) + " register files, " +
                      std::to_string(site.parameterFiles.size()) + " parameter files, " +
                      std::to_string(site.problems.size()) + " problems found by lint");
    html += problemsSection(site, site.directoryPath);
    html += "<h2>Directory file <code>" + esc(site.directoryPath) +
            "</code></h2>\n<p>A slave of type T and driver version V gets the first row with T "
            "and V in its range. The class is what the slave factory makes for such a "
            "slave.</p>\n<table class=\"dir\" id=\"rows\">\n<caption>Rows of the directory file, "
            "in file order</caption>\n<thead><tr><th scope=\"col\">Line</th><th "
            "scope=\"col\">Slave type</th><th scope=\"col\">Driver versions</th><th "
            "scope=\"col\">Class</th><th scope=\"col\">Register file</th><th "
            "scope=\"col\">Parameter file</th><th scope=\"col\">Lint</th></tr></thead>\n<tbody>\n";
    for (const DirectoryRow& row : site.rows) {
        std::string faults;
        size_t count = 0;
        for (const Problem& p : site.problems) {
            if (p.file == site.directoryPath && p.line == row.line) {
                faults += "<div><span class=\"flag\">problem:</span> " + esc(p.text) + "</div>";
                ++count;
            }
        }
        const auto file = [&](int index, const std::string& name, bool registers) -> std::string {
            if (name.empty()) return "none";
            if (index < 0) return "<code>" + esc(name) + "</code> (not read)";
            const std::string& page =
                registers ? site.registerFiles[index].page : site.parameterFiles[index].page;
            const std::string& path =
                registers ? site.registerFiles[index].path : site.parameterFiles[index].path;
            return fileLink(page, name, problemCount(site, path));
        };
        html += "<tr" + std::string(faults.empty() ? "" : " class=\"fault\"") + " data-line=\"" +
                std::to_string(row.line) + "\"><td class=\"num\">" + std::to_string(row.line) +
                "</td><td class=\"num\">" + typeText(row.slaveType) + "</td><td class=\"num\">" +
                versionText(row.minDriverVersion) + " to " + versionText(row.maxDriverVersion) +
                "</td><td>" + classText(row) + "</td><td>" +
                file(row.registerIndex, row.registers, true) + "</td><td>" +
                file(row.parameterIndex, row.parameters, false) + "</td><td>" +
                (count == 0 ? std::string("ok")
                            : "<span class=\"flag\">" + std::to_string(count) +
                                  (count == 1 ? " problem" : " problems") + "</span>") +
                "</td></tr>\n";
        // The problems under their row, across the table, so that long paths fit.
        if (count != 0)
            html += "<tr class=\"fault-text\"><td colspan=\"7\">" + faults + "</td></tr>\n";
    }
    html += "</tbody>\n</table>\n<h2>Files</h2>\n<ul class=\"files\">\n";
    for (const RegisterFile& f : site.registerFiles) {
        html +=
            "<li>registers: " + fileLink(f.page, f.name, problemCount(site, f.path)) + "</li>\n";
    }
    for (const ParameterFile& f : site.parameterFiles) {
        html +=
            "<li>parameters: " + fileLink(f.page, f.name, problemCount(site, f.path)) + "</li>\n";
    }
    return html + "</ul>\n" + pageEnd(site);
}

std::string registerTable(const RegisterFile& file) {
    std::map<std::string, const Register*> byName;
    for (const Register& r : file.registers) byName[r.name] = &r;
    std::set<std::string> anchored;
    std::string html =
        "<table class=\"regs\" id=\"registers\">\n<caption>Every line of the file after the "
        "header: one slice of a register each</caption>\n<thead><tr><th scope=\"col\">Line</th>"
        "<th scope=\"col\">Register</th><th scope=\"col\">Word</th><th scope=\"col\">Word "
        "bits</th><th scope=\"col\">Register bits</th><th scope=\"col\">Width</th><th "
        "scope=\"col\">Access</th><th scope=\"col\">Order</th><th "
        "scope=\"col\">Included</th></tr></thead>\n<tbody>\n";
    for (const Slice& s : file.slices) {
        const std::string line = "<td class=\"num\">" + std::to_string(s.line) + "</td>";
        if (!s.included) {
            // As the line gives them: the plug-in looks no further.
            html += "<tr class=\"excluded\" data-row=\"" + std::to_string(s.line) +
                    "\" data-register=\"" + esc(s.registerName) + "\">" + line + "<td><code>" +
                    esc(s.registerName) + "</code></td><td class=\"num\">" + wordText(s.address) +
                    "</td><td class=\"num\">" + std::to_string(s.startBit) + " to " +
                    std::to_string(s.endBit) + "</td><td>-</td><td>-</td><td><code>" +
                    esc(s.access()) + "</code></td><td class=\"num\">" + std::to_string(s.order) +
                    "</td><td>no: the plug-in skips the line</td></tr>\n";
            continue;
        }
        const Register* reg = byName.count(s.registerName) ? byName[s.registerName] : nullptr;
        std::string id;
        if (!s.registerName.empty() && anchored.insert(s.registerName).second) {
            id = " id=\"" + registerId(s.registerName) + "\"";
        }
        const uint32_t regHigh = s.registerLow + s.width() - 1;
        html +=
            "<tr" + id + " data-row=\"" + std::to_string(s.line) + "\" data-register=\"" +
            esc(s.registerName) + "\">" + line + "<td><code>" +
            (s.registerName.empty() ? "(no name)" : esc(s.registerName)) +
            "</code></td><td class=\"num\"><a href=\"#" + wordId(s.address) + "\">" +
            wordText(s.address) + "</a></td><td class=\"num\">" + bitSpan(s.highBit(), s.lowBit()) +
            (s.bitReversed() ? " reversed" : "") + "</td><td class=\"num\">" +
            (s.bitReversed() ? bitSpan(s.registerLow, regHigh) : bitSpan(regHigh, s.registerLow)) +
            "</td><td class=\"num\">" + std::to_string(s.width()) +
            (reg != nullptr && reg->width != s.width() ? " of " + std::to_string(reg->width) : "") +
            "</td><td><code>" + esc(s.access()) + "</code></td><td class=\"num\">" +
            std::to_string(s.order) + "</td><td>yes</td></tr>\n";
    }
    return html + "</tbody>\n</table>\n";
}

std::string legend() {
    return "<figure>" + legendPicture() +
           "<figcaption id=\"legend-text\">Each picture is one bus word, bit 15 at the left. A box "
           "is a slice of a register, labelled with the register and the register bits it "
           "holds (left end first), and links to the register's row; a box marked 1/2 is part "
           "of a register over several boxes and names the word of the next part. Hatched boxes "
           "are bit-reversed, with an arrow pointing to the register's most significant bit. "
           "Dashed empty cells are free bits. A crossed row marks bits two registers claim "
           "(conflict), a dotted row bits read-only registers share. Bits 16 to 31 appear, "
           "grey, only where a slice reaches them.</figcaption></figure>\n";
}

std::string registerPage(const Site& site, size_t index) {
    const RegisterFile& file = site.registerFiles[index];
    std::string params;
    std::set<int> seen;
    for (const DirectoryRow& row : site.rows) {
        if (row.registerIndex != static_cast<int>(index) || row.parameterIndex < 0 ||
            !seen.insert(row.parameterIndex).second) {
            continue;
        }
        const ParameterFile& p = site.parameterFiles[row.parameterIndex];
        params += (params.empty() ? "" : ", ") + fileLink(p.page, p.name, 0);
    }
    std::string html = pageStart("Register file " + file.name,
                                 "<a href=\"index.html\">Data directory</a> &rsaquo; register file",
                                 "Register file <code>" + esc(file.name) + "</code>",
                                 "Used by " + usedBy(site, true, static_cast<int>(index)) +
                                     (params.empty() ? "" : "; parameters in " + params) + ". " +
                                     std::to_string(file.registers.size()) + " registers.");
    html += pictureDefs() + problemsSection(site, file.path);
    if (file.refused) {
        html +=
            "<p class=\"notice\">The plug-in refuses this file because of a line listed "
            "above; the lines it can read are shown.</p>\n";
    }
    html += "<h2>Registers</h2>\n" + registerTable(file) + "<h2>Bus words</h2>\n" + legend();
    std::set<uint32_t> words;
    for (const Slice& s : file.slices) {
        if (s.included) words.insert(s.address);
    }
    for (uint32_t address : words) {
        const std::string id = wordId(address);
        html += "<section class=\"word\" id=\"" + id + "\">\n<h3>Word <code>" + wordText(address) +
                "</code></h3>\n<figure>" +
                wordPicture(file, address, "Bit fields of word " + wordText(address), "tbl-" + id) +
                "</figure>\n" +
                wordTable(file, address, "tbl-" + id,
                          "Word <code>" + wordText(address) + "</code>, from bit 15 down") +
                "</section>\n";
    }
    return html + pageEnd(site);
}

// "word 0x0000 bits 3:1" for the bits a setting writes, highest first.
std::string bitsWritten(const Setting& setting) {
    std::map<uint32_t, std::set<uint32_t>> words;
    for (const BitWrite& w : setting.bits) words[w.address].insert(w.bit);
    std::string text;
    for (const auto& word : words) {
        std::string spans;
        auto it = word.second.rbegin();
        while (it != word.second.rend()) {
            const uint32_t high = *it;
            uint32_t low = high;
            while (++it != word.second.rend() && *it + 1 == low) low = *it;
            spans += (spans.empty() ? "" : ", ") + bitSpan(high, low);
        }
        const bool one = word.second.size() == 1;
        text += (text.empty() ? "" : "; ") + std::string("word ") + wordText(word.first) +
                (one ? " bit " : " bits ") + spans;
    }
    return text;
}

std::string parameterSection(const RegisterFile* registers, const Parameter& parameter) {
    const std::string pid = "param-" + idPart(parameter.name);
    std::string html = "<section class=\"param\" id=\"" + pid + "\">\n<h3><code>" +
                       esc(parameter.name) + "</code> <span class=\"meta\">line " +
                       std::to_string(parameter.line) + ", " +
                       std::to_string(parameter.choices.size()) + " choices</span></h3>\n";
    html += "<table class=\"choices\" id=\"tbl-" + pid + "\">\n<caption>Choices of <code>" +
            esc(parameter.name) +
            "</code> in order, and what each writes</caption>\n<thead><tr><th "
            "scope=\"col\">Index</th><th scope=\"col\">Choice</th><th scope=\"col\">Line</th><th "
            "scope=\"col\">Writes</th></tr></thead>\n<tbody>\n";
    std::set<uint32_t> words;
    for (size_t i = 0; i < parameter.choices.size(); ++i) {
        const Choice& c = parameter.choices[i];
        std::string writes;
        for (const Setting& s : c.settings) {
            const std::string reg = registers != nullptr
                                        ? "<a href=\"" + esc(registers->page) + "#" +
                                              registerId(s.registerName) + "\"><code>" +
                                              esc(s.registerName) + "</code></a>"
                                        : "<code>" + esc(s.registerName) + "</code>";
            writes += "<div>" + reg + " = <code>" + esc(s.digits) + "</code>";
            if (!s.problem.empty()) {
                writes += " <span class=\"flag\">" + esc(s.problem) + "</span>";
            } else {
                writes += ": " + bitsWritten(s);
            }
            writes += "</div>";
            for (const BitWrite& w : s.bits) words.insert(w.address);
        }
        html += "<tr><td class=\"num\">" + std::to_string(i) + "</td><td><code>" + esc(c.name) +
                "</code></td><td class=\"num\">" + std::to_string(c.line) + "</td><td>" +
                (writes.empty() ? "nothing" : writes) + "</td></tr>\n";
    }
    html += "</tbody>\n</table>\n";
    if (registers != nullptr) {
        for (uint32_t address : words) {
            html += "<figure>" +
                    choicePicture(*registers, address, parameter,
                                  "Bits of word " + wordText(address) + " each choice of " +
                                      parameter.name + " writes",
                                  "tbl-" + pid) +
                    "<figcaption>Word <code>" + wordText(address) + "</code> of <code>" +
                    esc(registers->name) +
                    "</code>: its boxes (filled: the registers the parameter sets), then the "
                    "bits each choice writes (dark: 1, light: 0; empty: left as they "
                    "are).</figcaption></figure>\n";
        }
    }
    return html + "</section>\n";
}

// Names in code, each linked to hrefPrefix + its id part when hrefPrefix is not empty.
std::string codeList(const std::vector<std::string>& names, const std::string& hrefPrefix) {
    std::string text;
    for (const std::string& n : names) {
        const std::string code = "<code>" + esc(n) + "</code>";
        text += (text.empty() ? "" : ", ") +
                (hrefPrefix.empty()
                     ? code
                     : "<a href=\"" + esc(hrefPrefix) + idPart(n) + "\">" + code + "</a>");
    }
    return text;
}

std::string computedSection(const Site& site, const ParameterFile& file) {
    if (file.classes.empty()) return "";
    const RegisterFile* registers =
        file.registerFile >= 0 ? &site.registerFiles[file.registerFile] : nullptr;
    std::string html = "<h2>Computed parameters</h2>\n";
    for (const ClassUse& use : file.classes) {
        std::string types;
        for (int32_t t : use.slaveTypes) types += (types.empty() ? "" : ", ") + typeText(t);
        html += "<h3>" + esc(use.className) + " <span class=\"meta\">slave types " + types +
                "</span></h3>\n";
        bool throughChoices = false;
        for (const ComputedAction& c : *use.computed) {
            throughChoices = throughChoices || !c.choiceParameters.empty();
        }
        html +=
            "<table class=\"computed\">\n<caption>Parameters the class adds to those of the "
            "file, and the registers each reads or writes</caption>\n<thead><tr><th "
            "scope=\"col\">Parameters</th><th scope=\"col\">Registers</th>" +
            std::string(throughChoices ? "<th scope=\"col\">Through choice parameters</th>" : "") +
            "</tr></thead>\n<tbody>\n";
        const std::string regLinks = registers != nullptr ? registers->page + "#reg-" : "";
        for (const ComputedAction& c : *use.computed) {
            const std::string regs = codeList(c.registers, regLinks);
            html +=
                "<tr><td>" + codeList(c.parameters, "") + "</td><td>" +
                (regs.empty() ? "none: a value the host passes in" : regs) + "</td>" +
                (throughChoices ? "<td>" + codeList(c.choiceParameters, "#param-") + "</td>" : "") +
                "</tr>\n";
        }
        html += "</tbody>\n</table>\n";
    }
    return html;
}

std::string parameterPage(const Site& site, size_t index) {
    const ParameterFile& file = site.parameterFiles[index];
    const RegisterFile* registers =
        file.registerFile >= 0 ? &site.registerFiles[file.registerFile] : nullptr;
    std::string html =
        pageStart("Parameter file " + file.name,
                  "<a href=\"index.html\">Data directory</a> &rsaquo; parameter file",
                  "Parameter file <code>" + esc(file.name) + "</code>",
                  "Used by " + usedBy(site, false, static_cast<int>(index)) +
                      (registers != nullptr ? "; settings shown on the registers of " +
                                                  fileLink(registers->page, registers->name, 0)
                                            : "") +
                      ". " + std::to_string(file.parameters.size()) + " parameters.");
    html += pictureDefs() + problemsSection(site, file.path);
    if (file.refused) {
        html +=
            "<p class=\"notice\">The plug-in refuses this file because of a problem listed "
            "above, and a slave that names it is not created; the parameters that can be read "
            "are shown.</p>\n";
    }
    html += "<h2>Parameters</h2>\n<p>";
    for (const Parameter& p : file.parameters) {
        html += "<a href=\"#param-" + idPart(p.name) + "\"><code>" + esc(p.name) + "</code></a> ";
    }
    html += "</p>\n";
    for (const Parameter& p : file.parameters) html += parameterSection(registers, p);
    return html + computedSection(site, file) + pageEnd(site);
}

std::string pageName(const std::string& prefix, const std::string& name,
                     std::set<std::string>& taken) {
    std::string base = prefix;
    for (char c : name) {
        const bool plain = (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') ||
                           (c >= '0' && c <= '9') || c == '_' || c == '-' || c == '.';
        base += plain ? c : '_';
    }
    std::string page = base + ".html";
    for (int n = 2; !taken.insert(page).second; ++n)
        page = base + "-" + std::to_string(n) + ".html";
    return page;
}

}  // namespace

void assignPages(Site& site) {
    std::set<std::string> taken{"index.html", "style.css"};
    for (RegisterFile& f : site.registerFiles) f.page = pageName("regs-", f.name, taken);
    for (ParameterFile& f : site.parameterFiles) f.page = pageName("params-", f.name, taken);
}

std::vector<Page> renderSite(const Site& site) {
    std::vector<Page> pages;
    pages.push_back(Page{"index.html", indexPage(site)});
    pages.push_back(Page{"style.css", "/* " + std::string(MARKER) + " */" + STYLE});
    for (size_t i = 0; i < site.registerFiles.size(); ++i) {
        pages.push_back(Page{site.registerFiles[i].page, registerPage(site, i)});
    }
    for (size_t i = 0; i < site.parameterFiles.size(); ++i) {
        pages.push_back(Page{site.parameterFiles[i].page, parameterPage(site, i)});
    }
    return pages;
}

}  // namespace doc
}  // namespace nebu
