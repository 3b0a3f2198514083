#include <vector>

#include "html/controls/kinds.h"
#include "html/dom/states.h"

namespace kestrune::html::controls {
namespace {

using namespace events;

// Elements of `tag` inside `scope` in document order, skipping what nested elements of tag
// `nested` hold (a submenu's items belong to the submenu).
std::vector<Element*> ItemsOf(Element& scope, dom::Atom tag, dom::Atom nested) {
  std::vector<Element*> items;
  std::vector<Element*> pending;
  for (std::size_t i = scope.elementCount(); i > 0; --i) pending.push_back(scope.ElementAt(i - 1));
  while (!pending.empty()) {
    Element* e = pending.back();
    pending.pop_back();
    if (e->tag() == nested) continue;
    if (e->tag() == tag) items.push_back(e);
    for (std::size_t i = e->elementCount(); i > 0; --i) pending.push_back(e->ElementAt(i - 1));
  }
  return items;
}

Element* ItemAt(Element& scope, Element* target, dom::Atom tag) {
  for (Element* e = target; e && e != &scope; e = e->parent()) {
    if (e->tag() == tag) return e;
  }
  return nullptr;
}

Element* CurrentOf(const std::vector<Element*>& items) {
  for (Element* item : items) {
    if (item->state() & dom::kStateCurrent) return item;
  }
  return nullptr;
}

// Moves within `items` by key; none when the key is not a move.
Element* Step(const std::vector<Element*>& items, Element* current, unsigned key) {
  std::vector<Element*> usable;
  for (Element* item : items) {
    if (!(item->state() & dom::kStateDisabled)) usable.push_back(item);
  }
  if (usable.empty()) return nullptr;
  std::size_t at = usable.size();
  for (std::size_t i = 0; i < usable.size(); ++i) {
    if (usable[i] == current) at = i;
  }
  switch (key) {
    case kVkHome: case kVkPrior: return usable.front();
    case kVkEnd: case kVkNext: return usable.back();
    case kVkUp: return at == usable.size() ? usable.back() : usable[at > 0 ? at - 1 : 0];
    case kVkDown: return at == usable.size() ? usable.front() : usable[std::min(at + 1, usable.size() - 1)];
    default: return nullptr;
  }
}

// A list of options with one chosen (the current one, also checked); with `multiple`, Control
// toggles further options.
class Select final : public Control {
 public:
  using Control::Control;
  unsigned Type(const Element& element) const override {
    return element.HasAttr(dom::kAtomMultiple) ? kCtlSelectMultiple : kCtlSelectSingle;
  }
  unsigned Subscription() const override { return kHandleMouse | kHandleKey | kHandleFocus | kHandleMethodCall; }

  void Attached(Element& element) override {
    const auto options = ItemsOf(element, dom::kAtomOption, dom::kAtomNone);
    if (CurrentOf(options)) return;
    for (Element* option : options) {
      if (option->HasAttr(dom::kAtomSelected)) {
        option->SetState(option->state() | dom::kStateCurrent | dom::kStateChecked);
        return;
      }
    }
  }

  ControlValue GetValue(const Element& element) const override {
    Element* current = CurrentOf(ItemsOf(const_cast<Element&>(element), dom::kAtomOption, dom::kAtomNone));
    if (!current) return {};
    if (const std::u16string* value = current->Attr(dom::kAtomValue)) return ControlValue::String(*value);
    return ControlValue::String(dom::InnerText(*current));
  }

  bool SetValue(Element& element, const ControlValue& value) override {
    if (value.kind != ControlValue::Kind::kString) return false;
    for (Element* option : ItemsOf(element, dom::kAtomOption, dom::kAtomNone)) {
      const std::u16string* own = option->Attr(dom::kAtomValue);
      if ((own ? *own : dom::InnerText(*option)) == value.string) {
        Choose(element, *option, false, nullptr);
        return true;
      }
    }
    return false;
  }

