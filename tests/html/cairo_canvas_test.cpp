// The cairo and Pango canvas: real text metrics, ellipsis, pictures, shapes and clipping, read
// back from the PNG it writes.
#include <cairo.h>
#include <gtest/gtest.h>

#include <cstdint>
#include <cstring>
#include <string>
#include <vector>

#include "html/canvas_cairo/cairo_canvas.h"
#include "support/temp_folder.h"

namespace kestrune::html::test {
namespace {

using canvas_cairo::CairoCanvas;
using canvas_cairo::PangoText;

constexpr paint::Color kWhite = 0xFFFFFFFF;
constexpr paint::Color kRed = 0xFFFF0000;
constexpr paint::Color kBlue = 0xFF0000FF;
constexpr paint::Color kBlack = 0xFF000000;

const layout::Font kFont{u"DejaVu Sans, sans-serif", 12, 400, false};

// The canvas's pixels, as its PNG holds them (0xAARRGGBB).
class Pixels {
 public:
  explicit Pixels(const CairoCanvas& canvas) {
    kestrune::test::TempFolder folder;
    const std::string path = (folder / "canvas.png").string();
    EXPECT_TRUE(canvas.WritePng(path));
    cairo_surface_t* surface = cairo_image_surface_create_from_png(path.c_str());
    EXPECT_EQ(cairo_surface_status(surface), CAIRO_STATUS_SUCCESS);
    width_ = cairo_image_surface_get_width(surface);
    height_ = cairo_image_surface_get_height(surface);
    const int stride = cairo_image_surface_get_stride(surface);
    const unsigned char* data = cairo_image_surface_get_data(surface);
    for (int y = 0; y < height_; ++y) {
      for (int x = 0; x < width_; ++x) {
        std::uint32_t pixel = 0;
        std::memcpy(&pixel, data + y * stride + x * 4, 4);
        pixels_.push_back(pixel | 0xFF000000u);
      }
    }
    cairo_surface_destroy(surface);
  }

  std::uint32_t At(int x, int y) const { return pixels_[static_cast<std::size_t>(y * width_ + x)]; }
  // The right edge (exclusive) of what is not white, or 0.
  int InkRight() const {
    int right = 0;
    for (int y = 0; y < height_; ++y) {
      for (int x = 0; x < width_; ++x) {
        if (At(x, y) != kWhite) right = std::max(right, x + 1);
      }
    }
    return right;
  }
  Size size() const { return {width_, height_}; }

