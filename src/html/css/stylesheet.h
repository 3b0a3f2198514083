#pragma once

#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "html/css/properties.h"
#include "html/css/selector.h"

namespace kestrune::html::css {

struct Rule {
  std::vector<ComplexSelector> selectors;
  std::vector<Declaration> declarations;
};

struct StyleSheet {
  std::vector<Rule> rules;
  std::vector<std::u16string> imports;  // @import URLs, as written
};

// Never fails: a rule with an invalid selector and a declaration that does not parse are
// skipped, unbalanced blocks end at the end of the text, as CSS recovery asks.
StyleSheet ParseStyleSheet(std::u16string_view text);

// The declarations of a `style` attribute or of a style the program sets.
std::vector<Declaration> ParseDeclarationBlock(std::u16string_view text);

}  // namespace kestrune::html::css
