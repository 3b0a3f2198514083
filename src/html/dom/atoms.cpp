#include "html/dom/atoms.h"

#include <unordered_map>
#include <vector>

#include "base/text.h"

namespace kestrune::html::dom {
namespace {

constexpr const char* kKnownNames[] = {
    "", "html", "head", "body", "title", "meta", "link", "style", "script", "div", "span", "p",
    "a", "img", "br", "hr", "input", "button", "textarea", "select", "option", "options",
    "optgroup", "table", "thead", "tbody", "tfoot", "tr", "td", "th", "col", "colgroup",
    "caption", "ul", "ol", "li", "dl", "dt", "dd", "menu", "popup", "widget", "text", "pre",
    "form", "frame", "iframe", "h1", "h2", "h3", "h4", "h5", "h6", "base", "area", "embed",
    "param", "source", "track", "wbr", "label", "section", "header", "footer", "nav",
    "blockquote", "address", "fieldset", "center",
    "id", "class", "type", "name", "value", "href", "src", "rel", "target", "checked",
    "disabled", "selected", "multiple", "readonly", "size", "maxlength"};
static_assert(sizeof(kKnownNames) / sizeof(kKnownNames[0]) == kAtomKnownCount);

struct NameHash {
  using is_transparent = void;
  std::size_t operator()(std::u16string_view name) const { return std::hash<std::u16string_view>{}(name); }
};

struct AtomTable {
  // Transparent lookups: the parser asks with views into its input and allocates nothing.
  std::unordered_map<std::u16string, Atom, NameHash, std::equal_to<>> byName;
  std::vector<std::u16string> names;

  AtomTable() {
    for (const char* name : kKnownNames) {
      std::u16string text = AsciiToUtf16(name);
      byName.emplace(text, static_cast<Atom>(names.size()));
      names.push_back(std::move(text));
    }
  }
};

AtomTable& Table() {
  static AtomTable table;
  return table;
}

bool HasUpper(std::u16string_view name) {
  for (char16_t unit : name) {
    if (unit >= u'A' && unit <= u'Z') return true;
  }
  return false;
}

std::u16string Folded(std::u16string_view name) {
  std::u16string folded(name);
  for (char16_t& unit : folded) unit = AsciiLower(unit);
  return folded;
}

}  // namespace

Atom InternName(std::u16string_view name) {
  AtomTable& table = Table();
  if (!HasUpper(name)) {
    auto found = table.byName.find(name);
    if (found != table.byName.end()) return found->second;
  }
  std::u16string folded = Folded(name);
  auto found = table.byName.find(folded);
  if (found != table.byName.end()) return found->second;
  const Atom atom = static_cast<Atom>(table.names.size());
  table.names.push_back(folded);
  table.byName.emplace(std::move(folded), atom);
  return atom;
}

Atom InternName(std::string_view asciiName) { return InternName(AsciiToUtf16(asciiName)); }

Atom FindName(std::u16string_view name) {
  AtomTable& table = Table();
  auto found = HasUpper(name) ? table.byName.find(Folded(name)) : table.byName.find(name);
  return found == table.byName.end() ? kAtomNone : found->second;
}

const std::u16string& NameOf(Atom atom) {
  AtomTable& table = Table();
  return atom < table.names.size() ? table.names[atom] : table.names[kAtomNone];
}

}  // namespace kestrune::html::dom
