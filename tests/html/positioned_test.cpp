// Positioned boxes, their hit tests, the location codes the behaviors use, and popups.
#include "layout_fixture.h"

namespace kestrune::html::test {
namespace {

TEST_F(LayoutTest, AbsoluteBoxesSitInTheirContainerAndFixedOnesInTheView) {
  Load(R"(<body style="margin:0; height:2000px">
    <div id=rel style="position:relative; width:300px; height:200px; margin:10px; border:5px solid black">
      <div id=abs style="position:absolute; left:20px; top:30px; width:50px; height:40px"></div>
      <div id=corner style="position:absolute; right:10px; bottom:10px; width:50px; height:40px"></div>
      <div id=stretch style="position:absolute; left:0; right:0; top:0; bottom:150px"></div>
      <p id=static style="position:absolute; margin:0">x</p>
    </div>
    <div id=fix style="position:fixed; right:0; bottom:0; width:100px; height:20px"></div>
    <div id=shift style="position:relative; left:7px; top:-3px; height:10px"></div></body>)");
  // Offsets are from the container's padding box, inside its 5px border.
  EXPECT_EQ(Box("#abs"), (Rect{35, 45, 85, 85}));
  EXPECT_EQ(Box("#corner"), (Rect{255, 165, 305, 205}));
  EXPECT_EQ(Box("#stretch"), (Rect{15, 15, 315, 65}));
  EXPECT_EQ(Box("#static").left, 15);  // where it would have been in the flow
  EXPECT_EQ(Box("#fix"), (Rect{784, 603, 884, 623}));  // the document scrolls: its bar takes 16px
  EXPECT_EQ(Box("#shift"), (Rect{7, 227, 891, 237}));
  // Scrolling the document moves the absolute boxes but not the fixed one.
  HTMLayoutSetScrollPos(Root(), {0, 100}, false);
  EXPECT_EQ(Box("#abs"), (Rect{35, -55, 85, -15}));
  EXPECT_EQ(Box("#abs", events::kRootRelative | events::kBorderBox), (Rect{35, 45, 85, 85}));
  EXPECT_EQ(Box("#fix"), (Rect{784, 603, 884, 623}));
}

TEST_F(LayoutTest, TheTopmostPositionedBoxTakesTheHitAsZIndexOrders) {
  Load(R"(<body style="margin:0">
    <div id=low style="position:absolute; left:0; top:0; width:100px; height:100px; z-index:1"></div>
    <div id=high style="position:absolute; left:50px; top:50px; width:100px; height:100px; z-index:2"></div>
    <div id=later style="position:absolute; left:120px; top:120px; width:50px; height:50px"></div>
    <div id=flow style="height:300px"></div></body>)");
  EXPECT_EQ(At(75, 75), Find("#high"));
  EXPECT_EQ(At(25, 25), Find("#low"));
  EXPECT_EQ(At(130, 130), Find("#high"));  // z-index 2 over the later box's 0
  EXPECT_EQ(At(160, 160), Find("#later"));
  EXPECT_EQ(At(250, 250), Find("#flow"));
  HTMLayoutSetStyleAttribute(Find("#low"), "z-index", u"3");
  EXPECT_EQ(At(75, 75), Find("#low"));
  HTMLayoutSetStyleAttribute(Find("#low"), "visibility", u"hidden");
  EXPECT_EQ(At(75, 75), Find("#high"));  // a hidden box takes no input
}

TEST_F(LayoutTest, LocationCodesGiveEachBoxRelativeToSelfContainerRootOrView) {
  Load(R"(<body style="margin:0"><div id=scroller style="height:100px; overflow:auto; padding:4px">
    <div id=loc style="margin:5px; border:3px solid red; padding:7px; width:100px; height:50px"></div>
    <div style="height:400px"></div></div></body>)");
  HTMLayoutSetScrollPos(Find("#scroller"), {0, 30}, false);
  // Border box 120 x 70, 5px margin, inside the scroller's 4px padding, scrolled by 30.
  EXPECT_EQ(Box("#loc", events::kViewRelative | events::kBorderBox), (Rect{9, -21, 129, 49}));
  EXPECT_EQ(Box("#loc", events::kRootRelative | events::kBorderBox), (Rect{9, -21, 129, 49}));
  EXPECT_EQ(Box("#loc", events::kSelfRelative | events::kBorderBox), (Rect{0, 0, 120, 70}));
  EXPECT_EQ(Box("#loc", events::kSelfRelative | events::kContentBox), (Rect{10, 10, 110, 60}));
  EXPECT_EQ(Box("#loc", events::kSelfRelative | events::kPaddingBox), (Rect{3, 3, 117, 67}));
  EXPECT_EQ(Box("#loc", events::kSelfRelative | events::kMarginBox), (Rect{-5, -5, 125, 75}));
  EXPECT_EQ(Box("#loc", events::kContainerRelative | events::kBorderBox), (Rect{9, -21, 129, 49}));
  // The scrollable area of a scroller is what shows of its content: its padding box less the bar.
  EXPECT_EQ(Box("#scroller", events::kRootRelative | events::kScrollableArea), (Rect{0, 0, 884, 108}));
  Point position;
  Rect view;
  Size content;
  ASSERT_EQ(HTMLayoutGetScrollInfo(Find("#scroller"), &position, &view, &content), DomResult::kOk);
  EXPECT_EQ(position, (Point{0, 30}));
  EXPECT_EQ(view, (Rect{0, 0, 884, 108}));
  EXPECT_EQ(content, (Size{884, 4 + 80 + 400 + 4}));
  HTMLayoutSetScrollPos(Find("#scroller"), {0, 10000}, false);
  EXPECT_EQ(ScrollPosition("#scroller"), (Point{0, 488 - 108}));
}

TEST_F(LayoutTest, APopupShowsBelowItsAnchorFlipsAboveAtTheBottomAndClosesOnAClickOutside) {
  Load(R"(<body style="margin:0; font-size:10px">
    <div id=top style="margin-left:100px; width:50px; height:20px"></div>
    <div style="height:560px"></div>
    <div id=bottom style="margin-left:100px; width:50px; height:20px"></div>
    <popup id=menu><div id=item style="width:80px; height:60px">item</div></popup></body>)");
  HELEMENT menu = Find("#menu");
  EXPECT_FALSE(Laid("#menu"));
  ASSERT_EQ(HTMLayoutShowPopup(menu, Find("#top"), 2), DomResult::kOk);
  EXPECT_EQ(Box("#menu"), (Rect{100, 20, 180, 80}));
  EXPECT_EQ(At(120, 50), Find("#item"));  // above the page
  EXPECT_NE(Paint().FindText(u"item"), nullptr);
  ASSERT_EQ(HTMLayoutShowPopup(menu, Find("#bottom"), 2), DomResult::kOk);
  EXPECT_EQ(Box("#menu"), (Rect{100, 520, 180, 580}));  // no room below 600: above the anchor
  Press(500, 300);
  EXPECT_FALSE(State(menu) & dom::kStatePopup);
  EXPECT_FALSE(Laid("#menu"));
  EXPECT_EQ(Paint().FindText(u"item"), nullptr);
  HTMLayoutShowPopupAt(menu, {850, 10}, 0);
  EXPECT_EQ(Box("#menu"), (Rect{820, 10, 900, 70}));  // moved in to stay in the view
}

}  // namespace
}  // namespace kestrune::html::test
