#include <algorithm>
#include <climits>

#include "html/dom/states.h"
#include "html/layout/inline_layout.h"
#include "html/layout/renderers.h"

namespace kestrune::html::layout {
namespace {

using css::ComputedStyle;
using css::Length;

bool IsInlineLevel(const dom::Node& node) {
  if (!node.IsElement()) return true;
  const auto& element = static_cast<const Element&>(node);
  const ComputedStyle* style = element.style().get();
  return style && !IsBlockLevel(*style) && !IsOutOfFlow(*style) && !(element.state() & dom::kStatePopup);
}

// A child that takes no room in the flow: hidden, positioned out of flow, or a shown popup.
bool OutOfFlow(Element& child, int staticX, int staticY, LayoutContext& ctx) {
  const ComputedStyle* style = child.style().get();
  if (!style) return true;
  if (style->display == css::Display::kNone) {
    HideSubtree(child);
    return true;
  }
  if (child.state() & dom::kStatePopup) return true;
  if (IsOutOfFlow(*style)) {
    RegisterPositioned(child, staticX, staticY, ctx);
    return true;
  }
  return false;
}

// Collapsed vertical margins of two adjoining siblings.
int Collapse(int a, int b) {
  if (a >= 0 && b >= 0) return std::max(a, b);
  if (a <= 0 && b <= 0) return std::min(a, b);
  return a + b;
}

class Block final : public Renderer {
 public:
  void Layout(Element& element, Box& box, const BoxInput& input, LayoutContext& ctx) const override {
    const ComputedStyle& style = *element.style();
    const Edges insets = Insets(style, input.cbWidth);
    const int contentWidth = ContentWidth(box, insets);
    const int contentCbHeight = ChildrenCbHeight(style, box, input, insets);

    const auto& nodes = element.nodes();
    const bool allInline = std::all_of(nodes.begin(), nodes.end(), [](const dom::Node* n) {
      return IsInlineLevel(*n) || !static_cast<const Element*>(n)->style() ||
             static_cast<const Element*>(n)->style()->display == css::Display::kNone;
    });
    int contentHeight = 0;
    if (allInline) {
      contentHeight = LayoutLines(element, box, {&element, 0, static_cast<std::uint32_t>(nodes.size())}, insets,
                                  contentWidth, insets.top, ctx);
    } else {
      contentHeight = LayoutChildren(element, box, input, insets, contentWidth, contentCbHeight, ctx);
    }
    box.contentHeight = contentHeight;
    box.height = ResolveHeight(style, input, insets, contentHeight + HorizontalBarHeight(box));
    if (!allInline && style.display == css::Display::kTableCell) AlignInCell(element, box, insets, HorizontalBarHeight(box));
  }

  IntrinsicWidths Intrinsic(Element& element, LayoutContext& ctx) const override {
    IntrinsicWidths result;
    const auto& nodes = element.nodes();
    std::uint32_t i = 0;
    while (i < nodes.size()) {
      if (IsInlineLevel(*nodes[i])) {
        std::uint32_t end = i;
        while (end < nodes.size() && IsInlineLevel(*nodes[end])) ++end;
        const IntrinsicWidths lines = InlineLayout::Intrinsic({&element, i, end}, ctx);
        result.min = std::max(result.min, lines.min);
        result.max = std::max(result.max, lines.max);
        i = end;
        continue;
      }
      Element& child = *static_cast<Element*>(nodes[i++]);
      const ComputedStyle* style = child.style().get();
      if (!style || style->display == css::Display::kNone || IsOutOfFlow(*style)) continue;
      const IntrinsicWidths widths = IntrinsicOf(child, ctx);
      const int margins = Margins(*style, 0).horizontal();
      result.min = std::max(result.min, widths.min + margins);
      result.max = std::max(result.max, widths.max + margins);
    }
    const int insets = Insets(*element.style(), 0).horizontal();
    return {result.min + insets, result.max + insets};
  }

