// Parameter definition files: the row format, every message, the per-session cache, printing.
#include <gtest/gtest.h>

#include <atomic>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <sstream>
#include <stdexcept>
#include <string>
#include <thread>
#include <vector>

#include "base/Orv_AbortException.h"
#include "hostsim/Sim.h"
#include "params/OrvNebu_DefaultParamReader.h"
#include "support/TestHost.h"

using OrvRT::Orv_AbortException;
using OrvRT::OrvNebu_ActionsMap;
using OrvRT::OrvNebu_DefaultParamReader;
using OrvRT::OrvNebu_ParamChoiceAction;

namespace {

struct Said {
    uint32_t handle;
    uint32_t severity;
    std::string text;
    bool operator==(const Said& o) const {
        return handle == o.handle && severity == o.severity && text == o.text;
    }
};

std::ostream& operator<<(std::ostream& os, const Said& m) {
    return os << "{" << m.handle << ", " << m.severity << ", \"" << m.text << "\"}";
}

class ParamReader : public TestHost {
protected:
    static constexpr uint32_t SESSION = 41;
    static constexpr uint32_t OTHER_SESSION = 42;

    void SetUp() override {
        TestHost::SetUp();
        dir_ = std::filesystem::temp_directory_path() /
               ("nebu_params_" + std::to_string(::testing::UnitTest::GetInstance()->random_seed()) +
                "_" + ::testing::UnitTest::GetInstance()->current_test_info()->name());
        std::filesystem::create_directories(dir_);
    }

    void TearDown() override {
        for (uint32_t h : {0u, SESSION, OTHER_SESSION}) OrvSim::endSession(h);
        TestHost::TearDown();
        std::error_code ec;
        std::filesystem::remove_all(dir_, ec);
    }

    std::string write(const std::string& name, const std::string& content) {
        const std::string path = (dir_ / name).string();
        std::ofstream(path, std::ios::binary) << content;
        return path;
    }

    OrvNebu_ActionsMap load(const std::string& path, uint32_t handle = SESSION) {
        OrvNebu_ActionsMap actions;
        OrvNebu_DefaultParamReader::addToHashMap(handle, path, actions);
        return actions;
    }

    static OrvNebu_ParamChoiceAction& choice(OrvNebu_ActionsMap& actions, const std::string& n) {
        EXPECT_EQ(1u, actions.count(n)) << n;
        return *static_cast<OrvNebu_ParamChoiceAction*>(actions.at(n));
    }

    Said parseError(const std::string& path, uint32_t line, const std::string& row) {
        return {SESSION, 512,
                "Unable to parse file: " + path + " line:" + std::to_string(line) + ": " + row};
    }

    // Every message so far, with its session.
    std::vector<Said> said() const {
        std::vector<Said> all;
        for (const TestHost::Message& m : messages()) all.push_back({m.handle, m.severity, m.text});
        return all;
    }

    std::filesystem::path dir_;
};

const char* const MODE_FILE =
    "param,index,choice,settings\n"
    "MODE,0,Off,EN=0\n"
    "MODE,1,On,EN=1,SEL=01\n"
    "LEVEL,0,Low,LVL=0000\n"
    "LEVEL,1,High,LVL=1111\n";

}  // namespace

TEST_F(ParamReader, MalformedRowsAreReportedWithTheirLine) {
    const char* const ORDER = "choice_index out-of-order";
    struct Case {
        std::string content;
        uint32_t line;
        std::string row;
        const char* first;  // the message before the parse error, if any
    };
    const std::vector<Case> cases = {
        {"h\nMODE,0,Off,EN=0\nMODE,1,On\n", 3, "MODE,1,On", nullptr},
        {"h\nMODE,0,Off,EN=0\nMODE,2,On,EN=1\n", 3, "MODE,2,On,EN=1", ORDER},
        // The conversion's own message names the bad digits.
        {"h\nMODE,0,Off,EN=2\n", 2, "MODE,0,Off,EN=2", "2"},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.content);
        const std::string path = write("bad.csv", c.content);
        clearMessages();
        EXPECT_THROW(load(path), Orv_AbortException);
        std::vector<Said> got = said();
        ASSERT_EQ(c.first ? 2u : 1u, got.size());
        if (c.first == ORDER) {
            EXPECT_EQ((Said{SESSION, 256, ORDER}), got[0]);
        }
        if (c.first != nullptr && c.first != ORDER) {
            EXPECT_EQ(256u, got[0].severity);
            EXPECT_NE(std::string::npos, got[0].text.find(c.first)) << got[0].text;
        }
        EXPECT_EQ(parseError(path, c.line, c.row), got.back());
        EXPECT_EQ(0u, OrvNebu_DefaultParamReader::cachedFileCount(SESSION));
    }
    // A failed read caches nothing and is retried.
    EXPECT_EQ(2u, load(write("bad.csv", MODE_FILE)).size());
}

