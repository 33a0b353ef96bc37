// Bit-field pictures of bus words: boxes laid out on 16 bit columns (bit 15 at the left),
// labels fitted to their boxes (wrapped at underscores, upright when a box is narrow).
#include "DocSvg.h"

#include <algorithm>
#include <cstddef>
#include <set>
#include <string>
#include <utility>
#include <vector>

#include "DocHtml.h"

namespace nebu {
namespace doc {

namespace {

constexpr uint32_t BUS_BITS = 16;  // slave words carry bits 0 to 15
constexpr int COL = 56;            // a bit column
constexpr int PAD = 8;
constexpr int HEADER = 18;  // bit numbers
constexpr int LANE = 56;    // a row of boxes
constexpr int TALL_LANE = 132;
constexpr int CLAIM_ROW = 28;
constexpr int BAND_TITLE = 20;
constexpr int GAP = 14;
constexpr int ARROW_SPACE = 12;
constexpr int CHOICE_ROW = 24;
constexpr int CHOICE_LABEL = 176;
constexpr double CHAR_WIDTH = 0.6;  // of the font size, for the monospace faces named below
const char* const FONT = "DejaVu Sans Mono, Liberation Mono, Menlo, Consolas, monospace";

std::string num(int value) { return std::to_string(value); }

// A slice, or the part of it in one band (bits 0-15 or 16-31).
struct Piece {
    size_t slice = 0;
    uint32_t high = 0;
    uint32_t low = 0;
    int band = 0;
    size_t lane = 0;
};

struct Fit {
    std::vector<std::string> lines;
    size_t nameLines = 0;
    int size = 12;
    bool rotated = false;
};

// name split after its underscores into lines of at most width characters where it can be.
std::vector<std::string> wrapName(const std::string& name, size_t width) {
    std::vector<std::string> pieces;
    size_t start = 0;
    while (start < name.size()) {
        size_t end = name.find('_', start);
        end = end == std::string::npos ? name.size() : end + 1;
        pieces.push_back(name.substr(start, end - start));
        start = end;
    }
    std::vector<std::string> lines;
    for (const std::string& piece : pieces) {
        if (!lines.empty() && lines.back().size() + piece.size() <= width) {
            lines.back() += piece;
        } else {
            lines.push_back(piece);
        }
    }
    if (lines.empty()) lines.push_back(name);
    return lines;
}

int lineHeight(int size) { return size + size / 5 + 1; }

bool tryFit(const std::string& name, const std::vector<std::string>& extra, int w, int h, int size,
            bool rotated, Fit& fit) {
    const int along = rotated ? h : w;
    const int across = rotated ? w : h;
    const int chars = static_cast<int>((along - 6) / (CHAR_WIDTH * size));
    if (chars < 1) return false;
    const size_t limit = static_cast<size_t>(chars);
    fit.lines = wrapName(name, limit);
    fit.nameLines = fit.lines.size();
    fit.lines.insert(fit.lines.end(), extra.begin(), extra.end());
    for (const std::string& line : fit.lines) {
        if (line.size() > limit) return false;
    }
    fit.size = size;
    fit.rotated = rotated;
    return static_cast<int>(fit.lines.size()) * lineHeight(size) <= across - 4;
}

std::string shorten(const std::string& text, size_t chars) {
    if (text.size() <= chars) return text;
    return chars <= 1 ? text.substr(0, chars) : text.substr(0, chars - 1) + "~";
}

// The best label for a box of inner size w x h; false when only a squeezed one fits.
bool fitLabel(const std::string& name, const std::vector<std::vector<std::string>>& extras, int w,
              int h, bool mayTurn, Fit& fit) {
    for (const auto& extra : extras) {
        for (int size : {12, 11, 10}) {
            if (tryFit(name, extra, w, h, size, false, fit)) return true;
        }
    }
    if (mayTurn) {
        for (const auto& extra : extras) {
            for (int size : {12, 11, 10, 9}) {
                if (tryFit(name, extra, w, h, size, true, fit)) return true;
            }
        }
    }
    // Squeezed: the name cut to one line (the table and the tooltip carry it whole).
    fit.size = 9;
    fit.rotated = mayTurn && h > w;
    const int along = fit.rotated ? h : w;
    const size_t chars = static_cast<size_t>(std::max(1.0, (along - 4) / (CHAR_WIDTH * 9)));
    fit.lines = {shorten(name, chars)};
    fit.nameLines = 1;
    if (!extras.empty() && !extras.back().empty()) {
        fit.lines.push_back(shorten(extras.back().front(), chars));
    }
    return false;
}

// halo: a white outline that keeps the text readable over a hatched box.
void drawLabel(std::string& svg, const Fit& fit, int cx, int cy, bool halo) {
    const int lh = lineHeight(fit.size);
    const int count = static_cast<int>(fit.lines.size());
    svg += std::string("<text class=\"lbl") + (halo ? " halo" : "") +
           "\" text-anchor=\"middle\" font-size=\"" + num(fit.size) + "\"";
    if (fit.rotated) svg += " transform=\"rotate(-90 " + num(cx) + " " + num(cy) + ")\"";
    svg += ">";
    const int first = cy - (count - 1) * lh / 2 + fit.size * 7 / 20;
    for (int i = 0; i < count; ++i) {
        svg += "<tspan x=\"" + num(cx) + "\" y=\"" + num(first + i * lh) + "\"";
        if (static_cast<size_t>(i) < fit.nameLines) svg += " class=\"nm\"";
        svg += ">" + esc(fit.lines[static_cast<size_t>(i)]) + "</tspan>";
    }
    svg += "</text>";
}

// Register bit carried by a word bit of the slice.
uint32_t registerBit(const Slice& s, uint32_t bit) {
    return s.bitReversed() ? s.registerLow + (s.startBit - bit)
                           : s.registerLow + (bit - s.startBit);
}

const Register* registerOf(const RegisterFile& file, const std::string& name) {
    for (const Register& r : file.registers) {
        if (r.name == name) return &r;
    }
    return nullptr;
}

std::string openSvg(const std::string& id, int width, int height, const std::string& title,
                    const std::string& describedBy) {
    return "<svg xmlns=\"http://www.w3.org/2000/svg\" class=\"bits\" role=\"img\" id=\"" + id +
           "\" viewBox=\"0 0 " + num(width) + " " + num(height) + "\" width=\"" + num(width) +
           "\" height=\"" + num(height) + "\" font-family=\"" + FONT + "\" aria-labelledby=\"" +
           id + "-t\" aria-describedby=\"" + describedBy + "\"><title id=\"" + id + "-t\">" +
           esc(title) + "</title>";
}

// The layout of one word's boxes, shared by both kinds of picture.
class WordLayout {
public:
    WordLayout(const RegisterFile& file, uint32_t address, int left, bool lowBandOnly,
               const std::string& linkPage)
        : file_(file), address_(address), left_(left), linkPage_(linkPage), claims_(32) {
        for (size_t i = 0; i < file.slices.size(); ++i) {
            const Slice& s = file.slices[i];
            if (!s.included || s.address != address) continue;
            for (uint32_t b = s.lowBit(); b <= s.highBit(); ++b) claims_[b].push_back(i);
            if (s.lowBit() < BUS_BITS) {
                pieces_.push_back(Piece{i, std::min(s.highBit(), BUS_BITS - 1), s.lowBit(), 0, 0});
            }
            if (s.highBit() >= BUS_BITS && !lowBandOnly) {
                pieces_.push_back(Piece{i, s.highBit(), std::max(s.lowBit(), BUS_BITS), 1, 0});
                upperShown_ = true;
            }
        }
        assignLanes();
    }

