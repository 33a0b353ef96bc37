// Reads parameter definition files into choice parameter actions, cached per session and file.
#pragma once

#include <cstdint>
#include <memory>
#include <ostream>
#include <set>
#include <string>
#include <utility>
#include <vector>

#include "host/OrvJtag.h"
#include "params/OrvNebu_ParamAction.h"
#include "params/OrvNebu_ParamChoiceAction.h"

namespace OrvRT {

class OrvNebu_DefaultParamReader {
public:
    typedef std::vector<OrvNebu_ParamChoiceAction> ChoiceActions;

    // One cache entry: the actions of one file for one session. Owns them.
    struct ParamList {
        ParamList(uint32_t h, const std::string& file, std::unique_ptr<ChoiceActions> actions,
                  const std::string& fileHeader)
            : handle(h), fileName(file), choiceActions(std::move(actions)), header(fileHeader) {}

        uint32_t handle;
        std::string fileName;
        std::unique_ptr<ChoiceActions> choiceActions;
        // The file's first line, so that printing from the cache keeps it.
        std::string header;
    };

    // Orders entries by session, then by path (bytes compared as unsigned); also compares an
    // entry with a (session, path) key.
    struct ParamListLess {
        typedef void is_transparent;
        typedef std::pair<uint32_t, const std::string*> Key;
        static Key key(const ParamList& e) { return Key(e.handle, &e.fileName); }
        static const Key& key(const Key& k) { return k; }
        template <class A, class B>
        bool operator()(const A& a, const B& b) const {
            const Key& ka = key(a);
            const Key& kb = key(b);
            if (ka.first != kb.first) return ka.first < kb.first;
            return ka.second->compare(*kb.second) < 0;
        }
    };

    // Forgets a session's cached files when the host ends the session.
    class SessionEndListener : public SessionMessageListener {
    public:
        void sessionNotice(uint32_t handle) override;
        void sessionEnded(uint32_t handle) override;
    };

    virtual ~OrvNebu_DefaultParamReader() = default;
    OrvNebu_DefaultParamReader(const OrvNebu_DefaultParamReader&) = default;
    OrvNebu_DefaultParamReader& operator=(const OrvNebu_DefaultParamReader&) = default;

    // Adds the choice actions of the file (read on first use in the session) to actions under
    // their names; a name already in the map keeps its action. The actions stay owned by the
    // cache until the session ends. On failure reports on the session channel and throws
    // (std::logic_error when the file cannot be opened, Orv_AbortException for a bad row).
    static void addToHashMap(uint32_t handle, const std::string& paramFile,
                             OrvNebu_ActionsMap& actions);
    // Prints the file (cached under session 0) back in its own format.
    static void readAndPrint(const std::string& paramFile, std::ostream& out);

    // The number of cached files of a session (for tools and tests).
    static size_t cachedFileCount(uint32_t handle);

protected:
    OrvNebu_DefaultParamReader(uint32_t handle, const std::string& fileName);

private:
    typedef std::set<ParamList, ParamListLess> ParamStorage;

    static ParamStorage& paramStorage();

    ChoiceActions* getFromStorage(uint32_t handle, const std::string& fileName);
    // Returns the actions now cached under the key.
    ChoiceActions* addToStorage(uint32_t handle, const std::string& fileName,
                                std::unique_ptr<ChoiceActions> actions);
    std::unique_ptr<ChoiceActions> readParamsFromFile();
    ChoiceActions* getParams();

    uint32_t handle_;
    std::string fileName_;
    std::string header_;

    // The one listener, registered with the host whenever the cache has been empty.
    static SessionEndListener& sessionListener();
};

}  // namespace OrvRT
