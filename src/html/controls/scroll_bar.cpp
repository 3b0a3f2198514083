#include "html/controls/scroll_bar.h"

#include <algorithm>

#include "base/text.h"
#include "html/controls/kinds.h"

namespace kestrune::html::controls {

using namespace events;

int ScrollBar::Clamp(int value) const { return std::max(min_, std::min(value, std::max(min_, max_))); }

bool ScrollBar::SetValue(Element&, const ControlValue& value) {
  if (value.kind != ControlValue::Kind::kInt) return false;
  value_ = Clamp(value.integer);
  return true;
}

bool ScrollBar::OnMethod(Element& element, MethodParams& method) {
  if (method.methodId == kScrollBarSetValue) {
    const auto& params = static_cast<const ScrollBarValueParams&>(method);
    min_ = params.minValue;
    max_ = std::max(params.minValue, params.maxValue);
    page_ = std::max(0, params.pageValue);
    step_ = std::max(1, params.stepValue);
    value_ = Clamp(params.value);
    element.MarkPaintDirty();
    return true;
  }
  if (method.methodId == kScrollBarGetValue) {
    auto& params = static_cast<ScrollBarValueParams&>(method);
    params.value = value_;
    params.minValue = min_;
    params.maxValue = max_;
    params.pageValue = page_;
    params.stepValue = step_;
    return true;
  }
  return false;
}

void ScrollBar::Command(Element& element, unsigned scrollCommand, int position) {
  int next = value_;
  switch (scrollCommand) {
    case kScrollHome: next = min_; break;
    case kScrollEnd: next = max_; break;
    case kScrollStepPlus: next = value_ + step_; break;
    case kScrollStepMinus: next = value_ - step_; break;
    case kScrollPagePlus: next = value_ + page_; break;
    case kScrollPageMinus: next = value_ - page_; break;
    case kScrollPos: next = position; break;
    default: break;
  }
  value_ = Clamp(next);
  element.MarkPaintDirty();
  const std::u16string* type = element.Attr(dom::kAtomType);
  const bool vertical = !(type && EqualsIgnoringAsciiCase(*type, u"hscrollbar"));
  // The owner learns the command and where the position went.
  ScrollParams params{scrollCommand, &element, value_, vertical};
  host().dispatcher().Route(&element, kHandleScroll, &params, params.cmd);
}

std::unique_ptr<Control> MakeScrollBar(ControlHost& host) { return std::make_unique<ScrollBar>(host); }

}  // namespace kestrune::html::controls
