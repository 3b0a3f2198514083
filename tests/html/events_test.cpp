#include <chrono>

#include "page_fixture.h"

namespace kestrune::html::test {
namespace {

using events::kHandleAll;
using events::kHandleBehaviorEvent;
using events::kSinking;

constexpr unsigned kProbeEvent = events::kFirstApplicationEventCode + 1;

class EventsTest : public PageTest {
 protected:
  void SetUp() override {
    Load("<body><div id=outer><span id=inner>x</span></div><div id=form><button id=b>B</button></div>"
         "<input id=one><input id=two></body>");
    outer_ = Find("#outer");
    inner_ = Find("#inner");
  }

  void AttachProbe(HELEMENT e, EventLog::Probe& probe, unsigned subscription = kHandleAll) {
    ASSERT_EQ(HTMLayoutAttachEventHandlerEx(e, &EventLog::Proc, &probe, subscription), DomResult::kOk);
  }

  EventLog log_;
  HELEMENT outer_ = nullptr;
  HELEMENT inner_ = nullptr;
};

std::string Entry(const char* name, unsigned group, unsigned cmd) {
  return std::string(name) + ":" + std::to_string(group) + ":" + std::to_string(cmd);
}

TEST_F(EventsTest, SinksFromTheWindowToTheTargetThenBubblesBack) {
  EventLog::Probe& window = log_.Make("window");
  HTMLayoutWindowAttachEventHandler(window_, &EventLog::Proc, &window, kHandleBehaviorEvent);
  AttachProbe(outer_, log_.Make("outer"), kHandleBehaviorEvent);
  AttachProbe(inner_, log_.Make("inner"), kHandleBehaviorEvent);
  log_.entries.clear();
  log_.elements.clear();

  bool handled = true;
  HTMLayoutSendEvent(inner_, kProbeEvent, inner_, 7, &handled);
  EXPECT_FALSE(handled);
  const unsigned g = kHandleBehaviorEvent;
  EXPECT_EQ(log_.entries, (std::vector<std::string>{
                              Entry("window", g, kProbeEvent | kSinking), Entry("outer", g, kProbeEvent | kSinking),
                              Entry("inner", g, kProbeEvent | kSinking), Entry("inner", g, kProbeEvent),
                              Entry("outer", g, kProbeEvent), Entry("window", g, kProbeEvent)}));
  EXPECT_EQ(log_.elements.front(), Root());  // a window handler sees the root as its element
  EXPECT_EQ(log_.elements[1], outer_);
  EXPECT_EQ(log_.behaviorEvents.back().heTarget, inner_);
  EXPECT_EQ(log_.behaviorEvents.back().reason, 7u);
}

TEST_F(EventsTest, AHandledEventGoesNoFurther) {
  EventLog::Probe& outer = log_.Make("outer");
  outer.handleSinking = true;
  AttachProbe(outer_, outer, kHandleBehaviorEvent);
  AttachProbe(inner_, log_.Make("inner"), kHandleBehaviorEvent);
  log_.entries.clear();
  bool handled = false;
  HTMLayoutSendEvent(inner_, kProbeEvent, inner_, 0, &handled);
  EXPECT_TRUE(handled);
  EXPECT_EQ(log_.entries, (std::vector<std::string>{Entry("outer", kHandleBehaviorEvent, kProbeEvent | kSinking)}));

  outer.handleSinking = false;
  EventLog::Probe& innerStops = log_.Make("inner2");
  innerStops.handleBubbling = true;
  AttachProbe(inner_, innerStops, kHandleBehaviorEvent);
  log_.entries.clear();
  HTMLayoutSendEvent(inner_, kProbeEvent, inner_, 0, &handled);
  EXPECT_EQ(log_.entries.back(), Entry("inner2", kHandleBehaviorEvent, kProbeEvent));  // outer never bubbles
}

// A handler that, while an event runs, posts one event and sends another.
struct PostThenSend {
  HELEMENT other;
  std::vector<unsigned>* seen;
  static bool Proc(void* tag, HELEMENT, unsigned group, void* params) {
    auto& self = *static_cast<PostThenSend*>(tag);
    if (group != kHandleBehaviorEvent) return false;
    const auto& event = *static_cast<events::BehaviorEventParams*>(params);
    if (event.cmd & kSinking) return false;
    self.seen->push_back(event.cmd);
    if (event.cmd == kProbeEvent) {
      HTMLayoutPostEvent(self.other, kProbeEvent + 1, nullptr, 0);
      HTMLayoutSendEvent(self.other, kProbeEvent + 2, nullptr, 0, nullptr);
      self.seen->push_back(0);  // the sent event has run before this point
    }
    return true;
  }
};

TEST_F(EventsTest, PostedEventsRunAfterTheCurrentOneAndSentOnesAtOnce) {
  std::vector<unsigned> seen;
  PostThenSend probe{inner_, &seen};
  HTMLayoutAttachEventHandlerEx(inner_, &PostThenSend::Proc, &probe, kHandleBehaviorEvent);
  HTMLayoutSendEvent(inner_, kProbeEvent, nullptr, 0, nullptr);
  EXPECT_EQ(seen, (std::vector<unsigned>{kProbeEvent, kProbeEvent + 2, 0, kProbeEvent + 1}));

  // Posted from outside any event: it waits for the host's wake-up.
  seen.clear();
  HTMLayoutPostEvent(inner_, kProbeEvent + 1, nullptr, 0);
  EXPECT_TRUE(seen.empty());
  EXPECT_TRUE(host_.Pump(*window_));
  EXPECT_EQ(seen, (std::vector<unsigned>{kProbeEvent + 1}));
}

// Counts its ticks and stops the timer after three.
struct Ticker {
  int ticks = 0;
  static bool Proc(void* tag, HELEMENT, unsigned group, void*) {
    auto& self = *static_cast<Ticker*>(tag);
    if (group != events::kHandleTimer) return false;
    return ++self.ticks < 3;
  }
};

TEST_F(EventsTest, TimersTickUntilTheirHandlerDeclinesOrTheElementLeaves) {
  Ticker ticker;
  HTMLayoutAttachEventHandlerEx(inner_, &Ticker::Proc, &ticker, events::kHandleTimer);
  EXPECT_EQ(HTMLayoutRunPending(window_), -1);  // no timer yet
  HTMLayoutSetTimer(inner_, 10);
  auto now = events::Clock::now();
  const auto untilDue = window_->RunPending(now);
  EXPECT_EQ(ticker.ticks, 0);  // not due yet
  ASSERT_TRUE(untilDue.has_value());
  EXPECT_LE(*untilDue, std::chrono::milliseconds(10));
  for (int i = 1; i <= 5; ++i) window_->RunPending(now + std::chrono::milliseconds(20 * i));
  EXPECT_EQ(ticker.ticks, 3);

  Ticker other;
  HTMLayoutAttachEventHandlerEx(outer_, &Ticker::Proc, &other, events::kHandleTimer);
  HTMLayoutSetTimer(outer_, 10);
  HTMLayout_UseElement(outer_);
  HTMLayoutDeleteElement(outer_);
  window_->RunPending(now + std::chrono::seconds(5));
  EXPECT_EQ(other.ticks, 0);
  HTMLayout_UnuseElement(outer_);
}

TEST_F(EventsTest, BehaviorsAreAttachedAndDetachedAsTheirNamesComeAndGo) {
  struct Answer {
    EventLog::Probe* probe;
    static std::intptr_t Callback(unsigned, std::uintptr_t, std::intptr_t lParam, void* context) {
      auto* header = reinterpret_cast<host::NotificationHeader*>(lParam);
      if (header->code != host::kNotifyAttachBehavior) return 0;
      auto* attach = reinterpret_cast<host::AttachBehaviorNotification*>(header);
      if (std::string(attach->behaviorName) != "probe") return 0;
      attach->elementProc = &EventLog::Proc;
      attach->elementTag = static_cast<Answer*>(context)->probe;
      attach->elementEvents = kHandleBehaviorEvent;
      return 0;
    }
  } answer{&log_.Make("probe")};
  HTMLayoutSetCallback(window_, &Answer::Callback, &answer);
  Load("<style>.p { behavior: probe }</style><div id=a class=p>x</div><div id=b>y</div>");
  const unsigned init = events::kHandleInitialization;
  EXPECT_EQ(log_.entries, (std::vector<std::string>{Entry("probe", init, events::kBehaviorAttach)}));
  HELEMENT a = Find("#a");
  HELEMENT b = Find("#b");
  HTMLayoutSetAttributeByName(a, "class", nullptr);
  HTMLayoutSetAttributeByName(b, "class", u"p");
  EXPECT_EQ(log_.entries, (std::vector<std::string>{Entry("probe", init, events::kBehaviorAttach),
                                                     Entry("probe", init, events::kBehaviorDetach),
                                                     Entry("probe", init, events::kBehaviorAttach)}));
  EXPECT_EQ(log_.elements.back(), b);
  HTMLayoutDeleteElement(b);
  EXPECT_EQ(log_.entries.back(), Entry("probe", init, events::kBehaviorDetach));
}

TEST_F(EventsTest, FocusMovesWithClicksAndTellsBothSidesAboutTheOther) {
  HELEMENT one = Find("#one");
  HELEMENT two = Find("#two");
  EventLog::Probe& window = log_.Make("window");
  HTMLayoutWindowAttachEventHandler(window_, &EventLog::Proc, &window, events::kHandleFocus);
  Click(one);
  EXPECT_TRUE(State(one) & dom::kStateFocus);
  log_.entries.clear();
  log_.focusTargets.clear();
  Click(two);
  EXPECT_FALSE(State(one) & dom::kStateFocus);
  EXPECT_TRUE(State(two) & dom::kStateFocus);
  const unsigned f = events::kHandleFocus;
  ASSERT_EQ(log_.entries, (std::vector<std::string>{Entry("window", f, events::kFocusLost | kSinking),
                                                     Entry("window", f, events::kFocusLost),
                                                     Entry("window", f, events::kFocusGot | kSinking),
                                                     Entry("window", f, events::kFocusGot)}));
  EXPECT_EQ(log_.focusTargets[0], two);  // lost: the element that gets the focus
  EXPECT_EQ(log_.focusTargets[2], one);  // got: the element that had it
  // Tab moves on in document order.
  Key(events::kKeyDown, events::kVkTab, events::kShiftKeyPressed);
  EXPECT_TRUE(State(one) & dom::kStateFocus);
}

TEST_F(EventsTest, ADisabledSubtreeTakesNoInput) {
  EventLog::Probe& window = log_.Make("window");
  HTMLayoutWindowAttachEventHandler(window_, &EventLog::Proc, &window, kHandleBehaviorEvent);
  HELEMENT form = Find("#form");
  HELEMENT button = Find("#b");
  HTMLayoutSetElementState(form, dom::kStateDisabled, 0, false);
  Click(button);
  EXPECT_TRUE(log_.behaviorEvents.empty());
  bool enabled = true;
  HTMLayoutIsElementEnabled(button, &enabled);
  EXPECT_FALSE(enabled);
  events::MethodParams click{events::kDoClick};
  EXPECT_EQ(HTMLayoutCallBehaviorMethod(button, &click), DomResult::kOkNotHandled);

  HTMLayoutSetElementState(form, 0, dom::kStateDisabled, false);
  Click(button);
  ASSERT_FALSE(log_.behaviorEvents.empty());
  EXPECT_EQ(log_.behaviorEvents.back().cmd, events::kButtonClick);
  EXPECT_EQ(HTMLayoutCallBehaviorMethod(button, &click), DomResult::kOk);
  EXPECT_EQ(HTMLayoutCallBehaviorMethod(outer_, &click), DomResult::kOkNotHandled);  // no control there
}

TEST_F(EventsTest, MouseEnterAndLeaveFollowThePointerAndSetHover) {
  EventLog::Probe& probe = log_.Make("outer");
  AttachProbe(outer_, probe, events::kHandleMouse);
  log_.entries.clear();
  Mouse(events::kMouseMove, inner_);
  EXPECT_TRUE(State(outer_) & dom::kStateHover);
  Mouse(events::kMouseMove, Find("#one"));
  EXPECT_FALSE(State(outer_) & dom::kStateHover);
  const unsigned m = events::kHandleMouse;
  EXPECT_EQ(log_.entries, (std::vector<std::string>{
                              Entry("outer", m, events::kMouseEnter | kSinking), Entry("outer", m, events::kMouseEnter),
                              Entry("outer", m, events::kMouseMove | kSinking), Entry("outer", m, events::kMouseMove),
                              Entry("outer", m, events::kMouseLeave | kSinking), Entry("outer", m, events::kMouseLeave)}));
}

}  // namespace
}  // namespace kestrune::html::test
