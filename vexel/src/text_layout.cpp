#include "text_layout.h"

#include <fribidi.h>

#include <algorithm>
#include <limits>
#include <utility>

#include "unicode_text.h"

namespace Vexel::internal {
namespace {

// One shaped run: characters [start, end) of the paragraph at one bidi
// level and in one script; glyphs in visual order as HarfBuzz returns them.
struct ShapedGlyph {
  std::uint32_t glyph;
  std::uint32_t cluster;  // index of the run's character the glyph belongs to
  float advance;
  float x_offset;
  float y_offset;
};

struct Run {
  std::size_t start;
  std::size_t end;
  int level;
  std::vector<ShapedGlyph> glyphs;
};

bool IsCjk(char32_t c) {
  return (c >= 0x1100 && c <= 0x11FF) || (c >= 0x2E80 && c <= 0x303F) ||
         (c >= 0x3040 && c <= 0x31FF) || (c >= 0x3400 && c <= 0x4DBF) ||
         (c >= 0x4E00 && c <= 0x9FFF) || (c >= 0xAC00 && c <= 0xD7AF) ||
         (c >= 0xF900 && c <= 0xFAFF) || (c >= 0xFF00 && c <= 0xFFEF) ||
         (c >= 0x20000 && c <= 0x3FFFF);
}

// Closing punctuation a line should not start with, opening punctuation it
// should not end with.
bool MayNotStartLine(char32_t c) {
  static const std::u32string closing =
      U"、。，．：；？！）」』】〕〉》〗〙〛ーゝゞヽヾ・々〜，｡｣､･）］｝";
  return closing.find(c) != std::u32string::npos;
}

bool MayNotEndLine(char32_t c) {
  static const std::u32string opening = U"（「『【〔〈《〖〘〚［｛｢";
  return opening.find(c) != std::u32string::npos;
}

// Whether a line may start at character i (0 < i < n).
bool BreakBefore(const std::u32string& p, std::size_t i) {
  const char32_t before = p[i - 1];
  const char32_t here = p[i];
  if (IsWhiteSpace(here))
    return false;
  if (IsWhiteSpace(before))
    return true;
  if (!IsCjk(before) && !IsCjk(here))
    return false;
  return !MayNotStartLine(here) && !MayNotEndLine(before);
}

hb_script_t ScriptOf(char32_t c) {
  return hb_unicode_script(hb_unicode_funcs_get_default(), c);
}

bool IsNeutralScript(hb_script_t script) {
  return script == HB_SCRIPT_COMMON || script == HB_SCRIPT_INHERITED || script == HB_SCRIPT_UNKNOWN;
}

std::vector<int> EmbeddingLevels(const std::u32string& p) {
  const auto n = static_cast<FriBidiStrIndex>(p.size());
  std::vector<FriBidiCharType> types(p.size());
  std::vector<FriBidiBracketType> brackets(p.size());
  std::vector<FriBidiLevel> levels(p.size());
  const auto* chars = reinterpret_cast<const FriBidiChar*>(p.data());
  fribidi_get_bidi_types(chars, n, types.data());
  fribidi_get_bracket_types(chars, n, types.data(), brackets.data());
  FriBidiParType direction = FRIBIDI_PAR_ON;
  if (fribidi_get_par_embedding_levels_ex(types.data(), brackets.data(), n, &direction,
                                          levels.data()) == 0) {
    return std::vector<int>(p.size(), 0);
  }
  return std::vector<int>(levels.begin(), levels.end());
}

std::vector<Run> Itemize(const std::u32string& p, const std::vector<int>& levels) {
  // Neutral characters take the script of what precedes them (or follows,
  // at the start).
  std::vector<hb_script_t> scripts(p.size(), HB_SCRIPT_COMMON);
  hb_script_t current = HB_SCRIPT_COMMON;
  for (std::size_t i = 0; i < p.size(); ++i) {
    const hb_script_t script = ScriptOf(p[i]);
    if (!IsNeutralScript(script))
      current = script;
    scripts[i] = current;
  }
  current = HB_SCRIPT_COMMON;
  for (std::size_t i = p.size(); i-- > 0;) {
    if (!IsNeutralScript(scripts[i]))
      current = scripts[i];
    else
      scripts[i] = current;
  }
  std::vector<Run> runs;
  for (std::size_t i = 0; i < p.size(); ++i) {
    if (runs.empty() || levels[i] != runs.back().level || scripts[i] != scripts[runs.back().start])
      runs.push_back(Run{i, i + 1, levels[i], {}});
    else
      runs.back().end = i + 1;
  }
  return runs;
}

void Shape(const std::u32string& p, const FontFace& face, Run& run) {
  hb_buffer_t* buffer = hb_buffer_create();
  // The whole paragraph goes in as context, so that joining scripts join
  // across run ends; only the run is shaped.
  hb_buffer_add_utf32(buffer, reinterpret_cast<const std::uint32_t*>(p.data()),
                      static_cast<int>(p.size()), static_cast<unsigned int>(run.start),
                      static_cast<int>(run.end - run.start));
  hb_buffer_set_direction(buffer, run.level % 2 == 1 ? HB_DIRECTION_RTL : HB_DIRECTION_LTR);
  hb_buffer_guess_segment_properties(buffer);
  hb_shape(face.hb_font(), buffer, nullptr, 0);
  unsigned int count = 0;
  const hb_glyph_info_t* infos = hb_buffer_get_glyph_infos(buffer, &count);
  const hb_glyph_position_t* positions = hb_buffer_get_glyph_positions(buffer, &count);
  const float em = face.units_per_em();
  run.glyphs.reserve(count);
  for (unsigned int i = 0; i < count; ++i) {
    run.glyphs.push_back(ShapedGlyph{infos[i].codepoint, infos[i].cluster,
                                     static_cast<float>(positions[i].x_advance) / em,
                                     static_cast<float>(positions[i].x_offset) / em,
                                     static_cast<float>(positions[i].y_offset) / em});
  }
  hb_buffer_destroy(buffer);
}

// Line ranges [start, end) of the paragraph.
std::vector<std::pair<std::size_t, std::size_t>> BreakLines(const std::u32string& p,
                                                            const std::vector<float>& advance,
                                                            const std::vector<bool>& starts,
                                                            float extra, float max_width) {
  const std::size_t n = p.size();
  // Running sums of advances and character (cluster) counts.
  std::vector<float> advance_before(n + 1, 0.0f);
  std::vector<int> clusters_before(n + 1, 0);
  for (std::size_t i = 0; i < n; ++i) {
    advance_before[i + 1] = advance_before[i] + advance[i];
    clusters_before[i + 1] = clusters_before[i] + (starts[i] ? 1 : 0);
  }
  auto width = [&](std::size_t from, std::size_t to) {
    while (to > from && IsWhiteSpace(p[to - 1]))
      --to;
    const int clusters = clusters_before[to] - clusters_before[from];
    return advance_before[to] - advance_before[from] +
           extra * static_cast<float>(std::max(clusters - 1, 0));
  };
  std::vector<std::pair<std::size_t, std::size_t>> lines;
  std::size_t line_start = 0;
  std::size_t last_fit = 0;  // end of the longest line from line_start that fits
  for (std::size_t i = 1; i <= n; ++i) {
    const bool opportunity = i == n || (starts[i] && BreakBefore(p, i));
    if (!opportunity)
      continue;
    if (max_width > 0.0f && width(line_start, i) > max_width && last_fit > line_start) {
      lines.emplace_back(line_start, last_fit);
      line_start = last_fit;
    }
    last_fit = i;
  }
  if (line_start < n || lines.empty())
    lines.emplace_back(line_start, n);
  return lines;
}

// Rule L2 of the bidirectional algorithm over the runs of one line.
void ReorderVisually(std::vector<const Run*>& runs) {
  int highest = 0;
  int lowest_odd = std::numeric_limits<int>::max();
  for (const Run* run : runs) {
    highest = std::max(highest, run->level);
    if (run->level % 2 == 1)
      lowest_odd = std::min(lowest_odd, run->level);
  }
  for (int level = highest; level >= lowest_odd; --level) {
    for (std::size_t i = 0; i < runs.size();) {
      if (runs[i]->level < level) {
        ++i;
        continue;
      }
      std::size_t j = i;
      while (j < runs.size() && runs[j]->level >= level)
        ++j;
      std::reverse(runs.begin() + static_cast<std::ptrdiff_t>(i),
                   runs.begin() + static_cast<std::ptrdiff_t>(j));
      i = j;
    }
  }
}

struct LineGlyphs {
  std::vector<ShapedGlyph> glyphs;  // visual order
  float width = 0.0f;
};

// The glyphs of `run` that belong to characters [start, end). HarfBuzz keeps
// clusters monotonic in the run's direction (ascending left to right,
// descending right to left), so the range is found by bisection: a long
// paragraph broken into many lines would otherwise visit every glyph once
// per line.
std::pair<const ShapedGlyph*, const ShapedGlyph*> GlyphsOf(const Run& run, std::size_t start,
                                                           std::size_t end) {
  const ShapedGlyph* first = run.glyphs.data();
  const ShapedGlyph* last = first + run.glyphs.size();
  if (run.level % 2 == 0) {
    auto before = [](const ShapedGlyph& g, std::size_t c) { return g.cluster < c; };
    return {std::lower_bound(first, last, start, before),
            std::lower_bound(first, last, end, before)};
  }
  auto before = [](const ShapedGlyph& g, std::size_t c) { return g.cluster >= c; };
  return {std::lower_bound(first, last, end, before), std::lower_bound(first, last, start, before)};
}

LineGlyphs CollectLine(const std::u32string& p, const std::vector<Run>& runs, std::size_t start,
                       std::size_t end, float extra) {
  while (end > start && IsWhiteSpace(p[end - 1]))
    --end;
  // Runs are in logical order and do not overlap: those of the line follow
  // the first one that ends after its start.
  std::vector<const Run*> line_runs;
  auto run = std::partition_point(runs.begin(), runs.end(),
                                  [start](const Run& r) { return r.end <= start; });
  for (; run != runs.end() && run->start < end; ++run)
    line_runs.push_back(&*run);
  ReorderVisually(line_runs);
  LineGlyphs line;
  bool first = true;
  std::uint32_t previous_cluster = 0;
  for (const Run* line_run : line_runs) {
    const auto [from, to] = GlyphsOf(*line_run, start, end);
    for (const ShapedGlyph* glyph = from; glyph != to; ++glyph) {
      if (!first && glyph->cluster != previous_cluster)
        line.width += extra;
      ShapedGlyph placed = *glyph;
      placed.x_offset += line.width;  // pen position folded into the offset
      line.glyphs.push_back(placed);
      line.width += glyph->advance;
      previous_cluster = glyph->cluster;
      first = false;
    }
  }
  return line;
}

void Include(Rect& bounds, bool& empty, float left, float top, float right, float bottom) {
  if (empty) {
    bounds = Rect(left, top, right, bottom);
    empty = false;
    return;
  }
  bounds.left = std::min(bounds.left, left);
  bounds.top = std::max(bounds.top, top);
  bounds.right = std::max(bounds.right, right);
  bounds.bottom = std::min(bounds.bottom, bottom);
}

}  // namespace

TextLayout LayOutText(const std::u32string& text, const FontFace& face,
                      const LayoutParams& params) {
  TextLayout layout;
  if (text.empty())
    return layout;
  const Rect& box = params.container;
  const bool wraps = box.width() > 0.0f;
  float line_top = box.top;
  bool bounds_empty = true;
  bool ink_empty = true;
  layout.first_baseline = box.top - params.line.ascent;

  auto place_line = [&](const LineGlyphs& line) {
    float x = box.left;
    if (params.alignment == Text::ALIGN_CENTER)
      x = (wraps ? (box.left + box.right) / 2.0f : box.left) - line.width / 2.0f;
    else if (params.alignment == Text::ALIGN_RIGHT)
      x = (wraps ? box.right : box.left) - line.width;
    const float baseline = line_top - params.line.ascent;
    layout.last_baseline = baseline;
    Include(layout.bounds, bounds_empty, x, line_top, x + line.width,
            line_top - params.line.height());
    for (const ShapedGlyph& glyph : line.glyphs) {
      PlacedGlyph placed{glyph.glyph, x + glyph.x_offset, baseline + glyph.y_offset};
      const GlyphInk ink = face.Ink(glyph.glyph);
      if (!ink.empty) {
        Include(layout.bounds, bounds_empty, placed.x + ink.left, placed.y + ink.top,
                placed.x + ink.right, placed.y + ink.bottom);
        Include(layout.ink, ink_empty, placed.x + ink.left, placed.y + ink.top,
                placed.x + ink.right, placed.y + ink.bottom);
      }
      layout.glyphs.push_back(placed);
    }
    line_top -= params.line.height();
    ++layout.line_count;
  };

  std::size_t paragraph_start = 0;
  while (paragraph_start <= text.size()) {
    std::size_t paragraph_end = paragraph_start;
    while (paragraph_end < text.size() && !IsLineBreak(text[paragraph_end]))
      ++paragraph_end;
    const std::u32string p = text.substr(paragraph_start, paragraph_end - paragraph_start);
    if (p.empty()) {
      place_line(LineGlyphs{});
    } else {
      std::vector<Run> runs = Itemize(p, EmbeddingLevels(p));
      std::vector<float> advance(p.size(), 0.0f);
      std::vector<bool> starts(p.size(), false);
      for (Run& run : runs) {
        Shape(p, face, run);
        for (const ShapedGlyph& glyph : run.glyphs) {
          advance[glyph.cluster] += glyph.advance;
          starts[glyph.cluster] = true;
        }
      }
      for (const auto& [start, end] :
           BreakLines(p, advance, starts, params.extra_spacing, wraps ? box.width() : 0.0f)) {
        place_line(CollectLine(p, runs, start, end, params.extra_spacing));
      }
    }
    if (paragraph_end >= text.size())
      break;
    // "\r\n" is one break.
    paragraph_start = paragraph_end + 1;
    if (text[paragraph_end] == U'\r' && paragraph_start < text.size() &&
        text[paragraph_start] == U'\n')
      ++paragraph_start;
  }
  return layout;
}

}  // namespace Vexel::internal
