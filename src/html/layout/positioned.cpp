#include "html/layout/positioned.h"

#include <algorithm>

namespace kestrune::html::layout {
namespace {

using css::ComputedStyle;
using css::Length;

bool IsAuto(const Length& length) { return length.unit == Length::Unit::kAuto; }

// The nearest positioned ancestor (the root for fixed boxes): the container an out-of-flow
// element registers with.
const Element* ContainerOf(const Element& element) {
  const bool fixed = element.style()->position == css::Position::kFixed;
  const Element* up = element.parent();
  for (; up && up->parent(); up = up->parent()) {
    if (!fixed && up->style() && up->style()->position != css::Position::kStatic) return up;
  }
  return up;
}

// Whether the element may still be laid out as one of the container's positioned descendants.
bool StillBelongs(const Element& element, const Element& container) {
  if (!element.style() || !IsOutOfFlow(*element.style()) || element.document() != container.document()) return false;
  if (element.document() == nullptr) return false;
  if (ContainerOf(element) != &container) return false;
  for (const Element* up = element.parent(); up; up = up->parent()) {
    if (!up->style() || up->style()->display == css::Display::kNone) return false;
  }
  return true;
}

void LayoutOne(Element& element, const Rect& area, Point staticInArea, bool fixed, LayoutContext& ctx) {
  const ComputedStyle& style = *element.style();
  const int cbWidth = area.width(), cbHeight = area.height();
  const Edges margins = Margins(style, cbWidth);
  const Edges insets = Insets(style, cbWidth);
  const auto& o = style.offsets;
  const int left = Px(o[css::kLeft], cbWidth), right = Px(o[css::kRight], cbWidth);
  const int top = Px(o[css::kTop], cbHeight), bottom = Px(o[css::kBottom], cbHeight);
  const bool sized = style.width.unit == Length::Unit::kPx || style.width.unit == Length::Unit::kPercent;
  int width;
  if (sized) {
    width = ResolveWidth(style, cbWidth, insets, 0);
  } else if (!IsAuto(o[css::kLeft]) && !IsAuto(o[css::kRight])) {
    width = ResolveWidth(style, cbWidth, insets, std::max(0, cbWidth - left - right - margins.horizontal()));
  } else {
    const int from = IsAuto(o[css::kLeft]) ? (IsAuto(o[css::kRight]) ? staticInArea.x : right) : left;
    width = ShrinkToFit(element, std::max(0, cbWidth - from - margins.horizontal()), ctx);
  }
  int forced = -1;
  if ((IsAuto(style.height) || IsFlexible(style.height)) && !IsAuto(o[css::kTop]) && !IsAuto(o[css::kBottom])) {
    forced = std::max(insets.vertical(), cbHeight - top - bottom - margins.vertical());
  }
  LayoutElement(element, {width, forced, cbWidth, cbHeight}, ctx);
  Box& box = *BoxOf(element);
  int x = area.left + staticInArea.x + margins.left;
  if (!IsAuto(o[css::kLeft])) x = area.left + left + margins.left;
  else if (!IsAuto(o[css::kRight])) x = area.right - right - margins.right - box.width;
  int y = area.top + staticInArea.y + margins.top;
  if (!IsAuto(o[css::kTop])) y = area.top + top + margins.top;
  else if (!IsAuto(o[css::kBottom])) y = area.bottom - bottom - margins.bottom - box.height;
  box.x = x;
  box.y = y;
  box.Set(fixed ? kBoxFixed : kBoxAbsolute, true);
}

}  // namespace

Point OriginInDocument(const Element& element) {
  Point origin;
  for (const Element* e = &element; e && e->parent(); e = e->parent()) {
    const Box* box = BoxOf(*e);
    if (!box) break;
    origin.x += box->x;
    origin.y += box->y;
    if (box->Has(kBoxFixed)) break;
    if (box->Has(kBoxAbsolute)) {
      const Element* container = ContainerOf(*e);
      if (!container) break;
      const Point rest = OriginInDocument(*container);
      return {origin.x + rest.x, origin.y + rest.y};
    }
  }
  return origin;
}

void LayoutPositionedDescendants(Element& container, Box& box, LayoutContext& ctx) {
  if (!box.extras || box.extras->positioned.empty()) return;
  auto& list = box.extras->positioned;
  std::erase_if(list, [&](const dom::Ref<Element>& e) { return !StillBelongs(*e, container); });
  const bool root = container.parent() == nullptr;
  const Edges border = BorderWidths(*container.style());
  const Rect padding{border.left, border.top, box.width - border.right, box.height - border.bottom};
  const Point containerOrigin = OriginInDocument(container);
  // The list may grow while its entries are laid out (positioned elements inside them register
  // with their own containers, not this one), so it is walked by index.
  for (std::size_t i = 0; i < list.size(); ++i) {
    dom::Ref<Element> element = list[i];
    const bool fixed = element->style()->position == css::Position::kFixed;
    // Fixed boxes sit in the view, less the document's scroll bars.
    const Rect area = fixed ? ScrollViewport(container, box) : padding;
    const Point inParent = EnsureBox(*element).Extras().staticPosition;
    Point staticPoint = inParent;
    if (element->parent()) {
      const Point parent = OriginInDocument(*element->parent());
      const Point base = fixed || root ? Point{} : containerOrigin;
      staticPoint = {parent.x + inParent.x - base.x - area.left, parent.y + inParent.y - base.y - area.top};
    }
    LayoutOne(*element, area, staticPoint, fixed, ctx);
  }
}

void LayoutPopup(Element& popup, const Rect* anchor, Point at, unsigned placement, LayoutContext& ctx) {
  const ComputedStyle& style = *popup.style();
  const Size view = ctx.view;
  const Edges margins = Margins(style, view.width);
  const bool sized = style.width.unit == Length::Unit::kPx || style.width.unit == Length::Unit::kPercent;
  int width = sized ? ResolveWidth(style, view.width, Insets(style, view.width), 0)
                    : ShrinkToFit(popup, std::max(0, view.width - margins.horizontal()), ctx);
  // A list that drops down under its owner is at least as wide as the owner.
  if (!sized && anchor && (placement == 2 || placement == 8)) {
    width = std::min(std::max(width, anchor->width()), std::max(width, view.width));
  }
  LayoutElement(popup, {width, -1, view.width, view.height}, ctx);
  Box& box = *BoxOf(popup);
  const int w = box.width + margins.horizontal(), h = box.height + margins.vertical();
  int x = at.x, y = at.y;
  if (anchor) {
    switch (placement) {
      case 8: x = anchor->left; y = anchor->top - h; break;
      case 4: x = anchor->left - w; y = anchor->top; break;
      case 6: x = anchor->right; y = anchor->top; break;
      default: x = anchor->left; y = anchor->bottom; break;
    }
    // Flipped to the other side when it would leave the view there and fits better there.
    if ((placement == 2 || placement == 1 || placement == 3 || placement == 0) && y + h > view.height && anchor->top - h >= 0) y = anchor->top - h;
    if (placement == 8 && y < 0 && anchor->bottom + h <= view.height) y = anchor->bottom;
    if (placement == 4 && x < 0 && anchor->right + w <= view.width) x = anchor->right;
    if (placement == 6 && x + w > view.width && anchor->left - w >= 0) x = anchor->left - w;
  }
  x = std::max(0, std::min(x, view.width - w));
  y = std::max(0, std::min(y, view.height - h));
  box.x = x + margins.left;
  box.y = y + margins.top;
  box.Set(kBoxFixed, true);
}

}  // namespace kestrune::html::layout
