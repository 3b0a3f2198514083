#pragma once

#include <string>

#include "html/dom/node.h"

namespace kestrune::html::parse {

// HTML text of an element's content, or of the element with its content. Parsing the result
// again gives the same tree: text and attribute values are escaped, void elements get no end
// tag, style text is written raw.
std::u16string InnerHtml(const dom::Element& element);
std::u16string OuterHtml(const dom::Element& element);

// Text as HTML text content: '&', '<' and '>' escaped.
std::u16string EscapeText(std::u16string_view text);

}  // namespace kestrune::html::parse
