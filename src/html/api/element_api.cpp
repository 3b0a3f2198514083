#include <algorithm>

#include "base/text.h"
#include "base/utf.h"
#include "html/api/registry.h"
#include "html/css/style_engine.h"
#include "html/dom/states.h"
#include "html/parse/serializer.h"

namespace kestrune::html {

using api_internal::Settle;
using api_internal::WindowOf;

namespace {

dom::Atom NameAtom(const char* name) { return dom::InternName(std::string_view(name)); }

}  // namespace

DomResult HTMLayout_UseElement(HELEMENT he) {
  if (he == nullptr) return DomResult::kInvalidHandle;
  he->AddRef();
  return DomResult::kOk;
}

DomResult HTMLayout_UnuseElement(HELEMENT he) {
  if (he == nullptr) return DomResult::kInvalidHandle;
  he->Release();
  return DomResult::kOk;
}

DomResult HTMLayoutGetChildrenCount(HELEMENT he, unsigned* count) {
  if (he == nullptr) return DomResult::kInvalidHandle;
  if (count == nullptr) return DomResult::kInvalidParameter;
  *count = static_cast<unsigned>(he->elementCount());
  return DomResult::kOk;
}

DomResult HTMLayoutGetNthChild(HELEMENT he, unsigned n, HELEMENT* child) {
  if (he == nullptr) return DomResult::kInvalidHandle;
  if (child == nullptr) return DomResult::kInvalidParameter;
  *child = he->ElementAt(n);
  return *child ? DomResult::kOk : DomResult::kInvalidParameter;
}

DomResult HTMLayoutGetParentElement(HELEMENT he, HELEMENT* parent) {
  if (he == nullptr) return DomResult::kInvalidHandle;
  if (parent == nullptr) return DomResult::kInvalidParameter;
  *parent = he->parent();
  return DomResult::kOk;
}

DomResult HTMLayoutGetElementIndex(HELEMENT he, unsigned* index) {
  if (he == nullptr) return DomResult::kInvalidHandle;
  if (index == nullptr) return DomResult::kInvalidParameter;
  *index = static_cast<unsigned>(he->elementIndex());
  return DomResult::kOk;
}

DomResult HTMLayoutGetElementType(HELEMENT he, std::string* tag) {
  if (he == nullptr) return DomResult::kInvalidHandle;
  if (tag == nullptr) return DomResult::kInvalidParameter;
  *tag = EncodeUtf8(dom::NameOf(he->tag()));
  return DomResult::kOk;
}

DomResult HTMLayoutGetElementHwnd(HELEMENT he, HLWINDOW* window) {
  if (he == nullptr) return DomResult::kInvalidHandle;
  if (window == nullptr) return DomResult::kInvalidParameter;
  *window = WindowOf(he);
  return *window ? DomResult::kOk : DomResult::kPassiveHandle;
}

DomResult HTMLayoutGetAttributeByName(HELEMENT he, const char* name, std::optional<std::u16string>* value) {
  if (he == nullptr) return DomResult::kInvalidHandle;
  if (name == nullptr || value == nullptr) return DomResult::kInvalidParameter;
  const dom::Atom atom = dom::FindName(AsciiToUtf16(name));
  const std::u16string* found = atom == dom::kAtomNone ? nullptr : he->Attr(atom);
  *value = found ? std::optional<std::u16string>(*found) : std::nullopt;
  return DomResult::kOk;
}

DomResult HTMLayoutSetAttributeByName(HELEMENT he, const char* name, const char16_t* value) {
  if (he == nullptr) return DomResult::kInvalidHandle;
  if (name == nullptr || *name == '\0') return DomResult::kInvalidParameter;
  if (value) he->SetAttr(NameAtom(name), value);
  else he->RemoveAttr(NameAtom(name));
  Settle(he);
  return DomResult::kOk;
}

DomResult HTMLayoutGetAttributeCount(HELEMENT he, unsigned* count) {
  if (he == nullptr) return DomResult::kInvalidHandle;
  if (count == nullptr) return DomResult::kInvalidParameter;
  *count = static_cast<unsigned>(he->attributes().size());
  return DomResult::kOk;
}

DomResult HTMLayoutGetNthAttribute(HELEMENT he, unsigned n, std::string* name, std::u16string* value) {
  if (he == nullptr) return DomResult::kInvalidHandle;
  if (n >= he->attributes().size() || name == nullptr || value == nullptr) return DomResult::kInvalidParameter;
  *name = EncodeUtf8(dom::NameOf(he->attributes()[n].name));
  *value = he->attributes()[n].value;
  return DomResult::kOk;
}

DomResult HTMLayoutGetStyleAttribute(HELEMENT he, const char* name, std::optional<std::u16string>* value) {
  if (he == nullptr) return DomResult::kInvalidHandle;
  if (name == nullptr || value == nullptr) return DomResult::kInvalidParameter;
  *value = std::nullopt;
  const std::u16string property = AsciiToUtf16(name);
  if (const dom::RareData* rare = he->rareIfAny()) {
    for (const auto& [own, text] : rare->runtimeStyle) {
      if (EqualsIgnoringAsciiCase(own, property)) *value = text;
    }
  }
  // Without a value of the program's own, the computed one (the splitter reads `flow` and sizes).
  if (!*value && he->style()) *value = css::ComputedValueText(*he->style(), property);
  return DomResult::kOk;
}

DomResult HTMLayoutSetStyleAttribute(HELEMENT he, const char* name, const char16_t* value) {
  if (he == nullptr) return DomResult::kInvalidHandle;
  if (name == nullptr || *name == '\0') return DomResult::kInvalidParameter;
  auto& style = he->rare().runtimeStyle;
  const std::u16string property = AsciiToUtf16(name);
  std::erase_if(style, [&](const auto& entry) { return EqualsIgnoringAsciiCase(entry.first, property); });
  if (value) style.emplace_back(property, value);
  he->MarkStyleDirty(false);
  Settle(he);
  return DomResult::kOk;
}

DomResult HTMLayoutGetElementState(HELEMENT he, unsigned* state) {
  if (he == nullptr) return DomResult::kInvalidHandle;
  if (state == nullptr) return DomResult::kInvalidParameter;
  *state = he->state();
  return DomResult::kOk;
}

DomResult HTMLayoutSetElementState(HELEMENT he, unsigned bitsToSet, unsigned bitsToClear, bool update) {
  if (he == nullptr) return DomResult::kInvalidHandle;
  host::Window* window = WindowOf(he);
  // Focus is the window's: moving the bit moves the focus.
  if (window && (bitsToSet & dom::kStateFocus)) window->input().SetFocus(he, false);
  if (window && (bitsToClear & dom::kStateFocus) && window->input().focus() == he) window->input().SetFocus(nullptr, false);
  he->SetState((he->state() & ~bitsToClear) | bitsToSet);
  if (window) {
    // "Update" means the view shows the change before the call returns.
    if (update) window->Redraw(he, true);
    else window->Update();
  }
  return DomResult::kOk;
}

DomResult HTMLayoutUpdateElement(HELEMENT he, bool renderNow) {
  if (he == nullptr) return DomResult::kInvalidHandle;
  host::Window* window = WindowOf(he);
  if (window == nullptr) return DomResult::kPassiveHandle;
  window->Redraw(he, renderNow);
  return DomResult::kOk;
}

DomResult HTMLayoutGetElementInnerText16(HELEMENT he, std::u16string* text) {
  if (he == nullptr) return DomResult::kInvalidHandle;
  if (text == nullptr) return DomResult::kInvalidParameter;
  *text = dom::InnerText(*he);
  return DomResult::kOk;
}

DomResult HTMLayoutSetElementInnerText16(HELEMENT he, const char16_t* text, std::size_t length) {
  if (he == nullptr) return DomResult::kInvalidHandle;
  const std::u16string_view value = text ? std::u16string_view(text, length) : std::u16string_view();
  if (host::Window* window = WindowOf(he)) {
    window->SetInnerText(*he, value);
  } else {
    he->RemoveAllChildren();
    if (!value.empty()) he->AppendChild(dom::Text::Create(std::u16string(value)));
  }
  return DomResult::kOk;
}

DomResult HTMLayoutGetElementHtml(HELEMENT he, std::string* utf8, bool outer) {
  if (he == nullptr) return DomResult::kInvalidHandle;
  if (utf8 == nullptr) return DomResult::kInvalidParameter;
  *utf8 = EncodeUtf8(outer ? parse::OuterHtml(*he) : parse::InnerHtml(*he));
  return DomResult::kOk;
}

DomResult HTMLayoutSetElementHtml(HELEMENT he, const unsigned char* utf8, std::size_t length, unsigned where) {
  if (he == nullptr) return DomResult::kInvalidHandle;
  if (utf8 == nullptr && length > 0) return DomResult::kInvalidParameter;
  const std::u16string html = DecodeUtf8(std::string_view(reinterpret_cast<const char*>(utf8), utf8 ? length : 0));
  host::Window* window = WindowOf(he);
  if (window == nullptr) return DomResult::kPassiveHandle;
  return window->SetElementHtml(*he, html, where) ? DomResult::kOk : DomResult::kInvalidParameter;
}

DomResult HTMLayoutIsElementVisible(HELEMENT he, bool* visible) {
  if (he == nullptr) return DomResult::kInvalidHandle;
  if (visible == nullptr) return DomResult::kInvalidParameter;
  *visible = WindowOf(he) != nullptr;
  for (const dom::Element* e = he; e && *visible; e = e->parent()) {
    *visible = e->style() && css::IsShown(*e->style());
  }
  return DomResult::kOk;
}

DomResult HTMLayoutIsElementEnabled(HELEMENT he, bool* enabled) {
  if (he == nullptr) return DomResult::kInvalidHandle;
  if (enabled == nullptr) return DomResult::kInvalidParameter;
  *enabled = !events::InputRouter::IsDisabled(*he);
  return DomResult::kOk;
}

DomResult HTMLayoutCreateElement(const char* tagName, const char16_t* text, HELEMENT* element) {
  if (tagName == nullptr || *tagName == '\0' || element == nullptr) return DomResult::kInvalidParameter;
  dom::Ref<dom::Element> created = dom::Element::Create(NameAtom(tagName));
  if (text && *text) created->AppendChild(dom::Text::Create(text));
  *element = created.Leak();
  return DomResult::kOk;
}

DomResult HTMLayoutInsertElement(HELEMENT he, HELEMENT parent, unsigned index) {
  if (he == nullptr || parent == nullptr) return DomResult::kInvalidHandle;
  if (he == parent || he->IsAncestorOf(parent)) return DomResult::kInvalidParameter;
  host::Window* from = WindowOf(he);
  host::Window* to = WindowOf(parent);
  dom::Ref<dom::Element> hold(he);
  // Leaving one window's document for another (or for none) detaches its behaviors.
  if (from && from != to) from->Detach(*he);
  parent->InsertElementAt(index, hold);
  Settle(parent);
  return DomResult::kOk;
}

DomResult HTMLayoutDetachElement(HELEMENT he) {
  if (he == nullptr) return DomResult::kInvalidHandle;
  if (host::Window* window = WindowOf(he)) window->Detach(*he);
  else if (he->parent()) he->parent()->RemoveChild(he);
  return DomResult::kOk;
}

DomResult HTMLayoutDeleteElement(HELEMENT he) { return HTMLayoutDetachElement(he); }

DomResult HTMLayoutSortElements(HELEMENT he, unsigned firstIndex, unsigned lastIndex, ElementComparator comparator,
                                void* param) {
  if (he == nullptr) return DomResult::kInvalidHandle;
  const std::size_t count = he->elementCount();
  if (comparator == nullptr || firstIndex > lastIndex || lastIndex > count) return DomResult::kInvalidParameter;
  std::vector<dom::Element*> order;
  for (std::size_t i = firstIndex; i < lastIndex; ++i) order.push_back(he->ElementAt(i));
  std::stable_sort(order.begin(), order.end(),
                   [&](dom::Element* a, dom::Element* b) { return comparator(a, b, param) < 0; });
  he->ReorderElements(firstIndex, order);
  Settle(he);
  return DomResult::kOk;
}

DomResult HTMLayoutSwapElements(HELEMENT a, HELEMENT b) {
  if (a == nullptr || b == nullptr) return DomResult::kInvalidHandle;
  dom::Element* parentA = a->parent();
  dom::Element* parentB = b->parent();
  if (parentA == nullptr || parentB == nullptr || a->IsAncestorOf(b) || b->IsAncestorOf(a)) return DomResult::kInvalidParameter;
  dom::Ref<dom::Element> holdA(a), holdB(b);
  const std::size_t indexA = a->nodeIndex(), indexB = b->nodeIndex();
  if (parentA == parentB) {
    const std::size_t low = std::min(indexA, indexB), high = std::max(indexA, indexB);
    dom::Element* first = indexA < indexB ? a : b;
    dom::Element* second = indexA < indexB ? b : a;
    dom::Ref<dom::Node> takenSecond = parentA->RemoveChild(second);
    dom::Ref<dom::Node> takenFirst = parentA->RemoveChild(first);
    parentA->InsertNodeAt(low, takenSecond);
    parentA->InsertNodeAt(high, takenFirst);
  } else {
    dom::Ref<dom::Node> takenA = parentA->RemoveChild(a);
    dom::Ref<dom::Node> takenB = parentB->RemoveChild(b);
    parentA->InsertNodeAt(indexA, takenB);
    parentB->InsertNodeAt(indexB, takenA);
  }
  Settle(parentA);
  Settle(parentB);
  return DomResult::kOk;
}

}  // namespace kestrune::html
