// Input on laid-out pages: scroll bars, the wheel, smooth scrolling, cursors, carets, hover and
// capture; and what a change asks to repaint, the draw event's layers and size events.
#include "layout_fixture.h"

namespace kestrune::html::test {
namespace {

constexpr const char* kScrollPage = R"(<body style="margin:0; font-size:10px">
  <div id=list style="width:200px; height:100px; overflow:auto"><div id=content style="height:1000px">top</div></div>
  <a id=link href="x.htm">link</a> <input id=field value="abcdef"></body>)";

TEST_F(LayoutTest, ScrollBarsStepPageAndDragAndTheWheelScrollsWhatIsUnderIt) {
  Load(kScrollPage);
  // The bar at x 184..200: 16px arrows at both ends, a 68px track, a 12px thumb (the least a
  // thumb gets) with 56px of travel over the 900px the list can scroll.
  Press(190, 95);  // the lower arrow
  Release(190, 95);
  EXPECT_EQ(ScrollPosition("#list"), (Point{0, 20}));
  Press(190, 80);  // the track below the thumb: a page, the view less one step
  Release(190, 80);
  EXPECT_EQ(ScrollPosition("#list"), (Point{0, 100}));
  const int thumbTop = 16 + 56 * 100 / 900;
  Press(190, thumbTop + 2);
  MoveMouse(190, thumbTop + 2 + 28, events::kMainMouseButton);
  Release(190, thumbTop + 2 + 28);
  EXPECT_EQ(ScrollPosition("#list"), (Point{0, 900 * (thumbTop + 28 - 16) / 56}));
  HTMLayoutSetScrollPos(Find("#list"), {0, 546}, false);
  HTMLayoutMouseInput(window_, {events::kMouseWheel, {50, 50}, 0, 0, nullptr, 2});
  EXPECT_EQ(ScrollPosition("#list"), (Point{0, 546 - 96}));
  HTMLayoutMouseInput(window_, {events::kMouseWheel, {500, 300}, 0, 0, nullptr, -1});
  EXPECT_EQ(ScrollPosition("#list"), (Point{0, 450}));  // nothing under the pointer scrolls

  // A scroll handler that answers "handled" keeps the position.
  auto& probe = log_.Make("list");
  probe.handleBubbling = true;
  HTMLayoutAttachEventHandlerEx(Find("#list"), &EventLog::Proc, &probe, events::kHandleScroll);
  HTMLayoutMouseInput(window_, {events::kMouseWheel, {50, 50}, 0, 0, nullptr, -1});
  EXPECT_EQ(ScrollPosition("#list"), (Point{0, 450}));
  EXPECT_EQ(log_.entries.back(), "list:8:" + std::to_string(events::kScrollStepPlus));
}

TEST_F(LayoutTest, ABoxThatHidesItsOverflowHasNoBarsButTheProgramScrollsIt) {
  Load(R"(<body style="margin:0; font-size:10px">
    <div id=clip style="width:200px; height:100px; overflow:hidden"><div style="height:30px">top</div>
      <div id=deep style="height:1000px">deep</div></div></body>)");
  Size content{};
  Rect view{};
  HTMLayoutGetScrollInfo(Find("#clip"), nullptr, &view, &content);
  EXPECT_EQ(content, (Size{200, 1030}));
  EXPECT_EQ(view.width(), 200);  // no room taken by bars
  HTMLayoutMouseInput(window_, {events::kMouseWheel, {50, 50}, 0, 0, nullptr, -2});
  EXPECT_EQ(ScrollPosition("#clip"), (Point{0, 0}));  // the wheel scrolls only what shows bars

  HTMLayoutSetScrollPos(Find("#clip"), {0, 40}, false);
  EXPECT_EQ(ScrollPosition("#clip"), (Point{0, 40}));
  EXPECT_EQ(Paint().FindText(u"top"), nullptr);
  // The position outlives a relayout, and the end of the content is as far as it goes.
  HTMLayoutSetStyleAttribute(Find("#clip"), "width", u"150px");
  EXPECT_EQ(ScrollPosition("#clip"), (Point{0, 40}));
  HTMLayoutSetScrollPos(Find("#clip"), {0, 5000}, false);
  EXPECT_EQ(ScrollPosition("#clip"), (Point{0, 930}));
  HTMLayoutSetScrollPos(Find("#clip"), {0, 0}, false);
  HTMLayoutSetStyleAttribute(Find("#clip"), "width", u"200px");
  EXPECT_EQ(ScrollPosition("#clip"), (Point{0, 0}));
  EXPECT_NE(Paint().FindText(u"top"), nullptr);
}

TEST_F(LayoutTest, ASmoothScrollIsPaintedOnItsWayWhileGeometryAnswersWhereItGoes) {
  Load(kScrollPage);
  HTMLayoutSetScrollPos(Find("#list"), {0, 500}, true);
  EXPECT_EQ(ScrollPosition("#list"), (Point{0, 500}));
  EXPECT_NE(Paint().FindText(u"top"), nullptr);  // the first frame still shows the top
  window_->RunPending(events::Clock::now() + std::chrono::seconds(1));
  EXPECT_EQ(Paint().FindText(u"top"), nullptr);
}

TEST_F(LayoutTest, ThePointerMovesTheHoverAndTheCursorFollowsWhatItIsOver) {
  Load(kScrollPage);
  const Rect link = Box("#link");
  const Rect field = Box("#field");
  MoveMouse(link.left + 2, link.top + 2);
  EXPECT_EQ(host_.cursor(), events::kCursorHand);
  EXPECT_TRUE(State(Find("#link")) & dom::kStateHover);
  MoveMouse(field.left + 5, field.top + 5);
  EXPECT_EQ(host_.cursor(), events::kCursorIBeam);
  EXPECT_FALSE(State(Find("#link")) & dom::kStateHover);
  MoveMouse(600, 400);
  EXPECT_EQ(host_.cursor(), events::kCursorArrow);
  HTMLayoutMouseInput(window_, {events::kMouseLeave, {}, 0, 0, nullptr});
  EXPECT_FALSE(State(Find("body")) & dom::kStateHover);

  HTMLayoutSetCapture(Find("#link"));
  EXPECT_TRUE(host_.captured());
  MoveMouse(600, 400);
  EXPECT_TRUE(State(Find("#link")) & dom::kStateHover);  // captured: the link keeps the pointer
  HTMLayoutReleaseCapture(Find("#link"));
  EXPECT_FALSE(host_.captured());
}

TEST_F(LayoutTest, AClickInATextFieldPutsTheCaretAtTheNearestCharacter) {
  Load(kScrollPage);
  const Rect content = Box("#field", events::kViewRelative | events::kContentBox);
  Press(content.left + 12, content.top + 3);  // between "ab" (10px) and "abc" (15px), nearer to 10
  Release(content.left + 12, content.top + 3);
  events::TextSelectionParams selection{};
  selection.methodId = events::kTextEditGetSelection;
  HTMLayoutCallBehaviorMethod(Find("#field"), &selection);
  EXPECT_EQ(selection.selectionEnd, 2u);
  TypeText(u"X");
  EXPECT_EQ(Text(Find("#field")), u"abXcdef");
}

TEST_F(LayoutTest, AScrollBarWidgetStepsAndDragsAndTellsItsOwner) {
  Load(R"(<body style="margin:0"><div id=owner><widget id=bar type=vscrollbar style="height:116px"></widget></div></body>)");
  HELEMENT bar = Find("#bar");
  events::ScrollBarValueParams set{};
  set.methodId = events::kScrollBarSetValue;
  set.minValue = 0;
  set.maxValue = 100;
  set.pageValue = 10;
  set.stepValue = 1;
  HTMLayoutCallBehaviorMethod(bar, &set);
  // Each arrow is drawn from its tip (the narrowest line) back: the tips point out of the bar.
  std::vector<paint::RecordingCanvas::Op> upper, lower;
  const auto canvas = Paint();
  for (const auto& op : canvas.ops()) {
    if (op.kind != paint::RecordingCanvas::Op::Kind::kLine) continue;
    (op.from.y < 16 ? upper : lower).push_back(op);
  }
  ASSERT_GE(upper.size(), 2u);
  ASSERT_GE(lower.size(), 2u);
  EXPECT_LT(upper.front().from.y, upper.back().from.y);
  EXPECT_GT(lower.front().from.y, lower.back().from.y);
  auto& owner = log_.Make("owner");
  HTMLayoutAttachEventHandlerEx(Find("#owner"), &EventLog::Proc, &owner, events::kHandleScroll);
  Press(8, 110);  // the lower arrow
  Release(8, 110);
  EXPECT_EQ(log_.entries.back(), "owner:8:" + std::to_string(events::kScrollStepPlus));
  events::ScrollBarValueParams get{};
  get.methodId = events::kScrollBarGetValue;
  HTMLayoutCallBehaviorMethod(bar, &get);
  EXPECT_EQ(get.value, 1);
  // An 84px track and a 12px thumb: 72px of travel. Drag the thumb to the end.
  Press(8, 16 + 1);
  MoveMouse(8, 16 + 1 + 72, events::kMainMouseButton);
  Release(8, 16 + 1 + 72);
  HTMLayoutCallBehaviorMethod(bar, &get);
  EXPECT_EQ(get.value, 100);
}

TEST_F(LayoutTest, AChangeAsksToRepaintOnlyTheAreaItTouches) {
  Load(R"(<body style="margin:0; font-size:10px"><style>tr:current td { background-color: blue }</style>
    <div id=list style="width:300px; height:100px; overflow:auto; margin-top:50px">
    <table id=t style="width:100%; border-spacing:0"><tr id=a><td>a</td></tr><tr id=b><td>b</td></tr></table></div></body>)");
  Paint();
  host_.ForgetInvalid();
  HTMLayoutSetElementState(Find("#b"), dom::kStateCurrent, 0, false);
  ASSERT_FALSE(host_.invalidated().empty());
  for (const Rect& area : host_.invalidated()) EXPECT_EQ(area, (Rect{0, 62, 300, 74})) << "row b only";
  host_.ForgetInvalid();
  const std::string rows = "<tr><td>x</td></tr><tr><td>y</td></tr><tr><td>z</td></tr>";
  HTMLayoutSetElementHtml(Find("#t"), reinterpret_cast<const unsigned char*>(rows.data()), rows.size(), kReplaceContent);
  ASSERT_FALSE(host_.invalidated().empty());
  for (const Rect& area : host_.invalidated()) EXPECT_EQ(area, (Rect{0, 50, 300, 150})) << "the list's box";

  // "Redraw at once": the host paints before the call returns.
  paint::RecordingCanvas canvas({900, 623});
  host_.RenderTo(window_, &canvas);
  HTMLayoutSetElementInnerText16(Find("td"), u"now", 3);
  EXPECT_EQ(canvas.FindText(u"now"), nullptr);
  HTMLayoutUpdateElement(Find("#t"), true);
  EXPECT_NE(canvas.FindText(u"now"), nullptr);
  host_.RenderTo(nullptr, nullptr);
}

class DrawTest : public LayoutTest {
 protected:
  std::vector<unsigned> layers_;
};

// Draws the content layer itself: a line from corner to corner of the area in the text colour.
bool DrawOwnContent(void* tag, HELEMENT, unsigned group, void* params) {
  if (group != events::kHandleDraw) return false;
  auto& draw = *static_cast<events::DrawParams*>(params);
  static_cast<std::vector<unsigned>*>(tag)->push_back(draw.cmd);
  if (draw.cmd != events::kDrawContent) return false;
  auto& canvas = *static_cast<paint::Canvas*>(draw.canvas);
  canvas.DrawLine({draw.area.left, draw.area.top}, {draw.area.right, draw.area.bottom}, 3, canvas.TextColor());
  return true;
}

TEST_F(DrawTest, AnElementThatDrawsItsContentReplacesTheEnginesAndKeepsItsBackground) {
  Load(R"(<body style="margin:0; font-size:10px"><div id=clock style="width:100px; height:60px; padding:5px;
    background-color:white; color:red">text under</div></body>)");
  HTMLayoutAttachEventHandlerEx(Find("#clock"), &DrawOwnContent, &layers_, events::kHandleDraw);
  const auto canvas = Paint();
  EXPECT_EQ(layers_, (std::vector<unsigned>{events::kDrawBackground, events::kDrawContent, events::kDrawForeground}));
  EXPECT_EQ(canvas.FindText(u"text under"), nullptr);
  bool line = false, background = false;
  for (const auto& op : canvas.ops()) {
    background |= op.kind == paint::RecordingCanvas::Op::Kind::kFillRect && op.rect == Rect{0, 0, 110, 70};
    line |= op.kind == paint::RecordingCanvas::Op::Kind::kLine && op.from == Point{5, 5} && op.to == Point{105, 65} &&
            op.color == 0xFFFF0000 && op.width == 3;
  }
  EXPECT_TRUE(background);
  EXPECT_TRUE(line);
}

TEST_F(LayoutTest, AnElementWhoseSizeChangesGetsTheSizeEvent) {
  Load(R"(<body style="margin:0"><div id=pane style="width:100px; height:10px"></div></body>)");
  auto& pane = log_.Make("pane");
  HTMLayoutAttachEventHandlerEx(Find("#pane"), &EventLog::Proc, &pane, events::kHandleSize);
  Box("#pane");
  Pump();
  log_.entries.clear();
  HTMLayoutSetStyleAttribute(Find("#pane"), "width", u"150px");
  Box("#pane");
  Pump();
  EXPECT_EQ(log_.entries, (std::vector<std::string>{"pane:32:0"}));
  HTMLayoutSetStyleAttribute(Find("#pane"), "color", u"red");
  Box("#pane");
  Pump();
  EXPECT_EQ(log_.entries.size(), 1u);  // a colour keeps the size
}

}  // namespace
}  // namespace kestrune::html::test
