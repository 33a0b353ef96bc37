// `nebu doc` run as a user runs it: the demo data's site checked against the register files it
// draws, then a broken copy and the output directory's rules.
#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <string>
#include <vector>

#include "support/NebuRun.h"

namespace {

namespace fs = std::filesystem;

using nebutest::readFile;
using nebutest::Result;

const std::string DEMO = NEBU_TEST_DATA_DIR;

std::vector<std::string> columns(const std::string& line) {
    std::vector<std::string> out(1);
    for (char c : line) {
        if (c == ',') {
            out.emplace_back();
        } else {
            out.back() += c;
        }
    }
    return out;
}

// A register file's address column as the pages write words: 0x and 4 digits.
std::string word(const std::string& address) {
    return "0x" + std::string(address.size() < 4 ? 4 - address.size() : 0, '0') + address;
}

class DocTest : public ::testing::Test {
protected:
    void SetUp() override {
        root_ = nebutest::makeTempDir("nebu_doc_test_");
        site_ = root_ / "site";
        std::ofstream(root_ / "stdin.txt");
    }
    void TearDown() override { fs::remove_all(root_); }

    Result run(const std::vector<std::string>& args) {
        return nebutest::runNebu(args, root_ / "stdin.txt", root_ / "stderr.txt");
    }
    std::string page(const std::string& name) const { return readFile(site_ / name); }
    bool has(const std::string& name, const std::string& text) const {
        return page(name).find(text) != std::string::npos;
    }

