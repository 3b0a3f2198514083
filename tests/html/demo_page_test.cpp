// The demonstration page (pages/demo.html) laid out with Pango's real text metrics, as the
// snapshot tool lays it out; and the snapshot tool itself. Geometry is compared, not pixels.
#include <cstdlib>
#include <fstream>
#include <iterator>
#include <string>
#include <vector>

#include "base/utf.h"
#include "html/canvas_cairo/cairo_canvas.h"
#include "layout_fixture.h"
#include "support/temp_folder.h"

namespace kestrune::html::test {
namespace {

class DemoPageTest : public LayoutTest {
 protected:
  DemoPageTest() {
    // The window of the fixture measures with fixed metrics: this one measures with Pango.
    HTMLayoutDestroyWindow(window_);
    window_ = HTMLayoutCreateWindow(pangoHost_);
    std::ifstream file(KESTRUNE_DEMO_PAGE, std::ios::binary);
    const std::vector<unsigned char> html((std::istreambuf_iterator<char>(file)), std::istreambuf_iterator<char>());
    EXPECT_FALSE(html.empty());
    const std::u16string url = DecodeUtf8(KESTRUNE_DEMO_PAGE);
    EXPECT_EQ(HTMLayoutLoadHtmlEx(window_, html.data(), html.size(), url.c_str()), DomResult::kOk);
    HTMLayoutRunPending(window_);
  }

