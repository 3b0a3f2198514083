#include <memory>
#include <string>
#include <unordered_map>

#include "base/utf.h"
#include "html/api/registry.h"
#include "html/css/selector.h"

namespace kestrune::html {
namespace {

using Selectors = std::vector<css::ComplexSelector>;

struct TextHash {
  using is_transparent = void;
  std::size_t operator()(std::string_view text) const { return std::hash<std::string_view>{}(text); }
};

// Behaviors select with the same few selectors over and over: keep them parsed.
constexpr std::size_t kSelectorCacheSize = 512;

std::shared_ptr<const Selectors> ParsedSelectors(std::string_view text) {
  static std::unordered_map<std::string, std::shared_ptr<const Selectors>, TextHash, std::equal_to<>> cache;
  auto found = cache.find(text);
  if (found != cache.end()) return found->second;
  auto parsed = css::ParseSelectorList(DecodeUtf8(text));
  if (!parsed) return nullptr;
  if (cache.size() >= kSelectorCacheSize) cache.clear();
  auto selectors = std::make_shared<const Selectors>(std::move(*parsed));
  cache.emplace(std::string(text), selectors);
  return selectors;
}

bool TagMatches(const dom::Element& element, const char* tagName) {
  if (tagName == nullptr || tagName[0] == '\0' || (tagName[0] == '*' && tagName[1] == '\0')) return true;
  return element.tag() == dom::InternName(std::string_view(tagName));
}

}  // namespace

DomResult HTMLayoutVisitElements(HELEMENT he, const char* tagName, const char* attributeName, const char16_t* value,
                                 ElementCallback callback, void* param, unsigned depth) {
  if (he == nullptr) return DomResult::kInvalidHandle;
  if (callback == nullptr) return DomResult::kInvalidParameter;
  const dom::Atom attribute = attributeName ? dom::FindName(DecodeUtf8(attributeName)) : dom::kAtomNone;
  if (attributeName && attribute == dom::kAtomNone) return DomResult::kOk;  // no element has it
  for (dom::Element* e = dom::NextElementInOrder(he, he); e; e = dom::NextElementInOrder(e, he)) {
    if (depth > 0) {
      unsigned level = 0;
      for (const dom::Element* up = e; up != he; up = up->parent()) ++level;
      if (level > depth) continue;
    }
    if (!TagMatches(*e, tagName)) continue;
    if (attributeName) {
      const std::u16string* own = e->Attr(attribute);
      if (own == nullptr || (value && *own != value)) continue;
    }
    if (callback(e, param)) break;
  }
  return DomResult::kOk;
}

DomResult HTMLayoutSelectElements(HELEMENT he, const char* selectors, ElementCallback callback, void* param) {
  if (he == nullptr) return DomResult::kInvalidHandle;
  if (selectors == nullptr || callback == nullptr) return DomResult::kInvalidParameter;
  const auto parsed = ParsedSelectors(selectors);
  if (!parsed) return DomResult::kInvalidParameter;
  for (dom::Element* e = dom::NextElementInOrder(he, he); e; e = dom::NextElementInOrder(e, he)) {
    if (css::MatchesAny(*parsed, *e) && callback(e, param)) break;
  }
  return DomResult::kOk;
}

DomResult HTMLayoutSelectParent(HELEMENT he, const char* selectors, unsigned depth, HELEMENT* parent) {
  if (he == nullptr) return DomResult::kInvalidHandle;
  if (selectors == nullptr || parent == nullptr) return DomResult::kInvalidParameter;
  const auto parsed = ParsedSelectors(selectors);
  if (!parsed) return DomResult::kInvalidParameter;
  *parent = nullptr;
  unsigned level = 0;
  for (dom::Element* e = he; e && (depth == 0 || level < depth); e = e->parent(), ++level) {
    if (css::MatchesAny(*parsed, *e)) {
      *parent = e;
      break;
    }
  }
  return DomResult::kOk;
}

}  // namespace kestrune::html
