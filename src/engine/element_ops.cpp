#include "engine/element_ops.h"

#include "base/text.h"
#include "base/utf.h"

namespace kestrune::engine {

namespace {
constexpr std::size_t kSelectorLimit = 2047;
}  // namespace

void ShowElement(const ElementHandle& element, bool visible) {
  if (!element) return;
  element.SetStyleAttribute("visibility", visible ? u"visible" : u"hidden");
  element.Update(true);
}

void EnableElement(const ElementHandle& element, bool enabled) {
  const unsigned disabled = html::dom::kStateDisabled;
  element.SetState(enabled ? 0u : disabled, enabled ? disabled : 0u, true);
}

void SetElementChecked(const ElementHandle& element, bool checked) {
  const unsigned bit = html::dom::kStateChecked;
  element.SetState(checked ? bit : 0u, checked ? 0u : bit, true);
}

void SetElementText(const ElementHandle& element, std::u16string_view text) {
  if (!element) return;
  element.SetText(text);
  element.Update(true);
}

void SetElementHtmlText(const ElementHandle& element, std::u16string_view html) {
  if (!element) return;
  const std::string utf8 = EncodeUtf8(html);
  if (utf8.empty()) element.SetText(u"");
  else element.SetHtml(utf8, html::kReplaceContent);
  element.SetScrollPos({0, 0}, true);
  element.Update(true);
}

std::string FormatSelector(std::string_view format, std::initializer_list<SelectorArgument> arguments) {
  std::string out;
  auto next = arguments.begin();
  for (std::size_t i = 0; i < format.size(); ++i) {
    const char c = format[i];
    if (c != '%' || i + 1 >= format.size()) {
      out.push_back(c);
      continue;
    }
    const char kind = format[++i];
    if (kind == '%') {
      out.push_back('%');
      continue;
    }
    if (next == arguments.end()) continue;
    const SelectorArgument& argument = *next++;
    if (kind == 'd' && std::holds_alternative<int>(argument)) out += EncodeUtf8(FormatDecimal(std::get<int>(argument)));
    else if (kind == 's' && std::holds_alternative<std::string_view>(argument)) out += std::get<std::string_view>(argument);
    else if (kind == 'S' && std::holds_alternative<std::u16string_view>(argument)) out += EncodeUtf8(std::get<std::u16string_view>(argument));
  }
  if (out.size() > kSelectorLimit) out.resize(kSelectorLimit);
  return out;
}

}  // namespace kestrune::engine
