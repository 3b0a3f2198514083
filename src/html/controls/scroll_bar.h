#pragma once

#include "html/controls/control.h"

namespace kestrune::html::controls {

// The parts of a scroll bar drawn in `bar`: an arrow button at each end, the track between them
// and the thumb on the track, as long against the track as the page is against the whole range.
struct ScrollBarParts {
  Rect back, forward, track, thumb;
};
ScrollBarParts ScrollBarLayout(const Rect& bar, bool vertical, int value, int minimum, int maximum, int page);
// The value the thumb stands for when its leading edge is at `thumbStart` on the track.
int ScrollBarValueAt(const ScrollBarParts& parts, bool vertical, int thumbStart, int minimum, int maximum);

// A scroll bar widget (`widget[type=vscrollbar]`, `widget[type=hscrollbar]`): position, range,
// page and step, set and read through methods 7 and 6. A scroll command (from its arrows, its
// track or its thumb) moves the position and sends the scroll event to the bar, from where it
// bubbles to its owner.
class ScrollBar final : public Control {
 public:
  using Control::Control;
  unsigned Type(const Element&) const override { return kCtlScrollbar; }
  unsigned Subscription() const override { return events::kHandleMethodCall | events::kHandleMouse; }
  ControlValue GetValue(const Element&) const override { return ControlValue::Int(value_); }
  bool SetValue(Element&, const ControlValue& value) override;
  bool OnMethod(Element& element, events::MethodParams& method) override;

  void Command(Element& element, unsigned scrollCommand, int position = 0);
  // Arrows step, the track pages, the thumb drags (the bar holds the mouse meanwhile).
  bool OnMouse(Element& element, events::MouseParams& mouse) override;

  int value() const { return value_; }
  int minimum() const { return min_; }
  int maximum() const { return max_; }
  int page() const { return page_; }

 private:
  int Clamp(int value) const;

  bool Vertical(const Element& element) const;

  int value_ = 0, min_ = 0, max_ = 100, page_ = 10, step_ = 1;
  int grab_ = -1;  // while the thumb is dragged: where it was taken, from its leading edge
};

}  // namespace kestrune::html::controls
