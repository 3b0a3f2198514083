#pragma once

#include <cstdint>

namespace kestrune::html::dom {

// Element state bits, the engine's own values; pages test them with pseudo-classes.
enum ElementState : std::uint32_t {
  kStateLink = 0x1,
  kStateHover = 0x2,
  kStateActive = 0x4,
  kStateFocus = 0x8,
  kStateVisited = 0x10,
  kStateCurrent = 0x20,
  kStateChecked = 0x40,
  kStateDisabled = 0x80,
  kStateReadOnly = 0x100,
  kStateExpanded = 0x200,
  kStateCollapsed = 0x400,
  kStateIncomplete = 0x800,
  kStateAnimating = 0x1000,
  kStateFocusable = 0x2000,
  kStateAnchor = 0x4000,
  kStateSynthetic = 0x8000,
  kStateOwnsPopup = 0x10000,
  kStateTabFocus = 0x20000,
  kStateEmpty = 0x40000,
  kStateBusy = 0x80000,
  kStateDragOver = 0x100000,
  kStateDropTarget = 0x200000,
  kStateMoving = 0x400000,
  kStateCopying = 0x800000,
  kStateDragSource = 0x1000000,
  kStateDropMarker = 0x2000000,
  kStatePressed = 0x4000000,
  kStatePopup = 0x8000000,
  kStateIsLtr = 0x10000000,
  kStateIsRtl = 0x20000000,
};

}  // namespace kestrune::html::dom
