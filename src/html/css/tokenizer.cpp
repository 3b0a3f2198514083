#include "html/css/tokenizer.h"

#include <algorithm>
#include <cmath>

#include "html/parse/entities.h"

namespace kestrune::html::css {
namespace {

bool IsSpace(char16_t c) { return c == u' ' || c == u'\t' || c == u'\n' || c == u'\r' || c == u'\f'; }
bool IsDigit(char16_t c) { return c >= u'0' && c <= u'9'; }
bool IsNameStart(char16_t c) {
  return (c >= u'a' && c <= u'z') || (c >= u'A' && c <= u'Z') || c == u'_' || c >= 0x80;
}
bool IsNameChar(char16_t c) { return IsNameStart(c) || IsDigit(c) || c == u'-'; }
int HexValue(char16_t c) {
  if (IsDigit(c)) return c - u'0';
  if (c >= u'a' && c <= u'f') return c - u'a' + 10;
  if (c >= u'A' && c <= u'F') return c - u'A' + 10;
  return -1;
}

constexpr double kNumberLimit = 1e7;

class Tokenizer {
 public:
  explicit Tokenizer(std::u16string_view text) : in_(text) {}

  std::vector<Token> Run() {
    std::vector<Token> out;
    while (pos_ < in_.size()) {
      Token token;
      if (Next(token)) out.push_back(std::move(token));
    }
    return out;
  }

 private:
  char16_t At(std::size_t offset) const { return pos_ + offset < in_.size() ? in_[pos_ + offset] : 0; }

  bool StartsName(std::size_t offset) const {
    const char16_t c = At(offset);
    if (IsNameStart(c) || (c == u'\\' && At(offset + 1) != u'\n')) return true;
    return c == u'-' && (IsNameStart(At(offset + 1)) || At(offset + 1) == u'-' || At(offset + 1) == u'\\');
  }

  bool StartsNumber() const {
    const char16_t c = At(0);
    if (IsDigit(c)) return true;
    if (c == u'.') return IsDigit(At(1));
    if (c == u'+' || c == u'-') return IsDigit(At(1)) || (At(1) == u'.' && IsDigit(At(2)));
    return false;
  }

  void ReadEscape(std::u16string& out) {
    ++pos_;  // the backslash
    if (pos_ >= in_.size()) return;
    if (HexValue(in_[pos_]) >= 0) {
      char32_t code = 0;
      for (int i = 0; i < 6 && pos_ < in_.size() && HexValue(in_[pos_]) >= 0; ++i) {
        code = code * 16 + static_cast<char32_t>(HexValue(in_[pos_++]));
      }
      if (pos_ < in_.size() && IsSpace(in_[pos_])) ++pos_;
      parse::AppendCodePoint(code, out);
      return;
    }
    out.push_back(in_[pos_++]);
  }

  std::u16string ReadName() {
    std::u16string name;
    while (pos_ < in_.size()) {
      if (in_[pos_] == u'\\' && At(1) != u'\n') {
        ReadEscape(name);
      } else if (IsNameChar(in_[pos_])) {
        name.push_back(in_[pos_++]);
      } else {
        break;
      }
    }
    return name;
  }

  double ReadNumber() {
    const std::size_t start = pos_;
    if (At(0) == u'+' || At(0) == u'-') ++pos_;
    double value = 0;
    while (pos_ < in_.size() && IsDigit(in_[pos_])) value = value * 10 + (in_[pos_++] - u'0');
    if (At(0) == u'.' && IsDigit(At(1))) {
      ++pos_;
      double scale = 0.1;
      while (pos_ < in_.size() && IsDigit(in_[pos_])) {
        value += (in_[pos_++] - u'0') * scale;
        scale /= 10;
      }
    }
    if ((At(0) == u'e' || At(0) == u'E') &&
        (IsDigit(At(1)) || ((At(1) == u'+' || At(1) == u'-') && IsDigit(At(2))))) {
      ++pos_;
      const bool negative = At(0) == u'-';
      if (At(0) == u'+' || At(0) == u'-') ++pos_;
      int exponent = 0;
      while (pos_ < in_.size() && IsDigit(in_[pos_])) exponent = std::min(exponent * 10 + (in_[pos_++] - u'0'), 400);
      value *= std::pow(10.0, negative ? -exponent : exponent);
    }
    if (in_[start] == u'-') value = -value;
    if (!std::isfinite(value)) value = 0;
    return value;
  }

