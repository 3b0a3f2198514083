#pragma once

#include "html/events/dispatcher.h"
#include "html/layout/layout_view.h"
#include "html/paint/canvas.h"

namespace kestrune::html::paint {

struct PaintStats {
  int elements = 0;  // elements whose boxes reached the area and were painted
  int textRuns = 0;
};

// Paints the part `area` of the view (view coordinates) onto the canvas: the page in painting
// order (backgrounds, content, positioned boxes by z-index), then the shown popups over it.
// Only what reaches the area is visited, so a long list costs what is on screen. An element
// with draw handlers gets the draw event for each layer (background: its border box, content:
// its content box, foreground) and draws that layer itself when it answers "handled".
PaintStats PaintView(layout::LayoutView& view, Canvas& canvas, const Rect& area, events::EventDispatcher* dispatcher);

// The look of the engine's own controls and scroll bars (control_looks.cpp).
void PaintScrollBar(Canvas& canvas, const Rect& bar, bool vertical, int value, int minimum, int maximum, int page);
// Check boxes and radio buttons that the page does not draw with an image; answers whether
// the element is one.
bool PaintToggle(Canvas& canvas, const dom::Element& element, const Rect& content);

}  // namespace kestrune::html::paint
