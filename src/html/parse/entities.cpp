#include "html/parse/entities.h"

#include "base/utf.h"

namespace kestrune::html::parse {
namespace {

struct NamedReference {
  const char16_t* name;
  char16_t value;
  bool needsSemicolon;
};

// The common named references; the first five also work without their semicolon, as old pages
// write them.
constexpr NamedReference kNamed[] = {
    {u"amp", u'&', false},       {u"lt", u'<', false},        {u"gt", u'>', false},
    {u"quot", u'"', false},      {u"nbsp", 0xA0, false},      {u"apos", u'\'', true},
    {u"copy", 0xA9, true},       {u"reg", 0xAE, true},        {u"trade", 0x2122, true},
    {u"hellip", 0x2026, true},   {u"mdash", 0x2014, true},    {u"ndash", 0x2013, true},
    {u"laquo", 0xAB, true},      {u"raquo", 0xBB, true},      {u"middot", 0xB7, true},
    {u"bull", 0x2022, true},     {u"euro", 0x20AC, true},     {u"pound", 0xA3, true},
    {u"yen", 0xA5, true},        {u"cent", 0xA2, true},       {u"sect", 0xA7, true},
    {u"deg", 0xB0, true},        {u"plusmn", 0xB1, true},     {u"times", 0xD7, true},
    {u"divide", 0xF7, true},     {u"frac12", 0xBD, true},     {u"frac14", 0xBC, true},
    {u"frac34", 0xBE, true},     {u"lsquo", 0x2018, true},    {u"rsquo", 0x2019, true},
    {u"ldquo", 0x201C, true},    {u"rdquo", 0x201D, true},    {u"sup2", 0xB2, true},
    {u"sup3", 0xB3, true},       {u"micro", 0xB5, true},      {u"para", 0xB6, true},
    {u"iexcl", 0xA1, true},      {u"iquest", 0xBF, true},     {u"auml", 0xE4, true},
    {u"ouml", 0xF6, true},       {u"uuml", 0xFC, true},       {u"Auml", 0xC4, true},
    {u"Ouml", 0xD6, true},       {u"Uuml", 0xDC, true},       {u"szlig", 0xDF, true},
    {u"eacute", 0xE9, true},     {u"egrave", 0xE8, true},     {u"agrave", 0xE0, true},
    {u"aacute", 0xE1, true},     {u"ccedil", 0xE7, true},     {u"ntilde", 0xF1, true},
    {u"oslash", 0xF8, true},     {u"aring", 0xE5, true},      {u"larr", 0x2190, true},
    {u"rarr", 0x2192, true},     {u"uarr", 0x2191, true},     {u"darr", 0x2193, true},
    {u"ensp", 0x2002, true},     {u"emsp", 0x2003, true},     {u"thinsp", 0x2009, true},
};

bool IsDigit(char16_t c) { return c >= u'0' && c <= u'9'; }
int HexValue(char16_t c) {
  if (IsDigit(c)) return c - u'0';
  if (c >= u'a' && c <= u'f') return c - u'a' + 10;
  if (c >= u'A' && c <= u'F') return c - u'A' + 10;
  return -1;
}

std::size_t DecodeNumeric(std::u16string_view text, std::size_t at, std::u16string& out) {
  std::size_t i = at + 2;
  const bool hex = i < text.size() && (text[i] == u'x' || text[i] == u'X');
  if (hex) ++i;
  const std::size_t digitsStart = i;
  char32_t code = 0;
  bool tooBig = false;
  for (; i < text.size(); ++i) {
    const int digit = hex ? HexValue(text[i]) : (IsDigit(text[i]) ? text[i] - u'0' : -1);
    if (digit < 0) break;
    code = code * (hex ? 16 : 10) + static_cast<char32_t>(digit);
    if (code > 0x10FFFF) {
      tooBig = true;
      code = 0x110000;
    }
  }
  if (i == digitsStart) return 0;
  if (i < text.size() && text[i] == u';') ++i;
  AppendCodePoint(tooBig ? 0xFFFD : code, out);
  return i - at;
}

}  // namespace

void AppendCodePoint(char32_t code, std::u16string& out) {
  if (code == 0 || code > 0x10FFFF || (code >= 0xD800 && code <= 0xDFFF)) code = 0xFFFD;
  AppendUtf16(out, code);
}

std::size_t DecodeCharacterReference(std::u16string_view text, std::size_t at, std::u16string& out) {
  if (at + 1 >= text.size()) return 0;
  if (text[at + 1] == u'#') return DecodeNumeric(text, at, out);
  for (const NamedReference& reference : kNamed) {
    const std::u16string_view name(reference.name);
    if (text.compare(at + 1, name.size(), name) != 0) continue;
    const std::size_t end = at + 1 + name.size();
    const bool semicolon = end < text.size() && text[end] == u';';
    if (!semicolon && reference.needsSemicolon) continue;
    out.push_back(reference.value);
    return end - at + (semicolon ? 1 : 0);
  }
  return 0;
}

}  // namespace kestrune::html::parse
