#include "html/layout/renderer.h"

#include <algorithm>

#include "html/dom/states.h"
#include "html/events/event_params.h"
#include "html/layout/positioned.h"
#include "html/layout/renderers.h"

namespace kestrune::html::layout {
namespace {

using css::ComputedStyle;
using css::Length;
using css::Overflow;

// Deeper trees than this are not laid out (the parser flattens its pages long before; only
// elements inserted by hand can nest further).
constexpr int kMaxLayoutDepth = 400;

bool HasSizeHandler(const Element& element) {
  const dom::RareData* rare = element.rareIfAny();
  if (!rare) return false;
  return std::any_of(rare->handlers.begin(), rare->handlers.end(),
                     [](const dom::AttachedHandler& h) { return (h.subscription & events::kHandleSize) != 0; });
}

bool Reusable(const Element& element, const Box& box, const BoxInput& input) {
  return !(element.dirty() & (dom::kLayoutDirty | dom::kChildLayoutDirty)) && !box.Has(kBoxHidden | kBoxPartial | kBoxInline) &&
         box.width == input.width && box.forcedHeight == input.forcedHeight && box.cbWidth == input.cbWidth &&
         box.cbHeight == input.cbHeight;
}

Overflow EffectiveOverflow(const Element& element, Overflow overflow) {
  // The root scrolls the view when its content does not fit.
  if (element.parent() == nullptr && overflow == Overflow::kVisible) return Overflow::kAuto;
  return overflow;
}

// The extent of the content from the padding box origin: what a scroll container scrolls.
Size ContentExtent(const Element& element, const Box& box, const Edges& border, const Edges& padding) {
  int right = 0, bottom = box.contentHeight + padding.vertical();
  const auto& nodes = element.nodes();
  auto account = [&](const Element& child) {
    const Box* b = LiveBox(child);
    if (!b || b->Has(kBoxFixed | kBoxInline)) return;
    const Edges margins = Margins(*child.style(), box.cbWidth);
    right = std::max(right, b->x + b->width + margins.right - border.left + padding.right);
    bottom = std::max(bottom, b->y + b->height + margins.bottom - border.top + padding.bottom);
  };
  if (box.Has(kBoxSortedChildren)) {
    // Stacked children: the last one reaches lowest; all of them share the widths of a table's rows.
    for (auto it = nodes.rbegin(); it != nodes.rend(); ++it) {
      if (const Element* child = dom::AsElement(*it); child && child->style() && !IsOutOfFlow(*child->style())) {
        account(*child);
        break;
      }
    }
  } else {
    for (dom::Node* node : nodes) {
      if (const Element* child = dom::AsElement(node); child && child->style()) account(*child);
    }
  }
  if (box.extras) {
    for (const InlineSegment& segment : box.extras->segments) right = std::max(right, segment.x + segment.width - border.left);
  }
  return {right, bottom};
}

// Whether the box keeps a scroll state through layout: the root, boxes with scroll bars, and
// clipping boxes the program has scrolled. A clipping box at (0, 0), like every cell of a table
// whose cells hide what overflows them, lays out as a plain box that clips; it gets its state
// when it is first scrolled (see the layout view).
bool NeedsScrollState(const Element& element, const ComputedStyle& style, const Box& box) {
  if (element.parent() == nullptr) return true;
  if (!Clips(style)) return false;
  const bool bars = style.overflowX == Overflow::kAuto || style.overflowX == Overflow::kScroll ||
                    style.overflowY == Overflow::kAuto || style.overflowY == Overflow::kScroll;
  const ScrollState* scroll = box.scroll();
  return bars || (scroll && (scroll->position != Point{} || scroll->shown != Point{}));
}

void LayoutScroller(Element& element, Box& box, const BoxInput& input, LayoutContext& ctx) {
  const ComputedStyle& style = *element.style();
  const Renderer& renderer = RendererFor(element);
  ScrollState& scroll = box.Extras().scroll ? *box.extras->scroll : box.extras->scroll.emplace();
  const Overflow ox = EffectiveOverflow(element, style.overflowX);
  const Overflow oy = EffectiveOverflow(element, style.overflowY);
  const Edges border = BorderWidths(style);
  const Edges padding = Padding(style, input.cbWidth);
  const Edges insets{border.top + padding.top, border.right + padding.right, border.bottom + padding.bottom,
                     border.left + padding.left};
  const int definite = input.forcedHeight >= 0 ? input.forcedHeight : SpecifiedHeight(style, input.cbHeight, insets);

  auto run = [&](bool vertical, bool horizontal, int stop) {
    scroll.vertical = vertical;
    scroll.horizontal = horizontal;
    BoxInput in = input;
    in.stopBelow = stop;
    box.Set(kBoxPartial, false);
    renderer.Layout(element, box, in, ctx);
  };
  auto viewportHeight = [&] { return ScrollViewport(element, box).height(); };
  auto overflowsY = [&] {
    return box.Has(kBoxPartial) || ContentExtent(element, box, border, padding).height > viewportHeight();
  };

  bool vertical = oy == Overflow::kScroll || (oy == Overflow::kAuto && scroll.vertical);
  const bool horizontal = ox == Overflow::kScroll || (ox == Overflow::kAuto && scroll.horizontal);
  if (oy == Overflow::kAuto) {
    // Without a bar, stopping as soon as the content is known not to fit; but a bar that was
    // there before is tried first, since a long list usually stays long.
    const int stop = definite >= 0 ? definite - border.bottom - (horizontal ? kScrollBarSize : 0) : INT_MAX;
    if (vertical) {
      run(true, horizontal, INT_MAX);
      if (!overflowsY()) {
        vertical = false;
        run(false, horizontal, stop);
      }
    } else {
      run(false, horizontal, stop);
    }
    if (!vertical && overflowsY()) {
      vertical = true;
      run(true, horizontal, INT_MAX);
    }
  } else {
    run(oy == Overflow::kScroll, horizontal, INT_MAX);
  }
  Size content = ContentExtent(element, box, border, padding);
  if (ox == Overflow::kAuto && !horizontal && content.width > ScrollViewport(element, box).width()) {
    scroll.horizontal = true;
    if (oy == Overflow::kAuto && !scroll.vertical && content.height > viewportHeight()) {
      run(true, true, INT_MAX);
      content = ContentExtent(element, box, border, padding);
    }
  }
  const Rect view = ScrollViewport(element, box);
  scroll.content = {std::max(content.width, view.width()), std::max(content.height, view.height())};
  scroll.position.x = std::clamp(scroll.position.x, 0, scroll.content.width - view.width());
  scroll.position.y = std::clamp(scroll.position.y, 0, scroll.content.height - view.height());
  box.Set(kBoxScroller, true);
}

}  // namespace

Size ScrollableExtent(const Element& element, const Box& box) {
  const ComputedStyle& style = *element.style();
  return ContentExtent(element, box, BorderWidths(style), Padding(style, box.cbWidth));
}

void HideSubtree(Element& element) {
  for (Element* e = &element; e; e = dom::NextElementInOrder(e, &element)) {
    if (Box* box = BoxOf(*e)) box->flags = kBoxHidden;
    e->ClearDirty(dom::kLayoutDirty | dom::kChildLayoutDirty | dom::kPaintDirty | dom::kChildPaintDirty);
  }
}

void LayoutElement(Element& element, const BoxInput& input, LayoutContext& ctx) {
  if (!element.style()) return;
  Box& box = EnsureBox(element);
  if (Reusable(element, box, input)) return;
  if (ctx.depth >= kMaxLayoutDepth) {
    HideSubtree(element);
    return;
  }
  const ComputedStyle& style = *element.style();
  ++ctx.laidOut;
  const int oldWidth = box.width, oldHeight = box.height;
  const bool hadHeader = box.extras && box.extras->headerHeight;
  box.flags = 0;
  if (box.extras) {
    box.extras->segments.clear();
    box.extras->columns.clear();
    if (hadHeader) box.extras->headerHeight = 0;
  }
  box.width = input.width;
  box.forcedHeight = input.forcedHeight;
  box.cbWidth = input.cbWidth;
  box.cbHeight = input.cbHeight;
  box.baseline = -1;
  const bool container = element.parent() == nullptr || style.position != css::Position::kStatic;
  if (container) ctx.positionedContainers.push_back(&element);
  ++ctx.depth;
  if (NeedsScrollState(element, style, box)) {
    LayoutScroller(element, box, input, ctx);
  } else {
    if (box.extras) box.extras->scroll.reset();
    RendererFor(element).Layout(element, box, input, ctx);
    box.Set(kBoxScroller, Clips(style));
  }
  --ctx.depth;
  if (container) {
    ctx.positionedContainers.pop_back();
    LayoutPositionedDescendants(element, box, ctx);
  }
  if (!Clips(style) && element.parent()) {
    const Edges insets = Insets(style, input.cbWidth);
    box.Set(kBoxOverflows, box.contentHeight + insets.vertical() > box.height);
  }
  // Laid out again inside an area already asked to be repainted (see LayoutView::TakeDamage).
  if (!box.Has(kBoxPartial)) element.ClearDirty(dom::kLayoutDirty | dom::kChildLayoutDirty | dom::kPaintDirty);
  if ((oldWidth != box.width || oldHeight != box.height) && HasSizeHandler(element)) ctx.resized.push_back(&element);
}

IntrinsicWidths IntrinsicOf(Element& element, LayoutContext& ctx) {
  auto found = ctx.intrinsic.find(&element);
  if (found != ctx.intrinsic.end()) return found->second;
  IntrinsicWidths widths;
  if (element.style() && ctx.depth < kMaxLayoutDepth) {
    const ComputedStyle& style = *element.style();
    const Edges insets = Insets(style, 0);
    if (style.width.unit == Length::Unit::kPx) {
      widths.min = widths.max = ResolveWidth(style, 0, insets, 0);
    } else {
      ++ctx.depth;
      widths = RendererFor(element).Intrinsic(element, ctx);
      --ctx.depth;
      const int low = ResolveWidth(style, 0, insets, widths.min);
      const int high = ResolveWidth(style, 0, insets, widths.max);
      widths = {low, std::max(low, high)};
    }
  }
  ctx.intrinsic.emplace(&element, widths);
  return widths;
}

int ResolveWidth(const ComputedStyle& style, int cbWidth, const Edges& insets, int autoWidth) {
  const bool borderBox = style.boxSizing == css::BoxSizing::kBorderBox;
  auto toBorderBox = [&](const Length& length, int fallback) {
    if (length.unit != Length::Unit::kPx && length.unit != Length::Unit::kPercent) return fallback;
    const int value = Px(length, cbWidth);
    return borderBox ? std::max(value, insets.horizontal()) : value + insets.horizontal();
  };
  int width = toBorderBox(style.width, autoWidth);
  const int maxWidth = style.maxWidth.unit == Length::Unit::kNone ? INT_MAX : toBorderBox(style.maxWidth, INT_MAX);
  const int minWidth = toBorderBox(style.minWidth, insets.horizontal());
  width = std::min(width, maxWidth);
  return std::max({width, minWidth, insets.horizontal(), 0});
}

int ShrinkToFit(Element& element, int available, LayoutContext& ctx) {
  const IntrinsicWidths widths = IntrinsicOf(element, ctx);
  const int fit = std::min(std::max(widths.min, available), widths.max);
  return ResolveWidth(*element.style(), available, Insets(*element.style(), available), fit);
}

int SpecifiedHeight(const ComputedStyle& style, int cbHeight, const Edges& insets) {
  const Length& height = style.height;
  if (height.unit != Length::Unit::kPx && !(height.unit == Length::Unit::kPercent && cbHeight >= 0)) return -1;
  const int value = Px(height, cbHeight);
  return style.boxSizing == css::BoxSizing::kBorderBox ? std::max(value, insets.vertical()) : value + insets.vertical();
}

int HorizontalBarHeight(const Box& box) {
  const ScrollState* scroll = box.scroll();
  return scroll && scroll->horizontal ? kScrollBarSize : 0;
}

int ChildrenCbHeight(const ComputedStyle& style, const Box& box, const BoxInput& input, const Edges& insets) {
  const int specified = input.forcedHeight >= 0 ? input.forcedHeight : SpecifiedHeight(style, input.cbHeight, insets);
  return specified >= 0 ? std::max(0, specified - insets.vertical() - HorizontalBarHeight(box)) : -1;
}

bool LaidApart(Element& child, LayoutContext* ctx) {
  const ComputedStyle* style = child.style().get();
  if (!style || style->display == css::Display::kNone) {
    if (ctx) HideSubtree(child);
    return true;
  }
  if (child.state() & dom::kStatePopup) return true;
  if (IsOutOfFlow(*style)) {
    if (ctx) RegisterPositioned(child, 0, 0, *ctx);
    return true;
  }
  return false;
}

int ResolveHeight(const ComputedStyle& style, const BoxInput& input, const Edges& insets, int contentHeight) {
  if (input.forcedHeight >= 0) return input.forcedHeight;
  int height = SpecifiedHeight(style, input.cbHeight, insets);
  if (height < 0) height = contentHeight + insets.vertical();
  const bool borderBox = style.boxSizing == css::BoxSizing::kBorderBox;
  auto toBorderBox = [&](const Length& length, int fallback) {
    if (length.unit != Length::Unit::kPx && !(length.unit == Length::Unit::kPercent && input.cbHeight >= 0)) return fallback;
    const int value = Px(length, input.cbHeight);
    return borderBox ? value : value + insets.vertical();
  };
  if (style.maxHeight.unit != Length::Unit::kNone) height = std::min(height, toBorderBox(style.maxHeight, INT_MAX));
  return std::max({height, toBorderBox(style.minHeight, 0), insets.vertical()});
}

int ContentWidth(const Box& box, const Edges& insets) {
  const ScrollState* scroll = box.scroll();
  return std::max(0, box.width - insets.horizontal() - (scroll && scroll->vertical ? kScrollBarSize : 0));
}

void PlaceChild(Element& child, Box& box, int x, int y, int cbWidth, int cbHeight) {
  const ComputedStyle& style = *child.style();
  if (style.position == css::Position::kRelative) {
    const auto& o = style.offsets;
    if (o[css::kLeft].unit != Length::Unit::kAuto) x += Px(o[css::kLeft], cbWidth);
    else if (o[css::kRight].unit != Length::Unit::kAuto) x -= Px(o[css::kRight], cbWidth);
    if (o[css::kTop].unit != Length::Unit::kAuto) y += Px(o[css::kTop], cbHeight);
    else if (o[css::kBottom].unit != Length::Unit::kAuto) y -= Px(o[css::kBottom], cbHeight);
  }
  box.x = x;
  box.y = y;
}

void RegisterPositioned(Element& element, int staticX, int staticY, LayoutContext& ctx) {
  if (ctx.positionedContainers.empty()) return;
  const bool fixed = element.style()->position == css::Position::kFixed;
  Element& container = *(fixed ? ctx.positionedContainers.front() : ctx.positionedContainers.back());
  Box& box = EnsureBox(element);
  box.Extras().staticPosition = {staticX, staticY};
  auto& list = EnsureBox(container).Extras().positioned;
  if (std::find_if(list.begin(), list.end(), [&](const dom::Ref<Element>& e) { return e.get() == &element; }) == list.end()) {
    list.emplace_back(&element);
  }
}

const Renderer& RendererFor(const Element& element) {
  const ComputedStyle& style = *element.style();
  if (element.tag() == dom::kAtomImg) return ReplacedRenderer();
  switch (style.display) {
    case css::Display::kTable:
    case css::Display::kInlineTable: return TableRenderer();
    default: break;
  }
  if (style.flow == css::Flow::kHorizontal || style.flow == css::Flow::kHorizontalFlow) return FlowRenderer();
  return BlockRenderer();
}

}  // namespace kestrune::html::layout
