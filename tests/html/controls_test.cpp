#include "html/controls/scroll_bar.h"
#include "html/controls/text_edit.h"
#include "page_fixture.h"

namespace kestrune::html::test {
namespace {

using events::kKeyChar;
using events::kKeyDown;

class ControlsTest : public PageTest {
 protected:
  void SetUp() override {
    Load("<body><button id=b>Go</button>"
         "<input type=checkbox id=c1><input type=checkbox id=c2 checked>"
         "<form><input type=radio name=r id=r1 checked><input type=radio name=r id=r2><input type=radio name=r id=r3></form>"
         "<input id=t maxlength=8><input id=ro readonly value=fixed><textarea id=area></textarea>"
         "<select id=s><option value=a>A<option value=b selected>B<option>C</select>"
         "<popup id=p><menu id=m><li id=one>One<li id=two>Two</menu></popup><span id=anchor>menu</span>"
         "<a id=link href='next.htm'>next</a><div id=owner><widget type=vscrollbar id=bar></widget></div></body>");
    HTMLayoutWindowAttachEventHandler(window_, &EventLog::Proc, &log_.Make("window"), events::kHandleBehaviorEvent);
  }

  // Behavior events seen at the window, bubbling phase only.
  std::vector<events::BehaviorEventParams> Seen() {
    std::vector<events::BehaviorEventParams> seen;
    for (const auto& event : log_.behaviorEvents) {
      if (!(event.cmd & events::kSinking)) seen.push_back(event);
    }
    return seen;
  }

  unsigned ControlType(HELEMENT e) {
    unsigned type = 0;
    HTMLayoutControlGetType(e, &type);
    return type;
  }

  ControlValue Value(HELEMENT e) {
    ControlValue value;
    HTMLayoutControlGetValue(e, &value);
    return value;
  }