  bool OnMouse(Element& element, MouseParams& mouse) override {
    if ((mouse.cmd != kMouseDown && mouse.cmd != kMouseDClick) || !(mouse.buttonState & kMainMouseButton)) return false;
    if (IsDisabled(element)) return false;
    Element* option = ItemAt(element, mouse.target, dom::kAtomOption);
    if (!option || (option->state() & dom::kStateDisabled)) return true;
    if (Type(element) == kCtlSelectMultiple && (mouse.altState & kControlKeyPressed)) {
      option->SetState(option->state() ^ dom::kStateChecked);
      Post(element, kSelectSelectionChanged, *option, kByMouseClick);
      return true;
    }
    unsigned reason = kByMouseClick;
    Choose(element, *option, true, &reason);
    return true;
  }

  bool OnKey(Element& element, KeyParams& key) override {
    if (key.cmd != kKeyDown || IsDisabled(element)) return false;
    const auto options = ItemsOf(element, dom::kAtomOption, dom::kAtomNone);
    Element* next = Step(options, CurrentOf(options), key.keyCode);
    if (!next) return false;
    unsigned reason = kByKeyClick;
    Choose(element, *next, true, &reason);
    return true;
  }

 private:
  void Choose(Element& element, Element& option, bool notify, const unsigned* reason) {
    const auto options = ItemsOf(element, dom::kAtomOption, dom::kAtomNone);
    Element* old = CurrentOf(options);
    if (old == &option && (option.state() & dom::kStateChecked)) return;
    for (Element* other : options) {
      if (other != &option) other->SetState(other->state() & ~(dom::kStateCurrent | dom::kStateChecked));
    }
    option.SetState(option.state() | dom::kStateCurrent | dom::kStateChecked);
    if (notify) Post(element, kSelectSelectionChanged, option, reason ? *reason : kSynthesized);
  }
};

// A menu of `li` items: hovering or arrows make an item current, a click or Enter sends the
// menu item click to the item, then the popup holding the menu closes.
class Menu final : public Control {
 public:
  using Control::Control;
  unsigned Type(const Element&) const override { return kCtlMenu; }
  unsigned Subscription() const override { return kHandleMouse | kHandleKey | kHandleMethodCall; }

  bool OnMouse(Element& element, MouseParams& mouse) override {
    Element* item = ItemAt(element, mouse.target, dom::kAtomLi);
    if (!item) return false;
    if (mouse.cmd == kMouseEnter || mouse.cmd == kMouseMove) {
      MakeCurrent(element, *item);
      return false;
    }
    if (mouse.cmd == kMouseDown) return true;
    if (mouse.cmd == kMouseUp) {
      Click(element, *item, kByMouseClick);
      return true;
    }
    return false;
  }

  bool OnKey(Element& element, KeyParams& key) override {
    if (key.cmd != kKeyDown) return false;
    const auto items = ItemsOf(element, dom::kAtomLi, dom::kAtomMenu);
    Element* current = CurrentOf(items);
    if (key.keyCode == kVkReturn) {
      if (current) Click(element, *current, kByKeyClick);
      return current != nullptr;
    }
    if (key.keyCode == kVkEscape) {
      host().HidePopupHolding(element);
      return true;
    }
    Element* next = Step(items, current, key.keyCode);
    if (!next) return false;
    MakeCurrent(element, *next);
    return true;
  }

  bool OnMethod(Element& element, MethodParams& method) override {
    if (method.methodId != kDoClick) return false;
    const auto items = ItemsOf(element, dom::kAtomLi, dom::kAtomMenu);
    if (Element* current = CurrentOf(items)) Click(element, *current, kSynthesized);
    return true;
  }

 private:
  void MakeCurrent(Element& element, Element& item) {
    if (item.state() & dom::kStateCurrent) return;
    for (Element* other : ItemsOf(element, dom::kAtomLi, dom::kAtomMenu)) {
      other->SetState(other->state() & ~dom::kStateCurrent);
    }
    item.SetState(item.state() | dom::kStateCurrent);
    Post(item, kMenuItemActive, element, kByMouseClick);
  }

  void Click(Element& element, Element& item, unsigned reason) {
    if (item.state() & dom::kStateDisabled) return;
    Element* owner = host().HidePopupHolding(element);
    Post(item, kMenuItemClick, owner ? *owner : element, reason);
  }
};

}  // namespace

std::unique_ptr<Control> MakeSelect(ControlHost& host) { return std::make_unique<Select>(host); }
std::unique_ptr<Control> MakeMenu(ControlHost& host) { return std::make_unique<Menu>(host); }

}  // namespace kestrune::html::controls
