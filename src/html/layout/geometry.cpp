// Where boxes are in the view: locations by location code, hit tests and caret positions.
#include <algorithm>

#include "html/controls/control.h"
#include "html/dom/states.h"
#include "html/layout/layout_view.h"

namespace kestrune::html::layout {
namespace {

using events::ElementAreas;

Rect Offset(const Rect& r, int dx, int dy) { return {r.left + dx, r.top + dy, r.right + dx, r.bottom + dy}; }

Rect Union(const Rect& a, const Rect& b) {
  if (a.width() <= 0 && a.height() <= 0) return b;
  return {std::min(a.left, b.left), std::min(a.top, b.top), std::max(a.right, b.right), std::max(a.bottom, b.bottom)};
}

// The block container whose lines hold an element, if that is how it is placed.
Element* LinesHolding(const Element& element) {
  const css::ComputedStyle* style = element.style().get();
  if (!style || IsOutOfFlow(*style) || (element.state() & dom::kStatePopup)) return nullptr;
  const Element* child = &element;
  Element* up = element.parent();
  while (up && up->parent()) {
    const Box* box = BoxOf(*up);
    if (!box || !box->Has(kBoxInline)) break;
    child = up;
    up = up->parent();
  }
  const Box* box = up ? BoxOf(*up) : nullptr;
  return box && InLines(*up, *box, *child) ? up : nullptr;
}

// The element a box's x and y are relative to.
const Element* OffsetParent(const Element& element, const Box& box) {
  if (!box.Has(kBoxAbsolute)) return element.parent();
  const Element* up = element.parent();
  for (; up && up->parent(); up = up->parent()) {
    if (up->style() && up->style()->position != css::Position::kStatic) return up;
  }
  return up;
}

bool IsVisible(const Element& element) { return element.style()->visibility == css::Visibility::kVisible; }

Rect BackgroundImageRect(const Element& element, const Box& box, LayoutContext& ctx) {
  const css::ComputedStyle& style = *element.style();
  const auto image = ctx.images().Get(style.backgroundImage);
  if (!image) return {};
  const Edges border = BorderWidths(style);
  const Rect padding{border.left, border.top, box.width - border.right, box.height - border.bottom};
  const int x = padding.left + Px(style.backgroundPosition[0], padding.width() - image->size.width);
  const int y = padding.top + Px(style.backgroundPosition[1], padding.height() - image->size.height);
  return {x, y, x + image->size.width, y + image->size.height};
}

}  // namespace

std::optional<Point> LayoutView::OriginInView(const Element& element, bool shownScroll) {
  if (element.document() != &document_) return std::nullopt;
  for (const Element* e = &element; e; e = e->parent()) {
    if (!LiveBox(*e)) return std::nullopt;
  }
  Point p;
  for (const Element* e = &element; e && e->parent();) {
    if (Element* lines = LinesHolding(*e)) EnsurePlaced(*lines);
    const Box& box = *BoxOf(*e);
    p.x += box.x;
    p.y += box.y;
    if (box.Has(kBoxFixed)) return p;
    const Element* next = OffsetParent(*e, box);
    const Box* parent = next ? BoxOf(*next) : nullptr;
    if (!parent) return std::nullopt;
    if (const ScrollState* scroll = parent->scroll(); scroll && !box.Has(kBoxPinned)) {
      const Point by = shownScroll ? scroll->shown : scroll->position;
      p.x -= by.x;
      p.y -= by.y;
    }
    e = next;
  }
  return p;
}

std::optional<Rect> LayoutView::Location(Element& element, unsigned areas) {
  Layout();
  return Locate(element, areas);
}

std::optional<Rect> LayoutView::Locate(const Element& element, unsigned areas) {
  const Box* box = LiveBox(element);
  auto origin = OriginInView(element);
  if (!box || !origin) return std::nullopt;
  const css::ComputedStyle& style = *element.style();
  ctx_.ForgetStyles();
  Rect border{0, 0, box->width, box->height};
  if (box->Has(kBoxInline)) {
    // The union of the element's pieces on its container's lines.
    Element* container = element.parent();
    while (container && BoxOf(*container) && BoxOf(*container)->Has(kBoxInline)) container = container->parent();
    if (!container) return std::nullopt;
    Rect found;
    const FontMetrics& m = ctx_.MetricsOf(style);
    for (const PlacedLine& line : LinesOf(*container, PlaceMode::kMeasureAll)) {
      for (const InlineFragment& f : line.fragments) {
        if (f.element == &element) found = Union(found, {f.left, line.baseline - m.ascent, f.right, line.baseline + m.descent});
      }
      for (const PlacedRun& run : line.runs) {
        if (run.element == &element || element.IsAncestorOf(run.element)) {
          found = Union(found, {run.x, run.top, run.x + std::max(0, run.width), run.top + run.height});
        }
      }
    }
    *origin = {origin->x + found.left, origin->y + found.top};
    border = {0, 0, found.width(), found.height()};
  }
  const Edges b = BorderWidths(style), p = Padding(style, box->cbWidth), m = Margins(style, box->cbWidth);
  Rect self;
  switch (areas & 0xF0u) {
    case events::kPaddingBox: self = {b.left, b.top, border.right - b.right, border.bottom - b.bottom}; break;
    case events::kBorderBox: self = border; break;
    case events::kMarginBox: self = {-m.left, -m.top, border.right + m.right, border.bottom + m.bottom}; break;
    case events::kScrollableArea:
      if (box->scroll()) {
        self = ScrollViewport(element, *box);
        break;
      }
      [[fallthrough]];
    case events::kContentBox:
      self = {b.left + p.left, b.top + p.top, border.right - b.right - p.right, border.bottom - b.bottom - p.bottom};
      break;
    case events::kBackImageArea: self = BackgroundImageRect(element, *box, ctx_); break;
    default: return std::nullopt;  // foreground images are not drawn by this engine
  }
  switch (areas & 0x0Fu) {
    case events::kSelfRelative: return self;
    case events::kViewRelative: return Offset(self, origin->x, origin->y);
    case events::kContainerRelative: {
      const Element* parent = element.parent();
      const auto base = parent ? OriginInView(*parent) : std::optional<Point>(Point{});
      if (!base) return std::nullopt;
      return Offset(self, origin->x - base->x, origin->y - base->y);
    }
    default: {
      // Root-relative: the document's coordinates, where the view's own scrolling is undone.
      const Box* root = BoxOf(*document_.root());
      const Point scroll = root && root->scroll() ? root->scroll()->position : Point{};
      return Offset(self, origin->x + scroll.x, origin->y + scroll.y);
    }
  }
}

std::optional<Rect> LayoutView::ClippedRect(const Element& element, const Rect& self) {
  auto origin = OriginInView(element);
  if (!origin) return std::nullopt;
  Rect rect = Offset(self, origin->x, origin->y);
  const Box* box = BoxOf(element);
  if (box && box->Has(kBoxFixed)) return rect;
  for (const Element* up = element.parent(); up; up = up->parent()) {
    const Box* upBox = LiveBox(*up);
    if (!upBox) return std::nullopt;
    if (upBox->Has(kBoxScroller)) {
      const auto at = OriginInView(*up);
      if (!at) return std::nullopt;
      const Rect clip = Offset(ScrollViewport(*up, *upBox), at->x, at->y);
      rect = {std::max(rect.left, clip.left), std::max(rect.top, clip.top), std::min(rect.right, clip.right),
              std::min(rect.bottom, clip.bottom)};
      if (rect.width() <= 0 || rect.height() <= 0) return std::nullopt;
    }
    if (upBox->Has(kBoxFixed)) break;
  }
  return rect;
}

Element* LayoutView::HitTest(Point viewPoint) {
  Layout();
  ctx_.ForgetStyles();
  const auto& shown = popups();
  for (auto it = shown.rbegin(); it != shown.rend(); ++it) {
    const Box* box = LiveBox(*it->popup);
    if (!box) continue;
    if (Element* hit = HitIn(*it->popup, viewPoint, {box->x, box->y})) return hit;
  }
  Element* root = document_.root();
  if (!root || !LiveBox(*root)) return nullptr;
  Element* hit = HitIn(*root, viewPoint, {0, 0});
  return hit ? hit : root;
}

Element* LayoutView::HitIn(Element& element, Point viewPoint, Point origin) {
  Box* box = LiveBox(element);
  if (!box || !element.style()) return nullptr;
  const std::vector<Element*> positioned = PositionedInOrder(element);
  auto zOf = [](const Element* e) { return e->style()->zIndexAuto ? 0 : e->style()->zIndex; };
  auto hitPositioned = [&](bool front) -> Element* {
    for (auto it = positioned.rbegin(); it != positioned.rend(); ++it) {
      if ((zOf(*it) >= 0) != front) continue;
      if (auto at = OriginInView(**it)) {
        if (Element* hit = HitIn(**it, viewPoint, *at)) return hit;
      }
    }
    return nullptr;
  };
  if (Element* hit = hitPositioned(true)) return hit;

  const Point local{viewPoint.x - origin.x, viewPoint.y - origin.y};
  const bool inside = local.x >= 0 && local.y >= 0 && local.x < box->width && local.y < box->height;
  const ScrollState* scroll = box->scroll();
  const Rect viewport = ScrollViewport(element, *box);
  if (scroll && inside && !viewport.Contains(local) && (local.x >= viewport.right || local.y >= viewport.bottom)) {
    return &element;  // its scroll bars
  }
  if (!box->Has(kBoxScroller) || viewport.Contains(local)) {
    const Point shift = scroll ? scroll->position : Point{};
    const int header = box->extras ? box->extras->headerHeight : 0;
    const auto& nodes = element.nodes();
    auto tryChild = [&](Element& child) -> Element* {
      Box* childBox = LiveBox(child);
      if (!childBox || childBox->Has(kBoxAbsolute | kBoxFixed | kBoxInline) || (child.state() & dom::kStatePopup)) return nullptr;
      if (LinesHolding(child)) return nullptr;
      const bool pinned = childBox->Has(kBoxPinned);
      const Point at{origin.x + childBox->x - (pinned ? 0 : shift.x), origin.y + childBox->y - (pinned ? 0 : shift.y)};
      if (!pinned && header > 0 && local.y < viewport.top + header) return nullptr;
      const bool within = viewPoint.x >= at.x && viewPoint.y >= at.y && viewPoint.x < at.x + childBox->width &&
                          viewPoint.y < at.y + childBox->height;
      if (!within && !childBox->Has(kBoxOverflows) && !(childBox->extras && !childBox->extras->positioned.empty())) return nullptr;
      return HitIn(child, viewPoint, at);
    };
    if (header > 0) {
      for (dom::Node* node : nodes) {
        Element* child = dom::AsElement(node);
        if (!child) continue;
        const Box* childBox = LiveBox(*child);
        if (!childBox || !childBox->Has(kBoxPinned)) break;
        if (Element* hit = tryChild(*child)) return hit;
      }
    }
    // Sorted children: only those from the one reaching the point down can hold it.
    const std::size_t from = FirstChildReaching(element, *box, local.y + shift.y);
    std::size_t to = nodes.size();
    if (box->Has(kBoxSortedChildren)) {
      for (to = from; to < nodes.size(); ++to) {
        const Element* child = dom::AsElement(nodes[to]);
        const Box* childBox = child ? LiveBox(*child) : nullptr;
        if (childBox && !childBox->Has(kBoxAbsolute | kBoxFixed | kBoxInline) && childBox->y > local.y + shift.y) break;
      }
    }
    for (std::size_t i = to; i > from; --i) {
      if (Element* child = dom::AsElement(nodes[i - 1])) {
        if (Element* hit = tryChild(*child)) return hit;
      }
    }
    if (box->Has(kBoxInlineContent)) {
      if (Element* hit = HitLines(element, *box, viewPoint, origin, shift)) return hit;
    }
  }
  if (Element* hit = hitPositioned(false)) return hit;
  return inside && IsVisible(element) ? &element : nullptr;
}

Element* LayoutView::HitLines(Element& element, Box& box, Point viewPoint, Point origin, Point scroll) {
  box.Set(kBoxPlaced, true);
  const Point local{viewPoint.x - origin.x + scroll.x, viewPoint.y - origin.y + scroll.y};
  const std::vector<PlacedLine> lines = LinesOf(element, PlaceMode::kPaint);
  const int right = box.width - Insets(*element.style(), box.cbWidth).right;
  for (auto line = lines.rbegin(); line != lines.rend(); ++line) {
    if (local.y < line->top || local.y >= line->top + line->height) continue;
    for (auto run = line->runs.rbegin(); run != line->runs.rend(); ++run) {
      if (run->kind == PlacedRun::Kind::kAtomic) {
        const Box* atom = LiveBox(*run->element);
        if (!atom) continue;
        if (Element* hit = HitIn(*run->element, viewPoint, {origin.x + atom->x - scroll.x, origin.y + atom->y - scroll.y})) return hit;
        continue;
      }
      const int end = run->width >= 0 ? run->x + run->width : right;
      if (local.x < run->x || local.x >= end || run->element == &element) continue;
      // Text inside an inline element: the innermost visible one takes the hit.
      for (Element* e = run->element; e && e != &element; e = e->parent()) {
        if (IsVisible(*e)) return e;
      }
    }
  }
  return nullptr;
}

std::optional<std::size_t> LayoutView::CharacterAt(Element& element, Point viewPoint) {
  Layout();
  const Box* box = LiveBox(element);
  const auto origin = OriginInView(element);
  if (!box || !origin) return std::nullopt;
  const Point scroll = box->scroll() ? box->scroll()->position : Point{};
  const Point local{viewPoint.x - origin->x + scroll.x, viewPoint.y - origin->y + scroll.y};
  const std::vector<PlacedLine> lines = LinesOf(element, PlaceMode::kMeasureAll);
  if (lines.empty()) return 0;
  const PlacedLine* line = &lines.back();
  for (const PlacedLine& l : lines) {
    if (local.y < l.top + l.height) {
      line = &l;
      break;
    }
  }
  const controls::Control* control = controls::ControlOf(element);
  const bool password = control && control->Type(element) == controls::kCtlPassword;
  const PlacedRun* last = nullptr;
  for (const PlacedRun& run : line->runs) {
    if (run.kind != PlacedRun::Kind::kText) continue;
    if (local.x < run.x) return run.offset;
    last = &run;
    if (local.x >= run.x + run.width) continue;
    const std::u16string shown = password ? std::u16string(run.text.size(), u'\u2022') : run.text;
    const Font font = FontOf(*run.style);
    // The boundary nearest to the point: widths of the prefixes grow with their length.
    std::size_t low = 0, high = shown.size();
    while (low < high) {
      const std::size_t mid = (low + high + 1) / 2;
      if (run.x + ctx_.measurer().TextWidth(font, std::u16string_view(shown).substr(0, mid)) <= local.x) low = mid;
      else high = mid - 1;
    }
    if (low < shown.size()) {
      const int before = ctx_.measurer().TextWidth(font, std::u16string_view(shown).substr(0, low));
      const int after = ctx_.measurer().TextWidth(font, std::u16string_view(shown).substr(0, low + 1));
      if (local.x - (run.x + before) > (run.x + after) - local.x) ++low;
    }
    return run.offset + low;
  }
  return last ? last->offset + last->text.size() : 0;
}

}  // namespace kestrune::html::layout
