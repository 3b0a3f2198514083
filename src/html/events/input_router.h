#pragma once

#include "html/events/dispatcher.h"
#include "html/events/geometry_source.h"

namespace kestrune::html::events {

// Input in platform-neutral form, as the window hosts deliver it.
struct MouseInput {
  unsigned cmd = kMouseMove;  // MouseEvents
  Point pos;                  // in the view
  unsigned buttons = 0;       // MouseButtons
  unsigned keys = 0;          // KeyboardStates
  // The element under the pointer when the caller knows it (tests, a host without layout);
  // otherwise the geometry's hit test decides.
  Element* target = nullptr;
};

struct KeyInput {
  unsigned cmd = kKeyDown;  // KeyEvents
  unsigned keyCode = 0;     // virtual key, or the character for kKeyChar
  unsigned keys = 0;        // KeyboardStates
};

enum VirtualKeys : unsigned {
  kVkBack = 0x08, kVkTab = 0x09, kVkReturn = 0x0D, kVkEscape = 0x1B, kVkSpace = 0x20, kVkPrior = 0x21,
  kVkNext = 0x22, kVkEnd = 0x23, kVkHome = 0x24, kVkLeft = 0x25, kVkUp = 0x26, kVkRight = 0x27,
  kVkDown = 0x28, kVkInsert = 0x2D, kVkDelete = 0x2E,
};

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
