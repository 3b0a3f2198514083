#pragma once

#include <functional>

#include "html/events/dispatcher.h"
#include "html/events/geometry_source.h"
#include "html/events/input.h"

namespace kestrune::html::events {

// Turns input into routed events: hover and its enter/leave events, focus (mouse-down on a
// focusable element, Tab), capture, and the :hover, :active and :focus states. Input aimed
// into a disabled subtree goes to the element above it, so a disabled form takes no input.
class InputRouter {
 public:
  InputRouter(EventDispatcher& dispatcher, GeometrySource& geometry);

  bool Mouse(const MouseInput& input);
  bool Key(const KeyInput& input);

  Element* focus() const { return focus_.get(); }
  void SetFocus(Element* element, bool byMouse);
  // The cursor an element asks for (its style's), put in the mouse parameters before they are
  // routed; handlers may change it there.
  void SetCursorSource(std::function<unsigned(const Element&)> source) { cursorOf_ = std::move(source); }
  // The cursor the last mouse event ended with.
  unsigned cursor() const { return cursor_; }
  Element* hover() const { return hover_.get(); }
  Element* capture() const { return capture_.get(); }
  void SetCapture(Element* element) { capture_ = dom::Ref<Element>(element); }
  void ReleaseCapture() { capture_ = {}; }
  // Forgets focus, hover and capture inside a subtree that leaves the document.
  void ForgetInside(const Element& subtree);

  static bool IsFocusable(const Element& element);
  static bool IsDisabled(const Element& element);  // itself or an ancestor

 private:
  Element* Retarget(Element* element) const;
  void MoveHover(Element* target, const MouseInput& input);
  void MoveFocusInOrder(bool backwards);

  EventDispatcher& dispatcher_;
  GeometrySource* geometry_;
  dom::Ref<Element> focus_;
  dom::Ref<Element> hover_;
  dom::Ref<Element> capture_;
  dom::Ref<Element> active_;
  std::function<unsigned(const Element&)> cursorOf_;
  unsigned cursor_ = kCursorArrow;
};

}  // namespace kestrune::html::events
