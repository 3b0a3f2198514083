// The engine's own look for what pages do not draw themselves: scroll bars, and check boxes and
// radio buttons without a background image.
#include "html/controls/control.h"
#include "html/controls/scroll_bar.h"
#include "html/dom/states.h"
#include "html/paint/painter.h"

namespace kestrune::html::paint {
namespace {

constexpr Color kTrack = 0xFFF0F0F0;
constexpr Color kThumb = 0xFFC1C1C1;
constexpr Color kArrow = 0xFF606060;
constexpr Color kFrame = 0xFF7A7A7A;
constexpr Color kField = 0xFFFFFFFF;
constexpr Color kMark = 0xFF202020;
constexpr Color kDisabledMark = 0xFFA0A0A0;

Rect Shrunk(const Rect& r, int by) { return {r.left + by, r.top + by, r.right - by, r.bottom - by}; }

// A small triangle pointing along the bar, drawn with lines so that any canvas can draw it.
void Arrow(Canvas& canvas, const Rect& button, bool vertical, bool forward) {
  const int cx = (button.left + button.right) / 2, cy = (button.top + button.bottom) / 2;
  const int size = std::max(1, std::min(button.width(), button.height()) / 4);
  for (int i = 0; i < size; ++i) {
    const int along = (forward ? 1 : -1) * (size / 2 - i);
    if (vertical) canvas.DrawLine({cx - i, cy + along}, {cx + i + 1, cy + along}, 1, kArrow);
    else canvas.DrawLine({cx + along, cy - i}, {cx + along, cy + i + 1}, 1, kArrow);
  }
}

}  // namespace

void PaintScrollBar(Canvas& canvas, const Rect& bar, bool vertical, int value, int minimum, int maximum, int page) {
  if (bar.width() <= 0 || bar.height() <= 0) return;
  const controls::ScrollBarParts parts = controls::ScrollBarLayout(bar, vertical, value, minimum, maximum, page);
  canvas.FillRect(bar, kTrack);
  Arrow(canvas, parts.back, vertical, false);
  Arrow(canvas, parts.forward, vertical, true);
  if (maximum > minimum && parts.thumb.width() > 0 && parts.thumb.height() > 0) {
    canvas.FillRoundRect(Shrunk(parts.thumb, 2), {3, 3, 3, 3}, kThumb);
  }
}

bool PaintToggle(Canvas& canvas, const dom::Element& element, const Rect& content) {
  const controls::Control* control = controls::ControlOf(element);
  if (!control || !element.style() || !element.style()->backgroundImage.empty()) return false;
  const unsigned type = control->Type(element);
  if (type != controls::kCtlCheckbox && type != controls::kCtlRadio) return false;
  if (content.width() <= 2 || content.height() <= 2) return true;
  const bool checked = (element.state() & dom::kStateChecked) != 0;
  const Color mark = (element.state() & dom::kStateDisabled) ? kDisabledMark : kMark;
  const BorderSide side{1, kFrame, css::BorderStyle::kSolid};
  const BorderSide sides[4] = {side, side, side, side};
  if (type == controls::kCtlRadio) {
    const int r = std::min(content.width(), content.height()) / 2;
    canvas.FillRoundRect(content, {r, r, r, r}, kField);
    canvas.DrawBorder(content, sides, {r, r, r, r});
    if (checked) {
      const Rect dot = Shrunk(content, std::max(3, r / 2));
      const int d = std::min(dot.width(), dot.height()) / 2;
      canvas.FillRoundRect(dot, {d, d, d, d}, mark);
    }
    return true;
  }
  canvas.FillRect(content, kField);
  canvas.DrawBorder(content, sides, {});
  if (checked) {
    // A tick: down to the lower third, then up to the top right.
    const int w = content.width(), h = content.height();
    const Point a{content.left + w / 5, content.top + h / 2};
    const Point b{content.left + w * 2 / 5, content.top + h * 3 / 4};
    const Point c{content.left + w * 4 / 5, content.top + h / 4};
    canvas.DrawLine(a, b, 2, mark);
    canvas.DrawLine(b, c, 2, mark);
  }
  return true;
}

}  // namespace kestrune::html::paint
