#pragma once

#include <cstdint>
#include <string>

#include "html/dom/geometry.h"
#include "html/dom/handle.h"
#include "html/layout/text_measurer.h"

namespace kestrune::html::host {

class Window;

// The platform side of a window: what the engine asks of the native window (or of a test).
// The platform paints by calling HTMLayoutPaint with its canvas for the invalid area.
class WindowHost {
 public:
  virtual ~WindowHost() = default;
  // Something must be repainted; no area means the whole window. The engine asks for the
  // smallest area it knows to be affected.
  virtual void Invalidate(const Rect* area) = 0;
  // Paint what is invalid now, before returning ("redraw at once").
  virtual void UpdateNow() {}
  // How text is measured in this window: the measuring side of the canvas it paints with. The
  // default measures with FixedMetrics (no fonts), for windows that are never shown.
  virtual const layout::TextMeasurer& Measurer();
  // The size of the view when the window is made (the program's window: 900 x 623); later
  // sizes come through HTMLayoutSetViewSize.
  virtual Size ClientSize() const { return {900, 623}; }
  // An element holds the mouse: the platform window should get the pointer's input even
  // outside itself until it is released.
  virtual void SetMouseCapture(bool captured) { (void)captured; }
  // Called from any thread: make the UI thread call Window::RunPending soon.
  virtual void RequestWakeUp() = 0;
  virtual void SetCursor(unsigned cursorType) { (void)cursorType; }
  virtual std::u16string ClipboardText() { return {}; }
  virtual void SetClipboardText(const std::u16string& text) { (void)text; }
};

// Notifications to the program's callback, the engine's codes.
enum NotificationCode : unsigned {
  kNotifyCreateControl = 0xB00,
  kNotifyLoadData = 0xB01,
  kNotifyControlCreated = 0xB02,
  kNotifyDataLoaded = 0xB03,
  kNotifyDocumentComplete = 0xB04,
  kNotifyDestroyControl = 0xB06,
  kNotifyAttachBehavior = 0xB07,
};
inline constexpr unsigned kWmNotify = 0x004E;

struct NotificationHeader {
  Window* window;
  std::uintptr_t idFrom;
  unsigned code;
};

// A file the page needs. The program answers with DataReady during the call (or fills
// outData/outDataSize); otherwise the engine loads it itself.
struct LoadDataNotification {
  NotificationHeader header;
  const char16_t* uri;
  const void* outData;
  unsigned outDataSize;
  unsigned dataType;  // events::DataType
  dom::Element* principal;
  dom::Element* initiator;
};

// A behavior an element names; the program fills the three fields to attach a handler.
struct AttachBehaviorNotification {
  NotificationHeader header;
  dom::Element* element;
  const char* behaviorName;
  dom::ElementEventProc elementProc;
  void* elementTag;
  unsigned elementEvents;
};

struct DataLoadedNotification {
  NotificationHeader header;
  const char16_t* uri;
  const void* data;
  unsigned dataSize;
  unsigned dataType;
  unsigned status;
};

// (message, wParam, lParam, context): message is kWmNotify and lParam points at the header.
using NotificationCallback = std::intptr_t (*)(unsigned message, std::uintptr_t wParam, std::intptr_t lParam, void* context);

}  // namespace kestrune::html::host
