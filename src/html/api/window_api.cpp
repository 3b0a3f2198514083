#include <chrono>
#include <map>
#include <memory>
#include <vector>

#include "html/api/registry.h"

namespace kestrune::html {

namespace api_internal {
namespace {

std::map<const dom::Document*, host::Window*>& Windows() {
  static std::map<const dom::Document*, host::Window*> windows;
  return windows;
}

// The interface's windows live until HTMLayoutDestroyWindow.
std::vector<std::unique_ptr<host::Window>>& Owned() {
  static std::vector<std::unique_ptr<host::Window>> owned;
  return owned;
}

}  // namespace

host::Window* WindowOf(const dom::Element* element) {
  if (element == nullptr) return nullptr;
  auto found = Windows().find(element->document());
  return found == Windows().end() ? nullptr : found->second;
}

void Register(host::Window& window) { Windows()[&window.document()] = &window; }
void Unregister(host::Window& window) { Windows().erase(&window.document()); }

void Settle(const dom::Element* element) {
  if (host::Window* window = WindowOf(element)) window->Update();
}

}  // namespace api_internal

HLWINDOW HTMLayoutCreateWindow(host::WindowHost& host) {
  auto& owned = api_internal::Owned();
  owned.push_back(std::make_unique<host::Window>(host));
  api_internal::Register(*owned.back());
  return owned.back().get();
}

void HTMLayoutDestroyWindow(HLWINDOW window) {
  if (window == nullptr) return;
  api_internal::Unregister(*window);
  auto& owned = api_internal::Owned();
  std::erase_if(owned, [window](const std::unique_ptr<host::Window>& w) { return w.get() == window; });
}

DomResult HTMLayoutSetCallback(HLWINDOW window, NotificationCallback callback, void* context) {
  if (window == nullptr) return DomResult::kInvalidWindow;
  window->SetCallback(callback, context);
  return DomResult::kOk;
}

DomResult HTMLayoutLoadHtml(HLWINDOW window, const unsigned char* bytes, std::size_t length) {
  return HTMLayoutLoadHtmlEx(window, bytes, length, nullptr);
}

DomResult HTMLayoutLoadHtmlEx(HLWINDOW window, const unsigned char* bytes, std::size_t length, const char16_t* baseUrl) {
  if (window == nullptr) return DomResult::kInvalidWindow;
  return window->LoadHtml(bytes, length, baseUrl ? std::u16string(baseUrl) : std::u16string())
             ? DomResult::kOk
             : DomResult::kInvalidParameter;
}

DomResult HTMLayoutDataReady(HLWINDOW window, const char16_t* uri, const unsigned char* bytes, std::size_t length) {
  if (window == nullptr) return DomResult::kInvalidWindow;
  if (uri == nullptr) return DomResult::kInvalidParameter;
  return window->DataReady(uri, bytes, length) ? DomResult::kOk : DomResult::kOperationFailed;
}

DomResult HTMLayoutWindowAttachEventHandler(HLWINDOW window, ElementEventProc proc, void* tag, unsigned subscription) {
  if (window == nullptr) return DomResult::kInvalidWindow;
  if (proc == nullptr) return DomResult::kInvalidParameter;
  window->dispatcher().AttachWindowHandler(proc, tag, subscription);
  return DomResult::kOk;
}

DomResult HTMLayoutWindowDetachEventHandler(HLWINDOW window, ElementEventProc proc, void* tag) {
  if (window == nullptr) return DomResult::kInvalidWindow;
  return window->dispatcher().DetachWindowHandler(proc, tag) ? DomResult::kOk : DomResult::kInvalidParameter;
}

bool HTMLayoutMouseInput(HLWINDOW window, const events::MouseInput& input) {
  if (window == nullptr) return false;
  return window->MouseInput(input);
}

bool HTMLayoutKeyInput(HLWINDOW window, const events::KeyInput& input) {
  if (window == nullptr) return false;
  const bool handled = window->input().Key(input);
  window->Update();
  return handled;
}

int HTMLayoutRunPending(HLWINDOW window) {
  if (window == nullptr) return -1;
  const auto next = window->RunPending();
  if (!next) return -1;
  return static_cast<int>(std::chrono::ceil<std::chrono::milliseconds>(*next).count());
}

void HTMLayoutRunOnUiThread(HLWINDOW window, const std::function<void()>& call) {
  if (window) window->uiThread().Send(call);
}

DomResult HTMLayoutSetViewSize(HLWINDOW window, Size size) {
  if (window == nullptr) return DomResult::kInvalidWindow;
  if (size.width < 0 || size.height < 0) return DomResult::kInvalidParameter;
  window->SetViewSize(size);
  return DomResult::kOk;
}

DomResult HTMLayoutPaint(HLWINDOW window, paint::Canvas& canvas, const Rect& area) {
  if (window == nullptr) return DomResult::kInvalidWindow;
  window->Paint(canvas, area);
  return DomResult::kOk;
}

DomResult HTMLayoutGetRootElement(HLWINDOW window, HELEMENT* root) {
  if (window == nullptr) return DomResult::kInvalidWindow;
  if (root == nullptr) return DomResult::kInvalidParameter;
  *root = window->document().root();
  return DomResult::kOk;
}

DomResult HTMLayoutFindElement(HLWINDOW window, Point point, HELEMENT* element) {
  if (window == nullptr) return DomResult::kInvalidWindow;
  if (element == nullptr) return DomResult::kInvalidParameter;
  *element = window->geometry().HitTest(point);
  return *element ? DomResult::kOk : DomResult::kOperationFailed;
}

}  // namespace kestrune::html
