// Tables: column widths, spans, spacing, row heights, cells' vertical alignment, header rows of
// a scrolling table, and what a long table of unwrapped cells costs.
#include "layout_fixture.h"

namespace kestrune::html::test {
namespace {

TEST_F(LayoutTest, AFixedTableTakesItsColumnsFromTheFirstRow) {
  Load(R"(<body style="margin:0; font-size:10px">
    <table id=t style="table-layout:fixed; width:400px; border-spacing:0">
    <tr id=r1><td id=c1 style="width:100px">a</td><td id=c2 style="width:25%">b</td><td id=c3>c</td><td id=c4>d</td>
    <tr id=r2><td id=e colspan=2 style="width:5px">e</td><td>f</td><td id=g>ggggggggggggggggggggggggggggg</td>
    </table></body>)");
  // 100px plus the cell's 1px paddings; 25% of 400; the other two share the rest; later rows
  // (however wide their text) do not count.
  EXPECT_EQ(Box("#c1"), (Rect{0, 0, 102, 12}));
  EXPECT_EQ(Box("#c2"), (Rect{102, 0, 202, 12}));
  EXPECT_EQ(Box("#c3"), (Rect{202, 0, 301, 12}));
  EXPECT_EQ(Box("#c4"), (Rect{301, 0, 400, 12}));
  EXPECT_EQ(Box("#e"), (Rect{0, 12, 202, 24}));
  EXPECT_EQ(Box("#g"), (Rect{301, 12, 400, 24}));
  EXPECT_EQ(Box("#r2"), (Rect{0, 12, 400, 24}));
}

TEST_F(LayoutTest, AnAutomaticTableFitsItsColumnsToTheirContent) {
  Load(R"(<body style="margin:0; font-size:10px">
    <table id=u style="border-spacing:0"><tr><td id=u1>aa</td><td id=u2>aaaaaaaa</td></tr>
    <tr><td id=u3>a</td><td id=u4 style="width:60px">a</td></tr></table>
    <table id=w style="width:200px; border-spacing:0"><tr><td id=w1>aa</td><td id=w2>aaaaaa</td></tr></table></body>)");
  // Widest content per column (text and 1px paddings), or a cell's given width.
  EXPECT_EQ(Box("#u1"), (Rect{0, 0, 12, 12}));
  EXPECT_EQ(Box("#u2"), (Rect{12, 0, 74, 12}));
  EXPECT_EQ(Box("#u").width(), 74);
  // A wider table hands out the rest in proportion to what each column asked for.
  EXPECT_EQ(Box("#w1").width() + Box("#w2").width(), 200);
  EXPECT_LT(Box("#w1").width(), Box("#w2").width());
}

TEST_F(LayoutTest, SpacingFlexibleColumnsRowHeightsAndCellAlignment) {
  Load(R"(<body style="margin:0; font-size:10px">
    <table id=s style="width:300px; border-spacing:4px; table-layout:fixed">
    <tr><th id=h1 style="width:1*">x</th><th id=h2 style="width:2*">y</th></tr>
    <tr style="height:30px"><td id=m>mid</td><td id=b style="vertical-align:bottom">bot</td></tr></table></body>)");
  // 300 less three 4px gaps leaves 288 for 1* and 2*.
  EXPECT_EQ(Box("#h1"), (Rect{4, 4, 100, 16}));
  EXPECT_EQ(Box("#h2"), (Rect{104, 4, 296, 16}));
  EXPECT_EQ(Box("#m"), (Rect{4, 20, 100, 50}));
  const auto canvas = Paint();
  EXPECT_EQ(canvas.FindText(u"mid")->rect.top, 20 + 1 + 9);  // cells centre their content
  EXPECT_EQ(canvas.FindText(u"bot")->rect.top, 20 + 1 + 18);
  EXPECT_EQ(canvas.FindText(u"x")->rect.left, 4 + 1 + 44);  // headers centre their text
}

std::string Rows(int count) {
  std::string rows;
  for (int i = 1; i <= count; ++i) rows += "<tr id=r" + std::to_string(i) + "><td>row " + std::to_string(i) + "</td></tr>";
  return rows;
}

TEST_F(LayoutTest, HeaderRowsStayWhileAScrollingTableScrollsItsBody) {
  Load(R"(<body style="margin:0; font-size:10px"><table id=list fixedrows=1 style="width:300px; height:100px;
    overflow:auto; border-spacing:0; table-layout:fixed"><tr id=head><th id=name>Name</th></tr>)" + Rows(20) +
       "</table></body>");
  EXPECT_EQ(Box("#r1"), (Rect{0, 12, 284, 24}));
  HTMLayoutSetScrollPos(Find("#list"), {0, 50}, false);
  EXPECT_EQ(Box("#head"), (Rect{0, 0, 284, 12}));
  EXPECT_EQ(Box("#r1"), (Rect{0, -38, 284, -26}));
  EXPECT_EQ(At(10, 5), Find("#name"));  // the header covers the rows scrolled under it
  HELEMENT row = nullptr;
  HTMLayoutGetParentElement(At(10, 15), &row);
  EXPECT_EQ(Id(row), u"r5");  // row 5 shows from y 10, under the header's bottom edge
  const auto canvas = Paint();
  EXPECT_NE(canvas.FindText(u"Name"), nullptr);
  EXPECT_EQ(canvas.FindText(u"row 4"), nullptr);  // under the header: clipped away
  EXPECT_NE(canvas.FindText(u"row 5"), nullptr);
  // Scrolling a row into view keeps it below the header.
  HTMLayoutScrollToView(Find("#r2"), 0);
  EXPECT_EQ(Box("#r2").top, 12);
}

// Counts what the layout asks the measurer, around FixedMetrics.
class CountingMetrics final : public layout::TextMeasurer {
 public:
  layout::FontMetrics Metrics(const layout::Font& font) const override { return fixed_.Metrics(font); }
  int TextWidth(const layout::Font& font, std::u16string_view text) const override {
    ++widths;
    return fixed_.TextWidth(font, text);
  }
  mutable int widths = 0;

