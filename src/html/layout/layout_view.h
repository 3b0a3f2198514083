#pragma once

#include <chrono>
#include <functional>
#include <optional>
#include <vector>

#include "html/dom/document.h"
#include "html/events/geometry_source.h"
#include "html/events/input.h"
#include "html/layout/inline_layout.h"
#include "html/layout/layout_context.h"

namespace kestrune::html::layout {

using Clock = std::chrono::steady_clock;

struct PopupPlacement {
  dom::Ref<Element> popup;
  dom::Ref<Element> anchor;
  Point at;
  unsigned placement = 2;
};

// The boxes of one document in a view of a given size. Layout is lazy: it runs when geometry
// is asked for or the view is painted, and lays out again only what the dirty bits point at.
// Answers the geometry the events and the behaviors need, scrolls (scroll bars, the wheel,
// smooth scrolling) and tells which parts of the view a change needs repainted.
class LayoutView final : public events::GeometrySource {
 public:
  LayoutView(dom::Document& document, const TextMeasurer& measurer, ImageSource& images);
  LayoutView(const LayoutView&) = delete;
  LayoutView& operator=(const LayoutView&) = delete;

  void SetViewSize(Size size);
  Size viewSize() const { return view_; }
  dom::Document& document() { return document_; }
  LayoutContext& context() { return ctx_; }

  // Brings the boxes up to date; does nothing when nothing changed.
  void Layout();
  // Images changed (a resource arrived): sizes may change.
  void ImagesChanged();

  // Shown popups, lowest first.
  const std::vector<PopupPlacement>& popups();

  // Repaint areas (view coordinates) of what changed since the last call: the changed elements'
  // boxes, or for a change of layout the nearest box whose size its content cannot change.
  std::vector<Rect> TakeDamage();
  // Elements with size handlers whose size changed in the last layouts.
  std::vector<dom::Ref<Element>> TakeResized();

  // Where an element's border box is in the view, scroll positions applied (or the positions
  // painting shows); none when it is not shown. Lines holding it are placed first.
  std::optional<Point> OriginInView(const Element& element, bool shownScroll = false);
  // Places a block container's lines (their atomic children get their positions) once per layout.
  void EnsurePlaced(Element& container);
  // The lines of a container with inline content, from its border box origin.
  std::vector<PlacedLine> LinesOf(Element& container, PlaceMode mode);
  // The scroll position painting shows (it trails the real one while a smooth scroll runs).
  Point ShownScroll(const Box& box) const;

  // Scroll bars of overflowing elements: a press on an arrow, the track or the thumb, the drag
  // that follows and its release. Answers whether the input was the bars'.
  bool ScrollBarInput(const events::MouseInput& input);
  // The wheel over `target`: the nearest ancestor that can scroll that way scrolls.
  bool Wheel(Element* target, int delta);
  // Called for scroll bar and wheel scrolling before it happens (element, command, new
  // position, vertical); a handler that answers true keeps the position.
  void SetScrollHandler(std::function<bool(Element&, unsigned, int, bool)> handler) { onScroll_ = std::move(handler); }
  // Advances smooth scrolling; answers whether some is still under way.
  bool Animate(Clock::time_point now);

  // events::GeometrySource
  Element* HitTest(Point viewPoint) override;
  std::optional<Rect> Location(Element& element, unsigned areas) override;
  std::optional<events::ScrollInfo> GetScrollInfo(Element& element) override;
  bool SetScrollPos(Element& element, Point position, bool smooth) override;
  bool ScrollToView(Element& element, bool toTop, bool smooth) override;
  bool PlacePopup(Element& popup, Element* anchor, Point at, unsigned placement) override;
  std::optional<std::size_t> CharacterAt(Element& element, Point viewPoint) override;

 private:
  struct Animation {
    dom::Ref<Element> element;
    Point from;
    Clock::time_point start;
  };
  struct Drag {
    dom::Ref<Element> element;
    bool vertical = true;
    int grab = 0;
  };

  void PrunePopups();
  // Location without bringing the layout up to date first (callers inside a layout).
  std::optional<Rect> Locate(const Element& element, unsigned areas);
  Element* HitIn(Element& element, Point viewPoint, Point origin);
  Element* HitLines(Element& element, Box& box, Point viewPoint, Point origin, Point scroll);
  void Damage(const Rect& viewRect);
  void DamageElement(Element& element);
  void CollectDamage(Element& element);
  std::optional<Rect> ClippedRect(const Element& element, const Rect& self);
  bool ScrollTo(Element& element, Point position, bool smooth);
  Element* ScrollerAt(Point viewPoint, bool* vertical);

  dom::Document& document_;
  ImageCache images_;
  LayoutContext ctx_;
  Size view_;
  bool sizeChanged_ = true;
  std::vector<PopupPlacement> popups_;
  std::vector<Rect> damage_;
  std::vector<dom::Ref<Element>> resized_;
  std::vector<Animation> animations_;
  std::optional<Drag> drag_;
  std::function<bool(Element&, unsigned, int, bool)> onScroll_;
};

}  // namespace kestrune::html::layout
