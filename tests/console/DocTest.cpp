// `nebu doc` run as a user runs it: the demo data's site checked line by line against the
// register files it draws, a broken copy that still gets its pages, and the output directory's
// rules.
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>
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
        char pattern[] = "/tmp/nebu_doc_test_XXXXXX";
        ASSERT_NE(mkdtemp(pattern), nullptr);
        root_ = pattern;
        site_ = root_ / "site";
    }
    void TearDown() override { fs::remove_all(root_); }

    Result run(const std::vector<std::string>& args) {
        return nebutest::runNebu(args, "/dev/null", root_ / "stderr.txt");
    }
    std::string page(const std::string& name) const { return readFile(site_ / name); }

    fs::path root_;
    fs::path site_;
};

TEST_F(DocTest, DemoSiteDrawsEveryRegisterLine) {
    const Result r = run({"doc", DEMO, "-o", site_.string()});
    ASSERT_EQ(r.status, 0) << r.err;
    EXPECT_EQ(r.out, "doc " + DEMO + "/ -> " + site_.string() +
                         ": 9 directory rows, 7 register pages, 5 parameter pages, no problems\n");
    const std::string index = page("index.html");
    size_t registerFiles = 0;
    for (const auto& entry : fs::directory_iterator(DEMO)) {
        const std::string name = entry.path().filename().string();
        if (name.size() < 9 || name.compare(name.size() - 9, 9, "_regs.csv") != 0) continue;
        ++registerFiles;
        const std::string html = page("regs-" + name + ".html");
        EXPECT_NE(index.find("<a href=\"regs-" + name + ".html\">"), std::string::npos) << name;
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
            const int start = std::stoi(c[3]);
            const int end = std::stoi(c[4]);
            const int high = std::max(start, end);
            const int low = std::min(start, end);
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

    // Register bits, direction and the link of boxes whose register has more to it.
    struct Box {
        const char* file;
        uint32_t line;
        const char* name;
        const char* word;
        const char* bits;
        const char* registerBits;
        const char* link;
    };
    const Box boxes[] = {
        {"ctrl_regs.csv", 9, "BUILD_ID", "0x0002", "15:0", "15:0", "#word-0x0003"},
        {"ctrl_regs.csv", 10, "BUILD_ID", "0x0003", "15:0", "31:16", "#word-0x0002"},
        {"ctrl_regs.csv", 11, "LANE_MAP", "0x0004", "7:0", "0:7", "#reg-LANE_MAP"},
        {"ctrl_regs.csv", 15, "PATTERN", "0x0006", "15:12", "11:8", "#reg-PATTERN"},
        {"ctrl_regs.csv", 18, "TIMESTAMP", "0x0011", "7:0", "23:16", "#word-0x0010"},
        {"counter_regs.csv", 10, "CYCLE_COUNT", "0x0006", "15:0", "47:32", "#word-0x0004"},
        {"gpio_regs.csv", 5, "GPIO_IN_MIRRORED", "0x0001", "7:0", "0:7", "#reg-GPIO_IN_MIRRORED"},
    };
    for (const Box& b : boxes) {
        EXPECT_NE(
            page(std::string("regs-") + b.file + ".html")
                .find(std::string("<a href=\"") + b.link + "\"><g class=\"slice\" data-line=\"" +
                      std::to_string(b.line) + "\" data-register=\"" + b.name + "\" data-word=\"" +
                      b.word + "\" data-bits=\"" + b.bits + "\" data-register-bits=\"" +
                      b.registerBits + "\">"),
            std::string::npos)
            << b.file << ":" << b.line;
    }
    const std::string gpio = page("regs-gpio_regs.csv.html");
    EXPECT_NE(gpio.find("data-claim=\"shared\" data-bits=\"7:0\""), std::string::npos);
    EXPECT_EQ(gpio.find("data-claim=\"conflict\""), std::string::npos);
    EXPECT_NE(page("regs-ctrl_regs.csv.html").find("<rect class=\"box rev\""), std::string::npos);

    // What a choice writes, on the register's bits: self_test sets CTRL_MODE=010 (bits 3:1).
    const std::string params = page("params-ctrl_params.csv.html");
    for (const auto& bit : std::vector<std::pair<const char*, const char*>>{
             {"0", "one"}, {"1", "zero"}, {"2", "one"}, {"3", "zero"}, {"4", "one"}}) {
        EXPECT_NE(params.find(std::string("data-choice=\"self_test\" data-bit=\"") + bit.first +
                              "\"><rect class=\"" + bit.second + "\""),
                  std::string::npos)
            << "bit " << bit.first;
    }
    EXPECT_EQ(params.find("data-choice=\"custom\""), std::string::npos);
    // mode leaves CTRL_CLK_DIV alone: its box is drawn idle in mode's picture.
    const size_t mode = params.find("id=\"pic-mode-word-0x0000\"");
    ASSERT_NE(mode, std::string::npos);
    EXPECT_EQ(
        params.find("<rect class=\"box idle\"", mode),
        params.find("<rect class=\"box", params.find("data-register=\"CTRL_CLK_DIV\"", mode)));

    // The classes the factory makes, and what a transceiver class computes from which register.
    EXPECT_NE(index.find("<td class=\"num\">0x15</td><td class=\"num\">1 to 0xffff</td><td>R3Qra "
                         "transceiver</td>"),
              std::string::npos);
    EXPECT_NE(index.find("<td class=\"num\">0x11</td><td class=\"num\">1 to 0xffff</td><td>default "
                         "slave</td>"),
              std::string::npos);
    const std::string r3qra = page("params-vandu_r3qra_params.csv.html");
    EXPECT_NE(r3qra.find("slave types 0x15, 0x43"), std::string::npos);
    EXPECT_NE(r3qra.find("<tr><td><code>line_rate</code>"), std::string::npos);
    EXPECT_NE(r3qra.find("#reg-TX_OVERSAMPLE_MODE\"><code>TX_OVERSAMPLE_MODE</code>"),
              std::string::npos);
    EXPECT_EQ(page("params-ctrl_params.csv.html").find("Computed parameters"), std::string::npos);
}

TEST_F(DocTest, BrokenCopyStillGetsItsPages) {
    const fs::path data = root_ / "data";
    fs::copy(DEMO, data, fs::copy_options::recursive);
    std::ofstream(data / "ctrl_regs.csv", std::ios::app)
        << "OVERLAP,0,0,2,5,overlaps the mode,rw,0,y\n"
           "WIDE,8,0,12,19,reaches bit 19,rw,0,y\n"
           "SHORT,9\n";
    std::ofstream(data / "orvnebu_directory.csv", std::ios::app)
        << "0x21,1,0xFFFF,missing_regs.csv,,no such file\n";
    std::string params = readFile(data / "ctrl_params.csv");
    params.replace(params.find("CTRL_MODE=010"), 13, "CTRL_MODE=012");
    std::ofstream(data / "ctrl_params.csv", std::ios::trunc) << params;

    const Result r = run({"doc", data.string(), "-o", site_.string()});
    ASSERT_EQ(r.status, 0) << r.err;
    EXPECT_NE(r.out.find("problems\n"), std::string::npos) << r.out;
    const std::string dir = data.string() + "/";

    const std::string index = page("index.html");
    const size_t row = index.find("<tr class=\"fault\" data-line=\"11\">");
    ASSERT_NE(row, std::string::npos);
    EXPECT_NE(index.find("Unable to open OrvNebu register file: " + dir + "missing_regs.csv", row),
              std::string::npos);
    EXPECT_NE(index.find("<code>missing_regs.csv</code> (not read)", row), std::string::npos);

    const std::string regs = page("regs-ctrl_regs.csv.html");
    EXPECT_LT(regs.find("<section class=\"problems\""), regs.find("<h2>Registers</h2>"));
    EXPECT_NE(regs.find("<code>" + dir + "ctrl_regs.csv:21</code>"), std::string::npos);
    EXPECT_NE(regs.find("The plug-in refuses this file"), std::string::npos);
    EXPECT_NE(regs.find("data-claim=\"conflict\" data-bits=\"3:2\""), std::string::npos);
    EXPECT_NE(regs.find("data-claim=\"conflict\" data-bits=\"4\""), std::string::npos);
    EXPECT_NE(regs.find("data-register=\"WIDE\" data-word=\"0x0008\" data-bits=\"19:12\""),
              std::string::npos);
    EXPECT_NE(regs.find("<rect class=\"box beyond\""), std::string::npos);
    EXPECT_NE(regs.find("bits 31 to 16: slave words do not carry them"), std::string::npos);

    const std::string paramsPage = page("params-ctrl_params.csv.html");
    EXPECT_NE(paramsPage.find("<code>" + dir + "ctrl_params.csv:5</code>"), std::string::npos);
    EXPECT_NE(paramsPage.find("The plug-in refuses this file"), std::string::npos);
}

TEST_F(DocTest, OutputDirectoryRules) {
    const std::string out = site_.string();
    fs::create_directories(site_);
    std::ofstream(site_ / "notes.txt") << "mine\n";
    ASSERT_EQ(run({"doc", DEMO, "-o", out}).status, 0);
    // Its own pages are replaced; other files stay.
    std::ofstream(site_ / "index.html", std::ios::app) << "<!-- edited -->\n";
    ASSERT_EQ(run({"doc", DEMO, "-o", out}).status, 0);
    EXPECT_EQ(page("index.html").find("edited"), std::string::npos);
    EXPECT_EQ(page("notes.txt"), "mine\n");

    std::ofstream(site_ / "style.css", std::ios::trunc) << "body { color: red }\n";
    std::ofstream(root_ / "file") << "x";
    struct Case {
        std::vector<std::string> args;
        std::string err;
    };
    const Case cases[] = {
        {{"doc", DEMO}, "nebu: doc needs an output directory: -o DIR\n"},
        {{"doc", DEMO, "-o"}, "nebu: doc: -o needs a directory\n"},
        {{"doc", DEMO, "-x", "-o", out}, "nebu: unknown doc option '-x'\n"},
        {{"doc", DEMO, DEMO, "-o", out},
         "nebu: doc takes one data directory, not also '" + DEMO + "'\n"},
        {{"doc", (root_ / "none").string(), "-o", out},
         "nebu: doc: no data directory '" + (root_ / "none").string() + "'\n"},
        {{"doc", DEMO, "-o", (root_ / "file" / "site").string()},
         "nebu: doc: cannot make output directory '" + (root_ / "file" / "site").string() +
             "': Not a directory\n"},
        {{"doc", DEMO, "-o", out},
         "nebu: doc: " + out +
             "/style.css was not written by nebu doc; it is left alone and nothing is written\n"},
    };
    const std::string before = page("index.html");
    fs::remove(site_ / "regs-ctrl_regs.csv.html");
    for (const Case& c : cases) {
        const Result r = run(c.args);
        EXPECT_EQ(r.status, 2) << c.err;
        EXPECT_EQ(r.err, c.err);
        EXPECT_EQ(r.out, "");
    }
    EXPECT_EQ(page("style.css"), "body { color: red }\n");
    EXPECT_EQ(page("index.html"), before);
    EXPECT_FALSE(fs::exists(site_ / "regs-ctrl_regs.csv.html"));
}

}  // namespace
