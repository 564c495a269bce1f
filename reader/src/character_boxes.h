// Boxes of the characters of a read line, from where their CTC steps fire.
#ifndef TEXTREADER_CHARACTER_BOXES_H_
#define TEXTREADER_CHARACTER_BOXES_H_

#include <vector>

#include "box_geometry.h"
#include "recogniser.h"
#include "textreader/text_reader.h"

namespace textreader {

// One box per character other than a space. Each character spans from
// half-way to its neighbour before to half-way to its neighbour after; the
// first and last as far out again, within the line.
std::vector<CharacterBox> CharacterBoxes(const Reading& reading, const Corners& line);

}  // namespace textreader

#endif  // TEXTREADER_CHARACTER_BOXES_H_
