#pragma once

#include "html/layout/renderer.h"

namespace kestrune::html::layout {

// Block containers: block-level children stacked downwards (with flexible `1*` heights sharing
// the free height, as in `flow: vertical`) and inline content in lines.
const Renderer& BlockRenderer();
// `flow: horizontal`: children side by side, flexible widths sharing the free width.
const Renderer& FlowRenderer();
// Tables: rows, row groups, cells with colspan; fixed and automatic column widths.
const Renderer& TableRenderer();
// Images: their own size, or the one the style or the attributes give.
const Renderer& ReplacedRenderer();

}  // namespace kestrune::html::layout
