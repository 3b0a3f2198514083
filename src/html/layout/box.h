#pragma once

#include <climits>
#include <cstdint>
#include <memory>
#include <optional>
#include <vector>

#include "html/css/computed_style.h"
#include "html/dom/geometry.h"
#include "html/dom/node.h"

namespace kestrune::html::layout {

using dom::Element;

enum BoxFlag : std::uint16_t {
  kBoxHidden = 0x1,         // display: none, or inside such a subtree: no geometry
  kBoxInline = 0x2,         // an inline element: its places come from its container's lines
  kBoxAbsolute = 0x4,       // x, y relative to the containing block's border box, not the parent's
  kBoxFixed = 0x8,          // fixed, or a shown popup: x, y in the view
  kBoxInlineContent = 0x10, // lays its children out in lines (all of them, or the segments)
  kBoxPlaced = 0x20,        // the atomic children of its lines have their x and y
  kBoxSortedChildren = 0x40,// in-flow children stacked downwards, none reaching outside its box
  kBoxScroller = 0x80,      // overflow other than visible: clips its content, may scroll it
  kBoxPinned = 0x100,       // a header row that stays in place when its table scrolls
  kBoxPartial = 0x200,      // layout stopped early (the content was known to overflow): redo
  kBoxOverflows = 0x400,    // some content reaches outside the border box
  kBoxStackingContext = 0x800,
};

struct Edges {
  int top = 0, right = 0, bottom = 0, left = 0;
  int horizontal() const { return left + right; }
  int vertical() const { return top + bottom; }
};

struct ScrollState {
  Point position;           // where the content is scrolled to
  Point shown;              // where painting shows it: trails `position` while a smooth scroll runs
  Size content;             // the scrollable extent, from the padding box origin
  bool vertical = false;    // a vertical bar is shown
  bool horizontal = false;  // a horizontal bar is shown
};

// A run of inline content between block-level children of a container with mixed content.
struct InlineSegment {
  std::uint32_t firstNode = 0, endNode = 0;  // child node range
  int x = 0, y = 0;                          // of its content box, in the container's border box
  int width = 0, height = 0;
};

// What few boxes need, out of line so that a big table stays small.
struct BoxExtras {
  std::optional<ScrollState> scroll;
  std::vector<InlineSegment> segments;
  std::vector<dom::Ref<Element>> positioned;  // a stacking context's positioned descendants
  std::vector<int> columns;                   // a table's column widths
  int headerHeight = 0;                       // a table's pinned header rows, from its content top
  Point staticPosition;                       // where an absolute box would have been in flow
};

// The layout box of an element, kept in the element's layoutData() slot. Geometry is the border
// box, relative to the parent element's border box (absolute boxes: to their containing block's;
// fixed boxes and popups: to the view). Inline elements and the children of their lines are
// placed relative to the block that holds the lines.
class Box final : public dom::Extension {
 public:
  static void* operator new(std::size_t size);
  static void operator delete(void* memory, std::size_t size);

  int x = 0, y = 0, width = 0, height = 0;
  int contentHeight = 0;  // of the in-flow content, from the content box top
  int baseline = -1;      // of the last line, from the border box top; -1 when there is none
  // The constraints of the last layout, so that an unchanged subtree is not laid out again.
  int forcedHeight = -1, cbWidth = -1, cbHeight = -1;
  std::uint16_t flags = 0;
  std::unique_ptr<BoxExtras> extras;

  bool Has(std::uint16_t flag) const { return (flags & flag) != 0; }
  void Set(std::uint16_t flag, bool on) { flags = static_cast<std::uint16_t>(on ? (flags | flag) : (flags & ~flag)); }
  BoxExtras& Extras();
  ScrollState* scroll() const { return extras && extras->scroll ? &*extras->scroll : nullptr; }
  Rect BorderRect() const { return {x, y, x + width, y + height}; }
};

inline Box* BoxOf(const Element& element) { return static_cast<Box*>(element.layoutDataIfAny()); }
Box& EnsureBox(Element& element);
// The box of an element that is laid out and shown (not under display: none), or none.
Box* LiveBox(const Element& element);

// Box model values from the style, in whole pixels.
int Px(const css::Length& length, int percentBase, int autoValue = 0);
Edges BorderWidths(const css::ComputedStyle& style);
Edges Padding(const css::ComputedStyle& style, int cbWidth);
Edges Margins(const css::ComputedStyle& style, int cbWidth);  // auto margins count 0
inline Edges Insets(const css::ComputedStyle& style, int cbWidth) {
  const Edges b = BorderWidths(style), p = Padding(style, cbWidth);
  return {b.top + p.top, b.right + p.right, b.bottom + p.bottom, b.left + p.left};
}

bool IsBlockLevel(const css::ComputedStyle& style);
bool IsOutOfFlow(const css::ComputedStyle& style);
bool Clips(const css::ComputedStyle& style);
inline bool IsFlexible(const css::Length& length) { return length.unit == css::Length::Unit::kFlex; }

// The positioned descendants a container paints over its content (and hit tests first), in
// painting order: by z-index, then in document order. Entries that left are dropped.
std::vector<Element*> PositionedInOrder(const Element& container);

// Whether a child node of `container` is laid out in its lines (rather than as a box of its own).
bool InLines(const Element& container, const Box& box, const dom::Node& child);

// The index (among all child nodes) from which the children of a box with sorted children can
// reach down to `y` (the parent's border-box coordinates, scroll not applied): painting and hit
// tests start there instead of at the first of many rows. 0 for other boxes.
std::size_t FirstChildReaching(const Element& parent, const Box& box, int y);

// Thickness of the scroll bars the engine draws for overflowing elements.
inline constexpr int kScrollBarSize = 16;

// Where the lines of an element whose children are all inline start in its border box: the
// content box, lower in a table cell taller than its lines as `vertical-align` says.
Point LinesOrigin(const Element& element, const Box& box);

// The element's border box with its scroll bars taken off the padding box: where content shows.
Rect ScrollViewport(const Element& element, const Box& box);

}  // namespace kestrune::html::layout