TEST_F(ParamReader, MissingFileOrDirectory) {
    for (const std::string& path : {(dir_ / "absent.csv").string(), dir_.string()}) {
        clearMessages();
        const std::string text = "Unable to open OrvNebu parameter file: " + path;
        try {
            load(path);
            ADD_FAILURE() << "no exception for " << path;
        } catch (const Orv_AbortException&) {
            ADD_FAILURE() << "abort instead of the open failure";
        } catch (const std::logic_error& e) {
            EXPECT_EQ(text, e.what());
        }
        EXPECT_EQ((std::vector<Said>{{SESSION, 256, text}}), said());
    }
    EXPECT_EQ(0u, OrvNebu_DefaultParamReader::cachedFileCount(SESSION));
}

TEST_F(ParamReader, HeaderOnlyAndEmptyFilesAreCachedEmpty) {
    for (const char* content : {"param,index,choice\n", "param,index,choice", ""}) {
        const std::string path =
            write(std::string("h") + std::to_string(std::strlen(content)), content);
        EXPECT_TRUE(load(path).empty());
    }
    EXPECT_NO_MESSAGES();
    EXPECT_EQ(3u, OrvNebu_DefaultParamReader::cachedFileCount(SESSION));
}

TEST_F(ParamReader, RepeatedNameKeepsTheFirstAndAMapEntryIsNeverReplaced) {
    const std::string path = write("rep.csv",
                                   "h\n"
                                   "MODE,0,Off,EN=0\n"
                                   "LEVEL,0,Low,LVL=0\n"
                                   "MODE,0,Again,EN=1\n");
    OrvNebu_ActionsMap actions = load(path);
    EXPECT_NO_MESSAGES();
    EXPECT_EQ(10002u, choice(actions, "MODE").getPriority());
    EXPECT_EQ("Off", choice(actions, "MODE").getChoiceList()[0].getChoiceName());

    OrvRT::OrvNebu_ParamChoiceAction mine("LEVEL", 1);
    OrvNebu_ActionsMap preset{{"LEVEL", &mine}};
    OrvNebu_DefaultParamReader::addToHashMap(SESSION, path, preset);
    EXPECT_EQ(&mine, preset.at("LEVEL"));
    EXPECT_EQ(2u, preset.size());
}

TEST_F(ParamReader, SharedWithinASessionReadAgainInAnother) {
    const std::string path = write("p.csv", MODE_FILE);
    OrvNebu_ActionsMap first = load(path);
    // Changed on disk: the session keeps what it read, another session reads the new file.
    write("p.csv", "h\nMODE,0,Only,\n");
    OrvNebu_ActionsMap second = load(path);
    EXPECT_EQ(first, second);
    EXPECT_EQ(2u, choice(second, "MODE").getChoiceList().size());

    const uint64_t registrations = OrvSim::listenerRegistrations();
    OrvNebu_ActionsMap other = load(path, OTHER_SESSION);
    EXPECT_EQ(registrations, OrvSim::listenerRegistrations()) << "registered once, not per read";
    EXPECT_NE(first.at("MODE"), other.at("MODE"));
    EXPECT_EQ(1u, choice(other, "MODE").getChoiceList().size());
    EXPECT_EQ(0u, other.count("LEVEL"));
    EXPECT_EQ(1u, OrvNebu_DefaultParamReader::cachedFileCount(SESSION));
    EXPECT_EQ(1u, OrvNebu_DefaultParamReader::cachedFileCount(OTHER_SESSION));
}