    void setTouched(std::set<std::string> names) { touched_ = std::move(names); }
    int width() const { return left_ + 16 * COL + PAD; }
    bool upperShown() const { return upperShown_; }

    // Draws the band's title, bit numbers, boxes and claim row from y; returns the y after.
    int drawBand(std::string& svg, int band, int y, bool claimRow) const {
        if (band == 1) {
            svg += "<text class=\"band\" x=\"" + num(left_) + "\" y=\"" + num(y + 13) +
                   "\">bits 31 to 16: slave words do not carry them (reads give 0, writes are "
                   "lost)</text>";
            y += BAND_TITLE;
        }
        const uint32_t base = band == 1 ? BUS_BITS : 0;
        for (uint32_t b = 0; b < BUS_BITS; ++b) {
            svg += "<text class=\"bitno\" text-anchor=\"middle\" x=\"" +
                   num(columnX(base + b) + COL / 2) + "\" y=\"" + num(y + 13) + "\">" +
                   num(static_cast<int>(base + b)) + "</text>";
        }
        y += HEADER;
        const std::vector<int> heights = laneHeights(band);
        drawFreeBits(svg, band, y, heights.empty() ? LANE : heights.front());
        for (size_t lane = 0; lane < heights.size(); ++lane) {
            for (const Piece& p : pieces_) {
                if (p.band == band && p.lane == lane) drawBox(svg, p, y, heights[lane]);
            }
            y += heights[lane];
        }
        if (heights.empty()) y += LANE;
        if (claimRow && !claimRuns(band).empty()) {
            drawClaims(svg, band, y + 4);
            y += CLAIM_ROW + 4;
        }
        return y;
    }

