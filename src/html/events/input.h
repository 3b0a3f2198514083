#pragma once

#include "html/dom/geometry.h"
#include "html/events/event_params.h"

namespace kestrune::html::events {

// Input in platform-neutral form, as the window hosts deliver it.
struct MouseInput {
  unsigned cmd = kMouseMove;  // MouseEvents; kMouseLeave: the pointer left the window
  Point pos;                  // in the view
  unsigned buttons = 0;       // MouseButtons
  unsigned keys = 0;          // KeyboardStates
  // The element under the pointer when the caller knows it (tests); otherwise the layout's
  // hit test decides.
  dom::Element* target = nullptr;
  int wheelDelta = 0;  // kMouseWheel: notches, positive away from the user (scrolls up)
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

}  // namespace kestrune::html::events
