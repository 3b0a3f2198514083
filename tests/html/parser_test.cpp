#include <gtest/gtest.h>

#include "base/utf.h"
#include "html/parse/html_parser.h"
#include "html/parse/serializer.h"

namespace kestrune::html::parse {
namespace {

using dom::Element;

std::vector<dom::Ref<dom::Node>> Fragment(std::u16string_view html, dom::Atom context = dom::kAtomDiv) {
  return ParseFragment(html, context);
}

Element* E(const dom::Ref<dom::Node>& node) { return dom::AsElement(node.get()); }

std::u16string Tag(const Element* e) { return dom::NameOf(e->tag()); }

TEST(HtmlParser, TrackRowsWithoutEndTagsGiveSevenCellsEach) {
  const std::u16string row =
      u"<tr><td>1</td><td><input type=\"checkbox\" action=\"musicselection\" id=\"musicselection\">Title</td>"
      u"<td>3:07</td><td>Artist</td><td>Album</td><td>Genre</td><td/>";
  auto rows = Fragment(row + row + row, dom::kAtomTable);
  ASSERT_EQ(rows.size(), 3u);
  for (const auto& node : rows) {
    Element* tr = E(node);
    ASSERT_NE(tr, nullptr);
    EXPECT_EQ(Tag(tr), u"tr");
    ASSERT_EQ(tr->elementCount(), 7u);
    for (std::size_t i = 0; i < 7; ++i) EXPECT_EQ(Tag(tr->ElementAt(i)), u"td");
    EXPECT_TRUE(tr->ElementAt(6)->nodes().empty());
    Element* input = tr->ElementAt(1)->ElementAt(0);
    ASSERT_EQ(Tag(input), u"input");
    ASSERT_EQ(input->attributes().size(), 3u);
    EXPECT_EQ(dom::NameOf(input->attributes()[0].name), u"type");
    EXPECT_EQ(dom::NameOf(input->attributes()[2].name), u"id");
    EXPECT_EQ(input->attributes()[2].value, u"musicselection");
    EXPECT_TRUE(input->nodes().empty());  // void: the title is the cell's text, not the input's
    EXPECT_EQ(dom::InnerText(*tr->ElementAt(1)), u"Title");
  }
}

TEST(HtmlParser, EndsListItemsOptionsParagraphsAndDefinitionsImplicitly) {
  auto list = Fragment(u"<ul><li>a<li>b<LI>c</ul>");
  ASSERT_EQ(E(list[0])->elementCount(), 3u);
  EXPECT_EQ(dom::InnerText(*E(list[0])->ElementAt(2)), u"c");

  auto select = Fragment(u"<SELECT><OPTION value=1>One<option>Two<Option selected>Three</select>");
  Element* s = E(select[0]);
  EXPECT_EQ(Tag(s), u"select");
  ASSERT_EQ(s->elementCount(), 3u);
  EXPECT_TRUE(s->ElementAt(2)->HasAttr(dom::kAtomSelected));

  auto paragraphs = Fragment(u"<p>one<p>two<div>block</div>");
  ASSERT_EQ(paragraphs.size(), 3u);
  EXPECT_EQ(Tag(E(paragraphs[2])), u"div");

  auto definitions = Fragment(u"<dl><dt>term<dd>meaning<dt>next</dl>");
  EXPECT_EQ(E(definitions[0])->elementCount(), 3u);
}

TEST(HtmlParser, IgnoresStrayEndTagsAndClosesWhatIsLeftOpen) {
  auto nodes = Fragment(u"</b><div><span>x</div></span>tail<table><tr><td>1</tr><tr><td>2</table>");
  ASSERT_EQ(nodes.size(), 3u);
  Element* div = E(nodes[0]);
  ASSERT_EQ(div->elementCount(), 1u);
  EXPECT_EQ(dom::AsText(nodes[1].get())->text(), u"tail");
  Element* table = E(nodes[2]);
  ASSERT_EQ(table->elementCount(), 2u);
  EXPECT_EQ(table->ElementAt(0)->elementCount(), 1u);
  EXPECT_EQ(dom::InnerText(*table->ElementAt(1)), u"2");
}

TEST(HtmlParser, DecodesCharacterReferencesAndKeepsBrokenOnesAsText) {
  auto nodes = Fragment(u"a&amp;b&lt;&gt;&quot;&apos;&nbsp;&#65;&#x42;&#x1F600;&bogus;&#;&amp<i title='&lt;&#38;'>");
  const std::u16string text(dom::AsText(nodes[0].get())->text());
  EXPECT_EQ(text, std::u16string(u"a&b<>\"'\u00A0AB") + u"\U0001F600" + u"&bogus;&#;&");
  EXPECT_EQ(*E(nodes[1])->Attr(dom::InternName("title")), u"<&");
}

TEST(HtmlParser, DropsCommentsDeclarationsAndScriptsButKeepsStyleText) {
  auto nodes = Fragment(u"<!DOCTYPE html><!-- <p>no</p> --><script>if (a<b) x();</script>"
                        u"<style>p > a { color: red }</style><textarea>&lt;b&gt;</textarea>");
  ASSERT_EQ(nodes.size(), 2u);
  EXPECT_EQ(dom::InnerText(*E(nodes[0])), u"p > a { color: red }");
  EXPECT_EQ(dom::InnerText(*E(nodes[1])), u"<b>");
}

TEST(HtmlParser, FlattensNestingBeyondTheDepthLimit) {
  std::u16string deep;
  for (int i = 0; i < 5000; ++i) deep += u"<div>";
  deep += u"x";
  auto nodes = Fragment(deep);
  std::size_t depth = 0;
  for (Element* e = E(nodes[0]); e; e = e->elementCount() ? e->ElementAt(e->elementCount() - 1) : nullptr) ++depth;
  EXPECT_LE(depth, kMaxDepth + 1);
  EXPECT_GT(depth, kMaxDepth / 2);
}

TEST(HtmlParser, DropsWhitespaceBetweenRowsButNotBetweenWords) {
  auto nodes = Fragment(u"<table>\n  <tr>\n <td>a</td>\n </tr>\n</table><div><b>a</b> <i>b</i></div>");
  Element* table = E(nodes[0]);
  EXPECT_EQ(table->nodes().size(), 1u);
  EXPECT_EQ(table->ElementAt(0)->nodes().size(), 1u);
  EXPECT_EQ(E(nodes[1])->nodes().size(), 3u);
}

TEST(HtmlParser, ReadsEveryAttributeForm) {
  auto nodes = Fragment(u"<input TYPE=checkbox checked value='it''s' Id=\"x\" id=\"second\" data-a=1/>");
  Element* input = E(nodes[0]);
  EXPECT_EQ(*input->Attr(dom::kAtomType), u"checkbox");
  EXPECT_EQ(*input->Attr(dom::kAtomChecked), u"");
  EXPECT_EQ(*input->Attr(dom::kAtomValue), u"it");
  EXPECT_EQ(*input->Attr(dom::kAtomId), u"x");  // the first of two wins
  EXPECT_EQ(*input->Attr(dom::InternName("data-a")), u"1");

  nodes = Fragment(u"<a title=\"x &amp; y&lt;z & w&\" href=p&amp;q>t</a>");
  EXPECT_EQ(*E(nodes[0])->Attr(dom::InternName("title")), u"x & y<z & w&");
  EXPECT_EQ(*E(nodes[0])->Attr(dom::kAtomHref), u"p&q");
}

TEST(HtmlParser, PutsThePagesHtmlAttributesOnTheRoot) {
  dom::Document document;
  ParseDocument(u"<html lang=en><head><title>T</title></head><html lang=fr dir=rtl><body id=b>x</body></html>", document);
  Element* root = document.root();
  EXPECT_EQ(*root->Attr(dom::InternName("lang")), u"en");  // a second tag only adds what is missing
  EXPECT_EQ(*root->Attr(dom::InternName("dir")), u"rtl");
  ASSERT_EQ(root->elementCount(), 2u);
  EXPECT_EQ(Tag(root->ElementAt(1)), u"body");
}

TEST(HtmlSerializer, RoundTripsPagesAndEscapesWhatMustBe) {
  const std::u16string pages[] = {
      u"<div class=\"a b\" title=\"say &quot;hi&quot; &amp; go\">x &lt; y &amp; z<br><input type=\"text\" value=\"v\"></div>",
      u"<table><tr><td>1</td><td></td></tr></table><style>a > b { x: \"y\" }</style>",
      u"<ul><li>one</li><li><a href=\"#x\">two</a></li></ul>",
  };
  for (const auto& page : pages) {
    dom::Ref<Element> holder = Element::Create(dom::kAtomBody);
    for (auto& node : Fragment(page)) holder->AppendChild(node);
    const std::u16string once = InnerHtml(*holder);
    dom::Ref<Element> again = Element::Create(dom::kAtomBody);
    for (auto& node : Fragment(once)) again->AppendChild(node);
    EXPECT_EQ(InnerHtml(*again), once);
    EXPECT_EQ(once, page);
  }
}

TEST(HtmlSerializer, WritesOuterHtmlOfVoidAndOrdinaryElements) {
  auto nodes = Fragment(u"<p id=a>t<img src=x.png></p>");
  EXPECT_EQ(OuterHtml(*E(nodes[0])), u"<p id=\"a\">t<img src=\"x.png\"></p>");
  EXPECT_EQ(OuterHtml(*E(nodes[0])->ElementAt(0)), u"<img src=\"x.png\">");
  EXPECT_EQ(InnerHtml(*E(nodes[0])), u"t<img src=\"x.png\">");
}

}  // namespace
}  // namespace kestrune::html::parse
