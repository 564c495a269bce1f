#pragma once

#include <cstddef>
#include <string>

#include "vexel/Math.h"
#include "vexel/Node.h"

namespace Vexel {

class Font;

// A node that lays out and draws a Unicode string (UTF-8) with one font:
// shaped per script and direction, bidirectional paragraphs ordered for
// display (a right-to-left paragraph starts at the right), combining marks
// placed on their bases.
//
// Text units: one text unit is the font's em. Lines are stacked downwards
// from the container's top edge; each line is broken at spaces and between
// CJK characters so that it fits the container's width, and aligned within
// it. A container of zero width (the default rectangle is all zero) breaks
// only at newlines and aligns around its left edge: left-aligned lines start
// there, centred ones centre on it, right-aligned ones end there. Text is
// not clipped to the container.
//
// Glyphs are drawn from signed distance fields, so text stays sharp at any
// scale the node gives it. Drawn with alpha blending, without depth writes.
//
// Layout happens in initialize(), or on the first draw or bounding-box query
// after a change.
class Text : public Node {
 public:
  enum HorizontalAlignment {
    ALIGN_LEFT = 0,
    ALIGN_CENTER = 1,
    ALIGN_RIGHT = 2,
  };

  Text();
  ~Text() override;

  // The text keeps the font's face (and its reference character setting) for
  // itself; the Font object may be destroyed afterwards.
  void setFont(const Font& font);
  void setText(const std::string& utf8);
  const std::string& getText() const;
  // Puts the text into the form that is drawn: invalid UTF-8 becomes U+FFFD,
  // canonical composition (NFC) joins base letters and combining marks where
  // a precomposed character exists, control characters are dropped, and every
  // run of white space (line breaks included) becomes one space, none at
  // either end.
  void normalizeText();

  void setContainerRect(const Rect& rect);
  Rect getContainerRect() const;
  void setHorizontalAlignment(HorizontalAlignment alignment);
  HorizontalAlignment getHorizontalAlignment() const;
  // Added between neighbouring characters of a line (text units; negative
  // values tighten).
  void setExtraSpaceBetweenChars(float textUnits);
  float getExtraSpaceBetweenChars() const;
  void setColor(const Color& color);
  Color getColor() const;

  // Lays the text out now (and prepares its glyphs on the device).
  void initialize();
  // The smallest rectangle, in text units, holding every line's box and
  // every glyph's ink. Empty (all zero) for an empty text or without a font.
  Rect getBoundingBox() const;
  // The smallest rectangle, in text units, holding every glyph's ink alone.
  // Empty when no glyph has ink.
  Rect getInkBounds() const;
  // Where the ink of the text's lines lies by the font's design, in text
  // units, across the bounding box's width: from the first line's top to
  // the last line's bottom. A text holding a letter other than a capital
  // (lowercase, or of a script without case) reaches from the top of
  // ascenders and capitals (the font's "H b d f h k l") to the bottom of
  // descenders ("g j p q y"); one of capitals, digits and punctuation from
  // the top of the capitals ("H") to the baseline. With a reference character
  // that the font maps (a CJK line) and an ideograph in the font: from the top
  // to the bottom of the ideograph U+56FD instead. Unlike getInkBounds, the
  // same for every text of the same kind: "Salida" and "Mantener" get the
  // same box. Empty (all zero) for an empty text or without a font.
  Rect getLineInkBox() const;
  std::size_t getLineCount() const;
};

}  // namespace Vexel
