#pragma once

#include <cstdint>
#include <string>

#include "html/dom/geometry.h"
#include "html/dom/handle.h"

namespace kestrune::html::host {

class Window;

// The platform side of a window: what the engine asks of the native window (or of a test).
class WindowHost {
 public:
  virtual ~WindowHost() = default;
  // Something must be repainted; no area means the whole window.
  virtual void Invalidate(const Rect* area) = 0;
  // Paint what is invalid now ("redraw at once").
  virtual void UpdateNow() {}
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
