#include "html/css/computed_style.h"

#include <tuple>

namespace kestrune::html::css {
namespace {

template <typename Style>
auto InheritedFields(Style& s) {
  return std::tie(s.color, s.fontFamily, s.fontSize, s.fontWeight, s.fontStyle, s.lineHeight, s.textAlign,
                  s.whiteSpace, s.visibility, s.cursor);
}

bool SameBehaviors(const ComputedStyle& a, const ComputedStyle& b) {
  return BehaviorNames(a) == BehaviorNames(b);
}

}  // namespace

ComputedStyle ComputedStyle::InheritFrom(const ComputedStyle& parent) {
  ComputedStyle style;
  InheritedFields(style) = InheritedFields(parent);
  return style;
}

bool ComputedStyle::InheritedEqual(const ComputedStyle& other) const {
  return InheritedFields(*this) == InheritedFields(other);
}

bool ComputedStyle::operator==(const ComputedStyle& o) const {
  return InheritedEqual(o) && display == o.display && position == o.position &&
         std::equal(std::begin(offsets), std::end(offsets), std::begin(o.offsets)) && zIndex == o.zIndex &&
         zIndexAuto == o.zIndexAuto && overflowX == o.overflowX && overflowY == o.overflowY && flow == o.flow &&
         width == o.width && height == o.height && minWidth == o.minWidth && minHeight == o.minHeight &&
         maxWidth == o.maxWidth && maxHeight == o.maxHeight &&
         std::equal(std::begin(margin), std::end(margin), std::begin(o.margin)) &&
         std::equal(std::begin(padding), std::end(padding), std::begin(o.padding)) &&
         std::equal(std::begin(border), std::end(border), std::begin(o.border)) &&
         std::equal(std::begin(radius), std::end(radius), std::begin(o.radius)) && boxSizing == o.boxSizing &&
         backgroundColor == o.backgroundColor && backgroundImage == o.backgroundImage &&
         backgroundRepeat == o.backgroundRepeat &&
         std::equal(std::begin(backgroundPosition), std::end(backgroundPosition), std::begin(o.backgroundPosition)) &&
         textOverflow == o.textOverflow && verticalAlign == o.verticalAlign && SameBehaviors(*this, o);
}

const std::vector<std::string>& BehaviorNames(const ComputedStyle& style) {
  static const std::vector<std::string> kNone;
  return style.behaviors ? *style.behaviors : kNone;
}

}  // namespace kestrune::html::css
