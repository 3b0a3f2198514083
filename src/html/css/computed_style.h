#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <string_view>
#include <string>
#include <vector>

namespace kestrune::html::css {

// A length as the layout needs it: em are already pixels; percentages and flexible shares
// ("1*") stay relative because only the layout knows what they are relative to.
struct Length {
  enum class Unit : std::uint8_t { kAuto, kNone, kPx, kPercent, kFlex };
  float value = 0;
  Unit unit = Unit::kAuto;

  static Length Px(float px) { return {px, Unit::kPx}; }
  static Length Auto() { return {0, Unit::kAuto}; }
  static Length None() { return {0, Unit::kNone}; }
  bool operator==(const Length&) const = default;
};

// 0xAARRGGBB.
using Color = std::uint32_t;
inline constexpr Color kTransparent = 0x00000000;
inline constexpr Color kBlack = 0xFF000000;

enum class Display : std::uint8_t {
  kInline, kBlock, kInlineBlock, kNone, kListItem, kTable, kInlineTable, kTableRow,
  kTableCell, kTableRowGroup, kTableHeaderGroup, kTableFooterGroup, kTableColumn, kTableCaption,
};
enum class Position : std::uint8_t { kStatic, kRelative, kAbsolute, kFixed };
enum class Visibility : std::uint8_t { kVisible, kHidden, kCollapse };
enum class Overflow : std::uint8_t { kVisible, kHidden, kAuto, kScroll };
enum class Flow : std::uint8_t { kDefault, kVertical, kHorizontal, kHorizontalFlow, kVerticalFlow, kStack };
enum class BoxSizing : std::uint8_t { kContentBox, kBorderBox };
enum class BorderStyle : std::uint8_t { kNone, kSolid, kDotted, kDashed, kDouble, kInset, kOutset, kHidden };
enum class FontStyle : std::uint8_t { kNormal, kItalic };
enum class WhiteSpace : std::uint8_t { kNormal, kNoWrap, kPre, kPreWrap, kPreLine };
enum class TextOverflow : std::uint8_t { kClip, kEllipsis, kPathEllipsis };
enum class TextAlign : std::uint8_t { kLeft, kRight, kCenter, kJustify };
enum class VerticalAlign : std::uint8_t { kBaseline, kTop, kMiddle, kBottom, kSub, kSuper, kTextTop, kTextBottom };
enum class BackgroundRepeat : std::uint8_t { kRepeat, kRepeatX, kRepeatY, kNoRepeat };
enum class Cursor : std::uint8_t { kAuto, kDefault, kPointer, kText, kWait, kMove, kCrosshair, kHelp, kNotAllowed,
                                   kEResize, kNResize, kColResize, kRowResize };
enum Side : std::uint8_t { kTop, kRight, kBottom, kLeft };
enum Corner : std::uint8_t { kTopLeft, kTopRight, kBottomRight, kBottomLeft };

struct Border {
  float width = 0;  // px
  BorderStyle style = BorderStyle::kNone;
  Color color = kBlack;
  bool currentColor = true;  // the colour follows `color` until one is given
  bool operator==(const Border&) const = default;
};

// The computed values of one element. Elements with the same parent style and the same matched
// rules share one object, so a table of many alike rows holds a handful of these.
struct ComputedStyle {
  // Inherited.
  Color color = kBlack;
  std::u16string fontFamily = u"sans-serif";
  float fontSize = 12;  // px
  int fontWeight = 400;
  FontStyle fontStyle = FontStyle::kNormal;
  Length lineHeight = Length::Auto();  // auto = normal
  TextAlign textAlign = TextAlign::kLeft;
  WhiteSpace whiteSpace = WhiteSpace::kNormal;
  Visibility visibility = Visibility::kVisible;
  Cursor cursor = Cursor::kAuto;
  float borderSpacing = 0;  // px, between table cells and around them

  // Not inherited.
  Display display = Display::kInline;
  Position position = Position::kStatic;
  Length offsets[4] = {};  // top, right, bottom, left
  int zIndex = 0;
  bool zIndexAuto = true;
  Overflow overflowX = Overflow::kVisible;
  Overflow overflowY = Overflow::kVisible;
  Flow flow = Flow::kDefault;
  Length width = Length::Auto(), height = Length::Auto();
  Length minWidth = Length::Auto(), minHeight = Length::Auto();
  Length maxWidth = Length::None(), maxHeight = Length::None();
  Length margin[4] = {Length::Px(0), Length::Px(0), Length::Px(0), Length::Px(0)};
  Length padding[4] = {Length::Px(0), Length::Px(0), Length::Px(0), Length::Px(0)};
  Border border[4];
  Length radius[4] = {Length::Px(0), Length::Px(0), Length::Px(0), Length::Px(0)};
  BoxSizing boxSizing = BoxSizing::kContentBox;
  Color backgroundColor = kTransparent;
  std::u16string backgroundImage;  // URL as written; empty for none
  BackgroundRepeat backgroundRepeat = BackgroundRepeat::kRepeat;
  Length backgroundPosition[2] = {Length::Px(0), Length::Px(0)};
  TextOverflow textOverflow = TextOverflow::kClip;
  VerticalAlign verticalAlign = VerticalAlign::kBaseline;
  bool tableLayoutFixed = false;  // column widths from the first row (or `col`), not from every cell
  std::shared_ptr<const std::vector<std::string>> behaviors;  // names, in order; null for none

  // A fresh style for a child: inherited values copied, the rest at their initial values.
  static ComputedStyle InheritFrom(const ComputedStyle& parent);
  bool InheritedEqual(const ComputedStyle& other) const;
  // Whether the two styles give the same boxes: what differs only repaints.
  bool LayoutEqual(const ComputedStyle& other) const;
  bool operator==(const ComputedStyle& other) const;
};

const std::vector<std::string>& BehaviorNames(const ComputedStyle& style);

// The computed value of a property as CSS text ("200px", "50%", "1*", "auto", "hidden",
// "horizontal" ...), for the properties behaviors read back; none for the others.
std::optional<std::u16string> ComputedValueText(const ComputedStyle& style, std::u16string_view property);

}  // namespace kestrune::html::css