    // Vertical lines at the boxes' edges of the low band, from y to bottom.
    void drawBoxEdges(std::string& svg, int y, int bottom) const {
        std::set<int> edges{columnX(15), columnX(0) + COL};
        for (const Piece& p : pieces_) {
            if (p.band != 0 || p.lane != 0) continue;
            edges.insert(columnX(p.high));
            edges.insert(columnX(p.low) + COL);
        }
        for (int x : edges) {
            svg += "<line class=\"edge\" x1=\"" + num(x) + "\" y1=\"" + num(y) + "\" x2=\"" +
                   num(x) + "\" y2=\"" + num(bottom) + "\"/>";
        }
    }

    int columnX(uint32_t bit) const { return left_ + static_cast<int>(15 - bit % 16) * COL; }

    // The picture's facts, from the highest bit down: a row per slice, per run of free bits
    // and per run of bits claimed twice.
    std::string table(const std::string& id, const std::string& caption) const {
        std::vector<std::pair<uint32_t, std::string>> rows;
        for (size_t i = 0; i < file_.slices.size(); ++i) {
            const Slice& s = file_.slices[i];
            if (s.included && s.address == address_) rows.emplace_back(s.highBit(), sliceRow(i));
        }
        uint32_t bit = BUS_BITS;
        while (bit-- > 0) {
            if (!claims_[bit].empty()) continue;
            uint32_t low = bit;
            while (low > 0 && claims_[low - 1].empty()) --low;
            rows.emplace_back(bit, "<tr class=\"free\"><td class=\"num\">" + bitSpan(bit, low) +
                                       "</td><td colspan=\"4\">free</td></tr>");
            bit = low;
        }
        for (int band : {1, 0}) {
            for (const ClaimRun& run : claimRuns(band)) {
                rows.emplace_back(
                    run.high, "<tr class=\"claimed\"><td class=\"num\">" +
                                  bitSpan(run.high, run.low) + "</td><td colspan=\"4\"><strong>" +
                                  (run.conflict ? "conflict" : "shared") +
                                  "</strong>: " + (run.conflict ? "claimed by " : "read by ") +
                                  esc(ownerNames(run.owners)) + "</td></tr>");
            }
        }
        std::stable_sort(rows.begin(), rows.end(),
                         [](const auto& a, const auto& b) { return a.first > b.first; });
        std::string html =
            "<table class=\"bits\" id=\"" + id + "\"><caption>" + caption +
            "</caption><thead><tr><th scope=\"col\">Word bits</th><th "
            "scope=\"col\">Register</th><th scope=\"col\">Register bits</th><th "
            "scope=\"col\">Access</th><th scope=\"col\">Notes</th></tr></thead><tbody>";
        for (const auto& row : rows) html += row.second;
        return html + "</tbody></table>";
    }

private:
    std::string sliceRow(size_t i) const {
        const Slice& s = file_.slices[i];
        std::vector<std::string> notes;
        if (s.bitReversed()) {
            notes.push_back("bit-reversed: register bit " + std::to_string(s.registerLow) +
                            " at word bit " + std::to_string(s.startBit));
        }
        if (s.highBit() >= BUS_BITS)
            notes.push_back("bits 16 to 31 are not carried by slave words");
        const Register* reg = registerOf(file_, s.registerName);
        if (reg != nullptr && reg->slices.size() > 1) {
            const size_t k = partIndex(*reg, i);
            std::string note =
                "part " + std::to_string(k + 1) + " of " + std::to_string(reg->slices.size());
            const Slice& next = file_.slices[reg->slices[(k + 1) % reg->slices.size()]];
            if (next.address != address_) {
                note += ", next part in word <a href=\"#" + wordId(next.address) + "\">" +
                        wordText(next.address) + "</a>";
            }
            notes.push_back(note);
        }
        std::string joined;
        for (const std::string& n : notes) joined += (joined.empty() ? "" : "; ") + n;
        return "<tr data-register=\"" + esc(s.registerName) + "\"><td class=\"num\">" +
               bitSpan(s.highBit(), s.lowBit()) + "</td><td><a href=\"#" +
               registerId(s.registerName) + "\"><code>" + esc(s.registerName) +
               "</code></a></td><td class=\"num\">" +
               bitSpan(registerBit(s, s.highBit()), registerBit(s, s.lowBit())) +
               "</td><td><code>" + esc(s.access()) + "</code></td><td>" + joined + "</td></tr>";
    }

