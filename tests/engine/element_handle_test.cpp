#include <gtest/gtest.h>

#include "engine/element_handle.h"
#include "engine/element_ops.h"
#include "html/dom/node.h"  // reference counts, to prove what each handle holds
#include "html/host/headless_host.h"

namespace kestrune::engine {
namespace {

class ElementHandleTest : public ::testing::Test {
 protected:
  void SetUp() override {
    const std::string page =
        "<body><div id=MainForm><span id=Status>old</span><input type=checkbox id=selectallmusic action=x>"
        "<table id=TabMusicList><tr><td>x</td></tr></table></div><div id=Waiting>wait</div></body>";
    html::HTMLayoutLoadHtml(window_, reinterpret_cast<const unsigned char*>(page.data()), page.size());
    html::HELEMENT root = nullptr;
    html::HTMLayoutGetRootElement(window_, &root);
    root_ = ElementHandle(root);
  }
  void TearDown() override {
    root_.Reset();
    html::HTMLayoutDestroyWindow(window_);
  }

  html::host::HeadlessHost host_;
  html::HLWINDOW window_ = html::HTMLayoutCreateWindow(host_);
  ElementHandle root_;
};

TEST_F(ElementHandleTest, HoldsOneEngineReferencePerHandle) {
  ElementHandle status = root_.FindById(u"Status");
  ASSERT_TRUE(status);
  EXPECT_TRUE(status.Is(status.get()));
  EXPECT_FALSE(status.Is(root_.get()));
  EXPECT_FALSE(ElementHandle().Is(nullptr));
  const auto references = [&] { return status.get()->refCount(); };
  EXPECT_EQ(references(), 2u);  // the tree's and this handle's
  {
    ElementHandle copy = status;
    EXPECT_EQ(references(), 3u);
    ElementHandle moved = std::move(copy);
    EXPECT_EQ(references(), 3u);
    moved = root_.FindById(u"Waiting");  // replaced: its reference goes
    EXPECT_EQ(references(), 2u);
  }
  ElementHandle kept = status;
  status.Delete();  // out of the tree, still held by two handles
  EXPECT_EQ(references(), 2u);
  EXPECT_EQ(kept.Text(), u"old");
  status.Reset();
  EXPECT_EQ(kept.get()->refCount(), 1u);
  EXPECT_FALSE(root_.FindById(u"Status"));
}

TEST_F(ElementHandleTest, AnEmptyHandleDoesNothing) {
  const ElementHandle empty = root_.FindById(u"NoSuchId");
  EXPECT_FALSE(empty);
  empty.SetAttribute("a", u"b");
  empty.SetStyleAttribute("visibility", u"hidden");
  empty.SetState(0x40, 0, true);
  empty.SetText(u"x");
  empty.SetHtml("<b>x</b>", 0);
  empty.Update(true);
  empty.Post(0, ElementHandle(), 0);
  ShowElement(empty, false);
  EnableElement(empty, false);
  SetElementChecked(empty, true);
  SetElementText(empty, u"x");
  SetElementHtmlText(empty, u"<tr></tr>");
  EXPECT_EQ(empty.Attribute("a"), std::nullopt);
  EXPECT_EQ(empty.State(), 0u);
  EXPECT_EQ(empty.Text(), u"");
  EXPECT_EQ(empty.ChildCount(), 0u);
  EXPECT_FALSE(empty.Child(0));
  EXPECT_FALSE(empty.Parent());
  EXPECT_FALSE(empty.SelectFirst("div"));
  EXPECT_FALSE(empty.Send(0, ElementHandle(), 0));
  EXPECT_EQ(empty.Location(0), std::nullopt);
  EXPECT_EQ(host_.immediateUpdates(), 0);
}

TEST_F(ElementHandleTest, PanelOperationsChangeStyleStateAndTextAndRedrawAtOnce) {
  ElementHandle waiting = root_.FindById(u"Waiting");
  ElementHandle form = root_.FindById(u"MainForm");
  ElementHandle box = root_.FindById(u"selectallmusic");
  ShowElement(waiting, false);
  EXPECT_EQ(waiting.StyleAttribute("visibility"), u"hidden");
  EXPECT_FALSE(waiting.IsVisible());
  ShowElement(waiting, true);
  EXPECT_TRUE(waiting.IsVisible());
  EnableElement(form, false);
  EXPECT_TRUE(form.HasState(html::dom::kStateDisabled));
  EXPECT_FALSE(box.IsEnabled());
  EnableElement(form, true);
  EXPECT_FALSE(form.HasState(html::dom::kStateDisabled));
  SetElementChecked(box, true);
  EXPECT_TRUE(box.HasState(html::dom::kStateChecked));
  SetElementText(waiting, u"Scanning…");
  EXPECT_EQ(waiting.Text(), u"Scanning…");
  EXPECT_GE(host_.immediateUpdates(), 6);
}

TEST_F(ElementHandleTest, SetsGeneratedHtmlAndClearsWithEmptyText) {
  ElementHandle table = root_.FindById(u"TabMusicList");
  SetElementHtmlText(table, u"<tr><td>1</td><td>Ünïcødé</td><td/><tr><td>2</td>");
  ASSERT_EQ(table.ChildCount(), 2u);
  EXPECT_EQ(table.Child(0).Child(1).Text(), u"Ünïcødé");
  EXPECT_EQ(table.Child(0).Type(), "tr");
  SetElementHtmlText(table, u"");
  EXPECT_EQ(table.ChildCount(), 0u);
  EXPECT_EQ(table.Html(false), "");
}

TEST_F(ElementHandleTest, SortsChildrenThroughAComparison) {
  ElementHandle table = root_.FindById(u"TabMusicList");
  SetElementHtmlText(table, u"<tr><th>head</th><tr><td>b</td><tr><td>C</td><tr><td>a</td>");
  table.SortChildren(1, table.ChildCount(), [](const ElementHandle& x, const ElementHandle& y) {
    return x.Text().compare(y.Text());
  });
  EXPECT_EQ(table.Child(0).Text(), u"head");
  EXPECT_EQ(table.Child(1).Text(), u"C");
  EXPECT_EQ(table.Child(2).Text(), u"a");
  EXPECT_EQ(table.Child(3).Text(), u"b");
}

TEST(FormatSelector, FillsTextsAndNumbersAndKeepsToTheLimit) {
  EXPECT_EQ(FormatSelector("[accesskey=='%s'],[accesskey-alt=='%s']", {std::string_view("^S"), std::string_view("^S")}),
            "[accesskey=='^S'],[accesskey-alt=='^S']");
  EXPECT_EQ(FormatSelector("[name='%S'] > li:nth-child(%d) %%", {std::u16string_view(u"Straße"), 3}),
            "[name='Straße'] > li:nth-child(3) %");
  const std::u16string huge(5000, u'x');
  EXPECT_EQ(FormatSelector("#%S", {std::u16string_view(huge)}).size(), 2047u);
  EXPECT_EQ(FormatSelector("%d %S", {std::u16string_view(u"wrong kind")}), " ");
}

}  // namespace
}  // namespace kestrune::engine
