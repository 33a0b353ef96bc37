// Fills the model of `nebu doc` from what lint finds and from the library's own readers, so the
// pages show what the plug-in makes of the files.
#pragma once

#include <string>

#include "DocModel.h"

namespace nebu {
namespace doc {

// dataDir ends in a separator. Never throws for bad files: what cannot be read is left out
// and lint's problems say why.
Site readSite(const std::string& dataDir);

}  // namespace doc
}  // namespace nebu