    void assignLanes() {
        std::vector<std::vector<const Piece*>> lanes[2];
        for (Piece& p : pieces_) {
            auto& bandLanes = lanes[p.band];
            size_t lane = 0;
            for (; lane < bandLanes.size(); ++lane) {
                bool free = true;
                for (const Piece* other : bandLanes[lane]) {
                    if (p.low <= other->high && other->low <= p.high) free = false;
                }
                if (free) break;
            }
            if (lane == bandLanes.size()) bandLanes.emplace_back();
            p.lane = lane;
            bandLanes[lane].push_back(&p);
        }
    }

    std::vector<int> laneHeights(int band) const {
        std::vector<int> heights;
        for (const Piece& p : pieces_) {
            if (p.band != band) continue;
            if (heights.size() <= p.lane) heights.resize(p.lane + 1, LANE);
            Fit fit;
            if (!label(p, LANE, fit)) heights[p.lane] = TALL_LANE;
        }
        return heights;
    }

    // The lines under the name, longest first; false when the label had to be squeezed.
    bool label(const Piece& p, int laneHeight, Fit& fit) const {
        const Slice& s = file_.slices[p.slice];
        const std::string range =
            "[" + bitSpan(registerBit(s, p.high), registerBit(s, p.low)) + "]";
        std::vector<std::vector<std::string>> extras;
        const Register* reg = registerOf(file_, s.registerName);
        if (reg != nullptr && reg->slices.size() > 1) {
            const size_t k = partIndex(*reg, p.slice);
            const std::string part =
                std::to_string(k + 1) + "/" + std::to_string(reg->slices.size());
            const Slice& next = file_.slices[reg->slices[(k + 1) % reg->slices.size()]];
            if (next.address != address_) {
                extras.push_back({range, part + ", next " + wordText(next.address)});
            }
            extras.push_back({range, part});
        }
        extras.push_back({range});
        const int w = static_cast<int>(p.high - p.low + 1) * COL - 6;
        const int h = laneHeight - 6 - (s.bitReversed() ? ARROW_SPACE : 0);
        return fitLabel(s.registerName, extras, w, h, laneHeight == TALL_LANE, fit);
    }

