#pragma once

#include <cairo.h>
#include <pango/pango.h>

#include <list>
#include <memory>
#include <string>
#include <unordered_map>
#include <vector>

#include "html/paint/canvas.h"

namespace kestrune::html::canvas_cairo {

using layout::Font;

// Text with Pango on its cairo font map: measures for the layout and shapes for the canvas.
// Shaped lines are kept (by font and text, the most recent few thousand) so that text measured
// for layout is drawn without being shaped again. One lives as long as its window.
class PangoText final : public layout::TextMeasurer {
 public:
  PangoText();
  ~PangoText() override;
  PangoText(const PangoText&) = delete;
  PangoText& operator=(const PangoText&) = delete;

  layout::FontMetrics Metrics(const Font& font) const override;
  int TextWidth(const Font& font, std::u16string_view text) const override;

  // The shaped text (owned here; valid until the next call) and its width in px.
  PangoLayout* Shaped(const Font& font, std::u16string_view text, int* width) const;
  // A one-off layout of the text cut at `maxWidth` with an ellipsis (end, or middle for a path);
  // the caller unrefs it.
  PangoLayout* Ellipsized(const Font& font, std::u16string_view text, int maxWidth, bool middle) const;
  // The baseline of the layout's first line from its top, px.
  static int Baseline(PangoLayout* layout);

  std::size_t cachedLayouts() const { return lru_.size(); }

 private:
  struct FontEntry {
    PangoFontDescription* description;
    layout::FontMetrics metrics;
  };
  struct Key {
    std::size_t font;
    std::u16string text;
    bool operator==(const Key&) const = default;
  };
  struct KeyHash {
    std::size_t operator()(const Key& key) const { return std::hash<std::u16string>{}(key.text) * 31 + key.font; }
  };
  struct Entry {
    Key key;
    PangoLayout* layout;
    int width;
  };

  std::size_t FontIndex(const Font& font) const;

  PangoContext* context_;
  mutable std::vector<std::pair<Font, FontEntry>> fonts_;
  mutable std::unordered_map<Font, std::size_t, layout::FontHash> fontIndex_;
  mutable std::list<Entry> lru_;
  mutable std::unordered_map<Key, std::list<Entry>::iterator, KeyHash> shaped_;
};

// A canvas on a cairo context: a window's, or an image surface of its own for snapshots.
class CairoCanvas final : public paint::Canvas {
 public:
  CairoCanvas(cairo_t* cairo, const PangoText& text);
  // An image of the given size, white to begin with.
  CairoCanvas(Size size, const PangoText& text);
  ~CairoCanvas() override;
  CairoCanvas(const CairoCanvas&) = delete;
  CairoCanvas& operator=(const CairoCanvas&) = delete;

  layout::FontMetrics Metrics(const Font& font) const override { return text_.Metrics(font); }
  int TextWidth(const Font& font, std::u16string_view text) const override { return text_.TextWidth(font, text); }

  void FillRect(const Rect& rect, paint::Color color) override;
  void FillRoundRect(const Rect& rect, const paint::Radii& radii, paint::Color color) override;
  void DrawBorder(const Rect& box, const paint::BorderSide (&sides)[4], const paint::Radii& radii) override;
  void DrawText(const Font& font, std::u16string_view text, Point at, paint::Color color, int maxWidth,
                paint::TextEllipsis ellipsis) override;
  void DrawImage(const layout::Image& image, const Rect& dest) override;
  void DrawLine(Point from, Point to, float width, paint::Color color) override;
  void PushClip(const Rect& rect) override;
  void PopClip() override;

  // The image surface (a canvas made with a size), written as PNG; false on failure.
  bool WritePng(const std::string& path) const;

 private:
  void SetColor(paint::Color color);
  void RoundRectPath(double x, double y, double w, double h, const paint::Radii& radii);
  cairo_surface_t* Decoded(const layout::Image& image);

  cairo_t* cairo_;
  cairo_surface_t* surface_ = nullptr;  // owned when the canvas made its own image
  const PangoText& text_;
  // Pictures decoded during this canvas's paint, by the address of the image (which the view
  // holds for as long).
  std::unordered_map<const layout::Image*, cairo_surface_t*> images_;
};

}  // namespace kestrune::html::canvas_cairo
