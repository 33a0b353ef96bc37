// Resolution of the plug-in's exported functions.
#include "PluginApi.h"

#include "SharedLibrary.h"

namespace nebu {

PluginApi PluginApi::resolve(const SharedLibrary& library) {
    PluginApi api;
#define NEBU_API_RESOLVE(name) \
    api.name = reinterpret_cast<decltype(api.name)>(library.symbol("OrvNebu_" #name));
    NEBU_EXPORTED_FUNCTIONS(NEBU_API_RESOLVE)
#undef NEBU_API_RESOLVE
    return api;
}

bool PluginApi::exports(const std::string& name) const {
#define NEBU_API_EXPORTS(fn) \
    if (name == #fn) return fn != nullptr;
    NEBU_EXPORTED_FUNCTIONS(NEBU_API_EXPORTS)
#undef NEBU_API_EXPORTS
    return false;
}

}  // namespace nebu
