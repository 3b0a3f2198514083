#pragma once

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

// Everything that needs boxes on a screen. The layout engine supplies it; until a document is
// laid out the answer is "no geometry": no hit, no location, no scrolling.
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
};

class NoGeometry final : public GeometrySource {
 public:
  dom::Element* HitTest(Point) override { return nullptr; }
  std::optional<Rect> Location(dom::Element&, unsigned) override { return std::nullopt; }
  std::optional<ScrollInfo> GetScrollInfo(dom::Element&) override { return std::nullopt; }
  bool SetScrollPos(dom::Element&, Point, bool) override { return false; }
  bool ScrollToView(dom::Element&, bool, bool) override { return false; }
  bool PlacePopup(dom::Element&, dom::Element*, Point, unsigned) override { return false; }
};

}  // namespace kestrune::html::events
