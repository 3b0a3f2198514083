#pragma once

#include <cstdint>
#include <string_view>

#include "html/css/computed_style.h"
#include "html/dom/geometry.h"
#include "html/layout/image.h"
#include "html/layout/text_measurer.h"

namespace kestrune::html::paint {

using css::Color;
using layout::Font;

// Corner radii, circular, in px.
struct Radii {
  int topLeft = 0, topRight = 0, bottomRight = 0, bottomLeft = 0;
  bool any() const { return topLeft || topRight || bottomRight || bottomLeft; }
};

struct BorderSide {
  int width = 0;
  Color color = css::kBlack;
  css::BorderStyle style = css::BorderStyle::kNone;
};

enum class TextEllipsis : std::uint8_t {
  kNone,  // text that does not fit is cut at the edge
  kEnd,   // "..." at the end
  kPath,  // "..." in the middle, keeping the end (a file path's name)
};

// What the engine draws with; the window's platform supplies it (cairo and Pango on Linux, GDI
// on Windows) and tests record it. Small on purpose: every call maps onto one GDI call or two.
// Text is measured through the same object, so layout and painting agree.
class Canvas : public layout::TextMeasurer {
 public:
  virtual void FillRect(const Rect& rect, Color color) = 0;
  virtual void FillRoundRect(const Rect& rect, const Radii& radii, Color color) = 0;
  // A border drawn inside `box`, side by side as given (top, right, bottom, left).
  virtual void DrawBorder(const Rect& box, const BorderSide (&sides)[4], const Radii& radii) = 0;
  // Text on one line, its top-left at `at`. With `maxWidth` >= 0 it is cut there, or shortened
  // with an ellipsis.
  virtual void DrawText(const Font& font, std::u16string_view text, Point at, Color color, int maxWidth,
                        TextEllipsis ellipsis) = 0;
  // The image scaled into `dest`.
  virtual void DrawImage(const layout::Image& image, const Rect& dest) = 0;
  virtual void DrawLine(Point from, Point to, float width, Color color) = 0;
  // Clips what follows to the rectangle (and to the clips already pushed) until PopClip.
  virtual void PushClip(const Rect& rect) = 0;
  virtual void PopClip() = 0;

  // The colour text is drawn in unless told otherwise, as a device context keeps one: the
  // engine sets the element's colour before a draw handler runs.
  void SetTextColor(Color color) { textColor_ = color; }
  Color TextColor() const { return textColor_; }

 private:
  Color textColor_ = css::kBlack;
};

}  // namespace kestrune::html::paint
