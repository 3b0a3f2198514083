// Block, inline and flow layout, measured with FixedMetrics (10px text: 5px a character, 10px
// a line).
#include "layout_fixture.h"

namespace kestrune::html::test {
namespace {

using Texts = std::vector<std::u16string>;

Texts TextsOf(const paint::RecordingCanvas& canvas) {
  Texts texts;
  for (const auto* op : canvas.Texts()) texts.push_back(op->text);
  return texts;
}

TEST_F(LayoutTest, BlocksStackWithTheirMarginsBordersPaddingsAndWidths) {
  Load(R"(<body style="margin:0; font-size:10px">
    <div id=a style="margin:10px; padding:5px; border:2px solid black; height:50px"></div>
    <div id=b style="width:200px; margin:0 auto; height:10px"></div>
    <div id=c style="width:50%; box-sizing:border-box; padding:0 10px; min-width:500px; height:10px"></div>
    <div id=d style="max-width:100px; height:10px; margin-top:-4px"></div></body>)");
  EXPECT_EQ(Box("#a"), (Rect{10, 10, 890, 74}));
  EXPECT_EQ(Box("#a", events::kViewRelative | events::kContentBox), (Rect{17, 17, 883, 67}));
  EXPECT_EQ(Box("#a", events::kViewRelative | events::kPaddingBox), (Rect{12, 12, 888, 72}));
  EXPECT_EQ(Box("#a", events::kViewRelative | events::kMarginBox), (Rect{0, 0, 900, 84}));
  // The 10px margin below #a and none above #b collapse into 10px; auto margins centre #b.
  EXPECT_EQ(Box("#b"), (Rect{350, 84, 550, 94}));
  EXPECT_EQ(Box("#c"), (Rect{0, 94, 500, 104}));  // 50% is 450, the minimum wins
  EXPECT_EQ(Box("#d"), (Rect{0, 100, 100, 110}));  // a negative margin pulls it up
}

TEST_F(LayoutTest, TextWrapsAtSpacesAndAlignsInItsLines) {
  Load(R"(<body style="margin:0; font-size:10px">
    <div id=wrap style="width:60px">aaaa bbbb   cccc dddd</div>
    <div id=centre style="width:100px; text-align:center">abcd</div>
    <div id=right style="width:100px; text-align:right">ab</div>
    <div id=pre style="white-space:pre">one
two  three</div>
    <div id=tall style="line-height:30px">x</div></body>)");
  // "aaaa bbbb" is 45px; with " cccc" it would be 70: the line breaks at the space.
  EXPECT_EQ(Box("#wrap").height(), 20);
  EXPECT_EQ(Box("#centre").top, 20);
  EXPECT_EQ(Box("#pre").height(), 20);
  EXPECT_EQ(Box("#tall").height(), 30);
  const auto canvas = Paint();
  EXPECT_EQ(TextsOf(canvas), (Texts{u"aaaa bbbb", u"cccc dddd", u"abcd", u"ab", u"one", u"two  three", u"x"}));
  EXPECT_EQ(canvas.FindText(u"cccc dddd")->rect, (Rect{0, 10, 45, 20}));
  EXPECT_EQ(canvas.FindText(u"abcd")->rect.left, 40);  // (100 - 20) / 2
  EXPECT_EQ(canvas.FindText(u"ab")->rect.left, 90);
  EXPECT_EQ(canvas.FindText(u"x")->rect.top, 60 + 10);  // half of the 20px leading above
}

TEST_F(LayoutTest, UnwrappedTextIsCutWithAnEllipsisAtTheEdgeOfItsBox) {
  Load(R"(<body style="margin:0; font-size:10px">
    <div id=e style="width:60px; white-space:nowrap; overflow:hidden; text-overflow:ellipsis">aaaa bbbb cccc</div>
    <div id=clip style="width:60px; white-space:nowrap; overflow:hidden">aaaa bbbb cccc</div>
    <div id=fits style="width:100px; white-space:nowrap; overflow:hidden; text-overflow:ellipsis">short</div></body>)");
  EXPECT_EQ(Box("#e").height(), 10);
  const auto canvas = Paint();
  const auto* cut = canvas.FindText(u"aaaa bbbb...");
  ASSERT_NE(cut, nullptr);
  EXPECT_LE(cut->rect.right, 60);
  EXPECT_NE(canvas.FindText(u"aaaa bbbb cc"), nullptr);  // clipped at 60px, no dots
  EXPECT_NE(canvas.FindText(u"short"), nullptr);
}

TEST_F(LayoutTest, InlineBlocksAndImagesSitOnTheLineByTheirVerticalAlignment) {
  Load(R"(<body style="margin:0; font-size:10px"><div id=line>ab<span id=box style="display:inline-block; width:20px; height:30px"></span>
    <span id=mid style="display:inline-block; width:10px; height:6px; vertical-align:middle"></span><b id=bold>cd</b></div></body>)");
  // The 30px box sits on the baseline: the line is its height plus the text's descent.
  EXPECT_EQ(Box("#line").height(), 32);
  EXPECT_EQ(Box("#box"), (Rect{10, 0, 30, 30}));
  EXPECT_EQ(Box("#mid").left, 35);
  EXPECT_EQ(Box("#bold"), (Rect{45, 22, 55, 32}));  // an inline element: the union of its text
  EXPECT_EQ(At(47, 25), Find("#bold"));
  EXPECT_EQ(At(15, 10), Find("#box"));
}

TEST_F(LayoutTest, PercentageAndFlexibleHeightsShareAVerticalFlow) {
  Load(R"(<body style="margin:0"><div id=col style="height:200px; flow:vertical">
    <div id=f1 style="height:20px"></div><div id=f2 style="height:1*"></div>
    <div id=f3 style="height:3*"></div><div id=f4 style="height:25%"></div></div></body>)");
  // 25% is 50px; 130px are left for 1* and 3*.
  EXPECT_EQ(Box("#f1"), (Rect{0, 0, 900, 20}));
  EXPECT_EQ(Box("#f2"), (Rect{0, 20, 900, 53}));
  EXPECT_EQ(Box("#f3"), (Rect{0, 53, 900, 150}));
  EXPECT_EQ(Box("#f4"), (Rect{0, 150, 900, 200}));
}

TEST_F(LayoutTest, FlexibleHeightsLeaveRoomForLinesAndCollapsedMargins) {
  Load(R"(<body style="margin:0; font-size:10px"><div id=col style="height:100px; flow:vertical">a line
    <div id=g1 style="height:10px; margin-bottom:8px"></div><div id=g2 style="height:1*; margin-bottom:6px"></div>
    <div id=g3 style="height:10px; margin-top:4px"></div></div></body>)");
  // The line takes 10px, the boxes 20px, the margins 8px and 6px (6 and 4 collapse): 1* is 56px.
  EXPECT_EQ(Box("#g1"), (Rect{0, 10, 900, 20}));
  EXPECT_EQ(Box("#g2"), (Rect{0, 28, 900, 84}));
  EXPECT_EQ(Box("#g3"), (Rect{0, 90, 900, 100}));
  EXPECT_EQ(Paint().FindText(u"a line")->rect.top, 0);
}

TEST_F(LayoutTest, APaintCoversItsAreaWithTheWindowsWhiteFirst) {
  Load(R"(<body style="margin:0">no background</body>)");
  // Canvases keep what was drawn before: a page without a background must not show it.
  const auto canvas = Paint({10, 20, 110, 70});
  ASSERT_FALSE(canvas.ops().empty());
  const auto& first = canvas.ops().front();
  EXPECT_EQ(first.kind, paint::RecordingCanvas::Op::Kind::kFillRect);
  EXPECT_EQ(first.rect, (Rect{10, 20, 110, 70}));
  EXPECT_EQ(first.color, 0xFFFFFFFFu);
}

TEST_F(LayoutTest, PercentageAndFlexibleWidthsShareAHorizontalFlow) {
  Load(R"(<body style="margin:0"><div id=row style="flow:horizontal; width:400px; height:30px">
    <div id=h1 style="width:100px"></div><div id=h2 style="width:1*; height:1*"></div>
    <div id=h3 style="width:2*; height:50%"></div><div id=h4 style="width:10%; margin-left:5px"></div></div></body>)");
  // 10% is 40px and the margin 5px; 255px are left for 1* and 2*.
  EXPECT_EQ(Box("#h1"), (Rect{0, 0, 100, 30}));  // no height of its own: as tall as the row
  EXPECT_EQ(Box("#h2"), (Rect{100, 0, 185, 30}));
  EXPECT_EQ(Box("#h3"), (Rect{185, 0, 355, 15}));
  EXPECT_EQ(Box("#h4"), (Rect{360, 0, 400, 30}));
  std::optional<std::u16string> flow;
  HTMLayoutGetStyleAttribute(Find("#row"), "flow", &flow);
  EXPECT_EQ(flow, u"horizontal");  // what the splitter behavior reads
}

TEST_F(LayoutTest, DisplayNoneTakesNoRoomWhileHiddenKeepsItsRoomButDrawsAndTakesNothing) {
  Load(R"(<body style="margin:0; font-size:10px"><div id=n1 style="height:10px">first</div>
    <div id=none style="display:none; height:10px">gone</div>
    <div id=hidden style="visibility:hidden; height:10px">hidden text</div>
    <div id=after style="height:10px">after</div></body>)");
  EXPECT_FALSE(Laid("#none"));
  EXPECT_EQ(Box("#hidden"), (Rect{0, 10, 900, 20}));
  EXPECT_EQ(Box("#after"), (Rect{0, 20, 900, 30}));
  const auto canvas = Paint();
  EXPECT_EQ(TextsOf(canvas), (Texts{u"first", u"after"}));
  EXPECT_EQ(At(5, 15), Find("body"));  // the hidden block takes no hit
  EXPECT_EQ(At(5, 25), Find("#after"));

  HTMLayoutSetStyleAttribute(Find("#none"), "display", u"block");
  HTMLayoutSetStyleAttribute(Find("#hidden"), "visibility", u"visible");
  EXPECT_EQ(Box("#after"), (Rect{0, 30, 900, 40}));
  EXPECT_EQ(At(5, 25), Find("#hidden"));
  EXPECT_EQ(TextsOf(Paint()), (Texts{u"first", u"gone", u"hidden text", u"after"}));
}

TEST_F(LayoutTest, TextInputsAreOneLineHighEvenEmptyAndShowTheirCaretWhenFocused) {
  Load(R"(<body style="margin:0; font-size:10px"><input id=empty><input id=full value="hello"></body>)");
  // 150px wide, padding 2px 3px and a 1px border around one 10px line.
  EXPECT_EQ(Box("#empty"), (Rect{0, 0, 158, 16}));
  EXPECT_EQ(Box("#full").height(), 16);
  HTMLayoutSetElementState(Find("#full"), dom::kStateFocus, 0, false);
  const auto canvas = Paint();
  const auto* text = canvas.FindText(u"hello");
  ASSERT_NE(text, nullptr);
  // The caret stands after the last character: a 1px rectangle in the text colour.
  bool caret = false;
  for (const auto& op : canvas.ops()) {
    caret |= op.kind == paint::RecordingCanvas::Op::Kind::kFillRect && op.rect.width() == 1 && op.rect.left == text->rect.right;
  }
  EXPECT_TRUE(caret);
}

}  // namespace
}  // namespace kestrune::html::test
