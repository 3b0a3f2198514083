#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "html/css/tokenizer.h"
#include "html/dom/document.h"

namespace kestrune::html::css {

struct ComplexSelector;

struct AttributeTest {
  // `=` compares without regard to ASCII case, `==` exactly (pages use it for access keys,
  // where ^S and ^s differ).
  enum class Op : std::uint8_t { kExists, kEquals, kEqualsExact, kPrefix, kSuffix, kContains, kWord, kDash };
  dom::Atom name = dom::kAtomNone;
  Op op = Op::kExists;
  std::u16string value;
};

struct PseudoTest {
  enum class Kind : std::uint8_t { kState, kEnabled, kFirstChild, kLastChild, kOnlyChild, kNthChild,
                                   kNthLastChild, kRoot, kEmpty, kNot };
  Kind kind = Kind::kState;
  std::uint32_t state = 0;
  int a = 0, b = 0;  // an+b
  std::vector<ComplexSelector> negated;
};

// One compound selector: type, ids, classes, attributes and pseudo-classes of one element.
struct Compound {
  dom::Atom tag = dom::kAtomNone;  // none: any element
  std::vector<std::u16string> ids;
  std::vector<std::u16string> classes;
  std::vector<AttributeTest> attributes;
  std::vector<PseudoTest> pseudos;
};

enum class Combinator : std::uint8_t { kDescendant, kChild, kNextSibling, kLaterSibling };

struct ComplexSelector {
  std::vector<Compound> compounds;       // left to right; the last one is the subject
  std::vector<Combinator> combinators;   // combinators[i] joins compounds[i] and compounds[i + 1]
  std::uint32_t specificity = 0;         // ids << 16 | classes, attributes, pseudo-classes << 8 | types
};

// Parses a selector list from tokens [begin, end); none when any selector of it is invalid.
std::optional<std::vector<ComplexSelector>> ParseSelectorList(const std::vector<Token>& tokens, std::size_t begin,
                                                              std::size_t end);
std::optional<std::vector<ComplexSelector>> ParseSelectorList(std::u16string_view text);

bool Matches(const ComplexSelector& selector, const dom::Element& element);
bool MatchesPseudo(const PseudoTest& pseudo, const dom::Element& element);
bool MatchesAny(const std::vector<ComplexSelector>& selectors, const dom::Element& element);

// Adds what the selector tests to the document's invalidation features.
void CollectFeatures(const ComplexSelector& selector, dom::StyleFeatures& features);

}  // namespace kestrune::html::css
