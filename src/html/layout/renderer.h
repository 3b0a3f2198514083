#pragma once

#include "html/layout/layout_context.h"

namespace kestrune::html::layout {

// One renderer per formatting context (block, table, horizontal flow, replaced content); each
// lays out an element's content inside the border-box width its parent chose and sets the
// box's height, and reports the element's intrinsic widths.
class Renderer {
 public:
  virtual ~Renderer() = default;
  virtual void Layout(Element& element, Box& box, const BoxInput& input, LayoutContext& ctx) const = 0;
  virtual IntrinsicWidths Intrinsic(Element& element, LayoutContext& ctx) const = 0;
};

const Renderer& RendererFor(const Element& element);

// Lays an element out (or keeps its box when nothing in it changed and the input is the same),
// then its scroll state and its positioned descendants. The caller positions it.
void LayoutElement(Element& element, const BoxInput& input, LayoutContext& ctx);
// Intrinsic widths of the element's border box (margins not included), cached for the pass.
IntrinsicWidths IntrinsicOf(Element& element, LayoutContext& ctx);
// The extent of a laid-out element's content from its padding box origin: what it scrolls.
Size ScrollableExtent(const Element& element, const Box& box);
// Marks an element and its subtree as not shown (display: none, or nested too deeply).
void HideSubtree(Element& element);

// Border-box width from `width`, `min-width`, `max-width` and `box-sizing`; auto and flexible
// widths take `autoWidth` (a border-box width) before min and max apply.
int ResolveWidth(const css::ComputedStyle& style, int cbWidth, const Edges& insets, int autoWidth);
// The border-box width of a shrink-to-fit box in `available` (margins already taken off).
int ShrinkToFit(Element& element, int available, LayoutContext& ctx);
// Border-box height: forced, else specified (px, or % of a known cbHeight), else content; then
// min and max.
int ResolveHeight(const css::ComputedStyle& style, const BoxInput& input, const Edges& insets, int contentHeight);
// The height `height` gives when it is definite (px, or % of a known base): a border-box
// height; -1 otherwise.
int SpecifiedHeight(const css::ComputedStyle& style, int cbHeight, const Edges& insets);

// The width content can use: the border box less insets and a vertical scroll bar.
int ContentWidth(const Box& box, const Edges& insets);
// The height of the box's horizontal scroll bar, 0 when it has none.
int HorizontalBarHeight(const Box& box);
// The height the children's percentages and flexible heights share: the forced or definite
// height less insets and a horizontal scroll bar; -1 when the height comes from the content.
int ChildrenCbHeight(const css::ComputedStyle& style, const Box& box, const BoxInput& input, const Edges& insets);

// Whether a child takes no place among its siblings: not shown (its subtree is then marked so),
// a shown popup, or positioned out of flow (registered to be placed by its containing block).
// Without a context nothing is marked or registered.
bool LaidApart(Element& child, LayoutContext* ctx);

// Puts a laid-out child at (x, y) of its parent's border box, with its relative offset.
void PlaceChild(Element& child, Box& box, int x, int y, int cbWidth, int cbHeight);

// Registers a positioned descendant met in flow, with its static position in the parent's
// border box, so that its containing block lays it out.
void RegisterPositioned(Element& element, int staticX, int staticY, LayoutContext& ctx);

}  // namespace kestrune::html::layout
