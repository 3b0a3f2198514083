#include <gtest/gtest.h>

#include "html/css/selector.h"
#include "html/dom/states.h"
#include "html/parse/html_parser.h"

namespace kestrune::html::css {
namespace {

using dom::Element;

class SelectorTest : public ::testing::Test {
 protected:
  void SetUp() override {
    parse::ParseDocument(
        u"<body><div id=main class='panel wide'><ul><li id=l1>a</li><li id=l2 class=x>b</li><li id=l3>c</li>"
        u"<li id=l4>d</li><li id=l5>e</li></ul><p id=empty></p>"
        u"<input id=box accesskey='^S' lang=en-GB data-path='/music/abc.mp3' title='one two three'></div></body>",
        document_);
  }

  Element* ById(std::u16string_view id) {
    for (Element* e = document_.root(); e; e = dom::NextElementInOrder(e, document_.root())) {
      const std::u16string* own = e->Attr(dom::kAtomId);
      if (own && *own == id) return e;
    }
    return nullptr;
  }

  bool Match(std::u16string_view selector, std::u16string_view id) {
    auto parsed = ParseSelectorList(selector);
    EXPECT_TRUE(parsed.has_value()) << std::string(selector.begin(), selector.end());
    Element* element = ById(id);
    EXPECT_NE(element, nullptr);
    return parsed && element && MatchesAny(*parsed, *element);
  }

