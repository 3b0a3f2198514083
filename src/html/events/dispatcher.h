#pragma once

#include <chrono>
#include <cstdint>
#include <deque>
#include <functional>
#include <optional>
#include <vector>

#include "html/dom/document.h"
#include "html/events/event_params.h"

namespace kestrune::html::events {

using Clock = std::chrono::steady_clock;

// Delivers events to element-level handlers (behaviors, built-in controls, handlers attached by
// hand) and window-level ones. Routed events (mouse, key, focus, scroll, behavior events) go
// first down from the window and the root to the target with kSinking set, then up from the
// target to the root and the window; the first handler that answers "handled" ends the trip.
// Posted events run after the event in progress; sent ones at once.
class EventDispatcher {
 public:
  explicit EventDispatcher(dom::Document& document);
  EventDispatcher(const EventDispatcher&) = delete;
  EventDispatcher& operator=(const EventDispatcher&) = delete;

  void AttachWindowHandler(dom::ElementEventProc proc, void* tag, unsigned subscription);
  bool DetachWindowHandler(dom::ElementEventProc proc, void* tag);

  // Handlers of one element; initialization events (attach, detach) reach every handler.
  void AttachHandler(Element& element, dom::AttachedHandler handler);
  bool DetachHandler(Element& element, dom::ElementEventProc proc, void* tag);
  // Sends detach to every handler of the element and removes them (the element leaves the
  // document, or its behaviors change).
  void DetachAll(Element& element, bool onlyBehaviors);

  // `cmd` is the command field of `params`, which the trip marks with kSinking on the way down.
  bool Route(Element* target, unsigned group, void* params, unsigned& cmd);
  // The element's own handlers only (timers, method calls, size, draw, data arrival).
  bool DeliverToElement(Element& element, unsigned group, void* params);

  bool SendEvent(Element* target, unsigned code, Element* source, std::uintptr_t reason);
  void PostEvent(Element* target, unsigned code, Element* source, std::uintptr_t reason);
  void PostTask(std::function<void()> task);
  // Runs what was posted, in order, including what those events post in turn.
  void RunPosted();

  // A wake-up request for the host: something was posted or a timer changed while no event
  // was in progress.
  void SetWakeUp(std::function<void()> wakeUp) { wakeUp_ = std::move(wakeUp); }

  // Timers per element (and id); a handler that answers "not handled" ends its timer.
  void SetTimer(Element& element, unsigned milliseconds, std::uintptr_t id);
  void RunDueTimers(Clock::time_point now);
  std::optional<Clock::time_point> NextTimer() const;
  // Forgets the timers of elements that left the document.
  void DropTimersOutside(const Element& root);

  dom::Document& document() { return document_; }

  // While one lives (the view is being painted), posted events wait: they run at the host's
  // next wake-up, never in the middle of a paint.
  class Hold {
   public:
    explicit Hold(EventDispatcher& dispatcher);
    ~Hold();
    Hold(const Hold&) = delete;
    Hold& operator=(const Hold&) = delete;

   private:
    EventDispatcher& dispatcher_;
    bool wasDraining_;
  };

 private:
  struct WindowHandler {
    dom::ElementEventProc proc;
    void* tag;
    unsigned subscription;
  };
  struct Timer {
    dom::Ref<Element> element;
    std::uintptr_t id;
    Clock::duration period;
    Clock::time_point due;
  };
  struct Depth;

  bool CallHandlers(Element& element, unsigned group, void* params);
  bool CallWindowHandlers(unsigned group, void* params);
  void Settle();

  dom::Document& document_;
  std::vector<WindowHandler> windowHandlers_;
  std::deque<std::function<void()>> posted_;
  std::vector<Timer> timers_;
  std::function<void()> wakeUp_;
  int depth_ = 0;
  bool draining_ = false;
};

}  // namespace kestrune::html::events
