#include "html/api/registry.h"

namespace kestrune::html {

using api_internal::WindowOf;

DomResult HTMLayoutAttachEventHandlerEx(HELEMENT he, ElementEventProc proc, void* tag, unsigned subscription) {
  if (he == nullptr) return DomResult::kInvalidHandle;
  if (proc == nullptr) return DomResult::kInvalidParameter;
  host::Window* window = WindowOf(he);
  if (window == nullptr) return DomResult::kPassiveHandle;
  window->dispatcher().AttachHandler(*he, {proc, tag, subscription, {}});
  return DomResult::kOk;
}

DomResult HTMLayoutDetachEventHandler(HELEMENT he, ElementEventProc proc, void* tag) {
  if (he == nullptr) return DomResult::kInvalidHandle;
  host::Window* window = WindowOf(he);
  if (window == nullptr) return DomResult::kPassiveHandle;
  return window->dispatcher().DetachHandler(*he, proc, tag) ? DomResult::kOk : DomResult::kInvalidParameter;
}

DomResult HTMLayoutSendEvent(HELEMENT he, unsigned code, HELEMENT source, std::uintptr_t reason, bool* handled) {
  if (he == nullptr) return DomResult::kInvalidHandle;
  host::Window* window = WindowOf(he);
  if (window == nullptr) return DomResult::kPassiveHandle;
  const bool taken = window->dispatcher().SendEvent(he, code, source, reason);
  if (handled) *handled = taken;
  window->Update();
  return DomResult::kOk;
}

DomResult HTMLayoutPostEvent(HELEMENT he, unsigned code, HELEMENT source, std::uintptr_t reason) {
  if (he == nullptr) return DomResult::kInvalidHandle;
  host::Window* window = WindowOf(he);
  if (window == nullptr) return DomResult::kPassiveHandle;
  window->dispatcher().PostEvent(he, code, source, reason);
  return DomResult::kOk;
}

DomResult HTMLayoutCallBehaviorMethod(HELEMENT he, events::MethodParams* params) {
  if (he == nullptr) return DomResult::kInvalidHandle;
  if (params == nullptr) return DomResult::kInvalidParameter;
  host::Window* window = WindowOf(he);
  if (window == nullptr) return DomResult::kPassiveHandle;
  const bool handled = window->dispatcher().DeliverToElement(*he, events::kHandleMethodCall, params);
  window->Update();
  return handled ? DomResult::kOk : DomResult::kOkNotHandled;
}

DomResult HTMLayoutSetTimer(HELEMENT he, unsigned milliseconds) { return HTMLayoutSetTimerEx(he, milliseconds, 0); }

DomResult HTMLayoutSetTimerEx(HELEMENT he, unsigned milliseconds, std::uintptr_t timerId) {
  if (he == nullptr) return DomResult::kInvalidHandle;
  host::Window* window = WindowOf(he);
  if (window == nullptr) return DomResult::kPassiveHandle;
  window->dispatcher().SetTimer(*he, milliseconds, timerId);
  return DomResult::kOk;
}

DomResult HTMLayoutSetCapture(HELEMENT he) {
  if (he == nullptr) return DomResult::kInvalidHandle;
  host::Window* window = WindowOf(he);
  if (window == nullptr) return DomResult::kPassiveHandle;
  window->SetCapture(he);
  return DomResult::kOk;
}

DomResult HTMLayoutReleaseCapture(HELEMENT he) {
  if (he == nullptr) return DomResult::kInvalidHandle;
  host::Window* window = WindowOf(he);
  if (window == nullptr) return DomResult::kPassiveHandle;
  if (window->input().capture() == he) window->SetCapture(nullptr);
  return DomResult::kOk;
}

}  // namespace kestrune::html
