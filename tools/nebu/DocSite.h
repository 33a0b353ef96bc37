// The pages of `nebu doc`: the site of a data directory as file names and texts, made from the
// model alone (DocReader fills it; runDoc writes the pages).
#pragma once

#include <string>
#include <vector>

#include "DocModel.h"

namespace nebu {
namespace doc {

// In the first lines of every file the site writes; a file without it is never replaced.
extern const char* const MARKER;

struct Page {
    std::string file;  // name within the output directory
    std::string text;
};

// Gives every register and parameter file a page name, unique within the site.
void assignPages(Site& site);

// index.html, style.css, then a page per register file and per parameter file.
std::vector<Page> renderSite(const Site& site);

}  // namespace doc
}  // namespace nebu
