#include "html/api/registry.h"

namespace kestrune::html {

using api_internal::WindowOf;

// Each of these asks the window's layout; an element that is not shown has no box to report,
// scroll or show: kOperationFailed.

DomResult HTMLayoutGetElementLocation(HELEMENT he, Rect* location, unsigned areas) {
  if (he == nullptr) return DomResult::kInvalidHandle;
  if (location == nullptr) return DomResult::kInvalidParameter;
  host::Window* window = WindowOf(he);
  if (window == nullptr) return DomResult::kPassiveHandle;
  const auto box = window->geometry().Location(*he, areas);
  if (!box) return DomResult::kOperationFailed;
  *location = *box;
  return DomResult::kOk;
}

DomResult HTMLayoutGetScrollInfo(HELEMENT he, Point* position, Rect* view, Size* content) {
  if (he == nullptr) return DomResult::kInvalidHandle;
  host::Window* window = WindowOf(he);
  if (window == nullptr) return DomResult::kPassiveHandle;
  const auto info = window->geometry().GetScrollInfo(*he);
  if (!info) return DomResult::kOperationFailed;
  if (position) *position = info->position;
  if (view) *view = info->view;
  if (content) *content = info->content;
  return DomResult::kOk;
}

DomResult HTMLayoutSetScrollPos(HELEMENT he, Point position, bool smooth) {
  if (he == nullptr) return DomResult::kInvalidHandle;
  host::Window* window = WindowOf(he);
  if (window == nullptr) return DomResult::kPassiveHandle;
  return window->geometry().SetScrollPos(*he, position, smooth) ? DomResult::kOk : DomResult::kOperationFailed;
}

DomResult HTMLayoutScrollToView(HELEMENT he, unsigned flags) {
  if (he == nullptr) return DomResult::kInvalidHandle;
  host::Window* window = WindowOf(he);
  if (window == nullptr) return DomResult::kPassiveHandle;
  return window->geometry().ScrollToView(*he, (flags & kScrollToTop) != 0, (flags & kScrollSmooth) != 0)
             ? DomResult::kOk
             : DomResult::kOperationFailed;
}

// Showing a popup is the document's business (its states, the popup list, closing on a menu
// click); where it appears is the layout engine's.
DomResult HTMLayoutShowPopup(HELEMENT popup, HELEMENT anchor, unsigned placement) {
  if (popup == nullptr) return DomResult::kInvalidHandle;
  host::Window* window = WindowOf(popup);
  if (window == nullptr) return DomResult::kPassiveHandle;
  return window->ShowPopup(*popup, anchor, {}, placement) ? DomResult::kOk : DomResult::kInvalidParameter;
}

DomResult HTMLayoutShowPopupAt(HELEMENT popup, Point at, unsigned mode) {
  if (popup == nullptr) return DomResult::kInvalidHandle;
  host::Window* window = WindowOf(popup);
  if (window == nullptr) return DomResult::kPassiveHandle;
  return window->ShowPopup(*popup, nullptr, at, mode) ? DomResult::kOk : DomResult::kInvalidParameter;
}

DomResult HTMLayoutHidePopup(HELEMENT popup) {
  if (popup == nullptr) return DomResult::kInvalidHandle;
  host::Window* window = WindowOf(popup);
  if (window == nullptr) return DomResult::kPassiveHandle;
  return window->HidePopup(*popup) ? DomResult::kOk : DomResult::kOkNotHandled;
}

}  // namespace kestrune::html
