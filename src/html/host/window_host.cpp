#include "html/host/window_host.h"

#include "html/paint/recording_canvas.h"

namespace kestrune::html::host {

const layout::TextMeasurer& WindowHost::Measurer() {
  static const paint::FixedMetrics kFixed;
  return kFixed;
}

}  // namespace kestrune::html::host