    static size_t partIndex(const Register& reg, size_t slice) {
        return static_cast<size_t>(std::find(reg.slices.begin(), reg.slices.end(), slice) -
                                   reg.slices.begin());
    }

    std::string link(const Slice& s) const {
        const Register* reg = registerOf(file_, s.registerName);
        if (reg != nullptr && linkPage_.empty() && reg->slices.size() > 1) {
            const size_t k = partIndex(*reg, static_cast<size_t>(&s - file_.slices.data()));
            const Slice& next = file_.slices[reg->slices[(k + 1) % reg->slices.size()]];
            if (next.address != address_) return "#" + wordId(next.address);
        }
        return linkPage_ + "#" + registerId(s.registerName);
    }

    void drawBox(std::string& svg, const Piece& p, int y, int laneHeight) const {
        const Slice& s = file_.slices[p.slice];
        const int x = columnX(p.high) + 2;
        const int w = static_cast<int>(p.high - p.low + 1) * COL - 4;
        const int top = y + 2;
        const int h = laneHeight - 4;
        const bool idle = !touched_.empty() && touched_.count(s.registerName) == 0;
        const char* kind = idle              ? "box idle"
                           : p.band == 1     ? "box beyond"
                           : s.bitReversed() ? "box rev"
                                             : "box";
        svg += "<a href=\"" + esc(link(s)) + "\"><g class=\"slice\" data-line=\"" +
               std::to_string(s.line) + "\" data-register=\"" + esc(s.registerName) +
               "\" data-word=\"" + wordText(s.address) + "\" data-bits=\"" +
               bitSpan(s.highBit(), s.lowBit()) + "\" data-register-bits=\"" +
               bitSpan(registerBit(s, s.highBit()), registerBit(s, s.lowBit())) + "\">";
        svg += "<title>" + esc(s.registerName) + ": register bits " +
               bitSpan(registerBit(s, p.high), registerBit(s, p.low)) + " in word bits " +
               bitSpan(p.high, p.low) + (s.bitReversed() ? ", bit-reversed" : "") + " (line " +
               std::to_string(s.line) + ")</title>";
        svg += "<rect class=\"" + std::string(kind) + "\" x=\"" + num(x) + "\" y=\"" + num(top) +
               "\" width=\"" + num(w) + "\" height=\"" + num(h) + "\" rx=\"3\"/>";
        for (uint32_t b = p.low + 1; b <= p.high; ++b) {
            const int tx = columnX(b) + COL;
            svg += "<path class=\"tick\" d=\"M" + num(tx) + " " + num(top) + "v5M" + num(tx) + " " +
                   num(top + h) + "v-5\"/>";
        }
        Fit fit;
        label(p, laneHeight, fit);
        const int arrow = s.bitReversed() ? ARROW_SPACE : 0;
        drawLabel(svg, fit, x + w / 2, top + (h - arrow) / 2, p.band == 1 || s.bitReversed());
        if (s.bitReversed()) {
            // Toward the register's most significant bit, which sits at the low word bit.
            const int ay = top + h - 7;
            svg += "<path class=\"arrow\" d=\"M" + num(x + 8) + " " + num(ay) + "H" +
                   num(x + w - 12) + "\"/><path class=\"head\" d=\"M" + num(x + w - 6) + " " +
                   num(ay) + "l-8 -4v8z\"/><text class=\"msb\" x=\"" + num(x + w - 16) + "\" y=\"" +
                   num(ay - 3) + "\" text-anchor=\"end\">MSB</text>";
        }
        svg += "</g></a>";
    }

