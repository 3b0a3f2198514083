#include "html/paint/painter.h"

#include <algorithm>
#include <cmath>

#include "html/controls/control.h"
#include "html/controls/scroll_bar.h"
#include "html/controls/text_edit.h"
#include "html/dom/states.h"

namespace kestrune::html::paint {
namespace {

using css::ComputedStyle;
using dom::Element;
using layout::Box;
using layout::Edges;
using layout::LiveBox;

Rect Offset(const Rect& r, Point by) { return {r.left + by.x, r.top + by.y, r.right + by.x, r.bottom + by.y}; }

Rect Intersect(const Rect& a, const Rect& b) {
  Rect r{std::max(a.left, b.left), std::max(a.top, b.top), std::min(a.right, b.right), std::min(a.bottom, b.bottom)};
  r.right = std::max(r.left, r.right);
  r.bottom = std::max(r.top, r.bottom);
  return r;
}

constexpr Color kWindowBackground = 0xFFFFFFFF;

bool Meets(const Rect& a, const Rect& b) { return a.left < b.right && b.left < a.right && a.top < b.bottom && b.top < a.bottom; }

Radii RadiiOf(const ComputedStyle& style, const Rect& box) {
  const int limit = std::min(box.width(), box.height()) / 2;
  auto r = [&](int corner) { return std::clamp(layout::Px(style.radius[corner], box.width()), 0, limit); };
  return {r(css::kTopLeft), r(css::kTopRight), r(css::kBottomRight), r(css::kBottomLeft)};
}

bool HasDrawHandler(const Element& element) {
  const dom::RareData* rare = element.rareIfAny();
  return rare && std::any_of(rare->handlers.begin(), rare->handlers.end(),
                             [](const dom::AttachedHandler& h) { return (h.subscription & events::kHandleDraw) != 0; });
}

bool IsPassword(const Element& element) {
  const controls::Control* control = controls::ControlOf(element);
  return control && control->Type(element) == controls::kCtlPassword;
}

class Painter {
 public:
  Painter(layout::LayoutView& view, Canvas& canvas, events::EventDispatcher* dispatcher)
      : view_(view), canvas_(canvas), dispatcher_(dispatcher) {}

  void Paint(const Rect& area) {
    Element* root = view_.document().root();
    if (!root || !LiveBox(*root)) return;
    canvas_.PushClip(area);
    // The window's own white under pages that paint no background: what was drawn before
    // must not show through.
    canvas_.FillRect(area, kWindowBackground);
    PaintElement(*root, {0, 0}, area);
    for (const layout::PopupPlacement& popup : view_.popups()) {
      if (const Box* box = LiveBox(*popup.popup)) PaintElement(*popup.popup, {box->x, box->y}, area);
    }
    canvas_.PopClip();
  }

  PaintStats stats;

 private:
  // The draw event for one layer; true when a handler drew it instead of the engine.
  bool DrawEvent(Element& element, unsigned layer, const Rect& area) {
    if (!dispatcher_ || !HasDrawHandler(element)) return false;
    canvas_.SetTextColor(element.style()->color);
    events::DrawParams params{layer, &canvas_, area, 0};
    return dispatcher_->DeliverToElement(element, events::kHandleDraw, &params);
  }

  void PaintElement(Element& element, Point origin, const Rect& clip) {
    Box* box = LiveBox(element);
    if (!box || !element.style()) return;
    const ComputedStyle& style = *element.style();
    const Rect border{origin.x, origin.y, origin.x + box->width, origin.y + box->height};
    const std::vector<Element*> positioned = layout::PositionedInOrder(element);
    if (!Meets(border, clip) && !box->Has(layout::kBoxOverflows) && positioned.empty()) return;
    ++stats.elements;
    const bool visible = style.visibility == css::Visibility::kVisible;
    const Edges insets = layout::Insets(style, box->cbWidth);
    const Rect content{border.left + insets.left, border.top + insets.top, border.right - insets.right, border.bottom - insets.bottom};

    if (visible && !DrawEvent(element, events::kDrawBackground, border)) PaintBackground(element, style, border);
    const bool clips = box->Has(layout::kBoxScroller);
    Rect inner = clip;
    if (clips) {
      inner = Intersect(clip, Offset(layout::ScrollViewport(element, *box), origin));
      canvas_.PushClip(inner);
    }
    PaintPositioned(positioned, false, inner);
    if (!(visible && DrawEvent(element, events::kDrawContent, content))) {
      PaintChildren(element, *box, origin, inner);
      if (box->Has(layout::kBoxInlineContent)) PaintLines(element, *box, origin, inner, content);
      if (visible) PaintControl(element, content);
    }
    PaintPositioned(positioned, true, inner);
    if (clips) canvas_.PopClip();
    if (visible && box->scroll()) PaintScrollBars(element, *box, origin);
    if (visible) DrawEvent(element, events::kDrawForeground, border);
  }

