// The HTML parser and serializer on arbitrary bytes: a tree of bounded depth, a serialization
// that parses back to itself, never a crash or a hang.
#include <cstdint>
#include <string_view>

#include "base/utf.h"
#include "html/parse/html_parser.h"
#include "html/parse/serializer.h"

using namespace kestrune::html;

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const std::u16string text = kestrune::DecodeUtf8(std::string_view(reinterpret_cast<const char*>(data), size));
  dom::Document document;
  parse::ParseDocument(text, document);
  std::size_t depth = 0;
  for (dom::Element* e = document.root(); e; e = dom::NextElementInOrder(e, document.root())) {
    std::size_t level = 0;
    for (dom::Element* up = e; up; up = up->parent()) ++level;
    depth = std::max(depth, level);
  }
  if (depth > parse::kMaxDepth + 2) __builtin_trap();
  const std::u16string once = parse::InnerHtml(*document.root());
  auto nodes = parse::ParseFragment(once, dom::kAtomBody);
  dom::Ref<dom::Element> again = dom::Element::Create(dom::kAtomBody);
  for (auto& node : nodes) again->AppendChild(node);
  // Serializing what the serializer wrote gives the same text again.
  const std::u16string twice = parse::InnerHtml(*again);
  auto nodes2 = parse::ParseFragment(twice, dom::kAtomBody);
  dom::Ref<dom::Element> third = dom::Element::Create(dom::kAtomBody);
  for (auto& node : nodes2) third->AppendChild(node);
  if (parse::InnerHtml(*third) != twice) __builtin_trap();
  return 0;
}