    fs::path root_;
    fs::path site_;
};

// Every line of every register file has its table row, and its box with the word and bits of
// the line; a table of boxes adds register bits and links (bit-reversed, multi-word registers).
TEST_F(DocTest, DemoSiteDrawsEveryRegisterLine) {
    const Result r = run({"doc", DEMO, "-o", site_.string()});
    ASSERT_EQ(r.status, 0) << r.err;
    EXPECT_EQ(r.out, "doc " + DEMO + "/ -> " + site_.string() +
                         ": 9 directory rows, 7 register pages, 5 parameter pages, no problems\n");
    size_t registerFiles = 0;
    for (const auto& entry : fs::directory_iterator(DEMO)) {
        const std::string name = entry.path().filename().string();
        if (name.size() < 9 || name.compare(name.size() - 9, 9, "_regs.csv") != 0) continue;
        ++registerFiles;
        const std::string html = page("regs-" + name + ".html");
        EXPECT_TRUE(has("index.html", "<a href=\"regs-" + name + ".html\">")) << name;
        std::ifstream in(entry.path());
        std::string line;
        std::getline(in, line);
        for (uint32_t n = 2; std::getline(in, line); ++n) {
            const std::vector<std::string> c = columns(line);
            ASSERT_GE(c.size(), 9u) << name << ":" << n;
            const std::string at = name + ":" + std::to_string(n);
            const std::string row =
                "data-row=\"" + std::to_string(n) + "\" data-register=\"" + c[0] + "\"";
            const std::string box = "<g class=\"slice\" data-line=\"" + std::to_string(n) +
                                    "\" data-register=\"" + c[0] + "\"";
            if (c[8].find('n') != std::string::npos) {
                EXPECT_NE(html.find("<tr class=\"excluded\" " + row), std::string::npos) << at;
                EXPECT_EQ(html.find(box), std::string::npos) << at;
                continue;
            }
            const int high = std::max(std::stoi(c[3]), std::stoi(c[4]));
            const int low = std::min(std::stoi(c[3]), std::stoi(c[4]));
            EXPECT_NE(html.find(row + ">"), std::string::npos) << at;
            EXPECT_NE(html.find(box + " data-word=\"" + word(c[1]) + "\" data-bits=\"" +
                                (high == low ? std::to_string(high)
                                             : std::to_string(high) + ":" + std::to_string(low)) +
                                "\""),
                      std::string::npos)
                << at;
        }
    }
    EXPECT_EQ(registerFiles, 7u);

    struct Box {
        const char* file;
        uint32_t line;
        const char* name;
        const char* word;
        const char* bits;
        const char* registerBits;
        const char* link;  // the next part's word, or the register's row
    };
    const Box boxes[] = {
        {"ctrl_regs.csv", 9, "BUILD_ID", "0x0002", "15:0", "15:0", "#word-0x0003"},
        {"ctrl_regs.csv", 11, "LANE_MAP", "0x0004", "7:0", "0:7", "#reg-LANE_MAP"},
        {"ctrl_regs.csv", 15, "PATTERN", "0x0006", "15:12", "11:8", "#reg-PATTERN"},
        {"counter_regs.csv", 10, "CYCLE_COUNT", "0x0006", "15:0", "47:32", "#word-0x0004"},
    };
    for (const Box& b : boxes) {
        EXPECT_TRUE(has(std::string("regs-") + b.file + ".html",
                        std::string("<a href=\"") + b.link + "\"><g class=\"slice\" data-line=\"" +
                            std::to_string(b.line) + "\" data-register=\"" + b.name +
                            "\" data-word=\"" + b.word + "\" data-bits=\"" + b.bits +
                            "\" data-register-bits=\"" + b.registerBits + "\">"))
            << b.file << ":" << b.line;
    }

    // The factory's classes, shared and reversed bits, what a choice writes on the register's
    // bits (self_test sets CTRL_MODE=010 at bits 3:1), what a transceiver class computes.
    struct Text {
        const char* page;
        const char* text;
        bool present;
    };
    const Text texts[] = {
        {"index.html",
         "<td class=\"num\">0x15</td><td class=\"num\">1 to 0xffff</td><td>R3Qra transceiver</td>",
         true},
        {"regs-gpio_regs.csv.html", "data-claim=\"shared\" data-bits=\"7:0\"", true},
        {"regs-gpio_regs.csv.html", "data-claim=\"conflict\"", false},
        {"regs-ctrl_regs.csv.html", "<rect class=\"box rev\"", true},
        {"params-ctrl_params.csv.html",
         "data-choice=\"self_test\" data-bit=\"0\"><rect class=\"one\"", true},
        {"params-ctrl_params.csv.html",
         "data-choice=\"self_test\" data-bit=\"3\"><rect class=\"zero\"", true},
        {"params-ctrl_params.csv.html", "Computed parameters", false},
        {"params-vandu_r3qra_params.csv.html", "slave types 0x15, 0x43", true},
        {"params-vandu_r3qra_params.csv.html",
         "#reg-TX_OVERSAMPLE_MODE\"><code>TX_OVERSAMPLE_MODE</code>", true},
    };
    for (const Text& t : texts)
        EXPECT_EQ(has(t.page, t.text), t.present) << t.page << ": " << t.text;
}

// A broken copy still gets its pages, the reader's problems at the top with FILE:LINE; the
// output directory's rules: only nebu doc's own files are replaced, usage errors exit 2.
TEST_F(DocTest, BadInput) {
    const fs::path data = root_ / "data";
    fs::copy(DEMO, data, fs::copy_options::recursive);
    std::ofstream(data / "ctrl_regs.csv", std::ios::app)
        << "OVERLAP,0,0,2,5,overlaps the mode,rw,0,y\nWIDE,8,0,12,19,reaches bit "
           "19,rw,0,y\nSHORT,9\n";
    std::ofstream(data / "orvnebu_directory.csv", std::ios::app)
        << "0x21,1,0xFFFF,missing_regs.csv,,no such file\n";
    const std::string dir = data.string() + "/";
    const std::string out = site_.string();
    ASSERT_EQ(run({"doc", data.string(), "-o", out}).status, 0);
    const std::string regs = page("regs-ctrl_regs.csv.html");
    EXPECT_LT(regs.find("<section class=\"problems\""), regs.find("<h2>Registers</h2>"));
    for (const std::string& text :
         {"<code>" + dir + "ctrl_regs.csv:21</code>", std::string("The plug-in refuses this file"),
          std::string("data-claim=\"conflict\" data-bits=\"3:2\""),
          std::string("bits 31 to 16: slave words do not carry them")}) {
        EXPECT_NE(regs.find(text), std::string::npos) << text;
    }
    EXPECT_FALSE(fs::exists(site_ / "regs-missing_regs.csv.html"));

    std::ofstream(site_ / "notes.txt", std::ios::binary) << "mine\n";
    std::ofstream(site_ / "index.html", std::ios::app) << "<!-- edited -->\n";
    ASSERT_EQ(run({"doc", DEMO, "-o", out}).status, 0);
    EXPECT_FALSE(has("index.html", "edited"));
    std::ofstream(site_ / "style.css", std::ios::binary | std::ios::trunc)
        << "body { color: red }\n";
    std::ofstream(root_ / "file") << "x";
    const std::string blocked = (root_ / "file" / "site").string();
    const std::pair<std::vector<std::string>, std::string> cases[] = {
        {{"doc", DEMO}, "doc needs an output directory: -o DIR"},
        {{"doc", DEMO, "-x", "-o", out}, "unknown doc option '-x'"},
        {{"doc", DEMO, "-o", blocked},
         "doc: cannot make output directory '" + blocked + "': Not a directory"},
        {{"doc", DEMO, "-o", out},
         "doc: " + (site_ / "style.css").string() +
             " was not written by nebu doc; it is left alone "
             "and nothing is written"},
    };
    const std::string before = page("index.html");
    for (const auto& c : cases) {
        const Result r = run(c.first);
        EXPECT_EQ(r.status, 2) << c.second;
        EXPECT_EQ(r.err, "nebu: " + c.second + "\n");
    }
    EXPECT_EQ(page("style.css"), "body { color: red }\n");
    EXPECT_EQ(page("notes.txt"), "mine\n");
    EXPECT_EQ(page("index.html"), before);
}

}  // namespace
