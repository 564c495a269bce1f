// Word boxes joined into the text lines a reader sees, and reading order.
#ifndef TEXTREADER_LINE_GROUPING_H_
#define TEXTREADER_LINE_GROUPING_H_

#include <vector>

#include "textreader/text_reader.h"

namespace textreader {

// Joins boxes that continue one another into one line (one rotated
// rectangle): same reading direction, similar height, on one centre line,
// with a gap of at most about a line's height between them. The texts join
// with a space in reading order; the confidence is the mean weighted by
// text length. A box inside the box of a larger line goes.
std::vector<TextLine> GroupIntoLines(std::vector<TextLine> boxes);

// Top to bottom; lines side by side (their centres within half a line's
// height vertically) left to right.
void SortReadingOrder(std::vector<TextLine>& lines);

}  // namespace textreader

#endif  // TEXTREADER_LINE_GROUPING_H_
