#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace kestrune::html::css {

struct Token {
  enum class Type : unsigned char {
    kIdent, kFunction, kAtKeyword, kHash, kString, kUrl, kNumber, kPercentage, kDimension,
    kFlex,  // "1*": a share of the free space
    kDelim, kWhitespace, kColon, kSemicolon, kComma, kLeftBracket, kRightBracket, kLeftParen,
    kRightParen, kLeftBrace, kRightBrace,
  };
  Type type = Type::kDelim;
  std::u16string text;  // name, string or URL content, hash name, dimension unit, a number as written
  double number = 0;
  char16_t delim = 0;

  static Token Of(Type type) {
    Token token;
    token.type = type;
    return token;
  }
  static Token Ident(std::u16string name) {
    Token token = Of(Type::kIdent);
    token.text = std::move(name);
    return token;
  }

  bool Is(Type t) const { return type == t; }
  bool IsDelim(char16_t c) const { return type == Type::kDelim && delim == c; }
};

// CSS tokens of a text; comments are dropped, runs of whitespace become one token. Never fails:
// anything unexpected becomes a delimiter.
std::vector<Token> Tokenize(std::u16string_view text);

}  // namespace kestrune::html::css
