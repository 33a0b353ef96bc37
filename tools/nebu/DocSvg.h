// The pictures of `nebu doc`: inline SVG bit-field diagrams of bus words, drawn from the model.
// Every picture names the table that carries its facts (describedBy), so no fact lives in the
// picture alone; patterns and labels, not colour alone, tell the kinds of bits apart.
#pragma once

#include <cstdint>
#include <string>

#include "DocModel.h"

namespace nebu {
namespace doc {

// The patterns the pictures use; once per page, before them.
std::string pictureDefs();

// A sample of every kind of box, with its meaning.
std::string legendPicture();

// One bus word of the register file: 16 bit columns, one box per slice (bits 16 to 31 in a
// band of their own when a slice reaches them), a row marking bits claimed twice.
std::string wordPicture(const RegisterFile& file, uint32_t address, const std::string& title,
                        const std::string& describedBy);

// The facts of wordPicture as a table (id: the describedBy of the picture); the caption is HTML.
std::string wordTable(const RegisterFile& file, uint32_t address, const std::string& id,
                      const std::string& caption);

// The boxes of one bus word and, below them, one row per choice of the parameter with the
// bits that choice writes into the word.
std::string choicePicture(const RegisterFile& file, uint32_t address, const Parameter& parameter,
                          const std::string& title, const std::string& describedBy);

}  // namespace doc
}  // namespace nebu