TEST_F(ParamReader, SessionEndErasesOnlyThatSession) {
    const std::string a = write("a.csv", MODE_FILE);
    const std::string b = write("b.csv", "h\nB,0,x,\n");
    load(a);
    load(b);
    load(a, OTHER_SESSION);
    std::ostringstream sink;
    OrvNebu_DefaultParamReader::readAndPrint(a, sink);
    EXPECT_EQ(2u, OrvNebu_DefaultParamReader::cachedFileCount(SESSION));
    EXPECT_EQ(1u, OrvNebu_DefaultParamReader::cachedFileCount(0));

    OrvSim::endSession(SESSION);
    EXPECT_EQ(0u, OrvNebu_DefaultParamReader::cachedFileCount(SESSION));
    EXPECT_EQ(1u, OrvNebu_DefaultParamReader::cachedFileCount(OTHER_SESSION));
    EXPECT_EQ(1u, OrvNebu_DefaultParamReader::cachedFileCount(0));

    // The next use reads the file afresh.
    write("a.csv", "h\nNEW,0,x,\n");
    OrvNebu_ActionsMap again = load(a);
    EXPECT_EQ(1u, again.count("NEW"));
    EXPECT_EQ(1u, load(a, OTHER_SESSION).count("MODE"));
}

TEST_F(ParamReader, TheCacheRegistersAgainWithAHostThatForgotIt) {
    const std::string a = write("a.csv", MODE_FILE);
    for (int host = 0; host < 2; ++host) {
        OrvSim::resetHost();  // a new host knows no listener
        load(a);
        OrvSim::endSession(SESSION);
        EXPECT_EQ(0u, OrvNebu_DefaultParamReader::cachedFileCount(SESSION)) << "host " << host;
    }
}

TEST_F(ParamReader, PrintsTheFileBackAndAgainFromTheCache) {
    const std::string path = write("p.csv",
                                   "Param,Index,Choice,Settings\r\n"
                                   "MODE,0,Off,EN=0\n"
                                   "\"MODE\",1,On,EN=1,,SEL=01\n"
                                   "WIDE,0,w,R=000101\n"
                                   "WIDE,1,v,R=11\n"
                                   "EMPTY,0,none,\n");
    const std::string image =
        "Param,Index,Choice,Settings\n"
        "MODE,0,Off,EN=0\n"
        "MODE,1,On,EN=1,SEL=01\n"
        "WIDE,0,w,R=000101\n"
        "WIDE,1,v,R=000011\n"
        "EMPTY,0,none\n";
    std::ostringstream out;
    OrvNebu_DefaultParamReader::readAndPrint(path, out);
    EXPECT_EQ(image, out.str());
    EXPECT_NO_MESSAGES();

    // Printed from the cache (session 0): the file is not read again, the header is kept.
    write("p.csv", "Other\nX,0,y,\n");
    std::ostringstream again;
    OrvNebu_DefaultParamReader::readAndPrint(path, again);
    EXPECT_EQ(image, again.str());

    // Failures are reported on session 0.
    clearMessages();
    const std::string bad = write("bad.csv", "h\nM,0,a\n");
    std::ostringstream none;
    EXPECT_THROW(OrvNebu_DefaultParamReader::readAndPrint(bad, none), Orv_AbortException);
    EXPECT_EQ((std::vector<Said>{{0, 512, "Unable to parse file: " + bad + " line:2: M,0,a"}}),
              said());
}

TEST_F(ParamReader, SessionsMayReadAndEndAtTheSameTime) {
    // Each session is serialised by its own target lock only: one session may read a file
    // into the cache while the host ends another.
    const std::string path = write("p.csv", MODE_FILE);
    constexpr uint32_t FIRST = 5000;
    constexpr uint32_t COUNT = 400;
    // The host ends only sessions whose calls have returned.
    std::atomic<uint32_t> finished(0);
    std::atomic<bool> done(false);
    std::thread ender([&] {
        for (uint32_t k = 0; !done; ++k) {
            const uint32_t n = finished;
            if (n != 0) OrvSim::endSession(FIRST + k % n);
        }
    });
    size_t loaded = 0;
    for (uint32_t i = 0; i < COUNT; ++i) {
        loaded += load(path, FIRST + i).size();
        finished = i + 1;
    }
    done = true;
    ender.join();
    EXPECT_EQ(2u * COUNT, loaded);
    for (uint32_t i = 0; i < COUNT; ++i) OrvSim::endSession(FIRST + i);
    for (uint32_t i = 0; i < COUNT; ++i) {
        ASSERT_EQ(0u, OrvNebu_DefaultParamReader::cachedFileCount(FIRST + i));
    }
}
