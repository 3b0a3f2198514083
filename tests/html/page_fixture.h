#pragma once

#include <gtest/gtest.h>

#include <ostream>
#include <string>
#include <string_view>
#include <vector>

#include "html/api/htmlayout.h"
#include "html/host/headless_host.h"
#include "html/host/window.h"

namespace kestrune::html {

inline void PrintTo(const Rect& r, std::ostream* out) {
  *out << "{" << r.left << ", " << r.top << ", " << r.right << ", " << r.bottom << "}";
}
inline void PrintTo(const Point& p, std::ostream* out) { *out << "(" << p.x << ", " << p.y << ")"; }

}  // namespace kestrune::html

namespace kestrune::html::test {

// A window on the headless host with a page in it, and the input a user would give.
class PageTest : public ::testing::Test {
 protected:
  PageTest() : window_(HTMLayoutCreateWindow(host_)) {}
  // Before the derived fixture's handlers go: the window detaches them as it closes.
  void TearDown() override { HTMLayoutDestroyWindow(window_); }

  void Load(std::string_view utf8) {
    ASSERT_EQ(HTMLayoutLoadHtml(window_, reinterpret_cast<const unsigned char*>(utf8.data()), utf8.size()), DomResult::kOk);
  }

  HELEMENT Root() {
    HELEMENT root = nullptr;
    HTMLayoutGetRootElement(window_, &root);
    return root;
  }

  HELEMENT Find(const char* selector, HELEMENT under = nullptr) {
    HELEMENT found = nullptr;
    HTMLayoutSelectElements(under ? under : Root(), selector, [](HELEMENT e, void* param) {
      *static_cast<HELEMENT*>(param) = e;
      return true;
    }, &found);
    return found;
  }

  void Mouse(unsigned cmd, HELEMENT target, unsigned keys = 0) {
    events::MouseInput input;
    input.cmd = cmd;
    input.buttons = cmd == events::kMouseUp ? 0u : unsigned{events::kMainMouseButton};
    input.keys = keys;
    input.target = target;
    HTMLayoutMouseInput(window_, input);
    Pump();
  }

  void Click(HELEMENT target, unsigned keys = 0) {
    Mouse(events::kMouseDown, target, keys);
    Mouse(events::kMouseUp, target, keys);
  }

  bool Key(unsigned cmd, unsigned code, unsigned keys = 0) {
    const bool handled = HTMLayoutKeyInput(window_, {cmd, code, keys});
    Pump();
    return handled;
  }

  void TypeText(std::u16string_view text) {
    for (char16_t c : text) Key(events::kKeyChar, c);
  }

  void Pump() { host_.Pump(*window_); }

  unsigned State(HELEMENT e) {
    unsigned state = 0;
    HTMLayoutGetElementState(e, &state);
    return state;
  }

  std::u16string Text(HELEMENT e) {
    std::u16string text;
    HTMLayoutGetElementInnerText16(e, &text);
    return text;
  }

  std::u16string Id(HELEMENT e) {
    std::optional<std::u16string> id;
    if (e) HTMLayoutGetAttributeByName(e, "id", &id);
    return id.value_or(u"");
  }

  host::HeadlessHost host_;
  HLWINDOW window_;
};

// A handler that writes down what reaches it, as "name:group:command", and answers as told.
struct EventLog {
  struct Probe {
    EventLog* log;
    std::string name;
    bool handleSinking = false;
    bool handleBubbling = false;
  };

  static bool Proc(void* tag, HELEMENT element, unsigned group, void* params) {
    auto& probe = *static_cast<Probe*>(tag);
    unsigned cmd = 0;
    switch (group) {
      case events::kHandleInitialization: cmd = static_cast<events::InitializationParams*>(params)->cmd; break;
      case events::kHandleMouse: cmd = static_cast<events::MouseParams*>(params)->cmd; break;
      case events::kHandleKey: cmd = static_cast<events::KeyParams*>(params)->cmd; break;
      case events::kHandleFocus: cmd = static_cast<events::FocusParams*>(params)->cmd; break;
      case events::kHandleScroll: cmd = static_cast<events::ScrollParams*>(params)->cmd; break;
      case events::kHandleBehaviorEvent: {
        auto& event = *static_cast<events::BehaviorEventParams*>(params);
        cmd = event.cmd;
        probe.log->behaviorEvents.push_back(event);
        break;
      }
      case events::kHandleTimer: cmd = static_cast<unsigned>(static_cast<events::TimerParams*>(params)->timerId); break;
      default: break;
    }
    probe.log->entries.push_back(probe.name + ":" + std::to_string(group) + ":" + std::to_string(cmd));
    probe.log->elements.push_back(element);
    if (group == events::kHandleFocus) probe.log->focusTargets.push_back(static_cast<events::FocusParams*>(params)->target);
    const bool sinking = (cmd & events::kSinking) != 0;
    return group != events::kHandleInitialization && (sinking ? probe.handleSinking : probe.handleBubbling);
  }

  Probe& Make(std::string name) {
    probes.push_back(std::make_unique<Probe>(Probe{this, std::move(name)}));
    return *probes.back();
  }

  std::vector<std::unique_ptr<Probe>> probes;
  std::vector<std::string> entries;
  std::vector<HELEMENT> elements;
  std::vector<HELEMENT> focusTargets;
  std::vector<events::BehaviorEventParams> behaviorEvents;
};

}  // namespace kestrune::html::test