  canvas_cairo::PangoText text_;
  host::HeadlessHost pangoHost_{text_, {900, 623}};
};

TEST_F(DemoPageTest, TheFrameFillsTheWindowWithFlexibleAndFixedParts) {
  EXPECT_EQ(Box("#Caption"), (Rect{0, 0, 900, 50}));
  EXPECT_EQ(Box("#Logo"), (Rect{12, 11, 44, 43}));  // the picture's own 32px, centred on the line
  EXPECT_EQ(Box("#Toolbar"), (Rect{0, 50, 900, 80}));
  EXPECT_EQ(Box("#Status"), (Rect{0, 600, 900, 623}));
  EXPECT_EQ(Box("#Main"), (Rect{0, 80, 900, 600}));  // 1*: what the others leave
  // A horizontal flow: fixed side panel, splitter, and the rest.
  EXPECT_EQ(Box("#Side"), (Rect{0, 80, 180, 600}));
  EXPECT_EQ(Box("#Splitter"), (Rect{180, 80, 184, 600}));
  EXPECT_EQ(Box("#Right"), (Rect{184, 80, 900, 600}));
  // The side panel's vertical flow: the list takes what its neighbours and their margins leave.
  const Rect list = Box("#PlayLists");
  EXPECT_EQ(Box("#Wrapped").top, list.bottom + 8);
  EXPECT_EQ(Box("#Zoom").bottom, 600 - 6);
  Size content{};
  HTMLayoutGetScrollInfo(Find("#Side"), nullptr, nullptr, &content);
  EXPECT_EQ(content.height, 520);
  // Words wrap in the side panel; pre keeps its two lines.
  const Rect wrapped = Box("#Wrapped");
  EXPECT_EQ(wrapped.width(), 168);
  EXPECT_GE(wrapped.height(), 3 * 14);
  const Rect pre = Box("#Pre", events::kViewRelative | events::kContentBox);
  EXPECT_GE(pre.height(), 2 * 11);
  EXPECT_LT(pre.height(), 3 * 11);
  EXPECT_LE(Box("#Headline").width(), 500);  // max-width
}

TEST_F(DemoPageTest, TheTrackTableSharesItsWidthAndScrollsUnderItsHeader) {
  auto column = [&](int n) { return Box(("#TabMusicList th:nth-child(" + std::to_string(n) + ")").c_str()); };
  const Rect row = Box("#TabMusicList tr:nth-child(2)");
  int total = 0;
  for (int n = 1; n <= 7; ++n) total += column(n).width();
  EXPECT_EQ(total, row.width());
  EXPECT_EQ(column(1).width(), 34 + 8);  // widths of the content, plus the padding
  EXPECT_EQ(column(3).width(), 40 + 8);
  EXPECT_EQ(column(7).width(), 8 + 8);
  EXPECT_NEAR(column(2).width(), 2 * column(4).width(), 2);  // 2* and 1*
  EXPECT_NEAR(column(4).width(), column(5).width(), 1);
  EXPECT_EQ(row.height(), 20);
  // A heading across both columns of the small table in the side panel.
  EXPECT_EQ(Box("#Device th").width(), Box("#Device tr:nth-child(2)").width());
  EXPECT_NEAR(Box("#Device td").width(), Box("#Device tr:nth-child(2)").width() * 0.6, 1);  // padding included

  Point position{};
  Rect view{};
  Size content{};
  HELEMENT table = Find("#TabMusicList");
  HTMLayoutGetScrollInfo(table, &position, &view, &content);
  EXPECT_EQ(position, (Point{0, 0}));
  EXPECT_GT(content.height, view.height());
  const Rect header = column(1);
  HTMLayoutSetScrollPos(table, {0, content.height}, false);
  HTMLayoutGetScrollInfo(table, &position, nullptr, nullptr);
  EXPECT_EQ(position.y, content.height - view.height());  // held at the end of the range
  EXPECT_EQ(column(1), header);                          // the header row stays put
  const Rect last = Box("#TabMusicList tr:last-child");
  const Rect tableBox = Box("#TabMusicList", events::kViewRelative | events::kContentBox);
  EXPECT_LE(last.bottom, tableBox.bottom);
  EXPECT_GE(last.top, header.bottom);
}

TEST_F(DemoPageTest, PositionedBoxesStackByZIndexAndHiddenOnesTakeNoInput) {
  const Rect badge = Box("#Badge"), behind = Box("#Behind");
  EXPECT_EQ(badge.top, 10);
  EXPECT_EQ(badge.right, 900 - 14);
  EXPECT_EQ(behind, (Rect{814, 6, 894, 40}));
  EXPECT_EQ(At((badge.left + badge.right) / 2, (badge.top + badge.bottom) / 2), Find("#Badge"));
  EXPECT_EQ(At(behind.left + 2, behind.bottom - 2), Find("#Behind"));
  const Rect version = Box("#Version");
  EXPECT_EQ(version.right, 896);
  EXPECT_EQ(version.bottom, 619);
  EXPECT_EQ(Box("#Hidden"), (Rect{300, 200, 500, 300}));
  EXPECT_NE(At(400, 250), Find("#Hidden"));
  EXPECT_FALSE(Laid("#None"));
}

TEST_F(DemoPageTest, PicturesArePaintedInPlaceAndBackgroundsTiledInTheirBoxes) {
  paint::RecordingCanvas canvas({900, 623});
  HTMLayoutPaint(window_, canvas, {0, 0, 900, 623});
  const Rect logo = Box("#Status .logo");
  ASSERT_EQ(logo.width(), 16);
  // 50% 50%: the 32px picture's middle on the 16px box's middle, cut by the box.
  int logos = 0, stripes = 0, pictures = 0;
  const Rect side = Box("#Side"), picture = Box("#Logo");
  for (const auto& op : canvas.ops()) {
    if (op.kind != paint::RecordingCanvas::Op::Kind::kImage) continue;
    if (op.rect == picture) ++pictures;  // <img> at its own size
    if (op.clip == logo) {
      ++logos;
      EXPECT_EQ(op.rect, (Rect{logo.left - 8, logo.top - 8, logo.left + 24, logo.top + 24}));
    }
    if (op.clip == side && op.rect.width() == 8) ++stripes;
  }
  EXPECT_EQ(logos, 1);
  EXPECT_EQ(pictures, 1);
  EXPECT_EQ(stripes, ((180 + 7) / 8) * ((520 + 7) / 8));  // 8px tiles over the whole panel, no more
}

// Runs the snapshot tool; its exit status.
int Snapshot(const std::string& arguments) {
  const int status = std::system((std::string(KESTRUNE_HTML_SNAPSHOT) + " " + arguments + " 2>/dev/null").c_str());
  return WIFEXITED(status) ? WEXITSTATUS(status) : -1;
}

// Width and height from a PNG's header chunk.
Size PngHeaderSize(const std::vector<unsigned char>& png) {
  if (png.size() < 24 || std::string(png.begin() + 12, png.begin() + 16) != "IHDR") return {};
  auto be32 = [&](std::size_t at) { return int(png[at]) << 24 | int(png[at + 1]) << 16 | int(png[at + 2]) << 8 | int(png[at + 3]); };
  return {be32(16), be32(20)};
}

TEST(HtmlSnapshotTest, WritesAPngOfTheWindowsSizeOrFailsClearly) {
  kestrune::test::TempFolder folder;
  const std::string page = KESTRUNE_DEMO_PAGE;
  ASSERT_EQ(Snapshot(page + " " + (folder / "demo.png").string()), 0);
  EXPECT_EQ(PngHeaderSize(kestrune::test::ReadBytes(folder / "demo.png")), (Size{900, 623}));
  ASSERT_EQ(Snapshot(page + " " + (folder / "small.png").string() + " 320 200"), 0);
  EXPECT_EQ(PngHeaderSize(kestrune::test::ReadBytes(folder / "small.png")), (Size{320, 200}));

  EXPECT_EQ(Snapshot((folder / "missing.html").string() + " " + (folder / "missing.png").string()), 1);
  EXPECT_FALSE(std::filesystem::exists(folder / "missing.png"));
  EXPECT_EQ(Snapshot(page + " " + (folder / "bad.png").string() + " 0 200"), 2);
  EXPECT_EQ(Snapshot(page), 2);
  EXPECT_EQ(Snapshot(folder.path().string() + " " + (folder / "folder.png").string()), 1);  // a folder, not a page
  EXPECT_EQ(Snapshot(page + " " + (folder / "none" / "out.png").string()), 1);  // no such folder
}

}  // namespace
}  // namespace kestrune::html::test
