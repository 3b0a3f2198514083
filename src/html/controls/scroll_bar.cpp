#include "html/controls/scroll_bar.h"

#include <algorithm>

#include "base/text.h"
#include "html/controls/kinds.h"

namespace kestrune::html::controls {

using namespace events;

namespace {

// Arrow buttons are square; a thumb never gets shorter than this.
constexpr int kMinThumb = 12;

}  // namespace

ScrollBarParts ScrollBarLayout(const Rect& bar, bool vertical, int value, int minimum, int maximum, int page) {
  ScrollBarParts parts;
  const int length = vertical ? bar.height() : bar.width();
  const int thickness = vertical ? bar.width() : bar.height();
  const int arrow = std::min(thickness, length / 2);
  const int trackLength = std::max(0, length - 2 * arrow);
  const int range = std::max(0, maximum - minimum);
  int thumb = range + page > 0 ? static_cast<int>(static_cast<long long>(trackLength) * page / (range + page)) : trackLength;
  thumb = std::min(trackLength, std::max(thumb, std::min(kMinThumb, trackLength)));
  const int travel = trackLength - thumb;
  const int offset = range > 0 ? static_cast<int>(static_cast<long long>(travel) * (std::clamp(value, minimum, maximum) - minimum) / range) : 0;
  auto along = [&](int from, int to) {
    return vertical ? Rect{bar.left, bar.top + from, bar.right, bar.top + to} : Rect{bar.left + from, bar.top, bar.left + to, bar.bottom};
  };
  parts.back = along(0, arrow);
  parts.forward = along(length - arrow, length);
  parts.track = along(arrow, arrow + trackLength);
  parts.thumb = along(arrow + offset, arrow + offset + thumb);
  return parts;
}

int ScrollBarValueAt(const ScrollBarParts& parts, bool vertical, int thumbStart, int minimum, int maximum) {
  const int trackStart = vertical ? parts.track.top : parts.track.left;
  const int travel = (vertical ? parts.track.height() - parts.thumb.height() : parts.track.width() - parts.thumb.width());
  if (travel <= 0) return minimum;
  const int offset = std::clamp(thumbStart - trackStart, 0, travel);
  return minimum + static_cast<int>(static_cast<long long>(maximum - minimum) * offset / travel);
}

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
  // The owner learns the command and where the position went.
  ScrollParams params{scrollCommand, &element, value_, Vertical(element)};
  host().dispatcher().Route(&element, kHandleScroll, &params, params.cmd);
}

bool ScrollBar::Vertical(const Element& element) const {
  const std::u16string* type = element.Attr(dom::kAtomType);
  return !(type && EqualsIgnoringAsciiCase(*type, u"hscrollbar"));
}

bool ScrollBar::OnMouse(Element& element, MouseParams& mouse) {
  const auto box = host().geometry().Location(element, kSelfRelative | kBorderBox);
  if (!box) return false;
  const bool vertical = Vertical(element);
  const ScrollBarParts parts = ScrollBarLayout(*box, vertical, value_, min_, max_, page_);
  const int along = vertical ? mouse.pos.y : mouse.pos.x;
  if (mouse.cmd == kMouseDown && (mouse.buttonState & kMainMouseButton) && !IsDisabled(element)) {
    if (parts.back.Contains(mouse.pos)) {
      Command(element, kScrollStepMinus);
    } else if (parts.forward.Contains(mouse.pos)) {
      Command(element, kScrollStepPlus);
    } else if (parts.thumb.Contains(mouse.pos)) {
      grab_ = along - (vertical ? parts.thumb.top : parts.thumb.left);
      host().input().SetCapture(&element);
    } else if (parts.track.Contains(mouse.pos)) {
      const int thumbStart = vertical ? parts.thumb.top : parts.thumb.left;
      Command(element, along < thumbStart ? kScrollPageMinus : kScrollPagePlus);
    }
    return true;
  }
  if (mouse.cmd == kMouseMove && grab_ >= 0) {
    const int value = ScrollBarValueAt(parts, vertical, along - grab_, min_, max_);
    if (value != value_) Command(element, kScrollPos, value);
    return true;
  }
  if (mouse.cmd == kMouseUp && grab_ >= 0) {
    grab_ = -1;
    if (host().input().capture() == &element) host().input().ReleaseCapture();
    Command(element, kScrollSliderReleased, value_);
    return true;
  }
  return false;
}

std::unique_ptr<Control> MakeScrollBar(ControlHost& host) { return std::make_unique<ScrollBar>(host); }

}  // namespace kestrune::html::controls
