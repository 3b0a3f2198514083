#pragma once

// The engine's public interface: one function per engine operation the program uses, with the
// engine's names and effects. The program (engine/, behaviors/, app/) reaches the engine only
// through this header: elements and windows are opaque handles here.

#include <cstddef>
#include <cstdint>
#include <functional>
#include <optional>
#include <string>

#include "html/controls/control_value.h"
#include "html/dom/geometry.h"
#include "html/dom/states.h"
#include "html/events/event_params.h"
#include "html/events/geometry_source.h"
#include "html/events/input.h"
#include "html/host/window_host.h"

namespace kestrune::html {

namespace paint {
class Canvas;
}

using HELEMENT = dom::Element*;
using HLWINDOW = host::Window*;
using ElementEventProc = dom::ElementEventProc;
using NotificationCallback = host::NotificationCallback;
using ControlValue = controls::ControlValue;

enum class DomResult : int {
  kOk = 0,
  kInvalidWindow = 1,
  kInvalidHandle = 2,
  kPassiveHandle = 3,  // the element is not in a window's document
  kInvalidParameter = 4,
  kOperationFailed = 5,  // also: no geometry yet (nothing is laid out)
  kOkNotHandled = -1,
};

// Answers true to stop the walk.
using ElementCallback = bool (*)(HELEMENT element, void* param);
// Negative, zero or positive, as a < b, a == b, a > b.
using ElementComparator = int (*)(HELEMENT a, HELEMENT b, void* param);

struct RequestParam {
  const char16_t* name;
  const char16_t* value;
};

// Insertion modes of HTMLayoutSetElementHtml.
enum InsertionMode : unsigned {
  kReplaceContent = 0, kInsertAtStart = 1, kAppendAfterLast = 2, kReplaceElement = 3, kInsertBefore = 4,
  kInsertAfter = 5,
};
enum RequestType : unsigned { kGetAsync = 0, kPostAsync = 1 };

// --- Windows ---------------------------------------------------------------------------
HLWINDOW HTMLayoutCreateWindow(host::WindowHost& host);
void HTMLayoutDestroyWindow(HLWINDOW window);
DomResult HTMLayoutSetCallback(HLWINDOW window, NotificationCallback callback, void* context);
// The page's own files are asked for through the callback (code 0xB01) during the call.
DomResult HTMLayoutLoadHtml(HLWINDOW window, const unsigned char* bytes, std::size_t length);
DomResult HTMLayoutLoadHtmlEx(HLWINDOW window, const unsigned char* bytes, std::size_t length, const char16_t* baseUrl);
DomResult HTMLayoutDataReady(HLWINDOW window, const char16_t* uri, const unsigned char* bytes, std::size_t length);
DomResult HTMLayoutWindowAttachEventHandler(HLWINDOW window, ElementEventProc proc, void* tag, unsigned subscription);
DomResult HTMLayoutWindowDetachEventHandler(HLWINDOW window, ElementEventProc proc, void* tag);
// Platform-neutral input, the one entry the window hosts call.
bool HTMLayoutMouseInput(HLWINDOW window, const events::MouseInput& input);
bool HTMLayoutKeyInput(HLWINDOW window, const events::KeyInput& input);
// The host calls this on the UI thread when woken (queued calls, posted events, timers); the
// answer is the number of milliseconds until the next timer is due, -1 when none runs.
int HTMLayoutRunPending(HLWINDOW window);
// From a worker thread: runs the call on the UI thread and waits for it.
void HTMLayoutRunOnUiThread(HLWINDOW window, const std::function<void()>& call);
// The platform window's client size changed.
DomResult HTMLayoutSetViewSize(HLWINDOW window, Size size);
// Paints the area (view coordinates) with the platform's canvas: the host's answer to an
// invalidation.
DomResult HTMLayoutPaint(HLWINDOW window, paint::Canvas& canvas, const Rect& area);

// --- Element handles -----------------------------------------------------------------------
// Each handle the program keeps holds one reference; a held element stays valid after it
// leaves the tree.
DomResult HTMLayout_UseElement(HELEMENT he);
DomResult HTMLayout_UnuseElement(HELEMENT he);

// --- Navigation ------------------------------------------------------------------------------
DomResult HTMLayoutGetRootElement(HLWINDOW window, HELEMENT* root);
DomResult HTMLayoutGetChildrenCount(HELEMENT he, unsigned* count);
DomResult HTMLayoutGetNthChild(HELEMENT he, unsigned n, HELEMENT* child);
DomResult HTMLayoutGetParentElement(HELEMENT he, HELEMENT* parent);
DomResult HTMLayoutGetElementIndex(HELEMENT he, unsigned* index);
DomResult HTMLayoutGetElementType(HELEMENT he, std::string* tag);
DomResult HTMLayoutGetElementHwnd(HELEMENT he, HLWINDOW* window);
// Elements below `he` (depth 0: all levels) whose tag (null or "*": any) and attribute (null:
// any; with a value, exactly that value) match, in document order.
DomResult HTMLayoutVisitElements(HELEMENT he, const char* tagName, const char* attributeName, const char16_t* value,
                                 ElementCallback callback, void* param, unsigned depth);
// Elements below `he` that match the CSS selector list (UTF-8), in document order.
DomResult HTMLayoutSelectElements(HELEMENT he, const char* selectors, ElementCallback callback, void* param);
// The nearest of `he` and its ancestors (up to `depth` levels; 0: all) that matches.
DomResult HTMLayoutSelectParent(HELEMENT he, const char* selectors, unsigned depth, HELEMENT* parent);

// --- Attributes, style, state, content ------------------------------------------------------
DomResult HTMLayoutGetAttributeByName(HELEMENT he, const char* name, std::optional<std::u16string>* value);
// A null value removes the attribute.
DomResult HTMLayoutSetAttributeByName(HELEMENT he, const char* name, const char16_t* value);
DomResult HTMLayoutGetAttributeCount(HELEMENT he, unsigned* count);
DomResult HTMLayoutGetNthAttribute(HELEMENT he, unsigned n, std::string* name, std::u16string* value);
// Styles the program sets win over every style sheet; a null value removes the setting. Reading
// answers the program's value, or else the computed one for the properties behaviors read.
DomResult HTMLayoutGetStyleAttribute(HELEMENT he, const char* name, std::optional<std::u16string>* value);
DomResult HTMLayoutSetStyleAttribute(HELEMENT he, const char* name, const char16_t* value);
DomResult HTMLayoutGetElementState(HELEMENT he, unsigned* state);
// Setting or clearing the focus bit moves the window's focus; with `update` the view is
// repainted before the call returns.
DomResult HTMLayoutSetElementState(HELEMENT he, unsigned bitsToSet, unsigned bitsToClear, bool update);
DomResult HTMLayoutUpdateElement(HELEMENT he, bool renderNow);
DomResult HTMLayoutGetElementInnerText16(HELEMENT he, std::u16string* text);
DomResult HTMLayoutSetElementInnerText16(HELEMENT he, const char16_t* text, std::size_t length);
DomResult HTMLayoutGetElementHtml(HELEMENT he, std::string* utf8, bool outer);
DomResult HTMLayoutSetElementHtml(HELEMENT he, const unsigned char* utf8, std::size_t length, unsigned where);
DomResult HTMLayoutIsElementVisible(HELEMENT he, bool* visible);
DomResult HTMLayoutIsElementEnabled(HELEMENT he, bool* enabled);

// --- Creating, moving, deleting, sorting -----------------------------------------------------
// The new element comes with one reference for the caller.
DomResult HTMLayoutCreateElement(const char* tagName, const char16_t* text, HELEMENT* element);
DomResult HTMLayoutInsertElement(HELEMENT he, HELEMENT parent, unsigned index);
DomResult HTMLayoutDetachElement(HELEMENT he);
DomResult HTMLayoutDeleteElement(HELEMENT he);
// Sorts the element children of `he` in [firstIndex, lastIndex) with the comparator (stable).
DomResult HTMLayoutSortElements(HELEMENT he, unsigned firstIndex, unsigned lastIndex, ElementComparator comparator,
                                void* param);
DomResult HTMLayoutSwapElements(HELEMENT a, HELEMENT b);

// --- Events ---------------------------------------------------------------------------------
DomResult HTMLayoutAttachEventHandlerEx(HELEMENT he, ElementEventProc proc, void* tag, unsigned subscription);
DomResult HTMLayoutDetachEventHandler(HELEMENT he, ElementEventProc proc, void* tag);
DomResult HTMLayoutSendEvent(HELEMENT he, unsigned code, HELEMENT source, std::uintptr_t reason, bool* handled);
DomResult HTMLayoutPostEvent(HELEMENT he, unsigned code, HELEMENT source, std::uintptr_t reason);
// kOk when a handler (or the built-in control) took the call, kOkNotHandled otherwise.
DomResult HTMLayoutCallBehaviorMethod(HELEMENT he, events::MethodParams* params);
// Timer events (group 0x10) every `milliseconds` until 0 is set or the handler answers false.
DomResult HTMLayoutSetTimer(HELEMENT he, unsigned milliseconds);
DomResult HTMLayoutSetTimerEx(HELEMENT he, unsigned milliseconds, std::uintptr_t timerId);
DomResult HTMLayoutSetCapture(HELEMENT he);
DomResult HTMLayoutReleaseCapture(HELEMENT he);

// --- Geometry: answered by the layout engine; kOperationFailed for an element not shown -------
DomResult HTMLayoutGetElementLocation(HELEMENT he, Rect* location, unsigned areas);
DomResult HTMLayoutGetScrollInfo(HELEMENT he, Point* position, Rect* view, Size* content);
DomResult HTMLayoutSetScrollPos(HELEMENT he, Point position, bool smooth);
enum ScrollToViewFlags : unsigned { kScrollToTop = 1, kScrollSmooth = 0x10 };
DomResult HTMLayoutScrollToView(HELEMENT he, unsigned flags);
DomResult HTMLayoutFindElement(HLWINDOW window, Point point, HELEMENT* element);
// Popups: shown above the page, placed by the layout engine (placement 2: below the anchor).
DomResult HTMLayoutShowPopup(HELEMENT popup, HELEMENT anchor, unsigned placement);
DomResult HTMLayoutShowPopupAt(HELEMENT popup, Point at, unsigned mode);
DomResult HTMLayoutHidePopup(HELEMENT popup);

// --- URLs, data, HTTP, controls ------------------------------------------------------------
// Makes the zero-terminated URL in `buffer` absolute against the element's document.
DomResult HTMLayoutCombineURL(HELEMENT he, char16_t* buffer, unsigned bufferSize);
// GET or POST of name/value pairs; the answer comes as a data-arrived event (group 0x80) to he.
DomResult HTMLayoutHttpRequest(HELEMENT he, const char16_t* url, unsigned dataType, unsigned requestType,
                               const RequestParam* params, unsigned paramCount);
// Loads the URL for he: the initiator (or he) gets the data-arrived event; HTML that no handler
// takes becomes he's content.
DomResult HTMLayoutRequestElementData(HELEMENT he, const char16_t* url, unsigned dataType, HELEMENT initiator);
DomResult HTMLayoutControlGetType(HELEMENT he, unsigned* type);
DomResult HTMLayoutControlGetValue(HELEMENT he, ControlValue* value);
DomResult HTMLayoutControlSetValue(HELEMENT he, const ControlValue& value);

}  // namespace kestrune::html
