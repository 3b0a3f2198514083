#pragma once

#include <cstddef>
#include <string_view>
#include <vector>

#include "html/dom/document.h"

namespace kestrune::html::parse {

// Nesting deeper than this is flattened: further elements become children of the deepest one,
// so hostile input can never make the tree (or anything that walks it) deeper.
inline constexpr std::size_t kMaxDepth = 256;

// Parses a whole page into the document, replacing the root's attributes and content. The
// root is always the `html` element; `head` and `body` stay as the page writes them.
void ParseDocument(std::u16string_view html, dom::Document& document);

// Parses the content an element of tag `contextTag` gets; the nodes are returned in order,
// without a parent. A fragment of table rows given to a `table` is read as rows of that table.
// The `img` elements made are listed in `images` when it is given.
std::vector<dom::Ref<dom::Node>> ParseFragment(std::u16string_view html, dom::Atom contextTag,
                                               std::vector<dom::Element*>* images = nullptr);

// Tags with no content and no end tag.
bool IsVoidElement(dom::Atom tag);
// Tags whose content is raw text (not markup).
bool IsRawTextElement(dom::Atom tag);

}  // namespace kestrune::html::parse
