#include "html/layout/box.h"

#include <algorithm>
#include <cmath>
#include <cstddef>

#include "base/size_class_pool.h"

namespace kestrune::html::layout {
namespace {

// A big table has a box per element: they come from a pool like the nodes do, without a heap
// header each. UI thread only.
SizeClassPool& BoxMemory() {
  static auto* pool = new SizeClassPool();
  return *pool;
}

constexpr int kMaxPx = 1 << 24;  // lengths stay far from int overflow when summed

// Halves round away from zero, as lround does, without the library call: a table asks for
// every cell's paddings more than once.
int Round(double value) {
  const double v = std::clamp(value, -double{kMaxPx}, double{kMaxPx});
  return static_cast<int>(v < 0 ? v - 0.5 : v + 0.5);
}

bool Drawn(const css::Border& border) {
  return border.style != css::BorderStyle::kNone && border.style != css::BorderStyle::kHidden;
}

}  // namespace

void* Box::operator new(std::size_t size) { return BoxMemory().Allocate(size); }

void Box::operator delete(void* memory, std::size_t size) { BoxMemory().Deallocate(memory, size); }

BoxExtras& Box::Extras() {
  if (!extras) extras = std::make_unique<BoxExtras>();
  return *extras;
}

Box& EnsureBox(Element& element) {
  if (!element.layoutData()) element.layoutData() = std::unique_ptr<dom::Extension>(new Box());
  return *static_cast<Box*>(element.layoutData().get());
}

Box* LiveBox(const Element& element) {
  Box* box = BoxOf(element);
  return box && !box->Has(kBoxHidden) ? box : nullptr;
}

int Px(const css::Length& length, int percentBase, int autoValue) {
  switch (length.unit) {
    case css::Length::Unit::kPx: return Round(length.value);
    case css::Length::Unit::kPercent: return percentBase < 0 ? autoValue : Round(double{length.value} * percentBase / 100.0);
    default: return autoValue;
  }
}

Edges BorderWidths(const css::ComputedStyle& style) {
  auto side = [&](int s) { return Drawn(style.border[s]) ? Round(style.border[s].width) : 0; };
  return {side(css::kTop), side(css::kRight), side(css::kBottom), side(css::kLeft)};
}

Edges Padding(const css::ComputedStyle& style, int cbWidth) {
  auto side = [&](int s) { return std::max(0, Px(style.padding[s], cbWidth)); };
  return {side(css::kTop), side(css::kRight), side(css::kBottom), side(css::kLeft)};
}

Edges Margins(const css::ComputedStyle& style, int cbWidth) {
  auto side = [&](int s) { return Px(style.margin[s], cbWidth); };
  return {side(css::kTop), side(css::kRight), side(css::kBottom), side(css::kLeft)};
}

bool IsBlockLevel(const css::ComputedStyle& style) {
  using D = css::Display;
  return style.display != D::kInline && style.display != D::kInlineBlock && style.display != D::kInlineTable;
}

bool IsOutOfFlow(const css::ComputedStyle& style) {
  return style.position == css::Position::kAbsolute || style.position == css::Position::kFixed;
}

bool Clips(const css::ComputedStyle& style) {
  return style.overflowX != css::Overflow::kVisible || style.overflowY != css::Overflow::kVisible;
}

namespace {

// Indexes from the root down: comparing them orders elements as the document does.
std::vector<std::size_t> PathOf(const Element& element) {
  std::vector<std::size_t> path;
  for (const Element* e = &element; e->parent(); e = e->parent()) path.push_back(e->nodeIndex());
  std::reverse(path.begin(), path.end());
  return path;
}

}  // namespace

std::vector<Element*> PositionedInOrder(const Element& container) {
  std::vector<Element*> result;
  const Box* box = LiveBox(container);
  if (!box || !box->extras) return result;
  for (const dom::Ref<Element>& e : box->extras->positioned) {
    if (LiveBox(*e) && e->style() && IsOutOfFlow(*e->style()) && e->document() == container.document()) result.push_back(e.get());
  }
  if (result.size() < 2) return result;
  std::vector<std::pair<std::vector<std::size_t>, Element*>> keyed;
  for (Element* e : result) keyed.emplace_back(PathOf(*e), e);
  std::stable_sort(keyed.begin(), keyed.end(), [](const auto& a, const auto& b) {
    const int za = a.second->style()->zIndexAuto ? 0 : a.second->style()->zIndex;
    const int zb = b.second->style()->zIndexAuto ? 0 : b.second->style()->zIndex;
    return za != zb ? za < zb : a.first < b.first;
  });
  for (std::size_t i = 0; i < keyed.size(); ++i) result[i] = keyed[i].second;
  return result;
}

bool InLines(const Element& container, const Box& box, const dom::Node& child) {
  if (!box.Has(kBoxInlineContent) || child.parent() != &container) return false;
  if (!box.extras || box.extras->segments.empty()) return true;
  const std::uint32_t index = child.nodeIndex();
  return std::any_of(box.extras->segments.begin(), box.extras->segments.end(),
                     [&](const InlineSegment& s) { return index >= s.firstNode && index < s.endNode; });
}

std::size_t FirstChildReaching(const Element& parent, const Box& box, int y) {
  if (!box.Has(kBoxSortedChildren)) return 0;
  const auto& nodes = parent.nodes();
  // The bottom of the first element box at or after `i`, or none.
  auto bottomFrom = [&](std::size_t i) -> std::optional<int> {
    for (; i < nodes.size(); ++i) {
      if (const Element* e = dom::AsElement(nodes[i])) {
        const Box* b = LiveBox(*e);
        if (b && !b->Has(kBoxAbsolute | kBoxFixed | kBoxInline)) return b->y + b->height;
      }
    }
    return std::nullopt;
  };
  std::size_t low = 0, high = nodes.size();
  while (low < high) {
    const std::size_t mid = low + (high - low) / 2;
    const auto bottom = bottomFrom(mid);
    if (bottom && *bottom <= y) low = mid + 1;
    else high = mid;
  }
  return low;
}

Point LinesOrigin(const Element& element, const Box& box) {
  if (!element.style()) return {};
  const css::ComputedStyle& style = *element.style();
  const Edges insets = Insets(style, box.cbWidth);
  int y = insets.top;
  if (style.display == css::Display::kTableCell) {
    const int free = box.height - insets.vertical() - box.contentHeight;
    if (free > 0 && style.verticalAlign == css::VerticalAlign::kMiddle) y += free / 2;
    if (free > 0 && style.verticalAlign == css::VerticalAlign::kBottom) y += free;
  }
  return {insets.left, y};
}

Rect ScrollViewport(const Element& element, const Box& box) {
  const Edges border = element.style() ? BorderWidths(*element.style()) : Edges{};
  Rect view{border.left, border.top, box.width - border.right, box.height - border.bottom};
  if (const ScrollState* scroll = box.scroll()) {
    if (scroll->vertical) view.right -= kScrollBarSize;
    if (scroll->horizontal) view.bottom -= kScrollBarSize;
  }
  view.right = std::max(view.left, view.right);
  view.bottom = std::max(view.top, view.bottom);
  return view;
}

}  // namespace kestrune::html::layout