  dom::Document document_;
};

TEST_F(SelectorTest, MatchesTypeUniversalIdAndClass) {
  EXPECT_TRUE(Match(u"li", u"l1"));
  EXPECT_TRUE(Match(u"*", u"l1"));
  EXPECT_TRUE(Match(u"#main", u"main"));
  EXPECT_TRUE(Match(u"div.panel.wide", u"main"));
  EXPECT_FALSE(Match(u"div.panel.narrow", u"main"));
  EXPECT_FALSE(Match(u"#MAIN", u"main"));  // ids are compared exactly
  EXPECT_TRUE(Match(u"LI", u"l2"));        // tag names are not
}

TEST_F(SelectorTest, MatchesEveryAttributeOperator) {
  EXPECT_TRUE(Match(u"[accesskey]", u"box"));
  EXPECT_TRUE(Match(u"[accesskey='^s']", u"box"));    // = ignores ASCII case
  EXPECT_FALSE(Match(u"[accesskey=='^s']", u"box"));  // == does not
  EXPECT_TRUE(Match(u"[accesskey=='^S']", u"box"));
  EXPECT_TRUE(Match(u"[data-path^='/music']", u"box"));
  EXPECT_TRUE(Match(u"[data-path$='.mp3']", u"box"));
  EXPECT_TRUE(Match(u"[data-path*='abc']", u"box"));
  EXPECT_FALSE(Match(u"[data-path*='']", u"box"));
  EXPECT_TRUE(Match(u"[title~=two]", u"box"));
  EXPECT_FALSE(Match(u"[title~=tw]", u"box"));
  EXPECT_TRUE(Match(u"[lang|=en]", u"box"));
  EXPECT_FALSE(Match(u"[lang|=e]", u"box"));
  EXPECT_TRUE(Match(u"[id='box'],[name='box']", u"box"));
}

TEST_F(SelectorTest, MatchesCombinatorsListsAndNegation) {
  EXPECT_TRUE(Match(u"div li", u"l3"));
  EXPECT_TRUE(Match(u"ul > li", u"l3"));
  EXPECT_FALSE(Match(u"div > li", u"l3"));
  EXPECT_TRUE(Match(u"li.x + li", u"l3"));
  EXPECT_TRUE(Match(u"li.x ~ li", u"l5"));
  EXPECT_FALSE(Match(u"li.x ~ li", u"l1"));
  EXPECT_TRUE(Match(u"p, li", u"l1"));
  EXPECT_TRUE(Match(u"li:not(.x)", u"l1"));
  EXPECT_FALSE(Match(u"li:not(.x)", u"l2"));
  EXPECT_TRUE(Match(u"li:not(#l2, #l3)", u"l4"));
}

TEST_F(SelectorTest, MatchesStructuralPseudoClasses) {
  EXPECT_TRUE(Match(u"li:first-child", u"l1"));
  EXPECT_TRUE(Match(u"li:last-child", u"l5"));
  EXPECT_FALSE(Match(u"li:only-child", u"l1"));
  EXPECT_TRUE(Match(u"ul:only-child", u"l1") == false);
  EXPECT_TRUE(Match(u"li:nth-child(odd)", u"l3"));
  EXPECT_FALSE(Match(u"li:nth-child(even)", u"l3"));
  EXPECT_TRUE(Match(u"li:nth-child(2n+1)", u"l5"));
  EXPECT_TRUE(Match(u"li:nth-child(2n - 1)", u"l1"));
  EXPECT_TRUE(Match(u"li:nth-child(-n+3)", u"l3"));
  EXPECT_FALSE(Match(u"li:nth-child(-n+3)", u"l4"));
  EXPECT_TRUE(Match(u"li:nth-child(4)", u"l4"));
  EXPECT_TRUE(Match(u"li:nth-last-child(1)", u"l5"));
  EXPECT_TRUE(Match(u"p:empty", u"empty"));
  EXPECT_FALSE(Match(u"li:empty", u"l1"));
  EXPECT_TRUE(Match(u":root", u"main") == false);
}

TEST_F(SelectorTest, MatchesEveryStatePseudoClass) {
  const std::pair<const char16_t*, std::uint32_t> states[] = {
      {u"link", dom::kStateLink},           {u"hover", dom::kStateHover},       {u"active", dom::kStateActive},
      {u"focus", dom::kStateFocus},         {u"visited", dom::kStateVisited},   {u"current", dom::kStateCurrent},
      {u"checked", dom::kStateChecked},     {u"disabled", dom::kStateDisabled}, {u"read-only", dom::kStateReadOnly},
      {u"expanded", dom::kStateExpanded},   {u"collapsed", dom::kStateCollapsed},
      {u"incomplete", dom::kStateIncomplete}, {u"anchor", dom::kStateAnchor},   {u"focusable", dom::kStateFocusable},
      {u"owns-popup", dom::kStateOwnsPopup}, {u"busy", dom::kStateBusy},       {u"pressed", dom::kStatePressed},
      {u"popup", dom::kStatePopup},
  };
  Element* item = ById(u"l2");
  for (const auto& [name, bit] : states) {
    const std::u16string selector = std::u16string(u"li:") + name;
    item->SetState(0);
    EXPECT_FALSE(Match(selector, u"l2")) << bit;
    item->SetState(bit);
    EXPECT_TRUE(Match(selector, u"l2")) << bit;
  }
  item->SetState(dom::kStateDisabled);
  EXPECT_FALSE(Match(u"li:enabled", u"l2"));
  item->SetState(dom::kStateCurrent | dom::kStateChecked);
  EXPECT_TRUE(Match(u"li:current:checked", u"l2"));
  EXPECT_TRUE(Match(u"ul li:checked + li", u"l3"));
}

// Found by fuzzing: a number too big for any integer as an attribute value.
TEST_F(SelectorTest, TakesNumbersAsAttributeValuesAsWritten) {
  const std::u16string huge(70, u'3');
  ById(u"box")->SetAttr(dom::InternName("data-n"), huge + u"4");
  EXPECT_TRUE(Match(u"[data-n^=" + huge + u"]", u"box"));
  EXPECT_TRUE(Match(u"[data-n$=34]", u"box"));
  EXPECT_FALSE(ParseSelectorList(u"li:nth-child(" + huge + u"n+1)").has_value());
}

TEST_F(SelectorTest, RejectsInvalidSelectors) {
  const char16_t* invalid[] = {u"", u"a >", u"> a", u"[x=]", u"[=x]", u"a:unknown", u"a::before", u"a:not()",
                               u"li:nth-child(x)", u"a,", u"#", u".", u"[x", u"a:not(:not(:not(:not(:not(b)))))"};
  for (const char16_t* text : invalid) {
    EXPECT_FALSE(ParseSelectorList(text).has_value()) << std::string(text, text + std::char_traits<char16_t>::length(text));
  }
}

TEST_F(SelectorTest, ComputesSpecificity) {
  auto specificity = [](std::u16string_view text) { return (*ParseSelectorList(text))[0].specificity; };
  EXPECT_EQ(specificity(u"li"), 1u);
  EXPECT_EQ(specificity(u".x"), 0x100u);
  EXPECT_EQ(specificity(u"#a"), 0x10000u);
  EXPECT_EQ(specificity(u"ul li.x:hover[title]"), 0x302u);
  EXPECT_EQ(specificity(u"li:not(#a)"), 0x10001u);
}

TEST_F(SelectorTest, RecordsWhatSelectorsTestForInvalidation) {
  dom::StyleFeatures features;
  const auto list = ParseSelectorList(u"tr:current td, input:checked, .row + .row, li:first-child");
  for (const auto& selector : *list) CollectFeatures(selector, features);
  EXPECT_EQ(features.statesOutsideSubject, dom::kStateCurrent);
  EXPECT_EQ(features.states, dom::kStateCurrent | dom::kStateChecked);
  EXPECT_TRUE(features.siblingCombinators);
  EXPECT_TRUE(features.structural);
}

}  // namespace
}  // namespace kestrune::html::css
