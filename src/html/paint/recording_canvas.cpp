#include "html/paint/recording_canvas.h"

#include <algorithm>
#include <cmath>

namespace kestrune::html::paint {
namespace {

Rect Intersect(const Rect& a, const Rect& b) {
  Rect r{std::max(a.left, b.left), std::max(a.top, b.top), std::min(a.right, b.right), std::min(a.bottom, b.bottom)};
  r.right = std::max(r.left, r.right);
  r.bottom = std::max(r.top, r.bottom);
  return r;
}

constexpr std::u16string_view kDots = u"...";

RecordingCanvas::Op MakeOp(RecordingCanvas::Op::Kind kind, const Rect& rect, Color color) {
  RecordingCanvas::Op op;
  op.kind = kind;
  op.rect = rect;
  op.color = color;
  return op;
}

}  // namespace

layout::FontMetrics FixedMetrics::Metrics(const Font& font) const {
  const int ascent = static_cast<int>(std::lround(font.size * 0.8f));
  const int descent = static_cast<int>(std::lround(font.size * 0.2f));
  return {ascent, descent, ascent + descent};
}

int FixedMetrics::TextWidth(const Font& font, std::u16string_view text) const {
  return static_cast<int>(std::lround(static_cast<double>(text.size()) * font.size / 2));
}

bool RecordingCanvas::Op::visible() const {
  const Rect r = Intersect(kind == Kind::kLine ? Rect{std::min(from.x, to.x), std::min(from.y, to.y),
                                                      std::max(from.x, to.x) + 1, std::max(from.y, to.y) + 1}
                                               : rect,
                           clip);
  return r.width() > 0 && r.height() > 0;
}

void RecordingCanvas::Add(Op op) {
  op.clip = clips_.back();
  ops_.push_back(std::move(op));
}

void RecordingCanvas::FillRect(const Rect& rect, Color color) { Add(MakeOp(Op::Kind::kFillRect, rect, color)); }

void RecordingCanvas::FillRoundRect(const Rect& rect, const Radii&, Color color) {
  Add(MakeOp(Op::Kind::kFillRoundRect, rect, color));
}

void RecordingCanvas::DrawBorder(const Rect& box, const BorderSide (&sides)[4], const Radii&) {
  Add(MakeOp(Op::Kind::kBorder, box, sides[0].color));
}

void RecordingCanvas::DrawText(const Font& font, std::u16string_view text, Point at, Color color, int maxWidth,
                               TextEllipsis ellipsis) {
  std::u16string shown(text);
  if (maxWidth >= 0 && TextWidth(font, shown) > maxWidth) {
    if (ellipsis == TextEllipsis::kNone) {
      while (!shown.empty() && TextWidth(font, shown) > maxWidth) shown.pop_back();
    } else {
      // The longest part of the text that fits with the dots (at the end, or in the middle).
      const std::size_t keep = text.size();
      std::size_t n = keep;
      auto make = [&](std::size_t count) {
        if (ellipsis == TextEllipsis::kEnd) return std::u16string(text.substr(0, count)) + std::u16string(kDots);
        const std::size_t tail = (count + 1) / 2;
        return std::u16string(text.substr(0, count - tail)) + std::u16string(kDots) + std::u16string(text.substr(text.size() - tail));
      };
      while (n > 0 && TextWidth(font, make(n)) > maxWidth) --n;
      shown = n > 0 || TextWidth(font, kDots) <= maxWidth ? make(n) : std::u16string();
    }
  }
  const layout::FontMetrics m = Metrics(font);
  Op op = MakeOp(Op::Kind::kText, {at.x, at.y, at.x + TextWidth(font, shown), at.y + m.ascent + m.descent}, color);
  op.text = std::move(shown);
  op.font = font;
  Add(std::move(op));
}

void RecordingCanvas::DrawImage(const layout::Image&, const Rect& dest) { Add(MakeOp(Op::Kind::kImage, dest, 0)); }

void RecordingCanvas::DrawLine(Point from, Point to, float width, Color color) {
  Op op = MakeOp(Op::Kind::kLine, {}, color);
  op.from = from;
  op.to = to;
  op.width = width;
  Add(std::move(op));
}

void RecordingCanvas::PushClip(const Rect& rect) { clips_.push_back(Intersect(clips_.back(), rect)); }

void RecordingCanvas::PopClip() {
  if (clips_.size() > 1) clips_.pop_back();
}

std::vector<const RecordingCanvas::Op*> RecordingCanvas::Texts() const {
  std::vector<const Op*> texts;
  for (const Op& op : ops_) {
    if (op.kind == Op::Kind::kText && op.visible()) texts.push_back(&op);
  }
  return texts;
}

const RecordingCanvas::Op* RecordingCanvas::FindText(std::u16string_view text) const {
  for (const Op* op : Texts()) {
    if (op->text == text) return op;
  }
  return nullptr;
}

}  // namespace kestrune::html::paint