 private:
  // Lines of inline content at content-box y `top`; answers their height.
  static int LayoutLines(Element& element, Box& box, const InlineRange& range, const Edges& insets, int width, int top,
                         LayoutContext& ctx) {
    const LinesSize lines = InlineLayout::Measure(range, width, ctx);
    if (lines.height == 0) return 0;
    box.Set(kBoxInlineContent, true);
    if (lines.lastBaseline >= 0) box.baseline = top + lines.lastBaseline;
    if (range.firstNode != 0 || range.endNode != element.nodes().size()) {
      box.Extras().segments.push_back({range.firstNode, range.endNode, insets.left, top, width, lines.height});
    }
    return lines.height;
  }

  // A cell taller than its content moves the content down as `vertical-align` says.
  static void AlignInCell(Element& element, Box& box, const Edges& insets, int barHeight) {
    const int free = box.height - insets.vertical() - barHeight - box.contentHeight;
    const css::VerticalAlign align = element.style()->verticalAlign;
    const int shift = free <= 0 ? 0 : align == css::VerticalAlign::kMiddle ? free / 2 : align == css::VerticalAlign::kBottom ? free : 0;
    if (shift == 0) return;
    for (dom::Node* node : element.nodes()) {
      const Element* child = dom::AsElement(node);
      Box* childBox = child ? LiveBox(*child) : nullptr;
      if (childBox && !childBox->Has(kBoxAbsolute | kBoxFixed | kBoxInline)) childBox->y += shift;
    }
    if (box.extras) {
      for (InlineSegment& segment : box.extras->segments) segment.y += shift;
    }
    if (box.baseline >= 0) box.baseline += shift;
  }

  static int ChildWidth(const ComputedStyle& style, const Edges& margins, int contentWidth, Element& child,
                        LayoutContext& ctx) {
    const Edges insets = Insets(style, contentWidth);
    const int fill = std::max(0, contentWidth - margins.horizontal());
    // Tables without a width are as wide as their content needs.
    const bool shrink = (style.display == css::Display::kTable) && style.width.unit == Length::Unit::kAuto;
    return ResolveWidth(style, contentWidth, insets, shrink ? ShrinkToFit(child, fill, ctx) : fill);
  }

  // A child in the flow: an element, or (element none) one of the container's line segments.
  struct Placed {
    Element* element;
    Edges margins;
    int x;
    int width;
    bool flexible;
    std::size_t segment = 0;
  };

  int LayoutChildren(Element& element, Box& box, const BoxInput& input, const Edges& insets, int contentWidth,
                     int contentCbHeight, LayoutContext& ctx) const {
    const auto& nodes = element.nodes();
    std::vector<Placed> placed;
    int cursor = insets.top;  // bottom of the last box, before its margin
    int pendingMargin = 0;
    bool first = true;
    bool sorted = true;
    float flexWeight = 0;
    int flexMinimum = 0;
    std::uint32_t i = 0;
    while (i < nodes.size()) {
      if (IsInlineLevel(*nodes[i])) {
        std::uint32_t end = i;
        while (end < nodes.size() && IsInlineLevel(*nodes[end])) ++end;
        const int top = cursor + (first ? 0 : pendingMargin);
        const int height = LayoutLines(element, box, {&element, i, end}, insets, contentWidth, top, ctx);
        if (height > 0) {
          if (box.extras && !box.extras->segments.empty()) placed.push_back({nullptr, {}, 0, height, false, box.extras->segments.size() - 1});
          cursor = top + height;
          pendingMargin = 0;
          first = false;
          sorted = false;
        }
        i = end;
        continue;
      }
      Element& child = *static_cast<Element*>(nodes[i++]);
      if (OutOfFlow(child, insets.left, cursor + pendingMargin, ctx)) continue;
      const ComputedStyle& style = *child.style();
      const Edges margins = Margins(style, contentWidth);
      const bool flexible = IsFlexible(style.height) && contentCbHeight >= 0;
      const int width = ChildWidth(style, margins, contentWidth, child, ctx);
      int x = insets.left + margins.left;
      const bool autoLeft = style.margin[css::kLeft].unit == Length::Unit::kAuto;
      const bool autoRight = style.margin[css::kRight].unit == Length::Unit::kAuto;
      const int free = contentWidth - width - margins.horizontal();
      if (autoLeft && autoRight) x += std::max(0, free / 2);
      else if (autoLeft) x += std::max(0, free);
      const int y = first ? cursor + margins.top : cursor + Collapse(pendingMargin, margins.top);
      if (flexible) {
        flexWeight += std::max(0.0f, style.height.value);
        const Edges childInsets = Insets(style, contentWidth);
        flexMinimum += ResolveHeight(style, {width, -1, contentWidth, -1}, childInsets, 0);
      } else {
        LayoutElement(child, {width, -1, contentWidth, contentCbHeight, input.stopBelow == INT_MAX ? INT_MAX : input.stopBelow - y},
                      ctx);
      }
      Box* childBox = &EnsureBox(child);
      PlaceChild(child, *childBox, x, y, contentWidth, contentCbHeight);
      placed.push_back({&child, margins, x, width, flexible});
      if (childBox->Has(kBoxOverflows)) sorted = false;
      cursor = y + (flexible ? 0 : childBox->height);
      pendingMargin = margins.bottom;
      first = false;
      if (cursor > input.stopBelow) {
        box.Set(kBoxPartial, true);
        break;
      }
    }
    if (flexWeight > 0) {
      cursor = ShareFlexibleHeights(placed, box, insets, contentWidth, contentCbHeight, flexWeight, flexMinimum, ctx);
      pendingMargin = placed.empty() ? 0 : placed.back().margins.bottom;
    }
    box.Set(kBoxSortedChildren, sorted);
    if (!placed.empty() && placed.back().element) {
      const Box* last = BoxOf(*placed.back().element);
      if (!box.Has(kBoxInlineContent) && last->baseline >= 0) box.baseline = last->y + last->baseline;
    }
    return std::max(0, cursor + pendingMargin - insets.top);
  }

