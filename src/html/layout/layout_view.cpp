#include "html/layout/layout_view.h"

#include <algorithm>

#include "html/controls/scroll_bar.h"
#include "html/dom/states.h"
#include "html/layout/positioned.h"
#include "html/layout/renderer.h"

namespace kestrune::html::layout {
namespace {

constexpr auto kSmoothScrollTime = std::chrono::milliseconds(120);
constexpr int kWheelStep = 48;  // px per wheel notch: three lines
constexpr int kArrowStep = 20;

Rect Intersect(const Rect& a, const Rect& b) {
  Rect r{std::max(a.left, b.left), std::max(a.top, b.top), std::min(a.right, b.right), std::min(a.bottom, b.bottom)};
  if (r.right < r.left) r.right = r.left;
  if (r.bottom < r.top) r.bottom = r.top;
  return r;
}

// A box whose size its content cannot change: a change inside it repaints only its area.
bool IsLayoutBoundary(const Element& element) {
  if (!element.parent()) return true;
  const css::ComputedStyle* style = element.style().get();
  if (!style || !Clips(*style)) return false;
  auto definite = [](const css::Length& l) {
    return l.unit == css::Length::Unit::kPx || l.unit == css::Length::Unit::kPercent || l.unit == css::Length::Unit::kFlex;
  };
  return definite(style->width) && definite(style->height);
}

// What a box scrolls over: all of its content, and never less than its viewport.
Size ScrollRange(const Element& element, const Box& box) {
  const Size extent = ScrollableExtent(element, box);
  const Rect view = ScrollViewport(element, box);
  return {std::max(extent.width, view.width()), std::max(extent.height, view.height())};
}

// The box's scroll state; a clipping box laid out without one (never scrolled) gets it now.
ScrollState* ScrollStateFor(const Element& element, Box& box) {
  if (box.scroll() || !box.Has(kBoxScroller)) return box.scroll();
  ScrollState& scroll = box.Extras().scroll.emplace();
  scroll.content = ScrollRange(element, box);
  return &scroll;
}

}  // namespace

LayoutView::LayoutView(dom::Document& document, const TextMeasurer& measurer, ImageSource& images)
    : document_(document), images_(images), ctx_(measurer, images_) {}

void LayoutView::SetViewSize(Size size) {
  if (size == view_) return;
  view_ = size;
  sizeChanged_ = true;
  Damage({0, 0, size.width, size.height});
}

void LayoutView::ImagesChanged() {
  images_.Clear();
  if (Element* root = document_.root()) root->MarkLayoutDirty();
  for (Element* e = document_.root(); e; e = dom::NextElementInOrder(e, document_.root())) {
    if (e->tag() == dom::kAtomImg) e->MarkLayoutDirty();
  }
  Damage({0, 0, view_.width, view_.height});
}

void LayoutView::PrunePopups() {
  std::erase_if(popups_, [&](const PopupPlacement& p) {
    return !(p.popup->state() & dom::kStatePopup) || p.popup->document() != &document_ || !p.popup->style() ||
           p.popup->style()->display == css::Display::kNone;
  });
}

const std::vector<PopupPlacement>& LayoutView::popups() {
  PrunePopups();
  return popups_;
}

void LayoutView::Layout() {
  Element* root = document_.root();
  if (!root || !root->style()) return;
  PrunePopups();
  const bool dirty = (root->dirty() & (dom::kLayoutDirty | dom::kChildLayoutDirty)) || sizeChanged_ || !BoxOf(*root);
  if (!dirty && popups_.empty()) return;
  ctx_.BeginPass(view_);
  if (dirty) {
    if (sizeChanged_) root->MarkLayoutDirty();
    LayoutElement(*root, {view_.width, view_.height, view_.width, view_.height}, ctx_);
    Box& box = *BoxOf(*root);
    box.x = box.y = 0;
    sizeChanged_ = false;
  }
  for (const PopupPlacement& p : popups_) {
    std::optional<Rect> anchor;
    if (p.anchor) anchor = Locate(*p.anchor, events::kViewRelative | events::kBorderBox);
    LayoutPopup(*p.popup, anchor ? &*anchor : nullptr, p.at, p.placement, ctx_);
  }
  for (Element* e : ctx_.resized) resized_.emplace_back(e);
}

std::vector<dom::Ref<Element>> LayoutView::TakeResized() { return std::exchange(resized_, {}); }

std::vector<Rect> LayoutView::TakeDamage() {
  if (Element* root = document_.root()) CollectDamage(*root);
  for (const PopupPlacement& p : popups_) {
    if (p.popup->dirty() & (dom::kPaintDirty | dom::kChildPaintDirty | dom::kLayoutDirty | dom::kChildLayoutDirty)) {
      DamageElement(*p.popup);
    }
  }
  return std::exchange(damage_, {});
}

void LayoutView::Damage(const Rect& viewRect) {
  const Rect clipped = Intersect(viewRect, {0, 0, view_.width, view_.height});
  if (clipped.width() <= 0 || clipped.height() <= 0) return;
  for (Rect& known : damage_) {
    if (known.left <= clipped.left && known.top <= clipped.top && known.right >= clipped.right && known.bottom >= clipped.bottom) return;
  }
  damage_.push_back(clipped);
}

void LayoutView::DamageElement(Element& element) {
  const Box* box = LiveBox(element);
  if (!box) return;
  Rect self{0, 0, box->width, box->height};
  if (box->Has(kBoxInline)) {
    if (auto rect = Locate(element, events::kSelfRelative | events::kBorderBox)) self = *rect;
  }
  if (auto rect = ClippedRect(element, self)) Damage(*rect);
}

// Walks what changed: an element to repaint repaints its box; one to lay out again repaints the
// box of its nearest layout boundary, as it was before, which will hold whatever moves.
void LayoutView::CollectDamage(Element& element) {
  const std::uint16_t dirty = element.dirty();
  if (!(dirty & (dom::kPaintDirty | dom::kChildPaintDirty | dom::kLayoutDirty))) return;
  if (dirty & dom::kLayoutDirty) {
    // Its children keep their bits (and it the bit that leads to them) until they are laid
    // out: a later walk repaints them where they are then.
    element.ClearDirty(dom::kPaintDirty);
    Element* boundary = element.parent() ? element.parent() : &element;
    while (boundary->parent() && (!IsLayoutBoundary(*boundary) || !LiveBox(*boundary))) boundary = boundary->parent();
    if (!boundary->parent()) {
      Damage({0, 0, view_.width, view_.height});
    } else {
      DamageElement(*boundary);
    }
    return;
  }
  element.ClearDirty(dom::kPaintDirty | dom::kChildPaintDirty);
  if (dirty & dom::kPaintDirty) DamageElement(element);
  if (dirty & dom::kChildPaintDirty) {
    for (dom::Node* node : element.nodes()) {
      if (Element* child = dom::AsElement(node)) CollectDamage(*child);
    }
  }
}

void LayoutView::EnsurePlaced(Element& container) {
  Box* box = LiveBox(container);
  if (!box || !box->Has(kBoxInlineContent) || box->Has(kBoxPlaced)) return;
  box->Set(kBoxPlaced, true);
  LinesOf(container, PlaceMode::kPaint);
}

std::vector<PlacedLine> LayoutView::LinesOf(Element& container, PlaceMode mode) {
  Box* box = LiveBox(container);
  if (!box || !box->Has(kBoxInlineContent)) return {};
  ctx_.ForgetStyles();
  // Lines are placed from their segment's origin and answered in the view's terms.
  std::vector<PlacedLine> all;
  auto place = [&](const InlineRange& range, int width, Point origin) {
    for (PlacedLine& line : InlineLayout::Place(range, width, origin, mode, ctx_)) {
      line.top += origin.y;
      line.baseline += origin.y;
      for (PlacedRun& run : line.runs) {
        run.x += origin.x;
        if (run.kind == PlacedRun::Kind::kText) run.top += origin.y;
      }
      for (InlineFragment& f : line.fragments) {
        f.left += origin.x;
        f.right += origin.x;
      }
      all.push_back(std::move(line));
    }
  };
  if (!box->extras || box->extras->segments.empty()) {
    const Edges insets = Insets(*container.style(), box->cbWidth);
    place({&container, 0, static_cast<std::uint32_t>(container.nodes().size())}, ContentWidth(*box, insets),
          LinesOrigin(container, *box));
  } else {
    for (const InlineSegment& segment : box->extras->segments) {
      place({&container, segment.firstNode, segment.endNode}, segment.width, {segment.x, segment.y});
    }
  }
  return all;
}

Point LayoutView::ShownScroll(const Box& box) const {
  const ScrollState* scroll = box.scroll();
  return scroll ? scroll->shown : Point{};
}

bool LayoutView::ScrollTo(Element& element, Point position, bool smooth) {
  Box* box = LiveBox(element);
  if (!box) return false;
  ScrollState* scroll = ScrollStateFor(element, *box);
  if (!scroll) return true;  // nothing to scroll: the position stays (0, 0)
  const Rect view = ScrollViewport(element, *box);
  position.x = std::clamp(position.x, 0, std::max(0, scroll->content.width - view.width()));
  position.y = std::clamp(position.y, 0, std::max(0, scroll->content.height - view.height()));
  if (position == scroll->position && position == scroll->shown) return true;
  std::erase_if(animations_, [&](const Animation& a) { return a.element.get() == &element; });
  scroll->position = position;
  if (smooth && scroll->shown != position) {
    animations_.push_back({dom::Ref<Element>(&element), scroll->shown, Clock::now()});
  } else {
    scroll->shown = position;
  }
  DamageElement(element);
  return true;
}

bool LayoutView::Animate(Clock::time_point now) {
  std::erase_if(animations_, [&](const Animation& a) {
    Box* box = LiveBox(*a.element);
    ScrollState* scroll = box ? box->scroll() : nullptr;
    if (!scroll) return true;
    const double t = std::clamp(std::chrono::duration<double>(now - a.start) / kSmoothScrollTime, 0.0, 1.0);
    const double eased = 1 - (1 - t) * (1 - t);
    const Point to = scroll->position;
    scroll->shown = {a.from.x + static_cast<int>((to.x - a.from.x) * eased), a.from.y + static_cast<int>((to.y - a.from.y) * eased)};
    if (t >= 1) scroll->shown = to;
    DamageElement(*a.element);
    return t >= 1;
  });
  return !animations_.empty();
}

bool LayoutView::SetScrollPos(Element& element, Point position, bool smooth) {
  Layout();
  return ScrollTo(element, position, smooth);
}

bool LayoutView::PlacePopup(Element& popup, Element* anchor, Point at, unsigned placement) {
  std::erase_if(popups_, [&](const PopupPlacement& p) { return p.popup.get() == &popup; });
  popups_.push_back({dom::Ref<Element>(&popup), dom::Ref<Element>(anchor), at, placement});
  Layout();
  DamageElement(popup);
  return LiveBox(popup) != nullptr;
}

Element* LayoutView::ScrollerAt(Point viewPoint, bool* vertical) {
  for (Element* e = HitTest(viewPoint); e; e = e->parent()) {
    Box* box = LiveBox(*e);
    const ScrollState* scroll = box ? box->scroll() : nullptr;
    if (!scroll || (!scroll->vertical && !scroll->horizontal)) continue;
    const auto origin = OriginInView(*e);
    if (!origin) continue;
    const Rect view = ScrollViewport(*e, *box);
    const Point local{viewPoint.x - origin->x, viewPoint.y - origin->y};
    if (scroll->vertical && local.x >= view.right && local.x < view.right + kScrollBarSize && local.y >= view.top &&
        local.y < view.bottom) {
      *vertical = true;
      return e;
    }
    if (scroll->horizontal && local.y >= view.bottom && local.y < view.bottom + kScrollBarSize && local.x >= view.left &&
        local.x < view.right) {
      *vertical = false;
      return e;
    }
  }
  return nullptr;
}

bool LayoutView::ScrollBarInput(const events::MouseInput& input) {
  Layout();
  auto scrollBy = [&](Element& element, bool vertical, unsigned cmd, int value) {
    Box* box = LiveBox(element);
    if (!box || !box->scroll()) return;
    if (onScroll_ && onScroll_(element, cmd, value, vertical)) return;
    Point position = box->scroll()->position;
    (vertical ? position.y : position.x) = value;
    ScrollTo(element, position, false);
  };
  auto partsOf = [&](Element& element, bool vertical, Point* local) -> std::optional<controls::ScrollBarParts> {
    Box* box = LiveBox(element);
    const auto origin = OriginInView(element);
    if (!box || !box->scroll() || !origin) return std::nullopt;
    const ScrollState& scroll = *box->scroll();
    const Rect view = ScrollViewport(element, *box);
    const Rect bar = vertical ? Rect{view.right, view.top, view.right + kScrollBarSize, view.bottom}
                              : Rect{view.left, view.bottom, view.right, view.bottom + kScrollBarSize};
    *local = {input.pos.x - origin->x, input.pos.y - origin->y};
    const int page = vertical ? view.height() : view.width();
    const int range = std::max(0, (vertical ? scroll.content.height : scroll.content.width) - page);
    return controls::ScrollBarLayout(bar, vertical, vertical ? scroll.position.y : scroll.position.x, 0, range, page);
  };
  if (drag_) {
    Point local;
    auto parts = partsOf(*drag_->element, drag_->vertical, &local);
    if (input.cmd == events::kMouseUp || !parts) {
      drag_.reset();
      return true;
    }
    if (input.cmd == events::kMouseMove) {
      Box& box = *LiveBox(*drag_->element);
      const Rect view = ScrollViewport(*drag_->element, box);
      const int page = drag_->vertical ? view.height() : view.width();
      const int range = std::max(0, (drag_->vertical ? box.scroll()->content.height : box.scroll()->content.width) - page);
      const int along = drag_->vertical ? local.y : local.x;
      scrollBy(*drag_->element, drag_->vertical, events::kScrollPos,
               controls::ScrollBarValueAt(*parts, drag_->vertical, along - drag_->grab, 0, range));
    }
    return true;
  }
  if (input.cmd != events::kMouseDown || !(input.buttons & events::kMainMouseButton)) return false;
  bool vertical = true;
  Element* element = ScrollerAt(input.pos, &vertical);
  if (!element) return false;
  Point local;
  auto parts = partsOf(*element, vertical, &local);
  if (!parts) return false;
  const ScrollState& scroll = *LiveBox(*element)->scroll();
  const int position = vertical ? scroll.position.y : scroll.position.x;
  const Rect view = ScrollViewport(*element, *LiveBox(*element));
  const int page = std::max(1, (vertical ? view.height() : view.width()) - kArrowStep);
  const int along = vertical ? local.y : local.x;
  if (parts->back.Contains(local)) {
    scrollBy(*element, vertical, events::kScrollStepMinus, position - kArrowStep);
  } else if (parts->forward.Contains(local)) {
    scrollBy(*element, vertical, events::kScrollStepPlus, position + kArrowStep);
  } else if (parts->thumb.Contains(local)) {
    drag_ = Drag{dom::Ref<Element>(element), vertical, along - (vertical ? parts->thumb.top : parts->thumb.left)};
  } else if (along < (vertical ? parts->thumb.top : parts->thumb.left)) {
    scrollBy(*element, vertical, events::kScrollPageMinus, position - page);
  } else {
    scrollBy(*element, vertical, events::kScrollPagePlus, position + page);
  }
  return true;
}

bool LayoutView::Wheel(Element* target, int delta) {
  Layout();
  for (Element* e = target; e; e = e->parent()) {
    Box* box = LiveBox(*e);
    ScrollState* scroll = box ? box->scroll() : nullptr;
    if (!scroll || !scroll->vertical) continue;
    const Rect view = ScrollViewport(*e, *box);
    const int limit = std::max(0, scroll->content.height - view.height());
    const int next = std::clamp(scroll->position.y - delta * kWheelStep, 0, limit);
    if (next == scroll->position.y) continue;
    if (onScroll_ && onScroll_(*e, delta > 0 ? events::kScrollStepMinus : events::kScrollStepPlus, next, true)) return true;
    ScrollTo(*e, {scroll->position.x, next}, false);
    return true;
  }
  return false;
}

std::optional<events::ScrollInfo> LayoutView::GetScrollInfo(Element& element) {
  Layout();
  Box* box = LiveBox(element);
  if (!box) return std::nullopt;
  const Rect view = ScrollViewport(element, *box);
  if (const ScrollState* scroll = box->scroll()) return events::ScrollInfo{scroll->position, view, scroll->content};
  if (!box->Has(kBoxScroller)) return events::ScrollInfo{{}, view, {view.width(), view.height()}};
  return events::ScrollInfo{{}, view, ScrollRange(element, *box)};  // a clipping box never scrolled
}

bool LayoutView::ScrollToView(Element& element, bool toTop, bool smooth) {
  Layout();
  auto rect = Locate(element, events::kViewRelative | events::kBorderBox);
  if (!rect) return false;
  for (Element* up = element.parent(); up; up = up->parent()) {
    Box* box = LiveBox(*up);
    ScrollState* scroll = box ? ScrollStateFor(*up, *box) : nullptr;
    if (!scroll) continue;
    const auto origin = OriginInView(*up);
    if (!origin) break;
    Rect view = ScrollViewport(*up, *box);
    // Pinned header rows cover the top of a scrolling table.
    if (box->extras && box->extras->headerHeight > 0) view.top = std::min(view.bottom, view.top + box->extras->headerHeight);
    view = {view.left + origin->x, view.top + origin->y, view.right + origin->x, view.bottom + origin->y};
    int dy = 0, dx = 0;
    if (toTop || rect->top < view.top) dy = rect->top - view.top;
    else if (rect->bottom > view.bottom) dy = std::min(rect->bottom - view.bottom, rect->top - view.top);
    if (rect->left < view.left) dx = rect->left - view.left;
    else if (rect->right > view.right) dx = std::min(rect->right - view.right, rect->left - view.left);
    const Point before = scroll->position;
    ScrollTo(*up, {before.x + dx, before.y + dy}, smooth);
    const Point moved{scroll->position.x - before.x, scroll->position.y - before.y};
    *rect = {rect->left - moved.x, rect->top - moved.y, rect->right - moved.x, rect->bottom - moved.y};
  }
  return true;
}

}  // namespace kestrune::html::layout
