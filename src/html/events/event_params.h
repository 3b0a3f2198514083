#pragma once

#include <cstdint>

#include "html/dom/geometry.h"
#include "html/dom/handle.h"

// Event groups, codes and parameter blocks: the engine's own values. Every handler receives
// (tag, element, group, parameter block) through an element procedure (dom::ElementEventProc).
namespace kestrune::html::events {

using dom::Element;

enum EventGroup : unsigned {
  kHandleInitialization = 0x0,
  kHandleMouse = 0x1,
  kHandleKey = 0x2,
  kHandleFocus = 0x4,
  kHandleScroll = 0x8,
  kHandleTimer = 0x10,
  kHandleSize = 0x20,
  kHandleDraw = 0x40,
  kHandleDataArrived = 0x80,
  kHandleBehaviorEvent = 0x100,
  kHandleMethodCall = 0x200,
  kHandleAll = 0x3FF,
};

// Or'ed into a routed event's command while it travels from the root down to its target.
inline constexpr unsigned kSinking = 0x8000;

enum MouseButtons : unsigned { kMainMouseButton = 1, kPropMouseButton = 2, kMiddleMouseButton = 4 };
enum KeyboardStates : unsigned { kControlKeyPressed = 0x1, kShiftKeyPressed = 0x2, kAltKeyPressed = 0x4 };

enum InitializationEvents : unsigned { kBehaviorDetach = 0, kBehaviorAttach = 1 };
struct InitializationParams {
  unsigned cmd;
};

enum MouseEvents : unsigned {
  kMouseEnter = 0, kMouseLeave = 1, kMouseMove = 2, kMouseUp = 3, kMouseDown = 4, kMouseDClick = 5,
  kMouseWheel = 6, kMouseTick = 7, kMouseIdle = 8,
};

enum CursorType : unsigned {
  kCursorArrow = 0, kCursorIBeam = 1, kCursorWait = 2, kCursorCross = 3, kCursorUpArrow = 4,
  kCursorSizeNwse = 5, kCursorSizeNesw = 6, kCursorSizeWe = 7, kCursorSizeNs = 8, kCursorSizeAll = 9,
  kCursorNo = 10, kCursorAppStarting = 11, kCursorHelp = 12, kCursorHand = 13,
};

struct MouseParams {
  unsigned cmd;
  Element* target;
  Point pos;           // relative to the target element (the window's position without geometry)
  Point posDocument;   // relative to the document
  unsigned buttonState;
  unsigned altState;
  unsigned cursorType;
  bool isOnIcon;
  Element* dragging;
  unsigned draggingMode;
};

enum KeyEvents : unsigned { kKeyDown = 0, kKeyUp = 1, kKeyChar = 2 };
struct KeyParams {
  unsigned cmd;
  Element* target;
  unsigned keyCode;  // virtual key code, or the character for kKeyChar
  unsigned altState;
};

enum FocusEvents : unsigned { kFocusLost = 0, kFocusGot = 1 };
// For kFocusLost the target is the element that gets the focus; for kFocusGot the element that
// had it (either may be none). The event itself travels to the element losing or getting it.
struct FocusParams {
  unsigned cmd;
  Element* target;
  bool byMouseClick;
  bool cancel;
};

enum ScrollEvents : unsigned {
  kScrollHome = 0, kScrollEnd = 1, kScrollStepPlus = 2, kScrollStepMinus = 3, kScrollPagePlus = 4,
  kScrollPageMinus = 5, kScrollPos = 6, kScrollSliderReleased = 7,
};
struct ScrollParams {
  unsigned cmd;
  Element* target;
  int pos;
  bool vertical;
};

struct TimerParams {
  std::uintptr_t timerId;  // 0 for the element's plain timer
};

enum DrawEvents : unsigned { kDrawBackground = 0, kDrawContent = 1, kDrawForeground = 2 };
struct DrawParams {
  unsigned cmd;
  void* canvas;  // the painter's canvas
  Rect area;
  unsigned reserved;
};

enum BehaviorEvents : unsigned {
  kButtonClick = 0, kButtonPress = 1, kButtonStateChanged = 2, kEditValueChanging = 3,
  kEditValueChanged = 4, kSelectSelectionChanged = 5, kSelectStateChanged = 6, kPopupRequest = 7,
  kPopupReady = 8, kPopupDismissed = 9, kMenuItemActive = 0xA, kMenuItemClick = 0xB,
  kContextMenuRequest = 0x10, kVisualStatusChanged = 0x11, kDisabledStatusChanged = 0x12,
  kPopupDismissing = 0x13, kHyperlinkClick = 0x80, kTableHeaderClick = 0x81, kTableRowClick = 0x82,
  kTableRowDblClick = 0x83, kElementCollapsed = 0x90, kElementExpanded = 0x91, kActivateChild = 0x92,
  kInitDataView = 0x93, kRowsDataRequest = 0x94, kUiStateChanged = 0x95, kFormSubmit = 0x96,
  kFormReset = 0x97, kDocumentComplete = 0x98, kFirstApplicationEventCode = 0x100,
};
enum EventReason : unsigned { kByMouseClick = 0, kByKeyClick = 1, kSynthesized = 2 };

// heTarget is where the event goes; he is its source. A menu item click goes to the item.
struct BehaviorEventParams {
  unsigned cmd;
  Element* heTarget;
  Element* he;
  std::uintptr_t reason;
};

enum BehaviorMethods : unsigned {
  kDoClick = 0, kGetTextValue = 1, kSetTextValue = 2, kTextEditGetSelection = 3,
  kTextEditSetSelection = 4, kTextEditReplaceSelection = 5, kScrollBarGetValue = 6,
  kScrollBarSetValue = 7, kFirstApplicationMethodId = 0x100,
};
struct MethodParams {
  unsigned methodId;
};
struct TextValueParams : MethodParams {
  const char16_t* text;  // set: the new text; get: filled by the control, valid until the next call
  unsigned length;
};
struct TextSelectionParams : MethodParams {
  unsigned selectionStart;
  unsigned selectionEnd;
};
struct ScrollBarValueParams : MethodParams {
  int value;
  int minValue;
  int maxValue;
  int pageValue;
  int stepValue;
};

enum DataType : unsigned { kDataHtml = 0, kDataImage = 1, kDataStyle = 2, kDataCursor = 3, kDataScript = 4, kDataRaw = 5 };
struct DataArrivedParams {
  Element* initiator;
  const unsigned char* data;
  unsigned dataSize;
  unsigned dataType;
  unsigned status;  // 0 when the data came; otherwise the HTTP status or a failure code
  const char16_t* uri;
};

}  // namespace kestrune::html::events
