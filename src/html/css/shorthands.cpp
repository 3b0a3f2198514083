#include <array>

#include "base/text.h"
#include "html/css/properties.h"

namespace kestrune::html::css {
namespace {

using Type = Token::Type;
using P = PropertyId;

struct PropertyName {
  const char16_t* name;
  PropertyId id;
};

constexpr PropertyName kLonghands[] = {
    {u"display", P::kDisplay}, {u"position", P::kPosition}, {u"top", P::kTop}, {u"right", P::kRight},
    {u"bottom", P::kBottom}, {u"left", P::kLeft}, {u"z-index", P::kZIndex}, {u"visibility", P::kVisibility},
    {u"overflow-x", P::kOverflowX}, {u"overflow-y", P::kOverflowY}, {u"flow", P::kFlow}, {u"width", P::kWidth},
    {u"height", P::kHeight}, {u"min-width", P::kMinWidth}, {u"min-height", P::kMinHeight},
    {u"max-width", P::kMaxWidth}, {u"max-height", P::kMaxHeight}, {u"margin-top", P::kMarginTop},
    {u"margin-right", P::kMarginRight}, {u"margin-bottom", P::kMarginBottom}, {u"margin-left", P::kMarginLeft},
    {u"padding-top", P::kPaddingTop}, {u"padding-right", P::kPaddingRight},
    {u"padding-bottom", P::kPaddingBottom}, {u"padding-left", P::kPaddingLeft},
    {u"border-top-width", P::kBorderTopWidth}, {u"border-right-width", P::kBorderRightWidth},
    {u"border-bottom-width", P::kBorderBottomWidth}, {u"border-left-width", P::kBorderLeftWidth},
    {u"border-top-style", P::kBorderTopStyle}, {u"border-right-style", P::kBorderRightStyle},
    {u"border-bottom-style", P::kBorderBottomStyle}, {u"border-left-style", P::kBorderLeftStyle},
    {u"border-top-color", P::kBorderTopColor}, {u"border-right-color", P::kBorderRightColor},
    {u"border-bottom-color", P::kBorderBottomColor}, {u"border-left-color", P::kBorderLeftColor},
    {u"border-top-left-radius", P::kBorderTopLeftRadius}, {u"border-top-right-radius", P::kBorderTopRightRadius},
    {u"border-bottom-right-radius", P::kBorderBottomRightRadius},
    {u"border-bottom-left-radius", P::kBorderBottomLeftRadius}, {u"box-sizing", P::kBoxSizing},
    {u"font-family", P::kFontFamily}, {u"font-size", P::kFontSize}, {u"font-weight", P::kFontWeight},
    {u"font-style", P::kFontStyle}, {u"color", P::kColor}, {u"background-color", P::kBackgroundColor},
    {u"background-image", P::kBackgroundImage}, {u"background-repeat", P::kBackgroundRepeat},
    {u"background-position-x", P::kBackgroundPositionX}, {u"background-position-y", P::kBackgroundPositionY},
    {u"white-space", P::kWhiteSpace}, {u"text-overflow", P::kTextOverflow}, {u"text-align", P::kTextAlign},
    {u"vertical-align", P::kVerticalAlign}, {u"line-height", P::kLineHeight}, {u"cursor", P::kCursor},
    {u"behavior", P::kBehavior}, {u"table-layout", P::kTableLayout}, {u"border-spacing", P::kBorderSpacing},
};

using Parts = std::vector<std::vector<Token>>;

Parts SplitOnSpace(const std::vector<Token>& value) {
  Parts parts;
  int depth = 0;
  bool startNew = true;
  for (const Token& token : value) {
    if (token.Is(Type::kWhitespace) && depth == 0) {
      startNew = true;
      continue;
    }
    if (startNew) parts.emplace_back();
    startNew = false;
    if (token.Is(Type::kFunction)) ++depth;
    if (token.Is(Type::kRightParen) && depth > 0) --depth;
    parts.back().push_back(token);
  }
  return parts;
}

// 1 to 4 values for top, right, bottom, left, as margin and padding take them.
bool ExpandBox(const Parts& parts, std::array<P, 4> ids, bool important, std::vector<Declaration>& out) {
  if (parts.empty() || parts.size() > 4) return false;
  static constexpr std::size_t kPick[4][4] = {{0, 0, 0, 0}, {0, 1, 0, 1}, {0, 1, 2, 1}, {0, 1, 2, 3}};
  for (std::size_t side = 0; side < 4; ++side) out.push_back({ids[side], parts[kPick[parts.size() - 1][side]], important});
  return true;
}

bool IsBorderStyle(const std::vector<Token>& part) {
  static constexpr const char16_t* kStyles[] = {u"none", u"solid", u"dotted", u"dashed", u"double",
                                                u"inset", u"outset", u"hidden", u"groove", u"ridge"};
  if (part.size() != 1 || !part[0].Is(Type::kIdent)) return false;
  for (const char16_t* style : kStyles) {
    if (EqualsIgnoringAsciiCase(part[0].text, style)) return true;
  }
  return false;
}

bool IsWidthLike(const std::vector<Token>& part) {
  if (part.size() != 1) return false;
  const Token& t = part[0];
  if (t.Is(Type::kDimension) || t.Is(Type::kNumber)) return true;
  return t.Is(Type::kIdent) && (EqualsIgnoringAsciiCase(t.text, u"thin") || EqualsIgnoringAsciiCase(t.text, u"medium") ||
                                EqualsIgnoringAsciiCase(t.text, u"thick"));
}

bool ExpandBorder(const Parts& parts, const std::vector<int>& sides, bool important, std::vector<Declaration>& out) {
  if (parts.empty() || parts.size() > 3) return false;
  std::vector<Token> width{Token::Ident(u"medium")}, style{Token::Ident(u"none")},
      color{Token::Ident(u"currentcolor")};
  for (const auto& part : parts) {
    if (IsBorderStyle(part)) style = part;
    else if (IsWidthLike(part)) width = part;
    else if (ParseColor(part)) color = part;
    else return false;
  }
  for (int side : sides) {
    out.push_back({static_cast<P>(static_cast<int>(P::kBorderTopWidth) + side), width, important});
    out.push_back({static_cast<P>(static_cast<int>(P::kBorderTopStyle) + side), style, important});
    out.push_back({static_cast<P>(static_cast<int>(P::kBorderTopColor) + side), color, important});
  }
  return true;
}

bool IsPositionPart(const std::vector<Token>& part) {
  if (part.size() != 1) return false;
  const Token& t = part[0];
  if (t.Is(Type::kDimension) || t.Is(Type::kPercentage) || t.Is(Type::kNumber)) return true;
  static constexpr const char16_t* kWords[] = {u"left", u"right", u"top", u"bottom", u"center"};
  for (const char16_t* word : kWords) {
    if (t.Is(Type::kIdent) && EqualsIgnoringAsciiCase(t.text, word)) return true;
  }
  return false;
}

bool IsRepeat(const std::vector<Token>& part) {
  static constexpr const char16_t* kWords[] = {u"repeat", u"repeat-x", u"repeat-y", u"no-repeat"};
  for (const char16_t* word : kWords) {
    if (part.size() == 1 && part[0].Is(Type::kIdent) && EqualsIgnoringAsciiCase(part[0].text, word)) return true;
  }
  return false;
}

bool ExpandBackgroundPosition(const Parts& positions, bool important, std::vector<Declaration>& out) {
  if (positions.empty() || positions.size() > 2) return false;
  std::vector<Token> x = positions[0], y = positions.size() > 1 ? positions[1] : std::vector<Token>{Token::Ident(u"center")};
  // "top left": the vertical word came first.
  auto isWord = [](const std::vector<Token>& part, std::u16string_view w) {
    return part[0].Is(Type::kIdent) && EqualsIgnoringAsciiCase(part[0].text, w);
  };
  if (isWord(x, u"top") || isWord(x, u"bottom") || isWord(y, u"left") || isWord(y, u"right")) std::swap(x, y);
  out.push_back({P::kBackgroundPositionX, x, important});
  out.push_back({P::kBackgroundPositionY, y, important});
  return true;
}

bool ExpandBackground(const Parts& parts, bool important, std::vector<Declaration>& out) {
  std::vector<Token> color{Token::Ident(u"transparent")}, image{Token::Ident(u"none")}, repeat{Token::Ident(u"repeat")};
  Parts positions;
  for (const auto& part : parts) {
    if (part.size() == 1 && (part[0].Is(Type::kUrl) || (part[0].Is(Type::kIdent) && EqualsIgnoringAsciiCase(part[0].text, u"none")))) {
      image = part;
    } else if (IsRepeat(part)) {
      repeat = part;
    } else if (IsPositionPart(part)) {
      positions.push_back(part);
    } else if (ParseColor(part)) {
      color = part;
    } else {
      return false;
    }
  }
  out.push_back({P::kBackgroundColor, color, important});
  out.push_back({P::kBackgroundImage, image, important});
  out.push_back({P::kBackgroundRepeat, repeat, important});
  if (positions.empty()) positions = {{Token::Of(Type::kNumber)}, {Token::Of(Type::kNumber)}};
  return ExpandBackgroundPosition(positions, important, out);
}

bool ExpandFont(const std::vector<Token>& value, bool important, std::vector<Declaration>& out) {
  const Parts parts = SplitOnSpace(value);
  std::size_t i = 0;
  std::vector<Token> style{Token::Ident(u"normal")}, weight{Token::Ident(u"normal")};
  for (; i < parts.size(); ++i) {
    const auto& part = parts[i];
    if (part.size() != 1) break;
    const Token& t = part[0];
    if (t.Is(Type::kIdent) && (EqualsIgnoringAsciiCase(t.text, u"italic") || EqualsIgnoringAsciiCase(t.text, u"oblique"))) {
      style = part;
    } else if ((t.Is(Type::kIdent) && (EqualsIgnoringAsciiCase(t.text, u"bold") || EqualsIgnoringAsciiCase(t.text, u"bolder") ||
                                       EqualsIgnoringAsciiCase(t.text, u"lighter"))) ||
               (t.Is(Type::kNumber) && t.number >= 100)) {
      weight = part;
    } else if (!(t.Is(Type::kIdent) && EqualsIgnoringAsciiCase(t.text, u"normal"))) {
      break;
    }
  }
  if (i >= parts.size()) return false;
  // size, optionally "/line-height" in the same part
  std::vector<Token> size, lineHeight;
  bool afterSlash = false;
  for (const Token& t : parts[i]) {
    if (t.IsDelim(u'/')) afterSlash = true;
    else (afterSlash ? lineHeight : size).push_back(t);
  }
  ++i;
  if (afterSlash && lineHeight.empty() && i < parts.size()) lineHeight = parts[i++];
  if (size.size() != 1 || i >= parts.size()) return false;
  std::vector<Token> family;
  for (std::size_t k = i; k < parts.size(); ++k) {
    if (!family.empty()) family.push_back(Token::Of(Type::kWhitespace));
    family.insert(family.end(), parts[k].begin(), parts[k].end());
  }
  out.push_back({P::kFontStyle, style, important});
  out.push_back({P::kFontWeight, weight, important});
  out.push_back({P::kFontSize, size, important});
  if (!lineHeight.empty()) out.push_back({P::kLineHeight, lineHeight, important});
  out.push_back({P::kFontFamily, family, important});
  return true;
}

}  // namespace

bool ExpandDeclaration(std::u16string_view name, const std::vector<Token>& value, bool important,
                       std::vector<Declaration>& out) {
  if (value.empty()) return false;
  for (const PropertyName& longhand : kLonghands) {
    if (EqualsIgnoringAsciiCase(name, longhand.name)) {
      out.push_back({longhand.id, value, important});
      return true;
    }
  }
  const bool keyword = value.size() == 1 && value[0].Is(Type::kIdent) &&
                       (EqualsIgnoringAsciiCase(value[0].text, u"inherit") || EqualsIgnoringAsciiCase(value[0].text, u"initial"));
  const Parts parts = keyword ? Parts{} : SplitOnSpace(value);
  auto all = [&](std::initializer_list<P> ids) {
    for (P id : ids) out.push_back({id, value, important});
    return true;
  };
  auto is = [&](std::u16string_view shorthand) { return EqualsIgnoringAsciiCase(name, shorthand); };
  if (is(u"margin")) return keyword ? all({P::kMarginTop, P::kMarginRight, P::kMarginBottom, P::kMarginLeft})
                                    : ExpandBox(parts, {P::kMarginTop, P::kMarginRight, P::kMarginBottom, P::kMarginLeft}, important, out);
  if (is(u"padding")) return keyword ? all({P::kPaddingTop, P::kPaddingRight, P::kPaddingBottom, P::kPaddingLeft})
                                     : ExpandBox(parts, {P::kPaddingTop, P::kPaddingRight, P::kPaddingBottom, P::kPaddingLeft}, important, out);
  if (is(u"border-width")) return ExpandBox(parts, {P::kBorderTopWidth, P::kBorderRightWidth, P::kBorderBottomWidth, P::kBorderLeftWidth}, important, out);
  if (is(u"border-style")) return ExpandBox(parts, {P::kBorderTopStyle, P::kBorderRightStyle, P::kBorderBottomStyle, P::kBorderLeftStyle}, important, out);
  if (is(u"border-color")) return ExpandBox(parts, {P::kBorderTopColor, P::kBorderRightColor, P::kBorderBottomColor, P::kBorderLeftColor}, important, out);
  if (is(u"border-radius")) {
    Parts before;
    for (const auto& part : parts) {
      if (part.size() == 1 && part[0].IsDelim(u'/')) break;
      before.push_back(part);
    }
    return ExpandBox(before, {P::kBorderTopLeftRadius, P::kBorderTopRightRadius, P::kBorderBottomRightRadius, P::kBorderBottomLeftRadius}, important, out);
  }
  if (is(u"border")) return ExpandBorder(parts, {0, 1, 2, 3}, important, out);
  if (is(u"border-top")) return ExpandBorder(parts, {0}, important, out);
  if (is(u"border-right")) return ExpandBorder(parts, {1}, important, out);
  if (is(u"border-bottom")) return ExpandBorder(parts, {2}, important, out);
  if (is(u"border-left")) return ExpandBorder(parts, {3}, important, out);
  if (is(u"overflow")) {
    if (keyword || parts.size() == 1) return all({P::kOverflowX, P::kOverflowY});
    if (parts.size() != 2) return false;
    out.push_back({P::kOverflowX, parts[0], important});
    out.push_back({P::kOverflowY, parts[1], important});
    return true;
  }
  if (is(u"background")) return keyword ? false : ExpandBackground(parts, important, out);
  if (is(u"background-position")) return ExpandBackgroundPosition(parts, important, out);
  if (is(u"font")) return keyword ? false : ExpandFont(value, important, out);
  return false;
}

}  // namespace kestrune::html::css
