#pragma once

#include <string>

#include "vexel/Math.h"

// How a translated string is fitted into its text rectangle: on one line,
// centred, as large as fits without spilling, and letter-spaced when it is
// much shorter than the rectangle (a short translation of a long word then
// still spans most of the place the original took).
//
// Sizes: the box is the rectangle in camera units along its own axes; the
// text's bounds are in text units (one em); the scale is camera units per
// text unit, the same along both axes so glyphs keep their shape.
namespace ocr_ar::text_fit {

// The line box (ascender to descender, or the em box for CJK fonts) takes at
// most 90% of the rectangle's height: OCR rectangles hug the ink, and a line
// box filling them fully would make the glyphs look larger than the
// original; the 5% left above and below also keeps the one-pixel antialiased
// fringe inside.
inline constexpr float kHeightFill = 0.9f;
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

// The extra spacing (text units per gap) for a text of `natural_width` (its
// width without extra spacing) and `height`, with `gaps` places between
// characters, in `box`.
float ChooseExtraSpacing(float natural_width, float height, unsigned int gaps,
                         const Vexel::Vector2& box);

// The largest scale at which `bounds` fits the usable part of `box`; 0 for
// an empty text or box.
float FitScale(const Vexel::Rect& bounds, const Vexel::Vector2& box);

// Where the centre of `bounds` lands, relative to the text node's position,
// when the node has `scale` and is turned by `angle_degrees`
// (counter-clockwise). Subtracting it from the rectangle's centre centres
// the text on the rectangle.
Vexel::Vector2 CentreOffset(const Vexel::Rect& bounds, float scale, float angle_degrees);

}  // namespace ocr_ar::text_fit