  void PaintPositioned(const std::vector<Element*>& positioned, bool front, const Rect& clip) {
    for (Element* e : positioned) {
      const int z = e->style()->zIndexAuto ? 0 : e->style()->zIndex;
      if ((z >= 0) != front) continue;
      if (auto at = view_.OriginInView(*e, true)) PaintElement(*e, *at, clip);
    }
  }

  void PaintBackground(const Element& element, const ComputedStyle& style, const Rect& border) {
    const Radii radii = RadiiOf(style, border);
    if ((style.backgroundColor >> 24) != 0) {
      if (radii.any()) canvas_.FillRoundRect(border, radii, style.backgroundColor);
      else canvas_.FillRect(border, style.backgroundColor);
    }
    if (!style.backgroundImage.empty()) {
      if (auto image = view_.context().images().Get(style.backgroundImage)) PaintImage(*image, style, border);
    }
    const Edges widths = layout::BorderWidths(style);
    if (widths.top || widths.right || widths.bottom || widths.left) {
      BorderSide sides[4];
      const int w[4] = {widths.top, widths.right, widths.bottom, widths.left};
      for (int side = 0; side < 4; ++side) sides[side] = {w[side], style.border[side].color, style.border[side].style};
      canvas_.DrawBorder(border, sides, radii);
    }
    (void)element;
  }

  // A background image in the padding box, repeated as the style says; only the tiles that
  // reach the clip are drawn.
  void PaintImage(const layout::Image& image, const ComputedStyle& style, const Rect& border) {
    const Edges b = layout::BorderWidths(style);
    const Rect area{border.left + b.left, border.top + b.top, border.right - b.right, border.bottom - b.bottom};
    const Size size = image.size;
    if (size.width <= 0 || size.height <= 0 || area.width() <= 0 || area.height() <= 0) return;
    // A percentage places that point of the image on the same point of the area, so an image
    // larger than its area is shifted back (the free space is negative).
    auto offset = [](const css::Length& position, int freeSpace) {
      if (position.unit != css::Length::Unit::kPercent) return layout::Px(position, 0);
      return static_cast<int>(std::lround(double{position.value} * freeSpace / 100.0));
    };
    const int x = area.left + offset(style.backgroundPosition[0], area.width() - size.width);
    const int y = area.top + offset(style.backgroundPosition[1], area.height() - size.height);
    const bool repeatX = style.backgroundRepeat == css::BackgroundRepeat::kRepeat || style.backgroundRepeat == css::BackgroundRepeat::kRepeatX;
    const bool repeatY = style.backgroundRepeat == css::BackgroundRepeat::kRepeat || style.backgroundRepeat == css::BackgroundRepeat::kRepeatY;
    canvas_.PushClip(area);
    auto firstTile = [](int start, int edge, int step) { return start - ((start - edge) / step + (start > edge ? 1 : 0)) * step; };
    const int x0 = repeatX ? firstTile(x, area.left, size.width) : x;
    const int y0 = repeatY ? firstTile(y, area.top, size.height) : y;
    for (int ty = y0; ty < area.bottom; ty += size.height) {
      for (int tx = x0; tx < area.right; tx += size.width) {
        canvas_.DrawImage(image, {tx, ty, tx + size.width, ty + size.height});
        if (!repeatX) break;
      }
      if (!repeatY) break;
    }
    canvas_.PopClip();
  }