    void drawFreeBits(std::string& svg, int band, int y, int height) const {
        for (uint32_t b = 0; b < BUS_BITS; ++b) {
            const uint32_t bit = static_cast<uint32_t>(band) * BUS_BITS + b;
            if (!claims_[bit].empty()) continue;
            svg += "<rect class=\"" + std::string(band == 1 ? "free beyond" : "free") +
                   "\" data-free=\"" + std::to_string(bit) + "\" x=\"" + num(columnX(bit) + 2) +
                   "\" y=\"" + num(y + 2) + "\" width=\"" + num(COL - 4) + "\" height=\"" +
                   num(height - 4) + "\" rx=\"3\"><title>bit " + std::to_string(bit) +
                   " free</title></rect>";
        }
    }

    // Runs of bits claimed by more than one slice, within a band: "conflict" when one of
    // them writes or one register claims a bit twice, "shared" for read-only views.
    struct ClaimRun {
        uint32_t high = 0;
        uint32_t low = 0;
        std::vector<size_t> owners;
        bool conflict = false;
    };
    std::vector<ClaimRun> claimRuns(int band) const {
        std::vector<ClaimRun> runs;
        const uint32_t base = static_cast<uint32_t>(band) * BUS_BITS;
        for (uint32_t bit = base; bit < base + BUS_BITS; ++bit) {
            const std::vector<size_t>& owners = claims_[bit];
            if (owners.size() < 2) continue;
            if (!runs.empty() && runs.back().high + 1 == bit && runs.back().owners == owners) {
                runs.back().high = bit;
            } else {
                runs.push_back(ClaimRun{bit, bit, owners, isConflict(owners)});
            }
        }
        return runs;
    }

    std::string ownerNames(const std::vector<size_t>& owners) const {
        std::string names;
        for (size_t i : owners) {
            if (!names.empty()) names += " and ";
            names += file_.slices[i].registerName + " (line " +
                     std::to_string(file_.slices[i].line) + ")";
        }
        return names;
    }

    void drawClaims(std::string& svg, int band, int y) const {
        for (const ClaimRun& run : claimRuns(band)) {
            const int x = columnX(run.high) + 2;
            const int w = static_cast<int>(run.high - run.low + 1) * COL - 4;
            const char* word = run.conflict ? "conflict" : "shared";
            const std::string bits = bitSpan(run.high, run.low);
            svg += std::string("<g class=\"claim\" data-claim=\"") + word + "\" data-bits=\"" +
                   bits + "\"><title>bits " + bits + " " +
                   (run.conflict ? "claimed by " : "read by ") + esc(ownerNames(run.owners)) +
                   "</title><rect class=\"" + word + "\" x=\"" + num(x) + "\" y=\"" + num(y) +
                   "\" width=\"" + num(w) + "\" height=\"" + num(CLAIM_ROW - 4) + "\"/>";
            // A one-bit run has no room for its word: the pattern and the table tell it.
            if (w >= 64) {
                svg += "<rect class=\"tag\" x=\"" + num(x + w / 2 - 30) + "\" y=\"" + num(y + 4) +
                       "\" width=\"60\" height=\"15\" rx=\"2\"/><text class=\"tagtext\" "
                       "text-anchor=\"middle\" x=\"" +
                       num(x + w / 2) + "\" y=\"" + num(y + 15) + "\">" + word + "</text>";
            }
            svg += "</g>";
        }
    }

    bool isConflict(const std::vector<size_t>& owners) const {
        std::set<std::string> names;
        for (size_t i : owners) {
            const Slice& s = file_.slices[i];
            if (s.access().find('w') != std::string::npos) return true;
            if (!names.insert(s.registerName).second) return true;
        }
        return false;
    }

