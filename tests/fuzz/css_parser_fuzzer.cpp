// The style sheet parser and the cascade on arbitrary bytes: every rule that comes out applies
// to a small document without a crash, a hang or a read outside a buffer.
#include <cstdint>
#include <string_view>

#include "base/utf.h"
#include "html/css/style_engine.h"
#include "html/parse/html_parser.h"

using namespace kestrune::html;

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const std::u16string text = kestrune::DecodeUtf8(std::string_view(reinterpret_cast<const char*>(data), size));
  dom::Document document;
  parse::ParseDocument(u"<body class=a><div id=x class='a b' style='color:red'><p>t</p><input type=checkbox></div>"
                       u"<table><tr><td>1</td><td/></tr></table><ul><li>a<li>b</ul></body>",
                       document);
  css::StyleEngine styles(document);
  styles.AddPageSheet(css::ParseStyleSheet(text));
  styles.Update();
  // The same text as a style attribute.
  document.root()->SetAttr(dom::kAtomStyle, text);
  styles.Update();
  for (dom::Element* e = document.root(); e; e = dom::NextElementInOrder(e, document.root())) {
    if (!e->style()) __builtin_trap();
  }
  return 0;
}
