#include "html/canvas_cairo/cairo_canvas.h"

#include <pango/pangocairo.h>

#include <algorithm>
#include <cmath>
#include <cstring>

#include "base/utf.h"

namespace kestrune::html::canvas_cairo {
namespace {

constexpr std::size_t kMaxShaped = 4096;

int Pixels(int pango) { return (pango + PANGO_SCALE - 1) / PANGO_SCALE; }

// Reads PNG bytes for cairo from memory.
struct PngReader {
  const std::vector<unsigned char>* bytes;
  std::size_t at = 0;
  static cairo_status_t Read(void* closure, unsigned char* data, unsigned int length) {
    auto& reader = *static_cast<PngReader*>(closure);
    if (reader.at + length > reader.bytes->size()) return CAIRO_STATUS_READ_ERROR;
    std::memcpy(data, reader.bytes->data() + reader.at, length);
    reader.at += length;
    return CAIRO_STATUS_SUCCESS;
  }
};

}  // namespace

PangoText::PangoText() : context_(pango_font_map_create_context(pango_cairo_font_map_get_default())) {}

PangoText::~PangoText() {
  for (Entry& entry : lru_) g_object_unref(entry.layout);
  for (auto& [font, entry] : fonts_) pango_font_description_free(entry.description);
  g_object_unref(context_);
}

std::size_t PangoText::FontIndex(const Font& font) const {
  auto found = fontIndex_.find(font);
  if (found != fontIndex_.end()) return found->second;
  PangoFontDescription* description = pango_font_description_new();
  const std::string family = EncodeUtf8(font.family);
  pango_font_description_set_family(description, family.empty() ? "sans-serif" : family.c_str());
  pango_font_description_set_absolute_size(description, std::max(1.0, static_cast<double>(font.size)) * PANGO_SCALE);
  pango_font_description_set_weight(description, static_cast<PangoWeight>(std::clamp(font.weight, 100, 1000)));
  pango_font_description_set_style(description, font.italic ? PANGO_STYLE_ITALIC : PANGO_STYLE_NORMAL);
  PangoFontMetrics* m = pango_context_get_metrics(context_, description, nullptr);
  layout::FontMetrics metrics;
  metrics.ascent = Pixels(pango_font_metrics_get_ascent(m));
  metrics.descent = Pixels(pango_font_metrics_get_descent(m));
  metrics.lineHeight = std::max(metrics.ascent + metrics.descent, Pixels(pango_font_metrics_get_height(m)));
  pango_font_metrics_unref(m);
  fonts_.push_back({font, {description, metrics}});
  fontIndex_.emplace(font, fonts_.size() - 1);
  return fonts_.size() - 1;
}

layout::FontMetrics PangoText::Metrics(const Font& font) const { return fonts_[FontIndex(font)].second.metrics; }

PangoLayout* PangoText::Shaped(const Font& font, std::u16string_view text, int* width) const {
  Key key{FontIndex(font), std::u16string(text)};
  auto found = shaped_.find(key);
  if (found != shaped_.end()) {
    lru_.splice(lru_.begin(), lru_, found->second);
    *width = found->second->width;
    return found->second->layout;
  }
  PangoLayout* layout = pango_layout_new(context_);
  pango_layout_set_font_description(layout, fonts_[key.font].second.description);
  pango_layout_set_single_paragraph_mode(layout, TRUE);
  const std::string utf8 = EncodeUtf8(text);
  pango_layout_set_text(layout, utf8.data(), static_cast<int>(utf8.size()));
  PangoRectangle logical;
  pango_layout_get_extents(layout, nullptr, &logical);
  const int w = Pixels(logical.width);
  lru_.push_front({key, layout, w});
  shaped_.emplace(std::move(key), lru_.begin());
  if (lru_.size() > kMaxShaped) {
    shaped_.erase(lru_.back().key);
    g_object_unref(lru_.back().layout);
    lru_.pop_back();
  }
  *width = w;
  return layout;
}

int PangoText::TextWidth(const Font& font, std::u16string_view text) const {
  if (text.empty()) return 0;
  int width = 0;
  Shaped(font, text, &width);
  return width;
}

PangoLayout* PangoText::Ellipsized(const Font& font, std::u16string_view text, int maxWidth, bool middle) const {
  PangoLayout* layout = pango_layout_new(context_);
  pango_layout_set_font_description(layout, fonts_[FontIndex(font)].second.description);
  pango_layout_set_single_paragraph_mode(layout, TRUE);
  const std::string utf8 = EncodeUtf8(text);
  pango_layout_set_text(layout, utf8.data(), static_cast<int>(utf8.size()));
  pango_layout_set_width(layout, std::max(0, maxWidth) * PANGO_SCALE);
  pango_layout_set_ellipsize(layout, middle ? PANGO_ELLIPSIZE_MIDDLE : PANGO_ELLIPSIZE_END);
  return layout;
}

int PangoText::Baseline(PangoLayout* layout) { return pango_layout_get_baseline(layout) / PANGO_SCALE; }

CairoCanvas::CairoCanvas(cairo_t* cairo, const PangoText& text) : cairo_(cairo), text_(text) {}

CairoCanvas::CairoCanvas(Size size, const PangoText& text) : text_(text) {
  surface_ = cairo_image_surface_create(CAIRO_FORMAT_ARGB32, std::max(1, size.width), std::max(1, size.height));
  cairo_ = cairo_create(surface_);
  cairo_set_source_rgb(cairo_, 1, 1, 1);
  cairo_paint(cairo_);
}

CairoCanvas::~CairoCanvas() {
  for (auto& [image, surface] : images_) {
    if (surface) cairo_surface_destroy(surface);
  }
  if (surface_) {
    cairo_destroy(cairo_);
    cairo_surface_destroy(surface_);
  }
}

bool CairoCanvas::WritePng(const std::string& path) const {
  if (!surface_) return false;
  cairo_surface_flush(surface_);
  return cairo_surface_write_to_png(surface_, path.c_str()) == CAIRO_STATUS_SUCCESS;
}

void CairoCanvas::SetColor(paint::Color color) {
  cairo_set_source_rgba(cairo_, ((color >> 16) & 0xFF) / 255.0, ((color >> 8) & 0xFF) / 255.0, (color & 0xFF) / 255.0,
                        ((color >> 24) & 0xFF) / 255.0);
}

void CairoCanvas::FillRect(const Rect& rect, paint::Color color) {
  SetColor(color);
  cairo_rectangle(cairo_, rect.left, rect.top, rect.width(), rect.height());
  cairo_fill(cairo_);
}

void CairoCanvas::RoundRectPath(double x, double y, double w, double h, const paint::Radii& r) {
  const double kPi = 3.14159265358979323846;
  cairo_new_sub_path(cairo_);
  cairo_arc(cairo_, x + w - r.topRight, y + r.topRight, r.topRight, -kPi / 2, 0);
  cairo_arc(cairo_, x + w - r.bottomRight, y + h - r.bottomRight, r.bottomRight, 0, kPi / 2);
  cairo_arc(cairo_, x + r.bottomLeft, y + h - r.bottomLeft, r.bottomLeft, kPi / 2, kPi);
  cairo_arc(cairo_, x + r.topLeft, y + r.topLeft, r.topLeft, kPi, 3 * kPi / 2);
  cairo_close_path(cairo_);
}

void CairoCanvas::FillRoundRect(const Rect& rect, const paint::Radii& radii, paint::Color color) {
  SetColor(color);
  RoundRectPath(rect.left, rect.top, rect.width(), rect.height(), radii);
  cairo_fill(cairo_);
}

void CairoCanvas::DrawBorder(const Rect& box, const paint::BorderSide (&sides)[4], const paint::Radii& radii) {
  const bool same = std::all_of(std::begin(sides), std::end(sides), [&](const paint::BorderSide& s) {
    return s.width == sides[0].width && s.color == sides[0].color && s.style == sides[0].style;
  });
  if (same && sides[0].width > 0) {
    // One stroke along the middle of the border, rounded if the box is.
    const double w = sides[0].width;
    const double dash[] = {w * (sides[0].style == css::BorderStyle::kDotted ? 1 : 3), w * (sides[0].style == css::BorderStyle::kDotted ? 1 : 2)};
    const bool dashed = sides[0].style == css::BorderStyle::kDotted || sides[0].style == css::BorderStyle::kDashed;
    cairo_save(cairo_);
    SetColor(sides[0].color);
    cairo_set_line_width(cairo_, w);
    if (dashed) cairo_set_dash(cairo_, dash, 2, 0);
    const paint::Radii inner{std::max(0, radii.topLeft - sides[0].width / 2), std::max(0, radii.topRight - sides[0].width / 2),
                             std::max(0, radii.bottomRight - sides[0].width / 2), std::max(0, radii.bottomLeft - sides[0].width / 2)};
    RoundRectPath(box.left + w / 2, box.top + w / 2, box.width() - w, box.height() - w, inner);
    cairo_stroke(cairo_);
    cairo_restore(cairo_);
    return;
  }
  // Sides of their own: each a band along its edge.
  const Rect bands[4] = {{box.left, box.top, box.right, box.top + sides[0].width},
                         {box.right - sides[1].width, box.top, box.right, box.bottom},
                         {box.left, box.bottom - sides[2].width, box.right, box.bottom},
                         {box.left, box.top, box.left + sides[3].width, box.bottom}};
  for (int side = 0; side < 4; ++side) {
    if (sides[side].width > 0 && sides[side].style != css::BorderStyle::kNone) FillRect(bands[side], sides[side].color);
  }
}

void CairoCanvas::DrawText(const Font& font, std::u16string_view text, Point at, paint::Color color, int maxWidth,
                           paint::TextEllipsis ellipsis) {
  if (text.empty()) return;
  int width = 0;
  PangoLayout* layout = text_.Shaped(font, text, &width);
  PangoLayout* own = nullptr;
  const bool tooWide = maxWidth >= 0 && width > maxWidth;
  if (tooWide && ellipsis != paint::TextEllipsis::kNone) {
    own = text_.Ellipsized(font, text, maxWidth, ellipsis == paint::TextEllipsis::kPath);
    layout = own;
  }
  // The layout's first baseline goes where the font's ascent puts it.
  const int ascent = text_.Metrics(font).ascent;
  cairo_save(cairo_);
  if (tooWide && !own) {
    cairo_rectangle(cairo_, at.x, at.y - ascent, maxWidth, 4.0 * ascent + 16);
    cairo_clip(cairo_);
  }
  SetColor(color);
  cairo_move_to(cairo_, at.x, at.y + ascent - PangoText::Baseline(layout));
  pango_cairo_show_layout(cairo_, layout);
  cairo_restore(cairo_);
  if (own) g_object_unref(own);
}

cairo_surface_t* CairoCanvas::Decoded(const layout::Image& image) {
  auto found = images_.find(&image);
  if (found != images_.end()) return found->second;
  PngReader reader{&image.bytes};
  cairo_surface_t* surface = cairo_image_surface_create_from_png_stream(&PngReader::Read, &reader);
  if (cairo_surface_status(surface) != CAIRO_STATUS_SUCCESS) {
    cairo_surface_destroy(surface);
    surface = nullptr;
  }
  images_.emplace(&image, surface);
  return surface;
}

void CairoCanvas::DrawImage(const layout::Image& image, const Rect& dest) {
  cairo_surface_t* surface = Decoded(image);
  if (!surface || dest.width() <= 0 || dest.height() <= 0) return;
  const int w = cairo_image_surface_get_width(surface), h = cairo_image_surface_get_height(surface);
  cairo_save(cairo_);
  cairo_rectangle(cairo_, dest.left, dest.top, dest.width(), dest.height());
  cairo_clip(cairo_);
  cairo_translate(cairo_, dest.left, dest.top);
  cairo_scale(cairo_, static_cast<double>(dest.width()) / w, static_cast<double>(dest.height()) / h);
  cairo_set_source_surface(cairo_, surface, 0, 0);
  // Scaled up, the edges repeat their own pixels rather than fade into transparency.
  cairo_pattern_set_extend(cairo_get_source(cairo_), CAIRO_EXTEND_PAD);
  cairo_paint(cairo_);
  cairo_restore(cairo_);
}

void CairoCanvas::DrawLine(Point from, Point to, float width, paint::Color color) {
  cairo_save(cairo_);
  SetColor(color);
  cairo_set_line_width(cairo_, width);
  cairo_set_line_cap(cairo_, CAIRO_LINE_CAP_ROUND);
  // Odd widths on whole pixels would straddle two pixel rows: half a pixel in keeps them sharp.
  const double half = static_cast<int>(std::lround(width)) % 2 == 1 ? 0.5 : 0;
  cairo_move_to(cairo_, from.x + half, from.y + half);
  cairo_line_to(cairo_, to.x + half, to.y + half);
  cairo_stroke(cairo_);
  cairo_restore(cairo_);
}

void CairoCanvas::PushClip(const Rect& rect) {
  cairo_save(cairo_);
  cairo_rectangle(cairo_, rect.left, rect.top, std::max(0, rect.width()), std::max(0, rect.height()));
  cairo_clip(cairo_);
}

void CairoCanvas::PopClip() { cairo_restore(cairo_); }

}  // namespace kestrune::html::canvas_cairo
