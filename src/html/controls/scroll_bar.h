#pragma once

#include "html/controls/control.h"

namespace kestrune::html::controls {

// A scroll bar widget (`widget[type=vscrollbar]`, `widget[type=hscrollbar]`): position, range,
// page and step, set and read through methods 7 and 6. A scroll command (from its arrows, its
// track or its slider, which the layout engine turns pointer input into) moves the position and
// sends the scroll event to the bar, from where it bubbles to its owner.
class ScrollBar final : public Control {
 public:
  using Control::Control;
  unsigned Type(const Element&) const override { return kCtlScrollbar; }
  unsigned Subscription() const override { return events::kHandleMethodCall; }
  ControlValue GetValue(const Element&) const override { return ControlValue::Int(value_); }
  bool SetValue(Element&, const ControlValue& value) override;
  bool OnMethod(Element& element, events::MethodParams& method) override;

  void Command(Element& element, unsigned scrollCommand, int position = 0);

  int value() const { return value_; }
  int minimum() const { return min_; }
  int maximum() const { return max_; }
  int page() const { return page_; }

 private:
  int Clamp(int value) const;

  int value_ = 0, min_ = 0, max_ = 100, page_ = 10, step_ = 1;
};

}  // namespace kestrune::html::controls
