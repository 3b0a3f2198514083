#include "html/events/input_router.h"

#include <algorithm>

#include "html/dom/states.h"

namespace kestrune::html::events {
namespace {

void SetStateOnChain(Element* from, std::uint32_t bit, bool on) {
  for (Element* e = from; e; e = e->parent()) e->SetState(on ? (e->state() | bit) : (e->state() & ~bit));
}

}  // namespace

InputRouter::InputRouter(EventDispatcher& dispatcher, GeometrySource& geometry)
    : dispatcher_(dispatcher), geometry_(&geometry) {}

bool InputRouter::IsDisabled(const Element& element) {
  for (const Element* e = &element; e; e = e->parent()) {
    if (e->state() & dom::kStateDisabled) return true;
  }
  return false;
}

bool InputRouter::IsFocusable(const Element& element) {
  if (IsDisabled(element)) return false;
  if (element.HasAttr(dom::InternName("tabindex"))) return true;
  const dom::RareData* rare = element.rareIfAny();
  if (!rare) return false;
  return std::any_of(rare->handlers.begin(), rare->handlers.end(),
                     [](const dom::AttachedHandler& h) { return (h.subscription & kHandleFocus) != 0; });
}

Element* InputRouter::Retarget(Element* element) const {
  Element* result = element;
  for (Element* e = element; e; e = e->parent()) {
    if (e->state() & dom::kStateDisabled) result = e->parent();
  }
  return result;
}

void InputRouter::MoveHover(Element* target, const MouseInput& input) {
  if (hover_.get() == target) return;
  dom::Ref<Element> old = hover_;
  hover_ = dom::Ref<Element>(target);
  if (old) {
    SetStateOnChain(old.get(), dom::kStateHover, false);
    MouseParams params{kMouseLeave, old.get(), input.pos, input.pos, input.buttons, input.keys, 0, false, nullptr, 0};
    dispatcher_.Route(old.get(), kHandleMouse, &params, params.cmd);
  }
  if (target) {
    SetStateOnChain(target, dom::kStateHover, true);
    MouseParams params{kMouseEnter, target, input.pos, input.pos, input.buttons, input.keys, 0, false, nullptr, 0};
    dispatcher_.Route(target, kHandleMouse, &params, params.cmd);
  }
}

bool InputRouter::Mouse(const MouseInput& input) {
  if (input.cmd == kMouseLeave && !input.target) {
    MoveHover(nullptr, input);
    return false;
  }
  Element* target = capture_ ? capture_.get() : (input.target ? input.target : geometry_->HitTest(input.pos));
  if (!capture_) target = Retarget(target);
  if (target == nullptr) return false;
  dom::Ref<Element> hold(target);
  if (input.cmd == kMouseMove || input.cmd == kMouseDown) MoveHover(target, input);

  if (input.cmd == kMouseDown || input.cmd == kMouseDClick) {
    for (Element* e = target; e; e = e->parent()) {
      if (IsFocusable(*e)) {
        SetFocus(e, true);
        break;
      }
    }
    if (active_) SetStateOnChain(active_.get(), dom::kStateActive, false);
    active_ = hold;
    SetStateOnChain(target, dom::kStateActive, true);
  }

  Point local = input.pos;
  if (auto box = geometry_->Location(*target, kViewRelative | kBorderBox)) local = {input.pos.x - box->left, input.pos.y - box->top};
  // The wheel's notches travel in the button state, as the engine's events carry them.
  const unsigned buttons = input.cmd == kMouseWheel ? static_cast<unsigned>(input.wheelDelta) : input.buttons;
  const unsigned cursor = cursorOf_ ? cursorOf_(*target) : unsigned{kCursorArrow};
  MouseParams params{input.cmd, target, local, input.pos, buttons, input.keys, cursor, false, nullptr, 0};
  const bool handled = dispatcher_.Route(target, kHandleMouse, &params, params.cmd);
  cursor_ = params.cursorType;

  if (input.cmd == kMouseUp && active_) {
    SetStateOnChain(active_.get(), dom::kStateActive, false);
    active_ = {};
  }
  return handled;
}

bool InputRouter::Key(const KeyInput& input) {
  Element* target = focus_ && focus_->document() == &dispatcher_.document() ? focus_.get() : dispatcher_.document().root();
  target = Retarget(target);
  if (target == nullptr) return false;
  KeyParams params{input.cmd, target, input.keyCode, input.keys};
  const bool handled = dispatcher_.Route(target, kHandleKey, &params, params.cmd);
  if (!handled && input.cmd == kKeyDown && input.keyCode == kVkTab && !(input.keys & (kControlKeyPressed | kAltKeyPressed))) {
    MoveFocusInOrder((input.keys & kShiftKeyPressed) != 0);
    return true;
  }
  return handled;
}

void InputRouter::SetFocus(Element* element, bool byMouse) {
  if (focus_.get() == element) return;
  dom::Ref<Element> old = focus_;
  dom::Ref<Element> fresh(element);
  focus_ = fresh;
  if (old) {
    old->SetState(old->state() & ~dom::kStateFocus);
    FocusParams params{kFocusLost, fresh.get(), byMouse, false};
    dispatcher_.Route(old.get(), kHandleFocus, &params, params.cmd);
  }
  if (fresh && focus_ == fresh) {
    fresh->SetState(fresh->state() | dom::kStateFocus);
    FocusParams params{kFocusGot, old.get(), byMouse, false};
    dispatcher_.Route(fresh.get(), kHandleFocus, &params, params.cmd);
  }
}

void InputRouter::MoveFocusInOrder(bool backwards) {
  std::vector<Element*> focusable;
  std::vector<Element*> pending{dispatcher_.document().root()};
  while (!pending.empty()) {
    Element* e = pending.back();
    pending.pop_back();
    if (e == nullptr) continue;
    if (IsFocusable(*e)) focusable.push_back(e);
    for (std::size_t i = e->elementCount(); i > 0; --i) pending.push_back(e->ElementAt(i - 1));
  }
  if (focusable.empty()) return;
  auto at = std::find(focusable.begin(), focusable.end(), focus_.get());
  std::size_t index;
  if (at == focusable.end()) {
    index = backwards ? focusable.size() - 1 : 0;
  } else {
    const std::size_t current = static_cast<std::size_t>(at - focusable.begin());
    index = backwards ? (current + focusable.size() - 1) % focusable.size() : (current + 1) % focusable.size();
  }
  SetFocus(focusable[index], false);
}

void InputRouter::ForgetInside(const Element& subtree) {
  auto inside = [&](const dom::Ref<Element>& e) { return e && (e.get() == &subtree || subtree.IsAncestorOf(e.get())); };
  if (inside(focus_)) {
    focus_->SetState(focus_->state() & ~dom::kStateFocus);
    focus_ = {};
  }
  if (inside(hover_)) hover_ = {};
  if (inside(capture_)) capture_ = {};
  if (inside(active_)) active_ = {};
}

}  // namespace kestrune::html::events
