#pragma once

#include <climits>
#include <unordered_map>
#include <vector>

#include "html/layout/box.h"
#include "html/layout/image.h"
#include "html/layout/text_measurer.h"

namespace kestrune::html::layout {

// What a parent gives a child to lay out in.
struct BoxInput {
  int width = 0;           // the border-box width, decided by the parent
  int forcedHeight = -1;   // a border-box height the parent imposes (flexible shares, rows), or -1
  int cbWidth = 0;         // base of the element's percentage paddings and margins
  int cbHeight = -1;       // base of its percentage height; -1 when that is not known
  // In-flow content may stop once it reaches below this y (from the border-box top): a scroll
  // container only needs to know that its content overflows before it adds its scroll bar.
  int stopBelow = INT_MAX;
};

struct IntrinsicWidths {
  int min = 0;  // the narrowest border box the content fits (longest word)
  int max = 0;  // the border box the content needs without any soft wrap
};

// The state shared by one layout pass, and the caches that outlive it.
class LayoutContext {
 public:
  LayoutContext(const TextMeasurer& measurer, ImageCache& images) : measurer_(measurer), images_(images) {}

  const TextMeasurer& measurer() const { return measurer_; }
  ImageCache& images() { return images_; }
  Size view;

  // Font metrics and space width of a style's font (styles are shared, so a memo by style
  // makes a table's cells cheap: no font is built or hashed per cell).
  const FontMetrics& MetricsOf(const css::ComputedStyle& style);
  int SpaceWidth(const css::ComputedStyle& style);
  // The style's line height and its half-leading, in px.
  int LineHeightOf(const css::ComputedStyle& style);

  // Positioned containers (the root, positioned elements) being laid out, innermost last:
  // positioned descendants register with the innermost one.
  std::vector<Element*> positionedContainers;
  // Elements with size handlers whose box changed size.
  std::vector<Element*> resized;
  // Intrinsic widths computed in this pass.
  std::unordered_map<const Element*, IntrinsicWidths> intrinsic;
  int depth = 0;
  int laidOut = 0;  // boxes laid out (not kept) in this pass

  void BeginPass(Size viewSize);
  // Forgets the memo of the last style: a style object may be freed and another take its
  // address between passes.
  void ForgetStyles() {
    lastStyle_ = nullptr;
    lastEntry_ = nullptr;
    byStyle_.clear();
  }

 private:
  struct FontEntry {
    Font font;
    FontMetrics metrics;
    int space = -1;
  };
  FontEntry& EntryOf(const css::ComputedStyle& style);

  const TextMeasurer& measurer_;
  ImageCache& images_;
  std::unordered_map<Font, FontEntry, FontHash> fonts_;
  std::unordered_map<const css::ComputedStyle*, FontEntry*> byStyle_;
  const css::ComputedStyle* lastStyle_ = nullptr;
  FontEntry* lastEntry_ = nullptr;
};

}  // namespace kestrune::html::layout
