#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "html/layout/layout_context.h"

namespace kestrune::html::layout {

// Inline content: a range of a block container's child nodes (text, inline elements,
// inline-blocks and images, line breaks) laid out in lines. Heights are computed in the layout
// pass; where each run goes (which needs text widths) is worked out again when it is painted,
// hit or located, so that a big table of unwrapped cells measures only what is on screen.
struct InlineRange {
  Element* container = nullptr;
  std::uint32_t firstNode = 0;
  std::uint32_t endNode = 0;
};

struct LinesSize {
  int height = 0;
  int lastBaseline = -1;  // from the top of the lines
  int width = 0;          // of the widest line, when widths were measured
};

struct PlacedRun {
  enum class Kind : std::uint8_t { kText, kAtomic };
  Kind kind = Kind::kText;
  Element* element = nullptr;                  // text: its parent element; atomic: the element
  const css::ComputedStyle* style = nullptr;   // of `element`
  std::u16string text;                         // whitespace already processed
  std::uint32_t offset = 0;                    // of the text in the container's inner text (pre text)
  int x = 0;
  int width = -1;  // -1: not measured (nothing follows it on its line; painted to the line's end)
  int top = 0, height = 0;  // text: the font's ascent and descent; atomic: the margin box
};

// An inline element's piece on one line (its background and borders are drawn per piece).
struct InlineFragment {
  Element* element = nullptr;
  int left = 0, right = 0;
};

struct PlacedLine {
  int top = 0, height = 0, baseline = 0;  // from the content box top
  std::vector<PlacedRun> runs;
  std::vector<InlineFragment> fragments;
};

enum class PlaceMode : std::uint8_t {
  kPaint,       // a lone last run of a left-aligned unwrapped line stays unmeasured
  kMeasureAll,  // every width measured (hit tests inside text, caret positions)
};

class InlineLayout {
 public:
  // Lays the atomic children out and measures the lines in a content box `width` wide. Text is
  // measured only when it can wrap.
  static LinesSize Measure(const InlineRange& range, int width, LayoutContext& ctx);
  // The lines with their runs; atomic children get their x and y (`origin`: the content box
  // in the container's border box).
  static std::vector<PlacedLine> Place(const InlineRange& range, int width, Point origin, PlaceMode mode,
                                       LayoutContext& ctx);
  static IntrinsicWidths Intrinsic(const InlineRange& range, LayoutContext& ctx);
  // Whether the range holds anything but collapsible white space.
  static bool HasContent(const InlineRange& range);
};

}  // namespace kestrune::html::layout
