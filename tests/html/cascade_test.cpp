#include <gtest/gtest.h>

#include "html/css/style_engine.h"
#include "html/dom/states.h"
#include "html/parse/html_parser.h"

namespace kestrune::html::css {
namespace {

using dom::Element;

class CascadeTest : public ::testing::Test {
 protected:
  void Load(std::u16string_view html, std::u16string_view sheet) {
    parse::ParseDocument(html, document_);
    styles_.ClearPageSheets();
    styles_.AddPageSheet(ParseStyleSheet(sheet));
    styles_.Update(&changes_);
  }

  Element* ById(std::u16string_view id) {
    for (Element* e = document_.root(); e; e = dom::NextElementInOrder(e, document_.root())) {
      const std::u16string* own = e->Attr(dom::kAtomId);
      if (own && *own == id) return e;
    }
    return nullptr;
  }

  const ComputedStyle& Style(std::u16string_view id) { return *ById(id)->style(); }

  dom::Document document_;
  StyleEngine styles_{document_};
  StyleChanges changes_;
};

TEST_F(CascadeTest, OrdersBySpecificityThenSourceOrderThenImportanceAndOrigin) {
  Load(u"<div id=a class=c style='width:40px'><span id=b class=c>x</span><p id=p style='width:5px'></p></div>",
       u"#a { color: #010101; } div.c { color: #020202; } div { color: #030303; }"
       u"span { color: #111111; } span { color: #222222; }"
       u"div { width: 10px !important; }"
       u"p { height: 7px !important; }");
  EXPECT_EQ(Style(u"a").color, 0xFF010101u);   // the id beats later, weaker rules
  EXPECT_EQ(Style(u"b").color, 0xFF222222u);   // equal weight: the later rule
  EXPECT_EQ(Style(u"a").width, Length::Px(10));  // !important beats the style attribute
  EXPECT_EQ(Style(u"p").width, Length::Px(5));   // the style attribute beats sheets
  // What the program sets wins over everything.
  ById(u"p")->rare().runtimeStyle.emplace_back(u"height", u"9px");
  ById(u"p")->MarkStyleDirty(false);
  styles_.Update();
  EXPECT_EQ(Style(u"p").height, Length::Px(9));
}

TEST_F(CascadeTest, InheritsOnlyInheritedPropertiesAndResolvesEmAndPercent) {
  Load(u"<div id=a><p id=b><span id=c>x</span></p></div>",
       u"div { color: red; width: 50%; font-size: 20px; }"
       u"p { font-size: 150%; margin-left: 2em; width: inherit; }"
       u"span { font-size: 0.5em; line-height: 1.5; }");
  EXPECT_EQ(Style(u"b").color, 0xFFFF0000u);
  EXPECT_EQ(Style(u"c").width, Length::Auto());
  EXPECT_EQ(Style(u"b").width, (Length{50, Length::Unit::kPercent}));
  EXPECT_FLOAT_EQ(Style(u"b").fontSize, 30);
  EXPECT_EQ(Style(u"b").margin[kLeft], Length::Px(60));
  EXPECT_FLOAT_EQ(Style(u"c").fontSize, 15);
  EXPECT_EQ(Style(u"c").lineHeight, Length::Px(22.5f));
}

TEST_F(CascadeTest, ExpandsShorthandsAndReadsEveryLayoutProperty) {
  Load(u"<div id=a>x</div><div id=b>y</div>",
       u"#a { margin: 1px 2px 3px; padding: 4px; border: 2px solid #00f; border-radius: 3px 5px;"
       u" background: #fff url(bg.png) no-repeat right top; font: italic bold 14px/18px Segoe UI, Arial;"
       u" flow: horizontal; width: 1*; height: 2*; overflow: hidden auto; position: absolute; left: 3px;"
       u" z-index: 4; box-sizing: border-box; white-space: nowrap; text-overflow: ellipsis; text-align: center;"
       u" vertical-align: middle; cursor: pointer; visibility: hidden; display: inline-block;"
       u" min-width: 10px; max-height: 50%; behavior: grid sortable; }"
       u"#b { border-top: 1px dashed; color: green; display: none }");
  const ComputedStyle& a = Style(u"a");
  EXPECT_EQ(a.margin[kTop], Length::Px(1));
  EXPECT_EQ(a.margin[kRight], Length::Px(2));
  EXPECT_EQ(a.margin[kBottom], Length::Px(3));
  EXPECT_EQ(a.margin[kLeft], Length::Px(2));
  EXPECT_EQ(a.padding[kBottom], Length::Px(4));
  EXPECT_EQ(a.border[kLeft].width, 2);
  EXPECT_EQ(a.border[kLeft].style, BorderStyle::kSolid);
  EXPECT_EQ(a.border[kLeft].color, 0xFF0000FFu);
  EXPECT_EQ(a.radius[kTopRight], Length::Px(5));
  EXPECT_EQ(a.radius[kBottomRight], Length::Px(3));
  EXPECT_EQ(a.backgroundColor, 0xFFFFFFFFu);
  EXPECT_EQ(a.backgroundImage, u"bg.png");
  EXPECT_EQ(a.backgroundRepeat, BackgroundRepeat::kNoRepeat);
  EXPECT_EQ(a.backgroundPosition[0], (Length{100, Length::Unit::kPercent}));
  EXPECT_EQ(a.fontStyle, FontStyle::kItalic);
  EXPECT_EQ(a.fontWeight, 700);
  EXPECT_FLOAT_EQ(a.fontSize, 14);
  EXPECT_EQ(a.lineHeight, Length::Px(18));
  EXPECT_EQ(a.fontFamily, u"Segoe UI, Arial");
  EXPECT_EQ(a.flow, Flow::kHorizontal);
  EXPECT_EQ(a.width, (Length{1, Length::Unit::kFlex}));
  EXPECT_EQ(a.height, (Length{2, Length::Unit::kFlex}));
  EXPECT_EQ(a.overflowX, Overflow::kHidden);
  EXPECT_EQ(a.overflowY, Overflow::kAuto);
  EXPECT_EQ(a.position, Position::kAbsolute);
  EXPECT_EQ(a.offsets[kLeft], Length::Px(3));
  EXPECT_EQ(a.zIndex, 4);
  EXPECT_EQ(a.boxSizing, BoxSizing::kBorderBox);
  EXPECT_EQ(a.whiteSpace, WhiteSpace::kNoWrap);
  EXPECT_EQ(a.textOverflow, TextOverflow::kEllipsis);
  EXPECT_EQ(a.textAlign, TextAlign::kCenter);
  EXPECT_EQ(a.verticalAlign, VerticalAlign::kMiddle);
  EXPECT_EQ(a.cursor, Cursor::kPointer);
  EXPECT_EQ(a.visibility, Visibility::kHidden);
  EXPECT_EQ(a.display, Display::kInlineBlock);
  EXPECT_EQ(a.minWidth, Length::Px(10));
  EXPECT_EQ(a.maxHeight, (Length{50, Length::Unit::kPercent}));
  EXPECT_EQ(BehaviorNames(a), (std::vector<std::string>{"grid", "sortable"}));
  const ComputedStyle& b = Style(u"b");
  EXPECT_EQ(b.border[kTop].style, BorderStyle::kDashed);
  EXPECT_EQ(b.border[kTop].color, 0xFF008000u);  // the border follows the text colour
  EXPECT_EQ(b.display, Display::kNone);
}

TEST_F(CascadeTest, RecoversFromBrokenSheets) {
  Load(u"<div id=a><span id=b>x</span></div>",
       u"div { color: red; width: ; height: 5px } }} span::before { color: blue } @font-face { x: y }"
       u" @media screen { span { color: #00ff00 } } span { width: 3px; margin: 1px 2px 3px 4px 5px }"
       u" @unknown; div {{ broken } span { width: 4px }");
  EXPECT_EQ(Style(u"a").color, 0xFFFF0000u);
  EXPECT_EQ(Style(u"a").height, Length::Px(5));
  EXPECT_EQ(Style(u"b").color, 0xFF00FF00u);
  EXPECT_EQ(Style(u"b").width, Length::Px(3));
  EXPECT_EQ(Style(u"b").margin[kTop], Length::Px(0));  // five values: the declaration is dropped
  EXPECT_EQ(Style(u"a").width, Length::Auto());         // an unclosed block swallows the rest
}

TEST_F(CascadeTest, RestylesOnlyWhatAChangeCanAffect) {
  Load(u"<table id=t><tr id=r1><td id=c1>a</td><td>b</td></tr><tr id=r2><td><input id=box></td></tr></table>",
       u"tr:current td { color: red } input:checked { width: 3px } td { color: black }");
  ById(u"box")->SetState(dom::kStateChecked);  // tested on the subject only
  styles_.Update();
  EXPECT_EQ(styles_.lastComputed(), 1u);
  EXPECT_EQ(Style(u"box").width, Length::Px(3));

  ById(u"r1")->SetState(dom::kStateCurrent);  // tested on an ancestor: the row and its cells
  styles_.Update();
  EXPECT_EQ(styles_.lastComputed(), 3u);
  EXPECT_EQ(Style(u"c1").color, 0xFFFF0000u);
  // The rows' own styles stay alike; their cells must not be taken for one another.
  EXPECT_TRUE(*ById(u"r1")->style() == *ById(u"r2")->style());
  EXPECT_EQ(ById(u"r2")->ElementAt(0)->style()->color, 0xFF000000u);

  ById(u"r2")->SetState(dom::kStateExpanded);  // tested nowhere
  styles_.Update();
  EXPECT_EQ(styles_.lastComputed(), 0u);
}

TEST_F(CascadeTest, AlikeCousinsUnderDifferentlyStyledParentsInheritFromTheirOwn) {
  Load(u"<div id=x style='color: red'><span id=s1>a</span></div><div id=y style='color: lime'><span id=s2>b</span></div>"
       u"<div id=z><span id=s3>c</span></div><div id=w><span id=s4>d</span></div>",
       u"span { font-weight: bold }");
  EXPECT_EQ(Style(u"s1").color, 0xFFFF0000u);
  EXPECT_EQ(Style(u"s2").color, 0xFF00FF00u);
  EXPECT_EQ(Style(u"s3").color, 0xFF000000u);
  EXPECT_EQ(ById(u"s3")->style(), ById(u"s4")->style());
  EXPECT_NE(ById(u"s1")->style(), ById(u"s2")->style());
}

TEST_F(CascadeTest, SharesOneStyleAmongAlikeElementsAndReportsBehaviorAndVisibilityChanges) {
  std::u16string rows;
  for (int i = 0; i < 200; ++i) rows += u"<tr><td>1</td><td>2</td></tr>";
  Load(u"<table id=t>" + rows + u"</table><div id=panel><b id=inner>x</b></div>",
       u"td { color: blue } #panel { behavior: clock }");
  EXPECT_GE(styles_.lastShared(), 390u);
  Element* table = ById(u"t");
  EXPECT_EQ(table->ElementAt(0)->ElementAt(0)->style(), table->ElementAt(199)->ElementAt(1)->style());
  ASSERT_EQ(changes_.behaviors.size(), 1u);
  EXPECT_EQ(changes_.behaviors[0].get(), ById(u"panel"));

  ById(u"panel")->rare().runtimeStyle.emplace_back(u"visibility", u"hidden");
  ById(u"panel")->MarkStyleDirty(false);
  StyleChanges changes;
  styles_.Update(&changes);
  ASSERT_EQ(changes.hidden.size(), 1u);
  EXPECT_EQ(changes.hidden[0].get(), ById(u"panel"));
  EXPECT_EQ(Style(u"inner").visibility, Visibility::kHidden);  // inherited
}

}  // namespace
}  // namespace kestrune::html::css
