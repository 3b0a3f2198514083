#pragma once

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

  void SetGeometry(GeometrySource& geometry) { geometry_ = &geometry; }
  bool Mouse(const MouseInput& input);
  bool Key(const KeyInput& input);

  Element* focus() const { return focus_.get(); }
  void SetFocus(Element* element, bool byMouse);
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
};

}  // namespace kestrune::html::events
