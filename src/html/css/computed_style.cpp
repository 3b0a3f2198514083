#include "html/css/computed_style.h"

#include <string>
#include <tuple>

#include "base/text.h"

namespace kestrune::html::css {
namespace {

template <typename Style>
auto InheritedFields(Style& s) {
  return std::tie(s.color, s.fontFamily, s.fontSize, s.fontWeight, s.fontStyle, s.lineHeight, s.textAlign,
                  s.whiteSpace, s.visibility, s.cursor, s.borderSpacing);
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

namespace {

bool SameBorderGeometry(const Border (&a)[4], const Border (&b)[4]) {
  for (int side = 0; side < 4; ++side) {
    const bool drawnA = a[side].style != BorderStyle::kNone && a[side].style != BorderStyle::kHidden;
    const bool drawnB = b[side].style != BorderStyle::kNone && b[side].style != BorderStyle::kHidden;
    if (drawnA != drawnB || (drawnA && a[side].width != b[side].width)) return false;
  }
  return true;
}

}  // namespace

bool ComputedStyle::LayoutEqual(const ComputedStyle& o) const {
  return fontFamily == o.fontFamily && fontSize == o.fontSize && fontWeight == o.fontWeight &&
         fontStyle == o.fontStyle && lineHeight == o.lineHeight && textAlign == o.textAlign &&
         whiteSpace == o.whiteSpace && borderSpacing == o.borderSpacing && display == o.display &&
         position == o.position && std::equal(std::begin(offsets), std::end(offsets), std::begin(o.offsets)) &&
         overflowX == o.overflowX && overflowY == o.overflowY && flow == o.flow && width == o.width &&
         height == o.height && minWidth == o.minWidth && minHeight == o.minHeight && maxWidth == o.maxWidth &&
         maxHeight == o.maxHeight && std::equal(std::begin(margin), std::end(margin), std::begin(o.margin)) &&
         std::equal(std::begin(padding), std::end(padding), std::begin(o.padding)) &&
         SameBorderGeometry(border, o.border) && boxSizing == o.boxSizing && verticalAlign == o.verticalAlign &&
         tableLayoutFixed == o.tableLayoutFixed;
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
         textOverflow == o.textOverflow && verticalAlign == o.verticalAlign &&
         tableLayoutFixed == o.tableLayoutFixed && SameBehaviors(*this, o);
}

namespace {

std::u16string LengthText(const Length& length) {
  auto number = [](float value) {
    const long long whole = static_cast<long long>(value);
    if (static_cast<float>(whole) == value) return FormatDecimal(static_cast<std::int64_t>(whole));
    return AsciiToUtf16(std::to_string(value));
  };
  switch (length.unit) {
    case Length::Unit::kAuto: return u"auto";
    case Length::Unit::kNone: return u"none";
    case Length::Unit::kPx: return number(length.value) + u"px";
    case Length::Unit::kPercent: return number(length.value) + u"%";
    case Length::Unit::kFlex: return number(length.value) + u"*";
  }
  return u"auto";
}

}  // namespace

std::optional<std::u16string> ComputedValueText(const ComputedStyle& s, std::u16string_view property) {
  const std::pair<const char16_t*, const Length*> lengths[] = {
      {u"width", &s.width}, {u"height", &s.height}, {u"min-width", &s.minWidth}, {u"min-height", &s.minHeight},
      {u"max-width", &s.maxWidth}, {u"max-height", &s.maxHeight}, {u"top", &s.offsets[kTop]},
      {u"right", &s.offsets[kRight]}, {u"bottom", &s.offsets[kBottom]}, {u"left", &s.offsets[kLeft]},
      {u"margin-top", &s.margin[kTop]}, {u"margin-right", &s.margin[kRight]}, {u"margin-bottom", &s.margin[kBottom]},
      {u"margin-left", &s.margin[kLeft]}, {u"padding-top", &s.padding[kTop]}, {u"padding-right", &s.padding[kRight]},
      {u"padding-bottom", &s.padding[kBottom]}, {u"padding-left", &s.padding[kLeft]}};
  for (const auto& [name, length] : lengths) {
    if (EqualsIgnoringAsciiCase(property, name)) return LengthText(*length);
  }
  if (EqualsIgnoringAsciiCase(property, u"visibility")) {
    return s.visibility == Visibility::kVisible ? u"visible" : s.visibility == Visibility::kHidden ? u"hidden" : u"collapse";
  }
  if (EqualsIgnoringAsciiCase(property, u"display")) {
    static constexpr const char16_t* kNames[] = {u"inline", u"block", u"inline-block", u"none", u"list-item", u"table",
                                                 u"inline-table", u"table-row", u"table-cell", u"table-row-group",
                                                 u"table-header-group", u"table-footer-group", u"table-column",
                                                 u"table-caption"};
    return kNames[static_cast<int>(s.display)];
  }
  if (EqualsIgnoringAsciiCase(property, u"flow")) {
    static constexpr const char16_t* kNames[] = {u"default", u"vertical", u"horizontal", u"horizontal-flow",
                                                 u"vertical-flow", u"stack"};
    return kNames[static_cast<int>(s.flow)];
  }
  return std::nullopt;
}

const std::vector<std::string>& BehaviorNames(const ComputedStyle& style) {
  static const std::vector<std::string> kNone;
  return style.behaviors ? *style.behaviors : kNone;
}

}  // namespace kestrune::html::css
