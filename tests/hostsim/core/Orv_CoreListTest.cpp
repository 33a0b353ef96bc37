// The host's per-session core list: ownership, replacement, removal, slave lookups, the end of
// a session; and the name-value maps.
#include <string>
#include <vector>

#include "host/OrvCore.h"
#include "support/TestHost.h"

namespace {

using OrvRT::Orv_Core;
using OrvRT::Orv_CoreList;

// A core that tells when it is deleted.
class TrackedCore : public Orv_Core {
public:
    TrackedCore(uint32_t handle, ORV_CORE_REF ref, bool slave, int* deletions)
        : Orv_Core(handle, ref, ORV_CORE_INFO{{1, 0x44, 0, 0, 0}}, nullptr, 0),
          slave_(slave),
          deletions_(deletions) {}
    ~TrackedCore() override { ++*deletions_; }
    bool isOrvNebuSlave() override { return slave_; }

private:
    bool slave_;
    int* deletions_;
};

class Orv_CoreListTest : public TestHost {
protected:
    TrackedCore* core(uint32_t device, uint32_t chain, uint32_t index, bool slave = true,
                      uint32_t handle = HANDLE) {
        return new TrackedCore(handle, ORV_CORE_REF{device, chain, index}, slave, &deletions);
    }
    int deletions = 0;
};

TEST_F(Orv_CoreListTest, AddedCoresAreFoundByReferenceInTheirSessionOnly) {
    TrackedCore* a = core(0, 1, 2);
    Orv_CoreList::addCore(HANDLE, a);
    const ORV_SLAVE_REF ref{0, 1, 2};
    EXPECT_EQ(Orv_CoreList::getSlave(HANDLE, &ref), a);
    EXPECT_EQ(Orv_CoreList::getSlave(HANDLE + 1, &ref), nullptr);
    const ORV_SLAVE_REF otherChain{0, 2, 2};
    const ORV_SLAVE_REF otherIndex{0, 1, 3};
    EXPECT_EQ(Orv_CoreList::getSlave(HANDLE, &otherChain), nullptr);
    EXPECT_EQ(Orv_CoreList::getSlave(HANDLE, &otherIndex), nullptr);
    EXPECT_EQ(Orv_CoreList::getSlave(HANDLE, nullptr), nullptr);
    Orv_CoreList::addCore(HANDLE, nullptr);  // ignored
    EXPECT_EQ(Orv_CoreList::getSlave(HANDLE, &ref), a);
    EXPECT_EQ(deletions, 0);
}

TEST_F(Orv_CoreListTest, AddingUnderATakenReferenceDeletesTheOldCore) {
    TrackedCore* old = core(0, 1, 2);
    TrackedCore* replacement = core(0, 1, 2);
    Orv_CoreList::addCore(HANDLE, old);
    Orv_CoreList::addCore(HANDLE, old);  // the same core again: kept
    EXPECT_EQ(deletions, 0);
    Orv_CoreList::addCore(HANDLE, replacement);
    EXPECT_EQ(deletions, 1);
    const ORV_SLAVE_REF ref{0, 1, 2};
    EXPECT_EQ(Orv_CoreList::getSlave(HANDLE, &ref), replacement);
}

TEST_F(Orv_CoreListTest, RemoveDeletesAndNullsOnlyRegisteredCores) {
    TrackedCore* registered = core(0, 1, 2);
    Orv_CoreList::addCore(HANDLE, registered);
    Orv_Core* pointer = registered;
    Orv_CoreList::removeCore(HANDLE, &pointer);
    EXPECT_EQ(pointer, nullptr);
    EXPECT_EQ(deletions, 1);
    const ORV_SLAVE_REF ref{0, 1, 2};
    EXPECT_EQ(Orv_CoreList::getSlave(HANDLE, &ref), nullptr);

    // Unknown to the list, or registered in another session, or a stranger under a taken
    // reference: left alone.
    TrackedCore* stranger = core(0, 1, 2);
    TrackedCore* elsewhere = core(0, 1, 2, true, HANDLE + 1);
    TrackedCore* holder = core(0, 1, 2);
    Orv_CoreList::addCore(HANDLE + 1, elsewhere);
    Orv_CoreList::addCore(HANDLE, holder);
    Orv_Core* p = stranger;
    Orv_CoreList::removeCore(HANDLE, &p);
    EXPECT_EQ(p, stranger);
    Orv_Core* q = elsewhere;
    Orv_CoreList::removeCore(HANDLE + 2, &q);
    EXPECT_EQ(q, elsewhere);
    EXPECT_EQ(deletions, 1);
    EXPECT_EQ(Orv_CoreList::getSlave(HANDLE, &ref), holder);
    Orv_CoreList::removeCore(HANDLE, nullptr);
    Orv_Core* none = nullptr;
    Orv_CoreList::removeCore(HANDLE, &none);
    delete stranger;
    EXPECT_EQ(deletions, 2);
}

TEST_F(Orv_CoreListTest, GetSlavesAppendsTheBusSlavesOfOneBusByIndex) {
    TrackedCore* s5 = core(0, 1, 5);
    TrackedCore* s0 = core(0, 1, 0);
    TrackedCore* hostCore = core(0, 1, 3, false);
    TrackedCore* s2 = core(0, 1, 2);
    Orv_CoreList::addCore(HANDLE, s5);
    Orv_CoreList::addCore(HANDLE, s0);
    Orv_CoreList::addCore(HANDLE, hostCore);
    Orv_CoreList::addCore(HANDLE, s2);
    Orv_CoreList::addCore(HANDLE, core(0, 2, 1));                        // another bus
    Orv_CoreList::addCore(HANDLE, core(1, 1, 1));                        // another device
    Orv_CoreList::addCore(HANDLE + 1, core(0, 1, 4, true, HANDLE + 1));  // another session

    std::vector<Orv_Core*> found{nullptr};
    Orv_CoreList::getSlaves(HANDLE, 0, 1, found);
    EXPECT_EQ(found, (std::vector<Orv_Core*>{nullptr, s0, s2, s5}));
    std::vector<Orv_Core*> none;
    Orv_CoreList::getSlaves(HANDLE, 0, 9, none);
    EXPECT_TRUE(none.empty());
}

TEST_F(Orv_CoreListTest, TheEndOfASessionDeletesItsCoresOnly) {
    Orv_CoreList::addCore(HANDLE, core(0, 1, 0));
    Orv_CoreList::addCore(HANDLE, core(0, 1, 1, false));
    TrackedCore* kept = core(0, 1, 0, true, HANDLE + 1);
    Orv_CoreList::addCore(HANDLE + 1, kept);
    OrvSim::endSession(HANDLE);
    EXPECT_EQ(deletions, 2);
    const ORV_SLAVE_REF ref{0, 1, 0};
    EXPECT_EQ(Orv_CoreList::getSlave(HANDLE, &ref), nullptr);
    EXPECT_EQ(Orv_CoreList::getSlave(HANDLE + 1, &ref), kept);
    // The session lives on: new cores can be added after its end.
    Orv_CoreList::addCore(HANDLE, core(0, 1, 0));
    EXPECT_NE(Orv_CoreList::getSlave(HANDLE, &ref), nullptr);
    OrvSim::resetHost();  // every session ends
    EXPECT_EQ(deletions, 4);
}

TEST(OrvContainerTest, MapsStartWithAHundredBucketsAndAnswerByKey) {
    ORV_HASHMAP_HANDLE handle = OrvContainer_hashmapCStr_new();
    ASSERT_NE(handle, nullptr);
    auto& map = *static_cast<OrvRT::Orv_HashMapCStr*>(handle);
    EXPECT_TRUE(map.empty());
    EXPECT_GE(map.bucket_count(), 100u);
    map["dclk_has_reset"] = "1";
    map["empty"] = "";
    EXPECT_STREQ(OrvContainer_hashmapCStr_getCStr(handle, "dclk_has_reset"), "1");
    EXPECT_STREQ(OrvContainer_hashmapCStr_getCStr(handle, "empty"), "");
    EXPECT_EQ(OrvContainer_hashmapCStr_getCStr(handle, "DCLK_HAS_RESET"), nullptr);
    EXPECT_EQ(OrvContainer_hashmapCStr_getCStr(handle, nullptr), nullptr);
    EXPECT_EQ(OrvContainer_hashmapCStr_getCStr(nullptr, "x"), nullptr);
    OrvContainer_hashmapCStr_delete(handle);
    OrvContainer_hashmapCStr_delete(nullptr);
}

}  // namespace