  void ReadString(Token& token) {
    const char16_t quote = in_[pos_++];
    token.type = Token::Type::kString;
    while (pos_ < in_.size() && in_[pos_] != quote) {
      if (in_[pos_] == u'\n') break;  // an unclosed string ends at the line
      if (in_[pos_] == u'\\') {
        if (At(1) == u'\n') {
          pos_ += 2;
          continue;
        }
        ReadEscape(token.text);
        continue;
      }
      token.text.push_back(in_[pos_++]);
    }
    if (pos_ < in_.size() && in_[pos_] == quote) ++pos_;
  }

  void ReadUrl(Token& token) {
    token.type = Token::Type::kUrl;
    token.text.clear();
    while (pos_ < in_.size() && IsSpace(in_[pos_])) ++pos_;
    if (pos_ < in_.size() && (in_[pos_] == u'"' || in_[pos_] == u'\'')) {
      Token quoted;
      ReadString(quoted);
      token.text = std::move(quoted.text);
      while (pos_ < in_.size() && IsSpace(in_[pos_])) ++pos_;
      while (pos_ < in_.size() && in_[pos_] != u')') ++pos_;
    } else {
      while (pos_ < in_.size() && in_[pos_] != u')') token.text.push_back(in_[pos_++]);
      while (!token.text.empty() && IsSpace(token.text.back())) token.text.pop_back();
    }
    if (pos_ < in_.size()) ++pos_;
  }

  void ReadNumeric(Token& token) {
    const std::size_t start = pos_;
    // No length or count of a page needs more; the bound keeps every later conversion defined.
    token.number = std::clamp(ReadNumber(), -kNumberLimit, kNumberLimit);
    if (StartsName(0)) {
      token.type = Token::Type::kDimension;
      token.text = ReadName();
    } else if (At(0) == u'%') {
      ++pos_;
      token.type = Token::Type::kPercentage;
    } else if (At(0) == u'*') {
      ++pos_;
      token.type = Token::Type::kFlex;
    } else {
      token.type = Token::Type::kNumber;
      token.text = std::u16string(in_.substr(start, pos_ - start));  // as written, for attribute values
    }
  }

  bool Next(Token& token) {
    const char16_t c = in_[pos_];
    if (c == u'/' && At(1) == u'*') {
      const std::size_t end = in_.find(u"*/", pos_ + 2);
      pos_ = end == std::u16string_view::npos ? in_.size() : end + 2;
      return false;
    }
    if (IsSpace(c)) {
      while (pos_ < in_.size() && IsSpace(in_[pos_])) ++pos_;
      token.type = Token::Type::kWhitespace;
      return true;
    }
    if (c == u'"' || c == u'\'') {
      ReadString(token);
      return true;
    }
    if (StartsNumber()) {
      ReadNumeric(token);
      return true;
    }
    if (StartsName(0)) {
      token.text = ReadName();
      if (At(0) == u'(') {
        ++pos_;
        if (token.text.size() == 3 && (token.text[0] | 0x20) == u'u' && (token.text[1] | 0x20) == u'r' &&
            (token.text[2] | 0x20) == u'l') {
          ReadUrl(token);
        } else {
          token.type = Token::Type::kFunction;
        }
      } else {
        token.type = Token::Type::kIdent;
      }
      return true;
    }
    ++pos_;
    switch (c) {
      case u'#':
        if (pos_ < in_.size() && (IsNameChar(in_[pos_]) || in_[pos_] == u'\\')) {
          token.type = Token::Type::kHash;
          token.text = ReadName();
          return true;
        }
        break;
      case u'@':
        if (StartsName(0)) {
          token.type = Token::Type::kAtKeyword;
          token.text = ReadName();
          return true;
        }
        break;
      case u':': token.type = Token::Type::kColon; return true;
      case u';': token.type = Token::Type::kSemicolon; return true;
      case u',': token.type = Token::Type::kComma; return true;
      case u'[': token.type = Token::Type::kLeftBracket; return true;
      case u']': token.type = Token::Type::kRightBracket; return true;
      case u'(': token.type = Token::Type::kLeftParen; return true;
      case u')': token.type = Token::Type::kRightParen; return true;
      case u'{': token.type = Token::Type::kLeftBrace; return true;
      case u'}': token.type = Token::Type::kRightBrace; return true;
      default: break;
    }
    token.type = Token::Type::kDelim;
    token.delim = c;
    return true;
  }

  std::u16string_view in_;
  std::size_t pos_ = 0;
};

}  // namespace

std::vector<Token> Tokenize(std::u16string_view text) { return Tokenizer(text).Run(); }

}  // namespace kestrune::html::css