  void PaintChildren(Element& element, Box& box, Point origin, const Rect& clip) {
    const Point scroll = view_.ShownScroll(box);
    const auto& nodes = element.nodes();
    const int header = box.extras ? box.extras->headerHeight : 0;
    auto paint = [&](Element& child, const Rect& childClip) {
      Box* childBox = LiveBox(child);
      if (!childBox || childBox->Has(layout::kBoxAbsolute | layout::kBoxFixed | layout::kBoxInline)) return;
      if (child.state() & dom::kStatePopup) return;
      if (layout::InLines(element, box, child)) return;  // painted with the lines that hold it
      const bool pinned = childBox->Has(layout::kBoxPinned);
      const Point at{origin.x + childBox->x - (pinned ? 0 : scroll.x), origin.y + childBox->y - (pinned ? 0 : scroll.y)};
      PaintElement(child, at, childClip);
    };
    Rect bodyClip = clip;
    if (header > 0) {
      const Rect view = Offset(layout::ScrollViewport(element, box), origin);
      bodyClip.top = std::max(bodyClip.top, std::min(view.bottom, view.top + header));
      canvas_.PushClip(bodyClip);
    }
    const std::size_t from = layout::FirstChildReaching(element, box, clip.top - origin.y + scroll.y);
    for (std::size_t i = from; i < nodes.size(); ++i) {
      Element* child = dom::AsElement(nodes[i]);
      if (!child) continue;
      const Box* childBox = LiveBox(*child);
      if (childBox && childBox->Has(layout::kBoxPinned)) continue;
      // Sorted children below the area end the walk: the rest of a long list is not visited.
      if (box.Has(layout::kBoxSortedChildren) && childBox && !childBox->Has(layout::kBoxAbsolute | layout::kBoxFixed) &&
          origin.y + childBox->y - scroll.y >= clip.bottom) {
        break;
      }
      paint(*child, bodyClip);
    }
    if (header > 0) {
      canvas_.PopClip();
      for (dom::Node* node : nodes) {
        Element* child = dom::AsElement(node);
        const Box* childBox = child ? LiveBox(*child) : nullptr;
        if (!childBox || !childBox->Has(layout::kBoxPinned)) break;
        paint(*child, clip);
      }
    }
  }

  void PaintLines(Element& element, Box& box, Point origin, const Rect& clip, const Rect& content) {
    const Point scroll = view_.ShownScroll(box);
    const Point at{origin.x - scroll.x, origin.y - scroll.y};
    box.Set(layout::kBoxPlaced, true);
    const std::vector<layout::PlacedLine> lines = view_.LinesOf(element, layout::PlaceMode::kPaint);
    const ComputedStyle& style = *element.style();
    const bool clipsText = layout::Clips(style);
    const TextEllipsis ellipsis = !clipsText ? TextEllipsis::kNone
                                  : style.textOverflow == css::TextOverflow::kEllipsis   ? TextEllipsis::kEnd
                                  : style.textOverflow == css::TextOverflow::kPathEllipsis ? TextEllipsis::kPath
                                                                                           : TextEllipsis::kNone;
    const controls::TextEdit* edit = dynamic_cast<const controls::TextEdit*>(controls::ControlOf(element));
    const bool focused = edit && (element.state() & dom::kStateFocus);
    const bool password = IsPassword(element);
    for (const layout::PlacedLine& line : lines) {
      if (at.y + line.top >= clip.bottom || at.y + line.top + line.height <= clip.top) continue;
      for (const layout::InlineFragment& fragment : line.fragments) PaintFragment(*fragment.element, fragment, line, at);
      for (const layout::PlacedRun& run : line.runs) {
        if (run.kind == layout::PlacedRun::Kind::kAtomic) {
          if (const Box* child = LiveBox(*run.element)) PaintElement(*run.element, {at.x + child->x, at.y + child->y}, clip);
          continue;
        }
        if (run.element->style()->visibility != css::Visibility::kVisible) continue;
        const std::u16string text = password ? std::u16string(run.text.size(), u'\u2022') : run.text;
        const Font font = layout::FontOf(*run.style);
        if (focused) PaintSelection(*edit, run, text, font, at);
        int maxWidth = -1;
        const int room = content.right - (at.x + run.x);
        if (clipsText && (run.width < 0 || run.x + run.width > content.right - origin.x)) maxWidth = std::max(0, room);
        canvas_.DrawText(font, text, {at.x + run.x, at.y + run.top}, run.style->color, maxWidth,
                         maxWidth >= 0 ? ellipsis : TextEllipsis::kNone);
        ++stats.textRuns;
      }
    }
    if (focused) PaintCaret(element, *edit, lines, at, password);
  }

  void PaintFragment(const Element& element, const layout::InlineFragment& fragment, const layout::PlacedLine& line, Point at) {
    const ComputedStyle& style = *element.style();
    const Edges widths = layout::BorderWidths(style);
    if ((style.backgroundColor >> 24) == 0 && !widths.top && !widths.bottom && !widths.left && !widths.right) return;
    const layout::FontMetrics& m = view_.context().MetricsOf(style);
    const Edges padding = layout::Padding(style, 0);
    const Rect box{at.x + fragment.left, at.y + line.baseline - m.ascent - padding.top - widths.top, at.x + fragment.right,
                   at.y + line.baseline + m.descent + padding.bottom + widths.bottom};
    PaintBackground(element, style, box);
  }

