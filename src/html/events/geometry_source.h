#pragma once

#include <cstddef>
#include <optional>

#include "html/dom/geometry.h"
#include "html/dom/handle.h"

namespace kestrune::html::events {

struct ScrollInfo {
  Point position;
  Rect view;  // the visible part, in the element's coordinates
  Size content;
};

// Location codes: what box, relative to what.
enum ElementAreas : unsigned {
  kRootRelative = 0x01, kSelfRelative = 0x02, kContainerRelative = 0x03, kViewRelative = 0x04,
  kContentBox = 0x00, kPaddingBox = 0x10, kBorderBox = 0x20, kMarginBox = 0x30,
  kBackImageArea = 0x40, kForeImageArea = 0x50, kScrollableArea = 0x60,
};

// Everything that needs boxes on a screen: the layout engine answers it. Elements that are not
// laid out (not shown, not in the document) have no location and take no hit.
class GeometrySource {
 public:
  virtual ~GeometrySource() = default;
  virtual dom::Element* HitTest(Point viewPoint) = 0;
  virtual std::optional<Rect> Location(dom::Element& element, unsigned areas) = 0;
  virtual std::optional<ScrollInfo> GetScrollInfo(dom::Element& element) = 0;
  virtual bool SetScrollPos(dom::Element& element, Point position, bool smooth) = 0;
  virtual bool ScrollToView(dom::Element& element, bool toTop, bool smooth) = 0;
  // Places a shown popup next to its anchor (placement code) or at a view point.
  virtual bool PlacePopup(dom::Element& popup, dom::Element* anchor, Point at, unsigned placement) = 0;
  // The position in the element's text (UTF-16 units) nearest to a view point: where a click
  // puts a text field's caret.
  virtual std::optional<std::size_t> CharacterAt(dom::Element& element, Point viewPoint) = 0;
};

}  // namespace kestrune::html::events
