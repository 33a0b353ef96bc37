// Fills the model of `nebu doc` from the library's definition-file reader, so that the pages
// show what the plug-in makes of the files and the problems lint reports.
#pragma once

#include <string>

#include "DocModel.h"

namespace nebu {
namespace doc {

// dataDir ends in a separator. Never throws for bad files: what cannot be read is left out
// and the reader's problems say why.
Site readSite(const std::string& dataDir);

}  // namespace doc
}  // namespace nebu
