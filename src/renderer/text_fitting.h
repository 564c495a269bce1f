#pragma once

#include <string>

#include "vexel/Math.h"

// How a translated string is fitted into its text rectangle: on one line,
// centred, as large as fits without spilling, and letter-spaced when it is
// much shorter than the rectangle (a short translation of a long word then
// still spans most of the place the original took).
//
// The rectangles are OCR line boxes hugging the original line's ink: from
// the top of its tallest glyph to the bottom of its lowest descender. The
// translation should look printed at the original's size, i.e. with the
// same capital height. Neither the font's line box (ascender to descender
// plus line gap: capitals then fill under half of the rectangle) nor the
// string's own ink (a translation without descenders into the box of an
// original with them would come out a third too large, and an x-height-only
// word would be blown up) says where the capitals go. The kit's line ink box
// does: where the ink of a line of this kind of text lies by the font's
// design, the top of capitals and ascenders to the bottom of descenders,
// the same for every string of that kind. Fitting that box to the
// rectangle puts capitals where an original line with ascenders and
// descenders had them, and stands the baseline where its baseline stood.
// A text without small letters (capitals, digits: a sign) has no descender
// and nothing above its capitals, and neither, most likely, had the original
// it translates (translation keeps a sign's capitals), so its box runs from
// the capitals' top to the baseline and its capitals fill the rectangle like
// the original's.
// CJK lines use the ideographs' ink. The string's own ink is added to the box
// so that an accent or a descender of a text that has none by design still
// stays inside.
//
// Sizes: the box is the rectangle in camera units along its own axes; the
// text's bounds are in text units (one em); the scale is camera units per
// text unit, the same along both axes so glyphs keep their shape.
namespace ocr_ar::text_fit {

// The fitted ink takes 97% of the rectangle's height: the antialiased
// fringe (half a screen pixel beyond the outline) of a line some 30 pixels
// tall then stays inside.
inline constexpr float kHeightFill = 0.97f;
// At most 94% of the width, so the ends of the text stay clear of the
// patch's faded side edges.
inline constexpr float kWidthFill = 0.94f;
// A text that, at the height-limited scale, covers less than 75% of the
// usable width is spread to cover 75%...
inline constexpr float kSpreadCoverage = 0.75f;
// ...with at most a quarter em between neighbouring characters: wider gaps
// break a word up into separate letters.
inline constexpr float kMaxExtraSpacing = 0.25f;
// Spacing changes smaller than this are not applied: each change lays the
// text out again, and a tracked rectangle jitters by a pixel from frame to
// frame.
inline constexpr float kSpacingTolerance = 0.02f;

// Places between neighbouring characters of a one-line UTF-8 text (code
// points minus one, zero for an empty text).
unsigned int CountCharacterGaps(const std::string& utf8);

// What is fitted to the rectangle, in text units: the laid-out width of
// `bounds` (the text's bounding box) and the height of `line_ink` (the
// kit's line ink box) grown to hold `ink` (the glyphs' own ink). Each empty
// input is left out; `bounds` alone when both ink boxes are empty.
Vexel::Rect FittedBox(const Vexel::Rect& bounds, const Vexel::Rect& line_ink,
                      const Vexel::Rect& ink);

// The extra spacing (text units per gap) for a text of `natural_width` (its
// width without extra spacing) and fitted `height`, with `gaps` places
// between characters, in `box`.
float ChooseExtraSpacing(float natural_width, float height, unsigned int gaps,
                         const Vexel::Vector2& box);

// The largest scale at which `bounds` (a fitted box) fits the usable part of
// `box`; 0 for an empty text or box.
float FitScale(const Vexel::Rect& bounds, const Vexel::Vector2& box);

// Where the centre of `bounds` lands, relative to the text node's position,
// when the node has `scale` and is turned by `angle_degrees`
// (counter-clockwise). Subtracting it from the rectangle's centre centres
// the text on the rectangle.
Vexel::Vector2 CentreOffset(const Vexel::Rect& bounds, float scale, float angle_degrees);

}  // namespace ocr_ar::text_fit