 private:
  paint::FixedMetrics fixed_;
};

TEST(LongTableLayout, MeasuresNoTextToLayOutUnwrappedCellsAndPaintsOnlyTheRowsInView) {
  CountingMetrics metrics;
  host::HeadlessHost host(metrics);
  HLWINDOW window = HTMLayoutCreateWindow(host);
  const std::string page =
      R"(<body style="margin:0; font-size:10px"><div id=list style="height:100px; overflow:auto">
      <table id=t style="width:100%; table-layout:fixed; border-spacing:0"></table></div></body>)";
  HTMLayoutLoadHtml(window, reinterpret_cast<const unsigned char*>(page.data()), page.size());
  HELEMENT root = nullptr, table = nullptr, list = nullptr;
  HTMLayoutGetRootElement(window, &root);
  HTMLayoutSelectElements(root, "#t", [](HELEMENT e, void* p) { return *static_cast<HELEMENT*>(p) = e, true; }, &table);
  HTMLayoutSelectElements(root, "#list", [](HELEMENT e, void* p) { return *static_cast<HELEMENT*>(p) = e, true; }, &list);
  std::string rows;
  for (int i = 0; i < 1000; ++i) {
    rows += "<tr><td style='white-space:nowrap'>title " + std::to_string(i) + "</td><td style='white-space:nowrap'>artist</td></tr>";
  }
  HTMLayoutSetElementHtml(table, reinterpret_cast<const unsigned char*>(rows.data()), rows.size(), kReplaceContent);

  Size content;
  ASSERT_EQ(HTMLayoutGetScrollInfo(list, nullptr, nullptr, &content), DomResult::kOk);
  EXPECT_EQ(content.height, 1000 * 12);
  EXPECT_EQ(metrics.widths, 0);  // 2,000 cells, no text measured

  paint::RecordingCanvas canvas({900, 623});
  auto painted = [&] {
    canvas.Clear();
    HTMLayoutPaint(window, canvas, {0, 0, 900, 623});
    return canvas.Texts().size();
  };
  EXPECT_EQ(painted(), 2u * 9);  // 100px show 8 rows and part of a ninth
  EXPECT_LE(metrics.widths, 2 * 9 * 2);
  HTMLayoutSetScrollPos(list, {0, 6000}, false);
  EXPECT_EQ(painted(), 2u * 9);
  EXPECT_NE(canvas.FindText(u"title 500"), nullptr);

  // A change to one row lays out that row and its table again, not the others' cells.
  HELEMENT row = nullptr, cell = nullptr;
  HTMLayoutGetNthChild(table, 500, &row);
  HTMLayoutGetNthChild(row, 0, &cell);
  HTMLayoutSetElementInnerText16(cell, u"changed", 7);
  HTMLayoutGetScrollInfo(list, nullptr, nullptr, &content);
  EXPECT_LE(window->view().context().laidOut, 8);
  EXPECT_EQ(content.height, 1000 * 12);
  HTMLayoutDestroyWindow(window);
}

}  // namespace
}  // namespace kestrune::html::test
