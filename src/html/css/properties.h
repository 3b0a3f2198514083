#pragma once

#include <cstdint>
#include <optional>
#include <string_view>
#include <vector>

#include "html/css/computed_style.h"
#include "html/css/tokenizer.h"

namespace kestrune::html::css {

// Longhand properties; shorthands are expanded into these while parsing.
enum class PropertyId : std::uint8_t {
  kDisplay, kPosition, kTop, kRight, kBottom, kLeft, kZIndex, kVisibility, kOverflowX, kOverflowY,
  kFlow, kWidth, kHeight, kMinWidth, kMinHeight, kMaxWidth, kMaxHeight,
  kMarginTop, kMarginRight, kMarginBottom, kMarginLeft,
  kPaddingTop, kPaddingRight, kPaddingBottom, kPaddingLeft,
  kBorderTopWidth, kBorderRightWidth, kBorderBottomWidth, kBorderLeftWidth,
  kBorderTopStyle, kBorderRightStyle, kBorderBottomStyle, kBorderLeftStyle,
  kBorderTopColor, kBorderRightColor, kBorderBottomColor, kBorderLeftColor,
  kBorderTopLeftRadius, kBorderTopRightRadius, kBorderBottomRightRadius, kBorderBottomLeftRadius,
  kBoxSizing, kFontFamily, kFontSize, kFontWeight, kFontStyle, kColor, kBackgroundColor,
  kBackgroundImage, kBackgroundRepeat, kBackgroundPositionX, kBackgroundPositionY, kWhiteSpace,
  kTextOverflow, kTextAlign, kVerticalAlign, kLineHeight, kCursor, kBehavior, kTableLayout, kBorderSpacing,
  kCount
};

struct Declaration {
  PropertyId id;
  std::vector<Token> value;  // without leading or trailing whitespace
  bool important = false;
};

// Appends the longhand declarations of `name: value` (a shorthand gives several); false when
// the property is unknown or the value does not fit it.
bool ExpandDeclaration(std::u16string_view name, const std::vector<Token>& value, bool important,
                       std::vector<Declaration>& out);

// Sets the property on `style`; em and percentages of font sizes resolve against `parent`.
// Invalid values leave the style as it was.
void ApplyDeclaration(const Declaration& declaration, ComputedStyle& style, const ComputedStyle& parent);

std::optional<Color> ParseColor(const std::vector<Token>& value);

}  // namespace kestrune::html::css
