#pragma once

#include "html/paint/recording_canvas.h"
#include "page_fixture.h"

namespace kestrune::html::test {

// A page laid out in the headless window (900 x 623, FixedMetrics: a character is half the
// font size wide, a line is the font size high) and painted onto a recording canvas.
class LayoutTest : public PageTest {
 protected:
  // The element's box by location code (the view's border box unless told).
  Rect Box(const char* selector, unsigned areas = events::kViewRelative | events::kBorderBox) {
    HELEMENT e = Find(selector);
    EXPECT_NE(e, nullptr) << selector;
    Rect rect{-1, -1, -1, -1};
    if (e) {
      EXPECT_EQ(HTMLayoutGetElementLocation(e, &rect, areas), DomResult::kOk) << selector;
    }
    return rect;
  }

  bool Laid(const char* selector) {
    Rect rect;
    return HTMLayoutGetElementLocation(Find(selector), &rect, events::kViewRelative | events::kBorderBox) == DomResult::kOk;
  }

  HELEMENT At(int x, int y) {
    HELEMENT hit = nullptr;
    HTMLayoutFindElement(window_, {x, y}, &hit);
    return hit;
  }

  // Paints the whole view, or an area, onto a fresh recording canvas.
  paint::RecordingCanvas Paint(Rect area = {0, 0, 900, 623}) {
    paint::RecordingCanvas canvas({900, 623});
    HTMLayoutPaint(window_, canvas, area);
    return canvas;
  }

  void MoveMouse(int x, int y, unsigned buttons = 0) {
    HTMLayoutMouseInput(window_, {events::kMouseMove, {x, y}, buttons, 0, nullptr});
    Pump();
  }

  void Press(int x, int y) {
    HTMLayoutMouseInput(window_, {events::kMouseDown, {x, y}, events::kMainMouseButton, 0, nullptr});
    Pump();
  }

  void Release(int x, int y) {
    HTMLayoutMouseInput(window_, {events::kMouseUp, {x, y}, 0, 0, nullptr});
    Pump();
  }

  // Handlers attached in a test write here; the log outlives the window's closing.
  EventLog log_;

  Point ScrollPosition(const char* selector) {
    Point position{-1, -1};
    HTMLayoutGetScrollInfo(Find(selector), &position, nullptr, nullptr);
    return position;
  }
};

}  // namespace kestrune::html::test
