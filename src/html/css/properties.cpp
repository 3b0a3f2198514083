#include "html/css/properties.h"

#include <algorithm>
#include <cmath>

#include "base/text.h"
#include "base/utf.h"

namespace kestrune::html::css {
namespace {

using Type = Token::Type;

struct Keyword {
  const char16_t* name;
  std::uint8_t value;
};

template <typename E, std::size_t N>
std::optional<E> FindKeyword(const Keyword (&table)[N], const std::vector<Token>& value) {
  if (value.size() != 1 || !value[0].Is(Type::kIdent)) return std::nullopt;
  for (const Keyword& keyword : table) {
    if (EqualsIgnoringAsciiCase(value[0].text, keyword.name)) return static_cast<E>(keyword.value);
  }
  return std::nullopt;
}

bool IsIdent(const Token& token, std::u16string_view name) {
  return token.Is(Type::kIdent) && EqualsIgnoringAsciiCase(token.text, name);
}

constexpr Keyword kDisplay[] = {
    {u"inline", 0}, {u"block", 1}, {u"inline-block", 2}, {u"none", 3}, {u"list-item", 4}, {u"table", 5},
    {u"inline-table", 6}, {u"table-row", 7}, {u"table-cell", 8}, {u"table-row-group", 9},
    {u"table-header-group", 10}, {u"table-footer-group", 11}, {u"table-column", 12}, {u"table-caption", 13}};
constexpr Keyword kPosition[] = {{u"static", 0}, {u"relative", 1}, {u"absolute", 2}, {u"fixed", 3}};
constexpr Keyword kVisibility[] = {{u"visible", 0}, {u"hidden", 1}, {u"collapse", 2}};
constexpr Keyword kOverflow[] = {{u"visible", 0}, {u"hidden", 1}, {u"auto", 2}, {u"scroll", 3}, {u"hidden-scroll", 2}};
constexpr Keyword kFlow[] = {{u"default", 0}, {u"vertical", 1}, {u"horizontal", 2}, {u"horizontal-flow", 3},
                             {u"vertical-flow", 4}, {u"stack", 5}};
constexpr Keyword kBoxSizing[] = {{u"content-box", 0}, {u"border-box", 1}};
constexpr Keyword kBorderStyle[] = {{u"none", 0}, {u"solid", 1}, {u"dotted", 2}, {u"dashed", 3}, {u"double", 4},
                                    {u"inset", 5}, {u"outset", 6}, {u"hidden", 7}, {u"groove", 5}, {u"ridge", 6}};
constexpr Keyword kFontStyle[] = {{u"normal", 0}, {u"italic", 1}, {u"oblique", 1}};
constexpr Keyword kWhiteSpace[] = {{u"normal", 0}, {u"nowrap", 1}, {u"pre", 2}, {u"pre-wrap", 3}, {u"pre-line", 4}};
constexpr Keyword kTextOverflow[] = {{u"clip", 0}, {u"ellipsis", 1}, {u"path-ellipsis", 2}};
constexpr Keyword kTextAlign[] = {{u"left", 0}, {u"right", 1}, {u"center", 2}, {u"justify", 3}, {u"start", 0},
                                  {u"end", 1}};
constexpr Keyword kVerticalAlign[] = {{u"baseline", 0}, {u"top", 1}, {u"middle", 2}, {u"bottom", 3}, {u"sub", 4},
                                      {u"super", 5}, {u"text-top", 6}, {u"text-bottom", 7}};
constexpr Keyword kRepeat[] = {{u"repeat", 0}, {u"repeat-x", 1}, {u"repeat-y", 2}, {u"no-repeat", 3}};
constexpr Keyword kCursor[] = {{u"auto", 0}, {u"default", 1}, {u"pointer", 2}, {u"hand", 2}, {u"text", 3},
                               {u"wait", 4}, {u"move", 5}, {u"crosshair", 6}, {u"help", 7}, {u"not-allowed", 8},
                               {u"no-drop", 8}, {u"e-resize", 9}, {u"w-resize", 9}, {u"ew-resize", 9},
                               {u"n-resize", 10}, {u"s-resize", 10}, {u"ns-resize", 10}, {u"col-resize", 11},
                               {u"row-resize", 12}};

struct NamedColor {
  const char16_t* name;
  Color value;
};
constexpr NamedColor kColors[] = {
    {u"black", 0xFF000000},   {u"white", 0xFFFFFFFF},  {u"red", 0xFFFF0000},     {u"green", 0xFF008000},
    {u"blue", 0xFF0000FF},    {u"yellow", 0xFFFFFF00}, {u"gray", 0xFF808080},    {u"grey", 0xFF808080},
    {u"silver", 0xFFC0C0C0},  {u"maroon", 0xFF800000}, {u"purple", 0xFF800080},  {u"fuchsia", 0xFFFF00FF},
    {u"lime", 0xFF00FF00},    {u"olive", 0xFF808000},  {u"navy", 0xFF000080},    {u"teal", 0xFF008080},
    {u"aqua", 0xFF00FFFF},    {u"orange", 0xFFFFA500}, {u"transparent", 0x00000000},
    {u"lightgray", 0xFFD3D3D3}, {u"darkgray", 0xFFA9A9A9}, {u"whitesmoke", 0xFFF5F5F5},
    {u"window", 0xFFFFFFFF},  {u"windowtext", 0xFF000000}, {u"highlight", 0xFF3399FF},
    {u"highlighttext", 0xFFFFFFFF}, {u"graytext", 0xFF6D6D6D}, {u"threedface", 0xFFF0F0F0},
    {u"buttonface", 0xFFF0F0F0}, {u"buttontext", 0xFF000000},
};

int Hex(char16_t c) {
  if (c >= u'0' && c <= u'9') return c - u'0';
  if (c >= u'a' && c <= u'f') return c - u'a' + 10;
  if (c >= u'A' && c <= u'F') return c - u'A' + 10;
  return -1;
}

std::uint32_t Channel(double value) {
  return static_cast<std::uint32_t>(std::lround(std::clamp(value, 0.0, 255.0)));
}

std::optional<Color> ColorFromHash(std::u16string_view hex) {
  for (char16_t c : hex) {
    if (Hex(c) < 0) return std::nullopt;
  }
  if (hex.size() == 3) {
    std::uint32_t rgb = 0;
    for (char16_t c : hex) rgb = (rgb << 8) | static_cast<std::uint32_t>(Hex(c) * 17);
    return 0xFF000000 | rgb;
  }
  if (hex.size() == 6) {
    std::uint32_t rgb = 0;
    for (char16_t c : hex) rgb = (rgb << 4) | static_cast<std::uint32_t>(Hex(c));
    return 0xFF000000 | rgb;
  }
  return std::nullopt;
}

std::optional<Color> ColorFromFunction(const std::vector<Token>& value) {
  const bool alpha = EqualsIgnoringAsciiCase(value[0].text, u"rgba");
  if (!alpha && !EqualsIgnoringAsciiCase(value[0].text, u"rgb")) return std::nullopt;
  std::vector<double> parts;
  for (std::size_t i = 1; i < value.size(); ++i) {
    const Token& token = value[i];
    if (token.Is(Type::kNumber)) parts.push_back(parts.size() == 3 ? token.number * 255 : token.number);
    else if (token.Is(Type::kPercentage)) parts.push_back(token.number * 2.55);
    else if (token.Is(Type::kRightParen)) break;
    else if (!token.Is(Type::kComma) && !token.Is(Type::kWhitespace)) return std::nullopt;
  }
  if (parts.size() != (alpha ? 4u : 3u)) return std::nullopt;
  const std::uint32_t a = alpha ? Channel(parts[3]) : 255;
  return (a << 24) | (Channel(parts[0]) << 16) | (Channel(parts[1]) << 8) | Channel(parts[2]);
}

// Lengths compound through em from parent to child; kept in a range a float holds.
float Float(double value) { return static_cast<float>(std::clamp(value, -1e30, 1e30)); }

// A length; em against `emBase`; a bare 0 is 0 px.
std::optional<Length> ToLength(const Token& token, float emBase, bool allowAuto = true) {
  switch (token.type) {
    case Type::kNumber:
      if (token.number == 0) return Length::Px(0);
      return Length::Px(Float(token.number));  // unitless pixels, as old pages write them
    case Type::kPercentage: return Length{Float(token.number), Length::Unit::kPercent};
    case Type::kFlex: return Length{Float(token.number), Length::Unit::kFlex};
    case Type::kDimension: {
      const double n = token.number;
      const std::u16string& unit = token.text;
      if (EqualsIgnoringAsciiCase(unit, u"px")) return Length::Px(Float(n));
      if (EqualsIgnoringAsciiCase(unit, u"em")) return Length::Px(Float(n * emBase));
      if (EqualsIgnoringAsciiCase(unit, u"ex")) return Length::Px(Float(n * emBase / 2));
      if (EqualsIgnoringAsciiCase(unit, u"pt")) return Length::Px(Float(n * 4 / 3));
      if (EqualsIgnoringAsciiCase(unit, u"pc")) return Length::Px(Float(n * 16));
      if (EqualsIgnoringAsciiCase(unit, u"in")) return Length::Px(Float(n * 96));
      if (EqualsIgnoringAsciiCase(unit, u"cm")) return Length::Px(Float(n * 96 / 2.54));
      if (EqualsIgnoringAsciiCase(unit, u"mm")) return Length::Px(Float(n * 96 / 25.4));
      if (EqualsIgnoringAsciiCase(unit, u"dip")) return Length::Px(Float(n));
      return std::nullopt;
    }
    case Type::kDelim:
      if (token.delim == u'*') return Length{1, Length::Unit::kFlex};
      return std::nullopt;
    case Type::kIdent:
      if (allowAuto && EqualsIgnoringAsciiCase(token.text, u"auto")) return Length::Auto();
      if (EqualsIgnoringAsciiCase(token.text, u"none")) return Length::None();
      return std::nullopt;
    default: return std::nullopt;
  }
}

std::optional<Length> SingleLength(const std::vector<Token>& value, float emBase) {
  if (value.size() != 1) return std::nullopt;
  return ToLength(value[0], emBase);
}

std::optional<float> BorderWidth(const std::vector<Token>& value, float emBase) {
  if (value.size() == 1 && value[0].Is(Type::kIdent)) {
    if (IsIdent(value[0], u"thin")) return 1.0f;
    if (IsIdent(value[0], u"medium")) return 3.0f;
    if (IsIdent(value[0], u"thick")) return 5.0f;
    return std::nullopt;
  }
  auto length = SingleLength(value, emBase);
  if (!length || length->unit != Length::Unit::kPx || length->value < 0) return std::nullopt;
  return length->value;
}

std::optional<float> FontSize(const std::vector<Token>& value, float parentSize) {
  if (value.size() != 1) return std::nullopt;
  const Token& token = value[0];
  static constexpr std::pair<const char16_t*, float> kSizes[] = {
      {u"xx-small", 9}, {u"x-small", 10}, {u"small", 13}, {u"medium", 16}, {u"large", 18}, {u"x-large", 24},
      {u"xx-large", 32}};
  if (token.Is(Type::kIdent)) {
    for (const auto& [name, px] : kSizes) {
      if (IsIdent(token, name)) return px;
    }
    if (IsIdent(token, u"smaller")) return parentSize / 1.2f;
    if (IsIdent(token, u"larger")) return parentSize * 1.2f;
    return std::nullopt;
  }
  auto length = ToLength(token, parentSize, false);
  if (!length) return std::nullopt;
  if (length->unit == Length::Unit::kPercent) return parentSize * length->value / 100;
  if (length->unit != Length::Unit::kPx || length->value < 0) return std::nullopt;
  return length->value;
}

std::optional<int> FontWeight(const std::vector<Token>& value) {
  if (value.size() != 1) return std::nullopt;
  if (value[0].Is(Type::kNumber)) {
    const double weight = value[0].number;
    if (weight < 1 || weight > 1000) return std::nullopt;
    return static_cast<int>(weight);
  }
  if (IsIdent(value[0], u"normal")) return 400;
  if (IsIdent(value[0], u"bold")) return 700;
  if (IsIdent(value[0], u"bolder")) return 800;
  if (IsIdent(value[0], u"lighter")) return 300;
  return std::nullopt;
}

std::u16string FontFamily(const std::vector<Token>& value) {
  std::u16string family;
  for (const Token& token : value) {
    if (token.Is(Type::kIdent) || token.Is(Type::kString)) family += token.text;
    else if (token.Is(Type::kWhitespace)) family.push_back(u' ');
    else if (token.Is(Type::kComma)) family.push_back(u',');
  }
  return family;
}

std::optional<std::shared_ptr<const std::vector<std::string>>> Behaviors(const std::vector<Token>& value) {
  auto names = std::make_shared<std::vector<std::string>>();
  for (const Token& token : value) {
    if (token.Is(Type::kWhitespace) || token.Is(Type::kComma)) continue;
    if (!token.Is(Type::kIdent) && !token.Is(Type::kString)) return std::nullopt;
    if (IsIdent(token, u"none")) continue;
    names->push_back(EncodeUtf8(token.text));
  }
  if (names->empty()) return std::shared_ptr<const std::vector<std::string>>();
  return std::shared_ptr<const std::vector<std::string>>(std::move(names));
}

bool IsKeyword(const std::vector<Token>& value, std::u16string_view name) {
  return value.size() == 1 && IsIdent(value[0], name);
}

// Copies one property between styles, for `inherit` and `initial`.
void CopyProperty(PropertyId id, const ComputedStyle& from, ComputedStyle& to) {
  using P = PropertyId;
  const int index = static_cast<int>(id);
  switch (id) {
    case P::kDisplay: to.display = from.display; break;
    case P::kPosition: to.position = from.position; break;
    case P::kTop: case P::kRight: case P::kBottom: case P::kLeft:
      to.offsets[index - static_cast<int>(P::kTop)] = from.offsets[index - static_cast<int>(P::kTop)]; break;
    case P::kZIndex: to.zIndex = from.zIndex; to.zIndexAuto = from.zIndexAuto; break;
    case P::kVisibility: to.visibility = from.visibility; break;
    case P::kOverflowX: to.overflowX = from.overflowX; break;
    case P::kOverflowY: to.overflowY = from.overflowY; break;
    case P::kFlow: to.flow = from.flow; break;
    case P::kWidth: to.width = from.width; break;
    case P::kHeight: to.height = from.height; break;
    case P::kMinWidth: to.minWidth = from.minWidth; break;
    case P::kMinHeight: to.minHeight = from.minHeight; break;
    case P::kMaxWidth: to.maxWidth = from.maxWidth; break;
    case P::kMaxHeight: to.maxHeight = from.maxHeight; break;
    case P::kMarginTop: case P::kMarginRight: case P::kMarginBottom: case P::kMarginLeft:
      to.margin[index - static_cast<int>(P::kMarginTop)] = from.margin[index - static_cast<int>(P::kMarginTop)]; break;
    case P::kPaddingTop: case P::kPaddingRight: case P::kPaddingBottom: case P::kPaddingLeft:
      to.padding[index - static_cast<int>(P::kPaddingTop)] = from.padding[index - static_cast<int>(P::kPaddingTop)]; break;
    case P::kBorderTopWidth: case P::kBorderRightWidth: case P::kBorderBottomWidth: case P::kBorderLeftWidth: {
      const int side = index - static_cast<int>(P::kBorderTopWidth);
      to.border[side].width = from.border[side].width;
      break;
    }
    case P::kBorderTopStyle: case P::kBorderRightStyle: case P::kBorderBottomStyle: case P::kBorderLeftStyle: {
      const int side = index - static_cast<int>(P::kBorderTopStyle);
      to.border[side].style = from.border[side].style;
      break;
    }
    case P::kBorderTopColor: case P::kBorderRightColor: case P::kBorderBottomColor: case P::kBorderLeftColor: {
      const int side = index - static_cast<int>(P::kBorderTopColor);
      to.border[side].color = from.border[side].color;
      to.border[side].currentColor = from.border[side].currentColor;
      break;
    }
    case P::kBorderTopLeftRadius: case P::kBorderTopRightRadius: case P::kBorderBottomRightRadius:
    case P::kBorderBottomLeftRadius:
      to.radius[index - static_cast<int>(P::kBorderTopLeftRadius)] =
          from.radius[index - static_cast<int>(P::kBorderTopLeftRadius)];
      break;
    case P::kBoxSizing: to.boxSizing = from.boxSizing; break;
    case P::kFontFamily: to.fontFamily = from.fontFamily; break;
    case P::kFontSize: to.fontSize = from.fontSize; break;
    case P::kFontWeight: to.fontWeight = from.fontWeight; break;
    case P::kFontStyle: to.fontStyle = from.fontStyle; break;
    case P::kColor: to.color = from.color; break;
    case P::kBackgroundColor: to.backgroundColor = from.backgroundColor; break;
    case P::kBackgroundImage: to.backgroundImage = from.backgroundImage; break;
    case P::kBackgroundRepeat: to.backgroundRepeat = from.backgroundRepeat; break;
    case P::kBackgroundPositionX: to.backgroundPosition[0] = from.backgroundPosition[0]; break;
    case P::kBackgroundPositionY: to.backgroundPosition[1] = from.backgroundPosition[1]; break;
    case P::kWhiteSpace: to.whiteSpace = from.whiteSpace; break;
    case P::kTextOverflow: to.textOverflow = from.textOverflow; break;
    case P::kTextAlign: to.textAlign = from.textAlign; break;
    case P::kVerticalAlign: to.verticalAlign = from.verticalAlign; break;
    case P::kLineHeight: to.lineHeight = from.lineHeight; break;
    case P::kCursor: to.cursor = from.cursor; break;
    case P::kBehavior: to.behaviors = from.behaviors; break;
    case P::kTableLayout: to.tableLayoutFixed = from.tableLayoutFixed; break;
    case P::kBorderSpacing: to.borderSpacing = from.borderSpacing; break;
    case P::kCount: break;
  }
}

}  // namespace

std::optional<Color> ParseColor(const std::vector<Token>& value) {
  if (value.empty()) return std::nullopt;
  if (value[0].Is(Type::kHash) && value.size() == 1) return ColorFromHash(value[0].text);
  if (value[0].Is(Type::kFunction)) return ColorFromFunction(value);
  if (value.size() == 1 && value[0].Is(Type::kIdent)) {
    for (const NamedColor& color : kColors) {
      if (EqualsIgnoringAsciiCase(value[0].text, color.name)) return color.value;
    }
  }
  return std::nullopt;
}

void ApplyDeclaration(const Declaration& declaration, ComputedStyle& style, const ComputedStyle& parent) {
  using P = PropertyId;
  const std::vector<Token>& v = declaration.value;
  if (IsKeyword(v, u"inherit")) {
    CopyProperty(declaration.id, parent, style);
    return;
  }
  if (IsKeyword(v, u"initial")) {
    CopyProperty(declaration.id, ComputedStyle{}, style);
    return;
  }
  const float em = style.fontSize;
  const int index = static_cast<int>(declaration.id);
  auto setLength = [&](Length& field) {
    if (auto length = SingleLength(v, em)) field = *length;
  };
  auto setKeyword = [&](auto& field, const auto& table) {
    using E = std::decay_t<decltype(field)>;
    if (auto keyword = FindKeyword<E>(table, v)) field = *keyword;
  };
  switch (declaration.id) {
    case P::kDisplay: setKeyword(style.display, kDisplay); break;
    case P::kPosition: setKeyword(style.position, kPosition); break;
    case P::kTop: case P::kRight: case P::kBottom: case P::kLeft:
      setLength(style.offsets[index - static_cast<int>(P::kTop)]);
      break;
    case P::kZIndex:
      if (v.size() == 1 && v[0].Is(Type::kNumber)) {
        style.zIndex = static_cast<int>(std::clamp(v[0].number, -1e6, 1e6));
        style.zIndexAuto = false;
      } else if (IsKeyword(v, u"auto")) {
        style.zIndexAuto = true;
      }
      break;
    case P::kVisibility: setKeyword(style.visibility, kVisibility); break;
    case P::kOverflowX: setKeyword(style.overflowX, kOverflow); break;
    case P::kOverflowY: setKeyword(style.overflowY, kOverflow); break;
    case P::kFlow: setKeyword(style.flow, kFlow); break;
    case P::kWidth: setLength(style.width); break;
    case P::kHeight: setLength(style.height); break;
    case P::kMinWidth: setLength(style.minWidth); break;
    case P::kMinHeight: setLength(style.minHeight); break;
    case P::kMaxWidth: setLength(style.maxWidth); break;
    case P::kMaxHeight: setLength(style.maxHeight); break;
    case P::kMarginTop: case P::kMarginRight: case P::kMarginBottom: case P::kMarginLeft:
      setLength(style.margin[index - static_cast<int>(P::kMarginTop)]);
      break;
    case P::kPaddingTop: case P::kPaddingRight: case P::kPaddingBottom: case P::kPaddingLeft:
      setLength(style.padding[index - static_cast<int>(P::kPaddingTop)]);
      break;
    case P::kBorderTopWidth: case P::kBorderRightWidth: case P::kBorderBottomWidth: case P::kBorderLeftWidth:
      if (auto width = BorderWidth(v, em)) style.border[index - static_cast<int>(P::kBorderTopWidth)].width = *width;
      break;
    case P::kBorderTopStyle: case P::kBorderRightStyle: case P::kBorderBottomStyle: case P::kBorderLeftStyle:
      setKeyword(style.border[index - static_cast<int>(P::kBorderTopStyle)].style, kBorderStyle);
      break;
    case P::kBorderTopColor: case P::kBorderRightColor: case P::kBorderBottomColor: case P::kBorderLeftColor: {
      Border& border = style.border[index - static_cast<int>(P::kBorderTopColor)];
      if (IsKeyword(v, u"currentcolor")) {
        border.currentColor = true;
      } else if (auto color = ParseColor(v)) {
        border.color = *color;
        border.currentColor = false;
      }
      break;
    }
    case P::kBorderTopLeftRadius: case P::kBorderTopRightRadius: case P::kBorderBottomRightRadius:
    case P::kBorderBottomLeftRadius:
      setLength(style.radius[index - static_cast<int>(P::kBorderTopLeftRadius)]);
      break;
    case P::kBoxSizing: setKeyword(style.boxSizing, kBoxSizing); break;
    case P::kFontFamily: {
      std::u16string family = FontFamily(v);
      if (!family.empty()) style.fontFamily = std::move(family);
      break;
    }
    case P::kFontSize:
      if (auto size = FontSize(v, parent.fontSize)) style.fontSize = *size;
      break;
    case P::kFontWeight:
      if (auto weight = FontWeight(v)) style.fontWeight = *weight;
      break;
    case P::kFontStyle: setKeyword(style.fontStyle, kFontStyle); break;
    case P::kColor:
      if (auto color = ParseColor(v)) style.color = *color;
      break;
    case P::kBackgroundColor:
      if (auto color = ParseColor(v)) style.backgroundColor = *color;
      break;
    case P::kBackgroundImage:
      if (v.size() == 1 && v[0].Is(Type::kUrl)) style.backgroundImage = v[0].text;
      else if (IsKeyword(v, u"none")) style.backgroundImage.clear();
      break;
    case P::kBackgroundRepeat: setKeyword(style.backgroundRepeat, kRepeat); break;
    case P::kBackgroundPositionX: case P::kBackgroundPositionY: {
      Length& field = style.backgroundPosition[index - static_cast<int>(P::kBackgroundPositionX)];
      if (IsKeyword(v, u"left") || IsKeyword(v, u"top")) field = {0, Length::Unit::kPercent};
      else if (IsKeyword(v, u"center")) field = {50, Length::Unit::kPercent};
      else if (IsKeyword(v, u"right") || IsKeyword(v, u"bottom")) field = {100, Length::Unit::kPercent};
      else setLength(field);
      break;
    }
    case P::kWhiteSpace: setKeyword(style.whiteSpace, kWhiteSpace); break;
    case P::kTextOverflow: setKeyword(style.textOverflow, kTextOverflow); break;
    case P::kTextAlign: setKeyword(style.textAlign, kTextAlign); break;
    case P::kVerticalAlign: setKeyword(style.verticalAlign, kVerticalAlign); break;
    case P::kLineHeight:
      if (IsKeyword(v, u"normal")) {
        style.lineHeight = Length::Auto();
      } else if (v.size() == 1 && v[0].Is(Type::kNumber)) {
        style.lineHeight = Length::Px(Float(v[0].number * em));  // a factor of the font size
      } else if (auto length = SingleLength(v, em)) {
        if (length->unit == Length::Unit::kPercent) *length = Length::Px(length->value * em / 100);
        style.lineHeight = *length;
      }
      break;
    case P::kCursor: setKeyword(style.cursor, kCursor); break;
    case P::kBehavior:
      if (auto behaviors = Behaviors(v)) style.behaviors = std::move(*behaviors);
      break;
    case P::kTableLayout:
      if (IsKeyword(v, u"fixed")) style.tableLayoutFixed = true;
      else if (IsKeyword(v, u"auto")) style.tableLayoutFixed = false;
      break;
    case P::kBorderSpacing:
      // One length for both directions; a second one is not taken.
      if (auto length = SingleLength(v, em); length && length->unit == Length::Unit::kPx && length->value >= 0) {
        style.borderSpacing = length->value;
      }
      break;
    case P::kCount: break;
  }
}

}  // namespace kestrune::html::css
