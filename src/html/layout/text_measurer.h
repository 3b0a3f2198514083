#pragma once

#include <cstddef>
#include <functional>
#include <string>
#include <string_view>

#include "html/css/computed_style.h"

namespace kestrune::html::layout {

struct Font {
  std::u16string family;  // a list, as the style writes it ("Segoe UI, Tahoma, sans-serif")
  float size = 12;        // px
  int weight = 400;
  bool italic = false;
  bool operator==(const Font&) const = default;
};

struct FontHash {
  std::size_t operator()(const Font& font) const {
    return std::hash<std::u16string>{}(font.family) ^ (std::hash<float>{}(font.size) * 31) ^
           (static_cast<std::size_t>(font.weight) << 1) ^ (font.italic ? 0x9e3779b9u : 0u);
  }
};

struct FontMetrics {
  int ascent = 0;
  int descent = 0;
  int lineHeight = 0;  // the font's normal line spacing
};

Font FontOf(const css::ComputedStyle& style);

// Text measurement, the one thing layout needs from a canvas. Implementations cache what they
// measure; the layout asks for widths only of text it places (see InlineLayout).
class TextMeasurer {
 public:
  virtual ~TextMeasurer() = default;
  virtual FontMetrics Metrics(const Font& font) const = 0;
  virtual int TextWidth(const Font& font, std::u16string_view text) const = 0;
};

}  // namespace kestrune::html::layout
