#pragma once

#include <cstdint>
#include <string>
#include <string_view>

namespace kestrune {

// The progress bar's width when full.
inline constexpr double kProgressBarWidth = 365.0;

// What the progress panel shows at one moment.
struct ProgressView {
  std::u16string titleLine;  // the title, done, " of ", total and "......"
  std::u16string barWidth;   // the bar's style width: done ÷ total × 365, no decimals, no unit
  std::u16string item;       // the line that names the current item
  std::uint32_t done = 0;
  std::uint32_t total = 0;
};

// The panel's texts and figures for a title (which ends with its own space), the counts and the
// item line. Halves round away from zero, as ordinary rounding does, on every platform.
ProgressView MakeProgress(std::u16string_view title, std::uint32_t done, std::uint32_t total,
                          std::u16string_view item);

}  // namespace kestrune
