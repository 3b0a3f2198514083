// The selector parser on arbitrary bytes, and every selector it accepts matched against a small
// document: no crash, no unbounded recursion, no hang.
#include <cstdint>
#include <string_view>

#include "base/utf.h"
#include "html/css/selector.h"
#include "html/parse/html_parser.h"

using namespace kestrune::html;

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const std::u16string text = kestrune::DecodeUtf8(std::string_view(reinterpret_cast<const char*>(data), size));
  const auto selectors = css::ParseSelectorList(text);
  if (!selectors) return 0;
  static dom::Document* document = [] {
    auto* d = new dom::Document();
    parse::ParseDocument(u"<body><div id=a class='x y' title='one two'><span lang=en-GB>s</span><p></p></div>"
                         u"<ul><li>1<li class=x>2<li>3<li>4</ul><input accesskey='^S' checked></body>",
                         *d);
    return d;
  }();
  std::size_t matched = 0;
  for (dom::Element* e = document->root(); e; e = dom::NextElementInOrder(e, document->root())) {
    matched += css::MatchesAny(*selectors, *e) ? 1 : 0;
    dom::StyleFeatures features;
    for (const auto& selector : *selectors) css::CollectFeatures(selector, features);
  }
  (void)matched;
  return 0;
}
