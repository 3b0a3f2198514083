#include "html/events/dispatcher.h"

#include <algorithm>

namespace kestrune::html::events {

// Counts nested deliveries; posted events run when the outermost one ends.
struct EventDispatcher::Depth {
  explicit Depth(EventDispatcher& dispatcher) : d(dispatcher) { ++d.depth_; }
  ~Depth() {
    if (--d.depth_ == 0) d.Settle();
  }
  EventDispatcher& d;
};

EventDispatcher::EventDispatcher(dom::Document& document) : document_(document) {}

void EventDispatcher::AttachWindowHandler(dom::ElementEventProc proc, void* tag, unsigned subscription) {
  windowHandlers_.push_back({proc, tag, subscription});
}

bool EventDispatcher::DetachWindowHandler(dom::ElementEventProc proc, void* tag) {
  auto found = std::find_if(windowHandlers_.begin(), windowHandlers_.end(),
                            [&](const WindowHandler& h) { return h.proc == proc && h.tag == tag; });
  if (found == windowHandlers_.end()) return false;
  windowHandlers_.erase(found);
  return true;
}

void EventDispatcher::AttachHandler(Element& element, dom::AttachedHandler handler) {
  element.rare().handlers.push_back(std::move(handler));
  InitializationParams params{kBehaviorAttach};
  const dom::AttachedHandler added = element.rare().handlers.back();
  dom::Ref<Element> hold(&element);
  Depth depth(*this);
  added.proc(added.tag, &element, kHandleInitialization, &params);
}

bool EventDispatcher::DetachHandler(Element& element, dom::ElementEventProc proc, void* tag) {
  dom::RareData* rare = element.rareIfAny();
  if (!rare) return false;
  auto found = std::find_if(rare->handlers.begin(), rare->handlers.end(),
                            [&](const dom::AttachedHandler& h) { return h.proc == proc && h.tag == tag; });
  if (found == rare->handlers.end()) return false;
  const dom::AttachedHandler gone = *found;
  rare->handlers.erase(found);
  InitializationParams params{kBehaviorDetach};
  Depth depth(*this);
  gone.proc(gone.tag, &element, kHandleInitialization, &params);
  return true;
}

void EventDispatcher::DetachAll(Element& element, bool onlyBehaviors) {
  dom::RareData* rare = element.rareIfAny();
  if (!rare || rare->handlers.empty()) return;
  dom::NodeVector<dom::AttachedHandler> gone;
  if (onlyBehaviors) {
    auto keep = std::stable_partition(rare->handlers.begin(), rare->handlers.end(),
                                      [](const dom::AttachedHandler& h) { return h.behavior.empty(); });
    gone.assign(keep, rare->handlers.end());
    rare->handlers.erase(keep, rare->handlers.end());
  } else {
    gone.swap(rare->handlers);
  }
  dom::Ref<Element> hold(&element);
  Depth depth(*this);
  for (const dom::AttachedHandler& handler : gone) {
    InitializationParams params{kBehaviorDetach};
    handler.proc(handler.tag, &element, kHandleInitialization, &params);
  }
}

bool EventDispatcher::CallHandlers(Element& element, unsigned group, void* params) {
  dom::RareData* rare = element.rareIfAny();
  if (!rare || rare->handlers.empty()) return false;
  // A handler may attach or detach others while it runs: walk a copy.
  const dom::NodeVector<dom::AttachedHandler> handlers = rare->handlers;
  for (const dom::AttachedHandler& handler : handlers) {
    if ((handler.subscription & group) == 0) continue;
    if (handler.proc(handler.tag, &element, group, params)) return true;
  }
  return false;
}

bool EventDispatcher::CallWindowHandlers(unsigned group, void* params) {
  const std::vector<WindowHandler> handlers = windowHandlers_;
  dom::Element* root = document_.root();
  for (const WindowHandler& handler : handlers) {
    if ((handler.subscription & group) == 0) continue;
    if (handler.proc(handler.tag, root, group, params)) return true;
  }
  return false;
}

bool EventDispatcher::Route(Element* target, unsigned group, void* params, unsigned& cmd) {
  if (target == nullptr) return false;
  Depth depth(*this);
  std::vector<dom::Ref<Element>> path;  // target first, root last; held for the whole trip
  for (Element* e = target; e; e = e->parent()) path.emplace_back(e);
  const bool inDocument = path.back().get() == document_.root();
  const unsigned plain = cmd;

  cmd = plain | kSinking;
  if (inDocument && CallWindowHandlers(group, params)) return true;
  for (auto it = path.rbegin(); it != path.rend(); ++it) {
    if (CallHandlers(**it, group, params)) return true;
  }
  cmd = plain;
  for (auto& element : path) {
    if (CallHandlers(*element, group, params)) return true;
  }
  return inDocument && CallWindowHandlers(group, params);
}

bool EventDispatcher::DeliverToElement(Element& element, unsigned group, void* params) {
  Depth depth(*this);
  dom::Ref<Element> hold(&element);
  return CallHandlers(element, group, params);
}

bool EventDispatcher::SendEvent(Element* target, unsigned code, Element* source, std::uintptr_t reason) {
  BehaviorEventParams params{code, target, source, reason};
  return Route(target, kHandleBehaviorEvent, &params, params.cmd);
}

void EventDispatcher::PostEvent(Element* target, unsigned code, Element* source, std::uintptr_t reason) {
  if (target == nullptr) return;
  PostTask([this, held = dom::Ref<Element>(target), code, heldSource = dom::Ref<Element>(source), reason] {
    SendEvent(held.get(), code, heldSource.get(), reason);
  });
}

void EventDispatcher::PostTask(std::function<void()> task) {
  posted_.push_back(std::move(task));
  if (depth_ == 0 && !draining_ && wakeUp_) wakeUp_();
}

EventDispatcher::Hold::Hold(EventDispatcher& dispatcher) : dispatcher_(dispatcher), wasDraining_(dispatcher.draining_) {
  dispatcher_.draining_ = true;
}

EventDispatcher::Hold::~Hold() {
  dispatcher_.draining_ = wasDraining_;
  if (!wasDraining_ && !dispatcher_.posted_.empty() && dispatcher_.wakeUp_) dispatcher_.wakeUp_();
}

void EventDispatcher::Settle() {
  if (!draining_) RunPosted();
}

void EventDispatcher::RunPosted() {
  if (draining_) return;
  draining_ = true;
  while (!posted_.empty()) {
    std::function<void()> task = std::move(posted_.front());
    posted_.pop_front();
    task();
  }
  draining_ = false;
}

void EventDispatcher::SetTimer(Element& element, unsigned milliseconds, std::uintptr_t id) {
  timers_.erase(std::remove_if(timers_.begin(), timers_.end(),
                               [&](const Timer& t) { return t.element.get() == &element && t.id == id; }),
                timers_.end());
  if (milliseconds > 0) {
    const Clock::duration period = std::chrono::milliseconds(milliseconds);
    timers_.push_back({dom::Ref<Element>(&element), id, period, Clock::now() + period});
  }
  if (depth_ == 0 && wakeUp_) wakeUp_();
}

void EventDispatcher::RunDueTimers(Clock::time_point now) {
  std::vector<Timer> due;
  for (Timer& timer : timers_) {
    if (timer.due <= now) {
      timer.due = now + timer.period;
      due.push_back(timer);
    }
  }
  for (const Timer& timer : due) {
    TimerParams params{timer.id};
    if (!DeliverToElement(*timer.element, kHandleTimer, &params)) {
      timers_.erase(std::remove_if(timers_.begin(), timers_.end(),
                                   [&](const Timer& t) { return t.element == timer.element && t.id == timer.id; }),
                    timers_.end());
    }
  }
}

std::optional<Clock::time_point> EventDispatcher::NextTimer() const {
  if (timers_.empty()) return std::nullopt;
  return std::min_element(timers_.begin(), timers_.end(), [](const Timer& a, const Timer& b) { return a.due < b.due; })->due;
}

void EventDispatcher::DropTimersOutside(const Element& root) {
  timers_.erase(std::remove_if(timers_.begin(), timers_.end(),
                               [&](const Timer& t) { return t.element.get() != &root && !root.IsAncestorOf(t.element.get()); }),
                timers_.end());
}

}  // namespace kestrune::html::events
