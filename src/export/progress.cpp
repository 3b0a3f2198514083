#include "export/progress.h"

#include <cmath>

#include "base/text.h"

namespace kestrune {

ProgressView MakeProgress(std::u16string_view title, std::uint32_t done, std::uint32_t total,
                          std::u16string_view item) {
  ProgressView view;
  const double width =
      total == 0 ? 0.0 : static_cast<double>(done) / static_cast<double>(total) * kProgressBarWidth;
  view.barWidth = FormatDecimal(static_cast<std::uint64_t>(std::floor(width + 0.5)));
  view.titleLine =
      std::u16string(title) + FormatDecimal(done) + u" of " + FormatDecimal(total) + u"......";
  view.item = item;
  view.done = done;
  view.total = total;
  return view;
}

}  // namespace kestrune