 private:
  int width_ = 0, height_ = 0;
  std::vector<std::uint32_t> pixels_;
};

// A PNG of the given size in one colour, made by cairo.
layout::Image SolidPng(Size size, double r, double g, double b) {
  cairo_surface_t* surface = cairo_image_surface_create(CAIRO_FORMAT_ARGB32, size.width, size.height);
  cairo_t* cairo = cairo_create(surface);
  cairo_set_source_rgb(cairo, r, g, b);
  cairo_paint(cairo);
  cairo_destroy(cairo);
  layout::Image image;
  image.size = size;
  cairo_surface_write_to_png_stream(surface, [](void* closure, const unsigned char* data, unsigned int length) {
    auto& bytes = *static_cast<std::vector<unsigned char>*>(closure);
    bytes.insert(bytes.end(), data, data + length);
    return CAIRO_STATUS_SUCCESS;
  }, &image.bytes);
  cairo_surface_destroy(surface);
  return image;
}

TEST(CairoCanvasTest, PangoMeasuresTextOncePerFontAndText) {
  PangoText text;
  const layout::FontMetrics metrics = text.Metrics(kFont);
  EXPECT_GT(metrics.ascent, 6);
  EXPECT_GT(metrics.descent, 0);
  EXPECT_GE(metrics.lineHeight, metrics.ascent + metrics.descent);
  EXPECT_LE(metrics.lineHeight, 24);

  const int narrow = text.TextWidth(kFont, u"iiii");
  const int wide = text.TextWidth(kFont, u"WWWW");
  EXPECT_GT(narrow, 0);
  EXPECT_GT(wide, 2 * narrow);
  const int joined = text.TextWidth(kFont, u"Miles Davis");
  EXPECT_NEAR(joined, text.TextWidth(kFont, u"Miles ") + text.TextWidth(kFont, u"Davis"), 2);
  layout::Font bold = kFont;
  bold.weight = 700;
  EXPECT_GT(text.TextWidth(bold, u"Miles Davis"), joined);
  layout::Font larger = kFont;
  larger.size = 24;
  EXPECT_GT(text.TextWidth(larger, u"Miles Davis"), joined * 3 / 2);
  EXPECT_EQ(text.TextWidth(kFont, u""), 0);

  // Measured text is kept: asking again shapes nothing new.
  const std::size_t kept = text.cachedLayouts();
  EXPECT_EQ(text.TextWidth(kFont, u"Miles Davis"), joined);
  EXPECT_EQ(text.cachedLayouts(), kept);
  text.TextWidth(kFont, u"John Coltrane");
  EXPECT_EQ(text.cachedLayouts(), kept + 1);
}

TEST(CairoCanvasTest, TextTooWideIsCutOrEllipsizedWithinItsWidth) {
  PangoText text;
  const std::u16string title = u"A very long title that does not fit in its column";
  ASSERT_GT(text.TextWidth(kFont, title), 120);
  auto inkRight = [&](int maxWidth, paint::TextEllipsis ellipsis) {
    CairoCanvas canvas(Size{400, 20}, text);
    canvas.DrawText(kFont, title, {10, 2}, kBlack, maxWidth, ellipsis);
    return Pixels(canvas).InkRight();
  };
  EXPECT_GT(inkRight(-1, paint::TextEllipsis::kNone), 10 + 120);
  EXPECT_LE(inkRight(60, paint::TextEllipsis::kNone), 10 + 60);
  const int ellipsized = inkRight(60, paint::TextEllipsis::kEnd);
  EXPECT_LE(ellipsized, 10 + 60);
  EXPECT_GT(ellipsized, 10 + 30);  // the dots and some words, not nothing
  EXPECT_LE(inkRight(60, paint::TextEllipsis::kPath), 10 + 60);
}

TEST(CairoCanvasTest, PicturesAreDecodedFromPngAndScaledIntoPlace) {
  PangoText text;
  CairoCanvas canvas(Size{40, 40}, text);
  const layout::Image red = SolidPng({2, 2}, 1, 0, 0);
  canvas.DrawImage(red, {10, 10, 30, 30});
  layout::Image broken;
  broken.bytes = {1, 2, 3};
  broken.size = {4, 4};
  canvas.DrawImage(broken, {0, 0, 4, 4});  // not a PNG: nothing drawn
  const Pixels pixels(canvas);
  EXPECT_EQ(pixels.size(), (Size{40, 40}));
  EXPECT_EQ(pixels.At(11, 11), kRed);
  EXPECT_EQ(pixels.At(28, 28), kRed);
  EXPECT_EQ(pixels.At(5, 5), kWhite);
  EXPECT_EQ(pixels.At(1, 1), kWhite);
  EXPECT_EQ(pixels.At(32, 20), kWhite);
}

TEST(CairoCanvasTest, ShapesLinesAndBordersLandWhereAsked) {
  PangoText text;
  CairoCanvas canvas(Size{100, 60}, text);
  canvas.FillRoundRect({0, 0, 40, 40}, {10, 10, 10, 10}, kBlue);
  canvas.DrawLine({50, 10}, {90, 10}, 1, kBlack);
  canvas.DrawLine({50, 30}, {90, 30}, 3, kRed);
  paint::BorderSide sides[4];
  for (auto& side : sides) side = {2, kBlack, css::BorderStyle::kSolid};
  canvas.DrawBorder({60, 40, 100, 60}, sides, {});
  const Pixels pixels(canvas);
  EXPECT_EQ(pixels.At(1, 1), kWhite);  // outside the rounded corner
  EXPECT_EQ(pixels.At(20, 1), kBlue);
  EXPECT_EQ(pixels.At(20, 20), kBlue);
  EXPECT_EQ(pixels.At(70, 10), kBlack);
  EXPECT_EQ(pixels.At(70, 12), kWhite);
  EXPECT_EQ(pixels.At(70, 29), kRed);
  EXPECT_EQ(pixels.At(70, 31), kRed);
  EXPECT_EQ(pixels.At(70, 33), kWhite);
  EXPECT_EQ(pixels.At(60, 50), kBlack);
  EXPECT_EQ(pixels.At(99, 50), kBlack);
  EXPECT_EQ(pixels.At(80, 50), kWhite);
}

TEST(CairoCanvasTest, ClipsNestAndEndWithTheirPop) {
  PangoText text;
  CairoCanvas canvas(Size{40, 40}, text);
  canvas.PushClip({10, 10, 30, 30});
  canvas.PushClip({0, 0, 20, 20});
  canvas.FillRect({0, 0, 40, 40}, kBlue);
  canvas.PopClip();
  canvas.FillRect({0, 25, 40, 40}, kRed);
  canvas.PopClip();
  canvas.FillRect({0, 38, 40, 40}, kBlack);
  const Pixels pixels(canvas);
  EXPECT_EQ(pixels.At(15, 15), kBlue);
  EXPECT_EQ(pixels.At(5, 5), kWhite);
  EXPECT_EQ(pixels.At(25, 15), kWhite);
  EXPECT_EQ(pixels.At(20, 27), kRed);
  EXPECT_EQ(pixels.At(5, 27), kWhite);
  EXPECT_EQ(pixels.At(5, 39), kBlack);
}

}  // namespace
}  // namespace kestrune::html::test
