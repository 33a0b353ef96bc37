// `nebu doc`: a data directory as a static web site, drawn with the library's own readers.
#pragma once

#include <iosfwd>
#include <string>
#include <vector>

namespace nebu {

// args: the words after "doc" ([DATA_DIR] -o DIR; defaultDataDir when DATA_DIR is absent).
// Writes index.html, style.css and a page per register and parameter file into DIR (made when
// missing), replacing only files an earlier run wrote; prints one summary line on out. Returns
// 0 when the site is written (lint's problems are on its pages), 2 for a usage error or an
// output directory that cannot be written (reported on err as one "nebu: " line).
int runDoc(const std::vector<std::string>& args, const std::string& defaultDataDir,
           std::ostream& out, std::ostream& err);

}  // namespace nebu