  EventLog log_;
};

TEST_F(ControlsTest, AButtonClicksOnPressAndReleaseInsideOnEnterAndOnMethodZero) {
  HELEMENT button = Find("#b");
  EXPECT_EQ(ControlType(button), controls::kCtlButton);
  Click(button);
  auto seen = Seen();
  ASSERT_EQ(seen.size(), 2u);
  EXPECT_EQ(seen[0].cmd, events::kButtonPress);
  EXPECT_EQ(seen[1].cmd, events::kButtonClick);
  EXPECT_EQ(seen[1].heTarget, button);
  EXPECT_EQ(seen[1].he, button);

  log_.behaviorEvents.clear();
  Mouse(events::kMouseDown, button);
  Mouse(events::kMouseUp, Find("#anchor"));  // released elsewhere: no click
  EXPECT_EQ(Seen().size(), 1u);

  log_.behaviorEvents.clear();
  Key(kKeyDown, events::kVkReturn);  // the button has the focus since the click
  events::MethodParams click{events::kDoClick};
  HTMLayoutCallBehaviorMethod(button, &click);
  Pump();
  seen = Seen();
  ASSERT_EQ(seen.size(), 2u);
  EXPECT_EQ(seen[0].reason, events::kByKeyClick);
  EXPECT_EQ(seen[1].reason, events::kSynthesized);
}

TEST_F(ControlsTest, CheckBoxesToggleTheCheckedStateAndReportIt) {
  HELEMENT c1 = Find("#c1");
  HELEMENT c2 = Find("#c2");
  EXPECT_FALSE(State(c1) & dom::kStateChecked);
  EXPECT_TRUE(State(c2) & dom::kStateChecked);  // from the attribute
  EXPECT_EQ(ControlType(c1), controls::kCtlCheckbox);
  Click(c1);
  EXPECT_TRUE(State(c1) & dom::kStateChecked);
  EXPECT_EQ(Value(c1), ControlValue::Bool(true));
  auto seen = Seen();
  ASSERT_FALSE(seen.empty());
  EXPECT_EQ(seen.back().cmd, events::kButtonStateChanged);
  EXPECT_EQ(seen.back().he, c1);
  Click(c1);
  EXPECT_FALSE(State(c1) & dom::kStateChecked);
  EXPECT_EQ(HTMLayoutControlSetValue(c1, ControlValue::Bool(true)), DomResult::kOk);
  EXPECT_TRUE(State(c1) & dom::kStateChecked);
}

TEST_F(ControlsTest, RadioButtonsOfOneNameCheckOneAtATime) {
  HELEMENT r1 = Find("#r1"), r2 = Find("#r2"), r3 = Find("#r3");
  EXPECT_EQ(ControlType(r2), controls::kCtlRadio);
  Click(r2);
  EXPECT_FALSE(State(r1) & dom::kStateChecked);
  EXPECT_TRUE(State(r2) & dom::kStateChecked);
  EXPECT_FALSE(State(r3) & dom::kStateChecked);
  std::size_t changes = 0;
  for (const auto& event : Seen()) changes += event.cmd == events::kButtonStateChanged;
  EXPECT_EQ(changes, 1u);
  Click(r2);  // already checked: nothing changes, nothing is reported
  changes = 0;
  for (const auto& event : Seen()) changes += event.cmd == events::kButtonStateChanged;
  EXPECT_EQ(changes, 1u);
}

TEST_F(ControlsTest, ATextInputEditsItsTextWithKeysAndTheClipboard) {
  HELEMENT input = Find("#t");
  EXPECT_EQ(ControlType(input), controls::kCtlEdit);
  Click(input);
  TypeText(u"abc");
  EXPECT_EQ(Text(input), u"abc");
  Key(kKeyDown, events::kVkLeft);
  Key(kKeyDown, events::kVkBack);
  EXPECT_EQ(Text(input), u"ac");
  Key(kKeyDown, events::kVkHome);
  Key(kKeyDown, events::kVkDelete);
  EXPECT_EQ(Text(input), u"c");
  Key(kKeyDown, events::kVkEnd);
  TypeText(u"de");
  Key(kKeyDown, events::kVkLeft, events::kShiftKeyPressed);
  Key(kKeyDown, events::kVkLeft, events::kShiftKeyPressed);
  Key(kKeyDown, 'X', events::kControlKeyPressed);
  EXPECT_EQ(Text(input), u"c");
  EXPECT_EQ(host_.ClipboardText(), u"de");
  Key(kKeyDown, 'V', events::kControlKeyPressed);
  Key(kKeyDown, 'V', events::kControlKeyPressed);
  TypeText(u"123456789");  // maxlength 8
  EXPECT_EQ(Text(input), u"cdede123");
  EXPECT_EQ(Value(input), ControlValue::String(u"cdede123"));

  std::size_t changes = 0;
  for (const auto& event : Seen()) changes += event.cmd == events::kEditValueChanged && event.he == input;
  EXPECT_EQ(changes, 13u);  // 3 + backspace + delete + 2 + cut + 2 pastes + 3 kept of 9 typed
  // Enter is not the input's: it goes on to the page (the search field relies on it).
  EXPECT_FALSE(Key(kKeyDown, events::kVkReturn));
  Key(kKeyDown, 'A', events::kControlKeyPressed);
  auto* edit = static_cast<controls::TextEdit*>(controls::ControlOf(*input));
  EXPECT_EQ(edit->selectionStart(), 0u);
  EXPECT_EQ(edit->selectionEnd(), 8u);
}

TEST_F(ControlsTest, ReadOnlyInputsAndTextAreasFollowTheirOwnRules) {
  HELEMENT fixed = Find("#ro");
  EXPECT_EQ(Text(fixed), u"fixed");  // the value attribute becomes the text
  Click(fixed);
  TypeText(u"x");
  Key(kKeyDown, events::kVkBack);
  EXPECT_EQ(Text(fixed), u"fixed");

  HELEMENT area = Find("#area");
  EXPECT_EQ(ControlType(area), controls::kCtlTextarea);
  Click(area);
  TypeText(u"a");
  Key(kKeyChar, u'\r');
  TypeText(u"b");
  EXPECT_EQ(Text(area), u"a\nb");

  events::TextValueParams set{{events::kSetTextValue}, u"hello", 5};
  EXPECT_EQ(HTMLayoutCallBehaviorMethod(area, &set), DomResult::kOk);
  events::TextSelectionParams select{{events::kTextEditSetSelection}, 1, 3};
  HTMLayoutCallBehaviorMethod(area, &select);
  events::TextValueParams replace{{events::kTextEditReplaceSelection}, u"EL", 2};
  HTMLayoutCallBehaviorMethod(area, &replace);
  events::TextValueParams get{{events::kGetTextValue}, nullptr, 0};
  HTMLayoutCallBehaviorMethod(area, &get);
  EXPECT_EQ(std::u16string(get.text, get.length), u"hELlo");
}

TEST_F(ControlsTest, ASelectListChoosesOneOptionByMouseAndKeys) {
  HELEMENT select = Find("#s");
  HELEMENT a = Find("option[value=a]"), b = Find("option[value=b]");
  HELEMENT c = Find("option:last-child", select);
  EXPECT_EQ(ControlType(select), controls::kCtlSelectSingle);
  EXPECT_TRUE(State(b) & dom::kStateCurrent);
  EXPECT_EQ(Value(select), ControlValue::String(u"b"));
  Click(c);
  EXPECT_TRUE(State(c) & dom::kStateCurrent);
  EXPECT_TRUE(State(c) & dom::kStateChecked);
  EXPECT_FALSE(State(b) & (dom::kStateCurrent | dom::kStateChecked));
  EXPECT_EQ(Value(select), ControlValue::String(u"C"));  // no value attribute: the text
  auto seen = Seen();
  ASSERT_FALSE(seen.empty());
  EXPECT_EQ(seen.back().cmd, events::kSelectSelectionChanged);
  EXPECT_EQ(seen.back().heTarget, select);
  EXPECT_EQ(seen.back().he, c);

  Key(kKeyDown, events::kVkUp);
  EXPECT_TRUE(State(b) & dom::kStateCurrent);
  Key(kKeyDown, events::kVkHome);
  EXPECT_TRUE(State(a) & dom::kStateCurrent);
  Key(kKeyDown, events::kVkUp);  // nothing above the first
  EXPECT_TRUE(State(a) & dom::kStateCurrent);
  Key(kKeyDown, events::kVkEnd);
  EXPECT_TRUE(State(c) & dom::kStateCurrent);
  std::size_t changes = 0;
  for (const auto& event : Seen()) changes += event.cmd == events::kSelectSelectionChanged;
  EXPECT_EQ(changes, 4u);  // click, up, home, end (the second up moved nothing)
  EXPECT_EQ(HTMLayoutControlSetValue(select, ControlValue::String(u"a")), DomResult::kOk);
  EXPECT_TRUE(State(a) & dom::kStateCurrent);
}

TEST_F(ControlsTest, AMenuItemClickGoesToTheItemAndClosesItsPopup) {
  HELEMENT popup = Find("#p");
  HELEMENT anchor = Find("#anchor");
  HELEMENT two = Find("#two");
  ASSERT_EQ(HTMLayoutShowPopup(popup, anchor, 2), DomResult::kOk);
  EXPECT_TRUE(State(popup) & dom::kStatePopup);
  EXPECT_TRUE(State(anchor) & dom::kStateOwnsPopup);
  Mouse(events::kMouseMove, two);
  EXPECT_TRUE(State(two) & dom::kStateCurrent);
  Click(two);
  bool clicked = false;
  for (const auto& event : Seen()) {
    if (event.cmd != events::kMenuItemClick) continue;
    clicked = true;
    EXPECT_EQ(event.heTarget, two);
    EXPECT_EQ(event.he, anchor);
  }
  EXPECT_TRUE(clicked);
  EXPECT_FALSE(State(popup) & dom::kStatePopup);
  EXPECT_FALSE(State(anchor) & dom::kStateOwnsPopup);
}

TEST_F(ControlsTest, AHyperlinkReportsItsClickAndBecomesVisited) {
  HELEMENT link = Find("#link");
  EXPECT_EQ(ControlType(link), controls::kCtlHyperlink);
  EXPECT_TRUE(State(link) & dom::kStateLink);
  Click(link);
  auto seen = Seen();
  ASSERT_FALSE(seen.empty());
  EXPECT_EQ(seen.back().cmd, events::kHyperlinkClick);
  EXPECT_EQ(seen.back().heTarget, link);
  EXPECT_TRUE(State(link) & dom::kStateVisited);
}

TEST_F(ControlsTest, AScrollBarKeepsItsRangeAndTellsItsOwnerWhereItWent) {
  HELEMENT bar = Find("#bar");
  HELEMENT owner = Find("#owner");
  EXPECT_EQ(ControlType(bar), controls::kCtlScrollbar);
  events::ScrollBarValueParams set{{events::kScrollBarSetValue}, 5, 0, 300, 10, 1};
  EXPECT_EQ(HTMLayoutCallBehaviorMethod(bar, &set), DomResult::kOk);
  events::ScrollBarValueParams get{{events::kScrollBarGetValue}, 0, 0, 0, 0, 0};
  HTMLayoutCallBehaviorMethod(bar, &get);
  EXPECT_EQ(get.value, 5);
  EXPECT_EQ(get.maxValue, 300);
  EXPECT_EQ(get.pageValue, 10);

  struct Position {
    int pos = -1;
    bool vertical = false;
    static bool Proc(void* tag, HELEMENT, unsigned group, void* params) {
      if (group != events::kHandleScroll) return false;
      auto& self = *static_cast<Position*>(tag);
      const auto& scroll = *static_cast<events::ScrollParams*>(params);
      if (scroll.cmd & events::kSinking) return false;
      self.pos = scroll.pos;
      self.vertical = scroll.vertical;
      return true;
    }
  } position;
  HTMLayoutAttachEventHandlerEx(owner, &Position::Proc, &position, events::kHandleScroll);
  auto* scrollBar = static_cast<controls::ScrollBar*>(controls::ControlOf(*bar));
  scrollBar->Command(*bar, events::kScrollPagePlus);
  EXPECT_EQ(position.pos, 15);
  EXPECT_TRUE(position.vertical);
  scrollBar->Command(*bar, events::kScrollEnd);
  EXPECT_EQ(position.pos, 300);
  scrollBar->Command(*bar, events::kScrollStepPlus);  // clamped at the end
  EXPECT_EQ(position.pos, 300);
  HTMLayoutDetachEventHandler(owner, &Position::Proc, &position);
}

}  // namespace
}  // namespace kestrune::html::test
