#include "html/css/stylesheet.h"

#include "base/text.h"

namespace kestrune::html::css {
namespace {

using Type = Token::Type;

class SheetParser {
 public:
  explicit SheetParser(std::vector<Token> tokens) : t_(std::move(tokens)) {}

  StyleSheet Sheet() {
    StyleSheet sheet;
    RuleList(sheet, t_.size());
    return sheet;
  }

  std::vector<Declaration> Declarations() {
    std::vector<Declaration> out;
    DeclarationList(t_.size(), out);
    return out;
  }

 private:
  bool Is(std::size_t i, Type type) const { return i < t_.size() && t_[i].Is(type); }

  // Index just past the block or function that opens at `open` (or the end).
  std::size_t SkipBlock(std::size_t open, std::size_t end) const {
    int depth = 0;
    for (std::size_t i = open; i < end; ++i) {
      const Type type = t_[i].type;
      if (type == Type::kLeftBrace || type == Type::kLeftBracket || type == Type::kLeftParen || type == Type::kFunction) ++depth;
      if (type == Type::kRightBrace || type == Type::kRightBracket || type == Type::kRightParen) {
        if (--depth <= 0) return i + 1;
      }
    }
    return end;
  }

  void RuleList(StyleSheet& sheet, std::size_t end) {
    while (pos_ < end) {
      const Token& token = t_[pos_];
      if (token.Is(Type::kWhitespace) || token.IsDelim(u'<') || token.IsDelim(u'-') || token.IsDelim(u'!') ||
          token.Is(Type::kSemicolon) || token.Is(Type::kRightBrace)) {
        ++pos_;  // whitespace, stray "<!--" "-->" pieces, stray semicolons and braces
        continue;
      }
      if (token.Is(Type::kAtKeyword)) {
        AtRule(sheet, end);
        continue;
      }
      QualifiedRule(sheet, end);
    }
  }

  void AtRule(StyleSheet& sheet, std::size_t end) {
    const std::u16string name = t_[pos_].text;
    ++pos_;
    std::size_t i = pos_;
    while (i < end && !t_[i].Is(Type::kSemicolon) && !t_[i].Is(Type::kLeftBrace)) {
      i = (t_[i].Is(Type::kFunction) || t_[i].Is(Type::kLeftParen) || t_[i].Is(Type::kLeftBracket)) ? SkipBlock(i, end) : i + 1;
    }
    if (EqualsIgnoringAsciiCase(name, u"import")) {
      for (std::size_t k = pos_; k < i; ++k) {
        if (t_[k].Is(Type::kUrl) || t_[k].Is(Type::kString)) {
          sheet.imports.push_back(t_[k].text);
          break;
        }
      }
    }
    if (i >= end || t_[i].Is(Type::kSemicolon)) {
      pos_ = i + 1;
      return;
    }
    const std::size_t blockEnd = SkipBlock(i, end);
    if (EqualsIgnoringAsciiCase(name, u"media") && mediaDepth_ < kMaxMediaDepth) {
      // The engine draws on a screen: the rules of any media block apply.
      ++mediaDepth_;
      pos_ = i + 1;
      RuleList(sheet, blockEnd > 0 && Is(blockEnd - 1, Type::kRightBrace) ? blockEnd - 1 : blockEnd);
      --mediaDepth_;
    }
    pos_ = blockEnd;
  }

  void QualifiedRule(StyleSheet& sheet, std::size_t end) {
    std::size_t i = pos_;
    while (i < end && !t_[i].Is(Type::kLeftBrace)) {
      i = (t_[i].Is(Type::kFunction) || t_[i].Is(Type::kLeftParen) || t_[i].Is(Type::kLeftBracket)) ? SkipBlock(i, end) : i + 1;
    }
    if (i >= end) {
      pos_ = end;
      return;
    }
    std::size_t preludeEnd = i;
    while (preludeEnd > pos_ && t_[preludeEnd - 1].Is(Type::kWhitespace)) --preludeEnd;
    auto selectors = ParseSelectorList(t_, pos_, preludeEnd);
    const std::size_t blockEnd = SkipBlock(i, end);
    if (selectors) {
      Rule rule;
      rule.selectors = std::move(*selectors);
      pos_ = i + 1;
      DeclarationList(Is(blockEnd - 1, Type::kRightBrace) ? blockEnd - 1 : blockEnd, rule.declarations);
      if (!rule.declarations.empty()) sheet.rules.push_back(std::move(rule));
    }
    pos_ = blockEnd;
  }

  void DeclarationList(std::size_t end, std::vector<Declaration>& out) {
    while (pos_ < end) {
      if (t_[pos_].Is(Type::kWhitespace) || t_[pos_].Is(Type::kSemicolon)) {
        ++pos_;
        continue;
      }
      std::size_t stop = pos_;
      while (stop < end && !t_[stop].Is(Type::kSemicolon)) {
        const Type type = t_[stop].type;
        stop = (type == Type::kFunction || type == Type::kLeftParen || type == Type::kLeftBracket || type == Type::kLeftBrace)
                   ? SkipBlock(stop, end)
                   : stop + 1;
      }
      OneDeclaration(pos_, stop, out);
      pos_ = stop;
    }
  }

  void OneDeclaration(std::size_t begin, std::size_t end, std::vector<Declaration>& out) {
    if (!Is(begin, Type::kIdent)) return;
    const std::u16string& name = t_[begin].text;
    std::size_t i = begin + 1;
    while (i < end && t_[i].Is(Type::kWhitespace)) ++i;
    if (i >= end || !t_[i].Is(Type::kColon)) return;
    ++i;
    while (i < end && t_[i].Is(Type::kWhitespace)) ++i;
    std::size_t last = end;
    while (last > i && t_[last - 1].Is(Type::kWhitespace)) --last;
    bool important = false;
    if (last > i && t_[last - 1].Is(Type::kIdent) && EqualsIgnoringAsciiCase(t_[last - 1].text, u"important")) {
      std::size_t bang = last - 1;
      while (bang > i && t_[bang - 1].Is(Type::kWhitespace)) --bang;
      if (bang > i && t_[bang - 1].IsDelim(u'!')) {
        important = true;
        last = bang - 1;
        while (last > i && t_[last - 1].Is(Type::kWhitespace)) --last;
      }
    }
    ExpandDeclaration(name, std::vector<Token>(t_.begin() + static_cast<std::ptrdiff_t>(i), t_.begin() + static_cast<std::ptrdiff_t>(last)),
                      important, out);
  }

  static constexpr int kMaxMediaDepth = 4;
  std::vector<Token> t_;
  std::size_t pos_ = 0;
  int mediaDepth_ = 0;
};

}  // namespace

StyleSheet ParseStyleSheet(std::u16string_view text) { return SheetParser(Tokenize(text)).Sheet(); }

std::vector<Declaration> ParseDeclarationBlock(std::u16string_view text) {
  return SheetParser(Tokenize(text)).Declarations();
}

}  // namespace kestrune::html::css