  int PrefixWidth(const Font& font, const std::u16string& text, std::size_t count) {
    return canvas_.TextWidth(font, std::u16string_view(text).substr(0, std::min(count, text.size())));
  }

  void PaintSelection(const controls::TextEdit& edit, const layout::PlacedRun& run, const std::u16string& text,
                      const Font& font, Point at) {
    const std::size_t from = std::max(edit.selectionStart(), std::size_t{run.offset});
    const std::size_t to = std::min(edit.selectionEnd(), run.offset + text.size());
    if (from >= to) return;
    const int left = at.x + run.x + PrefixWidth(font, text, from - run.offset);
    const int right = at.x + run.x + PrefixWidth(font, text, to - run.offset);
    canvas_.FillRect({left, at.y + run.top, right, at.y + run.top + run.height}, 0xFF3399FF);
  }

  void PaintCaret(const Element& element, const controls::TextEdit& edit, const std::vector<layout::PlacedLine>& lines,
                  Point at, bool password) {
    const std::size_t caret = edit.caret();
    const layout::FontMetrics& m = view_.context().MetricsOf(*element.style());
    Rect place{0, 0, 1, m.ascent + m.descent};
    if (!lines.empty()) place = Offset(place, {lines.front().runs.empty() ? 0 : lines.front().runs.front().x, lines.front().top});
    else place = Offset(place, layout::LinesOrigin(element, *LiveBox(element)));
    for (const layout::PlacedLine& line : lines) {
      for (const layout::PlacedRun& run : line.runs) {
        if (run.kind != layout::PlacedRun::Kind::kText || caret < run.offset || caret > run.offset + run.text.size()) continue;
        const std::u16string text = password ? std::u16string(run.text.size(), u'\u2022') : run.text;
        const int x = run.x + PrefixWidth(layout::FontOf(*run.style), text, caret - run.offset);
        place = {x, run.top, x + 1, run.top + run.height};
      }
    }
    canvas_.FillRect(Offset(place, at), element.style()->color);
  }

  void PaintControl(const Element& element, const Rect& content) {
    if (element.tag() == dom::kAtomImg) {
      const std::u16string* src = element.Attr(dom::kAtomSrc);
      if (auto image = src ? view_.context().images().Get(*src) : nullptr) canvas_.DrawImage(*image, content);
      return;
    }
    if (PaintToggle(canvas_, element, content)) return;
    const auto* bar = dynamic_cast<const controls::ScrollBar*>(controls::ControlOf(element));
    if (!bar) return;
    const std::u16string* type = element.Attr(dom::kAtomType);
    const bool vertical = !(type && *type == u"hscrollbar");
    PaintScrollBar(canvas_, content, vertical, bar->value(), bar->minimum(), bar->maximum(), bar->page());
  }

  void PaintScrollBars(const Element& element, const Box& box, Point origin) {
    const layout::ScrollState& scroll = *box.scroll();
    const Rect view = Offset(layout::ScrollViewport(element, box), origin);
    if (scroll.vertical) {
      PaintScrollBar(canvas_, {view.right, view.top, view.right + layout::kScrollBarSize, view.bottom}, true,
                     scroll.shown.y, 0, std::max(0, scroll.content.height - view.height()), view.height());
    }
    if (scroll.horizontal) {
      PaintScrollBar(canvas_, {view.left, view.bottom, view.right, view.bottom + layout::kScrollBarSize}, false,
                     scroll.shown.x, 0, std::max(0, scroll.content.width - view.width()), view.width());
    }
  }

  layout::LayoutView& view_;
  Canvas& canvas_;
  events::EventDispatcher* dispatcher_;
};

}  // namespace

PaintStats PaintView(layout::LayoutView& view, Canvas& canvas, const Rect& area, events::EventDispatcher* dispatcher) {
  view.Layout();
  std::optional<events::EventDispatcher::Hold> hold;
  if (dispatcher) hold.emplace(*dispatcher);
  Painter painter(view, canvas, dispatcher);
  painter.Paint(area);
  return painter.stats;
}

}  // namespace kestrune::html::paint
