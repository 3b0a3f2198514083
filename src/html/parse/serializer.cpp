#include "html/parse/serializer.h"

#include <vector>

#include "html/parse/html_parser.h"

namespace kestrune::html::parse {
namespace {

void AppendEscaped(std::u16string_view text, bool attribute, std::u16string& out) {
  for (char16_t c : text) {
    switch (c) {
      case u'&': out += u"&amp;"; break;
      case u'<': out += u"&lt;"; break;
      case u'>': out += u"&gt;"; break;
      case u'"':
        if (attribute) {
          out += u"&quot;";
          break;
        }
        out.push_back(c);
        break;
      default: out.push_back(c);
    }
  }
}

void AppendStartTag(const dom::Element& element, std::u16string& out) {
  out.push_back(u'<');
  out += dom::NameOf(element.tag());
  for (const dom::Attribute& attribute : element.attributes()) {
    out.push_back(u' ');
    out += dom::NameOf(attribute.name);
    out += u"=\"";
    AppendEscaped(attribute.value, true, out);
    out.push_back(u'"');
  }
  out.push_back(u'>');
}

// Walks without recursion: an end marker (the element with `closing` set) follows its content.
void AppendContent(const dom::Element& element, std::u16string& out) {
  struct Step {
    const dom::Node* node;
    bool closing;
  };
  std::vector<Step> pending;
  for (auto it = element.nodes().rbegin(); it != element.nodes().rend(); ++it) pending.push_back({*it, false});
  while (!pending.empty()) {
    const Step step = pending.back();
    pending.pop_back();
    if (!step.node->IsElement()) {
      const dom::Element* parent = step.node->parent();
      const std::u16string_view text = static_cast<const dom::Text*>(step.node)->text();
      if (parent && (parent->tag() == dom::kAtomStyle || parent->tag() == dom::kAtomScript)) {
        out += text;
      } else {
        AppendEscaped(text, false, out);
      }
      continue;
    }
    const auto* child = static_cast<const dom::Element*>(step.node);
    if (step.closing) {
      out += u"</";
      out += dom::NameOf(child->tag());
      out.push_back(u'>');
      continue;
    }
    AppendStartTag(*child, out);
    if (IsVoidElement(child->tag())) continue;
    pending.push_back({child, true});
    for (auto it = child->nodes().rbegin(); it != child->nodes().rend(); ++it) pending.push_back({*it, false});
  }
}

}  // namespace

std::u16string InnerHtml(const dom::Element& element) {
  std::u16string out;
  AppendContent(element, out);
  return out;
}

std::u16string OuterHtml(const dom::Element& element) {
  std::u16string out;
  AppendStartTag(element, out);
  if (IsVoidElement(element.tag())) return out;
  AppendContent(element, out);
  out += u"</";
  out += dom::NameOf(element.tag());
  out.push_back(u'>');
  return out;
}

std::u16string EscapeText(std::u16string_view text) {
  std::u16string out;
  AppendEscaped(text, false, out);
  return out;
}

}  // namespace kestrune::html::parse
