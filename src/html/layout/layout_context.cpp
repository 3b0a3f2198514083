#include "html/layout/layout_context.h"

#include <cmath>

namespace kestrune::html::layout {

Font FontOf(const css::ComputedStyle& style) {
  return {style.fontFamily, style.fontSize, style.fontWeight, style.fontStyle == css::FontStyle::kItalic};
}

void LayoutContext::BeginPass(Size viewSize) {
  view = viewSize;
  positionedContainers.clear();
  resized.clear();
  intrinsic.clear();
  depth = 0;
  laidOut = 0;
  ForgetStyles();
}

LayoutContext::FontEntry& LayoutContext::EntryOf(const css::ComputedStyle& style) {
  if (&style == lastStyle_) return *lastEntry_;
  FontEntry*& known = byStyle_[&style];
  if (!known) {
    Font font = FontOf(style);
    auto found = fonts_.find(font);
    if (found == fonts_.end()) {
      FontEntry entry{font, measurer_.Metrics(font), -1};
      found = fonts_.emplace(std::move(font), std::move(entry)).first;
    }
    known = &found->second;
  }
  lastStyle_ = &style;
  lastEntry_ = known;
  return *known;
}

const FontMetrics& LayoutContext::MetricsOf(const css::ComputedStyle& style) { return EntryOf(style).metrics; }

int LayoutContext::SpaceWidth(const css::ComputedStyle& style) {
  FontEntry& entry = EntryOf(style);
  if (entry.space < 0) entry.space = measurer_.TextWidth(entry.font, u" ");
  return entry.space;
}

int LayoutContext::LineHeightOf(const css::ComputedStyle& style) {
  if (style.lineHeight.unit == css::Length::Unit::kPx) return static_cast<int>(std::lround(style.lineHeight.value));
  return MetricsOf(style).lineHeight;
}

}  // namespace kestrune::html::layout