    const RegisterFile& file_;
    uint32_t address_;
    int left_;
    std::string linkPage_;
    // When not empty, the registers whose boxes stand out; the others are drawn idle.
    std::set<std::string> touched_;
    std::vector<std::vector<size_t>> claims_;  // per word bit: the slices on it
    std::vector<Piece> pieces_;
    bool upperShown_ = false;
};

}  // namespace

std::string pictureDefs() {
    return "<svg class=\"defs\" width=\"0\" height=\"0\" aria-hidden=\"true\" focusable=\"false\">"
           "<defs>"
           "<pattern id=\"p-rev\" width=\"8\" height=\"8\" patternUnits=\"userSpaceOnUse\">"
           "<rect width=\"8\" height=\"8\" fill=\"#f4f4f4\"/>"
           "<path d=\"M0 8L8 0\" stroke=\"#9a9a9a\" stroke-width=\"1\"/></pattern>"
           "<pattern id=\"p-beyond\" width=\"6\" height=\"6\" patternUnits=\"userSpaceOnUse\">"
           "<rect width=\"6\" height=\"6\" fill=\"#e4e4e4\"/>"
           "<path d=\"M0 6L6 0M-1 1L1 -1M5 7L7 5\" stroke=\"#707070\" stroke-width=\"1\"/>"
           "</pattern>"
           "<pattern id=\"p-conflict\" width=\"8\" height=\"8\" patternUnits=\"userSpaceOnUse\">"
           "<rect width=\"8\" height=\"8\" fill=\"#ffffff\"/>"
           "<path d=\"M0 0L8 8M8 0L0 8\" stroke=\"#1a1a1a\" stroke-width=\"1.4\"/></pattern>"
           "<pattern id=\"p-shared\" width=\"6\" height=\"6\" patternUnits=\"userSpaceOnUse\">"
           "<rect width=\"6\" height=\"6\" fill=\"#ffffff\"/>"
           "<circle cx=\"3\" cy=\"3\" r=\"1.1\" fill=\"#404040\"/></pattern>"
           "</defs></svg>\n";
}

std::string legendPicture() {
    struct Sample {
        const char* rectClass;
        const char* text;
        const char* detail;
    };
    const Sample samples[] = {
        {"box", "NAME [7:0]", "a slice: register, register bits it holds"},
        {"box rev", "NAME [0:7]", "bit-reversed slice: arrow toward its MSB"},
        {"free", "", "a free bit"},
        {"box beyond", "NAME [3:0]", "bits 16 to 31: not on the bus"},
        {"conflict", "conflict", "bits two registers claim (one writes)"},
        {"shared", "shared", "bits read-only registers share"},
    };
    const int cell = 448;
    const int row = 36;
    const int box = 116;
    std::string svg = openSvg("legend", 2 * cell + 2 * PAD, 3 * row + 2 * PAD,
                              "Legend of the bit-field pictures", "legend-text");
    int i = 0;
    for (const Sample& s : samples) {
        const std::string kind = s.rectClass;
        const int x = PAD + (i % 2) * cell;
        const int y = PAD + (i / 2) * row;
        svg += "<rect class=\"" + kind + "\" x=\"" + num(x) + "\" y=\"" + num(y) + "\" width=\"" +
               num(box) + "\" height=\"" + num(row - 8) + "\" rx=\"3\"/>";
        if (kind == "box rev") {
            svg += "<path class=\"arrow\" d=\"M" + num(x + 8) + " " + num(y + 22) + "H" +
                   num(x + box - 12) + "\"/><path class=\"head\" d=\"M" + num(x + box - 6) + " " +
                   num(y + 22) + "l-8 -4v8z\"/>";
        }
        const bool tag = kind == "conflict" || kind == "shared";
        if (tag) {
            svg += "<rect class=\"tag\" x=\"" + num(x + box / 2 - 30) + "\" y=\"" + num(y + 6) +
                   "\" width=\"60\" height=\"15\" rx=\"2\"/>";
        }
        if (s.text[0] != '\0') {
            svg += "<text class=\"" + std::string(tag ? "tagtext" : "lbl nm halo") + "\" x=\"" +
                   num(x + box / 2) + "\" y=\"" + num(y + (tag ? 17 : 16)) +
                   "\" font-size=\"11\" text-anchor=\"middle\">" + s.text + "</text>";
        }
        svg += "<text class=\"cap\" x=\"" + num(x + box + 12) + "\" y=\"" + num(y + 18) + "\">" +
               s.detail + "</text>";
        ++i;
    }
    return svg + "</svg>";
}

std::string wordPicture(const RegisterFile& file, uint32_t address, const std::string& title,
                        const std::string& describedBy) {
    const WordLayout layout(file, address, PAD, false, "");
    std::string body;
    int y = PAD;
    if (layout.upperShown()) y = layout.drawBand(body, 1, y, true) + GAP;
    y = layout.drawBand(body, 0, y, true) + PAD;
    return openSvg("pic-" + wordId(address), layout.width(), y, title, describedBy) + body +
           "</svg>";
}

std::string wordTable(const RegisterFile& file, uint32_t address, const std::string& id,
                      const std::string& caption) {
    return WordLayout(file, address, PAD, false, "").table(id, caption);
}

std::string choicePicture(const RegisterFile& file, uint32_t address, const Parameter& parameter,
                          const std::string& title, const std::string& describedBy) {
    WordLayout layout(file, address, CHOICE_LABEL, true, file.page);
    std::set<std::string> touched;
    for (const Choice& choice : parameter.choices) {
        for (const Setting& setting : choice.settings) touched.insert(setting.registerName);
    }
    layout.setTouched(touched);
    std::string body;
    int y = layout.drawBand(body, 0, PAD, false);
    const int rowsTop = y + 4;
    body += "<text class=\"colhead\" x=\"" + num(CHOICE_LABEL - 10) + "\" y=\"" + num(rowsTop - 8) +
            "\" text-anchor=\"end\">choice</text>";
    y = rowsTop;
    const size_t labelChars = static_cast<size_t>((CHOICE_LABEL - 16) / (CHAR_WIDTH * 12));
    for (size_t c = 0; c < parameter.choices.size(); ++c) {
        const Choice& choice = parameter.choices[c];
        if (c % 2 == 1) {
            body += "<rect class=\"stripe\" x=\"" + num(PAD) + "\" y=\"" + num(y) + "\" width=\"" +
                    num(layout.width() - 2 * PAD) + "\" height=\"" + num(CHOICE_ROW) + "\"/>";
        }
        body += "<text class=\"choice\" x=\"" + num(CHOICE_LABEL - 10) + "\" y=\"" + num(y + 16) +
                "\" text-anchor=\"end\">" + esc(shorten(choice.name, labelChars)) + "</text>";
        for (const Setting& setting : choice.settings) {
            for (const BitWrite& w : setting.bits) {
                if (w.address != address || w.bit >= BUS_BITS) continue;
                const int x = layout.columnX(w.bit);
                body += "<g class=\"write\" data-choice=\"" + esc(choice.name) + "\" data-bit=\"" +
                        std::to_string(w.bit) + "\"><rect class=\"" +
                        std::string(w.one ? "one" : "zero") + "\" x=\"" + num(x + 6) + "\" y=\"" +
                        num(y + 3) + "\" width=\"" + num(COL - 12) + "\" height=\"" +
                        num(CHOICE_ROW - 6) + "\" rx=\"2\"/><text class=\"" +
                        std::string(w.one ? "digit1" : "digit0") + "\" x=\"" + num(x + COL / 2) +
                        "\" y=\"" + num(y + 16) + "\" text-anchor=\"middle\">" +
                        (w.one ? "1" : "0") + "</text></g>";
            }
        }
        y += CHOICE_ROW;
    }
    layout.drawBoxEdges(body, rowsTop, y);
    y += PAD;
    return openSvg("pic-" + idPart(parameter.name) + "-" + wordId(address), layout.width(), y,
                   title, describedBy) +
           body + "</svg>";
}

}  // namespace doc
}  // namespace nebu