  // Flexible heights share what the other children leave of the container's height; then the
  // children are stacked again with their final heights.
  static int ShareFlexibleHeights(const std::vector<Placed>& placed, Box& box, const Edges& insets, int contentWidth,
                                  int contentCbHeight, float weight, int flexMinimum, LayoutContext& ctx) {
    // What the others take, margins collapsed as the stacking below collapses them.
    int used = 0;
    int pending = 0;
    for (std::size_t k = 0; k < placed.size(); ++k) {
      const Edges& m = placed[k].margins;
      if (!placed[k].element) {
        used += pending + placed[k].width;
        pending = 0;
        continue;
      }
      used += k == 0 ? m.top : Collapse(pending, m.top);
      if (!placed[k].flexible) used += BoxOf(*placed[k].element)->height;
      pending = m.bottom;
    }
    used += pending;
    int free = std::max(flexMinimum, contentCbHeight - used);
    float remainingWeight = weight;
    int cursor = insets.top;
    int pendingMargin = 0;
    for (std::size_t k = 0; k < placed.size(); ++k) {
      if (!placed[k].element) {
        InlineSegment& segment = box.extras->segments[placed[k].segment];
        segment.y = cursor + (k == 0 ? 0 : pendingMargin);
        cursor = segment.y + segment.height;
        pendingMargin = 0;
        continue;
      }
      Element& child = *placed[k].element;
      Box* childBox = BoxOf(child);
      const Edges& m = placed[k].margins;
      const int y = k == 0 ? cursor + m.top : cursor + Collapse(pendingMargin, m.top);
      if (placed[k].flexible) {
        const float share = std::max(0.0f, child.style()->height.value);
        int height = remainingWeight > 0 ? static_cast<int>(static_cast<float>(free) * share / remainingWeight + 0.5f) : 0;
        height = std::clamp(height, 0, free);
        free -= height;
        remainingWeight -= share;
        const Edges childInsets = Insets(*child.style(), contentWidth);
        height = ResolveHeight(*child.style(), {placed[k].width, -1, contentWidth, -1}, childInsets, height - childInsets.vertical());
        LayoutElement(child, {placed[k].width, height, contentWidth, contentCbHeight}, ctx);
      }
      PlaceChild(child, *childBox, placed[k].x, y, contentWidth, contentCbHeight);
      cursor = y + childBox->height;
      pendingMargin = m.bottom;
    }
    return cursor;
  }
};

}  // namespace

const Renderer& BlockRenderer() {
  static const Block renderer;
  return renderer;
}

}  // namespace kestrune::html::layout
