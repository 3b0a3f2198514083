#pragma once

#include "html/layout/renderer.h"

namespace kestrune::html::layout {

// Lays out the absolute and fixed descendants registered with a positioned container (the
// root takes the fixed ones), once the container's own size is known.
void LayoutPositionedDescendants(Element& container, Box& box, LayoutContext& ctx);

// Lays a shown popup out over the view, next to its anchor (placement as on a numeric keypad:
// 2 below, 8 above, 4 left, 6 right), or at a view point; flipped or shifted to stay inside.
void LayoutPopup(Element& popup, const Rect* anchor, Point at, unsigned placement, LayoutContext& ctx);

// The border box origin of an element relative to the root's border box, scroll positions not
// applied; for the static positions of absolute boxes.
Point OriginInDocument(const Element& element);

}  // namespace kestrune::html::layout
