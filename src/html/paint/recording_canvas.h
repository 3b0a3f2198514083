#pragma once

#include <string>
#include <vector>

#include "html/paint/canvas.h"

namespace kestrune::html::paint {

// Text metrics that need no fonts, so that layout tests give the same numbers everywhere:
// every UTF-16 unit is half the font size wide; the ascent is 0.8 and the descent 0.2 of it,
// which together are the normal line height.
class FixedMetrics : public layout::TextMeasurer {
 public:
  layout::FontMetrics Metrics(const Font& font) const override;
  int TextWidth(const Font& font, std::u16string_view text) const override;
};

// A canvas that writes down what is drawn (with the clip in force at the time) instead of
// drawing it, measuring text with FixedMetrics.
class RecordingCanvas final : public Canvas {
 public:
  struct Op {
    enum class Kind { kFillRect, kFillRoundRect, kBorder, kText, kImage, kLine };
    Kind kind = Kind::kFillRect;
    Rect rect;             // where it goes (text: its box from `at`, as wide as what is drawn)
    Color color = 0;
    std::u16string text;   // text as drawn, ellipsis included
    Font font;
    Point from, to;        // lines
    float width = 0;       // lines
    Rect clip;             // the clip in force
    bool visible() const;  // whether any of it lies inside the clip
  };

  explicit RecordingCanvas(Size size) : clips_{Rect{0, 0, size.width, size.height}} {}

  layout::FontMetrics Metrics(const Font& font) const override { return metrics_.Metrics(font); }
  int TextWidth(const Font& font, std::u16string_view text) const override { return metrics_.TextWidth(font, text); }

  void FillRect(const Rect& rect, Color color) override;
  void FillRoundRect(const Rect& rect, const Radii& radii, Color color) override;
  void DrawBorder(const Rect& box, const BorderSide (&sides)[4], const Radii& radii) override;
  void DrawText(const Font& font, std::u16string_view text, Point at, Color color, int maxWidth,
                TextEllipsis ellipsis) override;
  void DrawImage(const layout::Image& image, const Rect& dest) override;
  void DrawLine(Point from, Point to, float width, Color color) override;
  void PushClip(const Rect& rect) override;
  void PopClip() override;

  const std::vector<Op>& ops() const { return ops_; }
  void Clear() { ops_.clear(); }
  // The visible text ops, in drawing order.
  std::vector<const Op*> Texts() const;
  // The first visible text op whose text is `text`, or none.
  const Op* FindText(std::u16string_view text) const;

 private:
  void Add(Op op);

  FixedMetrics metrics_;
  std::vector<Rect> clips_;
  std::vector<Op> ops_;
};

}  // namespace kestrune::html::paint
