#include <algorithm>

#include "html/dom/states.h"
#include "html/layout/inline_layout.h"
#include "html/layout/renderers.h"

namespace kestrune::html::layout {
namespace {

using css::ComputedStyle;
using css::Length;

bool IsBlankText(const dom::Node& node) {
  if (node.IsElement()) return false;
  const std::u16string_view text = static_cast<const dom::Text&>(node).text();
  return std::all_of(text.begin(), text.end(), [](char16_t c) { return c == u' ' || c == u'\t' || c == u'\n' || c == u'\r'; });
}

// A child of the row: an element, or a run of text between elements (laid out in lines).
struct Item {
  Element* element = nullptr;
  InlineRange text;
  Edges margins;
  int width = 0;
  float flex = 0;
};

std::vector<Item> ItemsOf(Element& container, LayoutContext* ctx, int cbWidth) {
  std::vector<Item> items;
  const auto& nodes = container.nodes();
  for (std::uint32_t i = 0; i < nodes.size(); ++i) {
    if (!nodes[i]->IsElement()) {
      if (IsBlankText(*nodes[i])) continue;
      std::uint32_t end = i;
      while (end < nodes.size() && !nodes[end]->IsElement()) ++end;
      items.push_back({nullptr, {&container, i, end}, {}, 0, 0});
      i = end - 1;
      continue;
    }
    Element& child = *static_cast<Element*>(nodes[i]);
    if (LaidApart(child, ctx)) continue;
    const ComputedStyle* style = child.style().get();
    items.push_back({&child, {}, Margins(*style, cbWidth), 0, IsFlexible(style->width) ? std::max(0.0f, style->width.value) : 0});
  }
  return items;
}

class Flow final : public Renderer {
 public:
  void Layout(Element& element, Box& box, const BoxInput& input, LayoutContext& ctx) const override {
    const ComputedStyle& style = *element.style();
    const Edges insets = Insets(style, input.cbWidth);
    const int contentWidth = ContentWidth(box, insets);
    const int contentCbHeight = ChildrenCbHeight(style, box, input, insets);

    std::vector<Item> items = ItemsOf(element, &ctx, contentWidth);
    // Widths: given ones first, then the content's for auto, then the flexible shares of the rest.
    int used = 0;
    float weight = 0;
    for (Item& item : items) {
      used += item.margins.horizontal();
      if (!item.element) {
        item.width = InlineLayout::Intrinsic(item.text, ctx).max;
      } else if (item.flex > 0) {
        weight += item.flex;
        continue;
      } else {
        const ComputedStyle& childStyle = *item.element->style();
        const bool sized = childStyle.width.unit == Length::Unit::kPx || childStyle.width.unit == Length::Unit::kPercent;
        item.width = sized ? ResolveWidth(childStyle, contentWidth, Insets(childStyle, contentWidth), 0)
                           : ShrinkToFit(*item.element, std::max(0, contentWidth - used), ctx);
      }
      used += item.width;
    }
    int free = std::max(0, contentWidth - used);
    for (Item& item : items) {
      if (item.flex <= 0) continue;
      const int share = weight > 0 ? static_cast<int>(static_cast<float>(free) * item.flex / weight + 0.5f) : 0;
      const ComputedStyle& childStyle = *item.element->style();
      item.width = ResolveWidth(childStyle, contentWidth, Insets(childStyle, contentWidth), std::clamp(share, 0, free));
      free -= std::min(free, share);
      weight -= item.flex;
    }

    int x = insets.left;
    int contentHeight = 0;
    for (Item& item : items) {
      x += item.margins.left;
      if (!item.element) {
        const LinesSize lines = InlineLayout::Measure(item.text, item.width, ctx);
        box.Extras().segments.push_back({item.text.firstNode, item.text.endNode, x, insets.top, item.width, lines.height});
        box.Set(kBoxInlineContent, true);
        contentHeight = std::max(contentHeight, lines.height);
      } else {
        const ComputedStyle& childStyle = *item.element->style();
        // Without a height of its own, or with a flexible one, a child fills the row's height:
        // panels side by side stand as tall as their row.
        int forced = -1;
        if (contentCbHeight >= 0 && (IsFlexible(childStyle.height) || childStyle.height.unit == Length::Unit::kAuto)) {
          forced = std::max(0, contentCbHeight - item.margins.vertical());
        }
        LayoutElement(*item.element, {item.width, forced, contentWidth, contentCbHeight}, ctx);
        Box& child = *BoxOf(*item.element);
        PlaceChild(*item.element, child, x, insets.top + item.margins.top, contentWidth, contentCbHeight);
        contentHeight = std::max(contentHeight, child.height + item.margins.vertical());
        if (child.baseline >= 0 && box.baseline < 0) box.baseline = insets.top + item.margins.top + child.baseline;
      }
      x += item.width + item.margins.right;
    }
    box.contentHeight = contentHeight;
    box.height = ResolveHeight(style, input, insets, contentHeight + HorizontalBarHeight(box));
  }

  IntrinsicWidths Intrinsic(Element& element, LayoutContext& ctx) const override {
    IntrinsicWidths result;
    for (Item& item : ItemsOf(element, nullptr, 0)) {
      const IntrinsicWidths widths = item.element ? IntrinsicOf(*item.element, ctx) : InlineLayout::Intrinsic(item.text, ctx);
      result.min += widths.min + item.margins.horizontal();
      result.max += widths.max + item.margins.horizontal();
    }
    const int insets = Insets(*element.style(), 0).horizontal();
    return {result.min + insets, result.max + insets};
  }
};

}  // namespace

const Renderer& FlowRenderer() {
  static const Flow renderer;
  return renderer;
}

}  // namespace kestrune::html::layout
