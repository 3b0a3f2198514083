// Layout and painting of the track table with Pango's real text measurement: a table of 4,000 or
// 40,000 rows inside a scrolling element of the window's size (900 x 623). The first layout
// after the rows are set; scrolling by one page and painting the window with cairo; the memory
// the laid-out table takes; and what a paint draws, which must not grow with the rows out of
// view.
#include <benchmark/benchmark.h>
#include <malloc.h>

#include <cstdio>
#include <string>

#include "html/api/htmlayout.h"
#include "html/canvas_cairo/cairo_canvas.h"
#include "html/host/headless_host.h"
#include "html/paint/recording_canvas.h"

namespace {

using namespace kestrune::html;

constexpr Size kWindow{900, 623};
constexpr int kRowHeight = 20;

// The main page's track list: a fixed-layout table with a header row, cells on one line.
constexpr const char* kPage = R"HTML(<html><head><style>
html, body { margin: 0; height: 100%; }
body { font: 12px "Segoe UI", "DejaVu Sans", sans-serif; }
#List { height: 100%; overflow: auto; }
#TabMusicList { width: 100%; table-layout: fixed; border-spacing: 0; }
#TabMusicList th { background-color: #e8ecf2; padding: 3px 4px; text-align: left; }
#TabMusicList td { height: 20px; padding: 0 4px; white-space: nowrap; overflow: hidden; text-overflow: ellipsis; }
#TabMusicList tr:nth-child(odd) td { background-color: #f7f9fc; }
#TabMusicList th:first-child { width: 34px; text-align: right; }
#TabMusicList th:nth-child(2) { width: 2*; }
#TabMusicList th:nth-child(3) { width: 40px; }
#TabMusicList th:nth-child(4), #TabMusicList th:nth-child(5) { width: 1*; }
#TabMusicList th:nth-child(6) { width: 15%; }
#TabMusicList th:last-child { width: 8px; }
input[type=checkbox] { vertical-align: middle; margin: 0 4px 0 0; }
</style></head><body><div id=List><table id=TabMusicList fixedrows=1></table></div></body></html>)HTML";

std::string TrackRows(int count) {
  std::string rows = "<tr><th>#</th><th>Name</th><th>Time</th><th>Artist</th><th>Album</th><th>Genre</th><th></th></tr>";
  rows.reserve(static_cast<std::size_t>(count) * 220);
  for (int i = 1; i <= count; ++i) {
    const std::string n = std::to_string(i);
    rows += "<tr><td>" + n + "</td><td><input type=\"checkbox\" action=\"musicselection\" id=\"musicselection\">Track title " +
            n + " of a long album side</td><td>" + std::to_string(i % 9 + 1) + ":0" + std::to_string(i % 10) +
            "</td><td>Artist " + std::to_string(i % 700) + "</td><td>Album " + std::to_string(i % 3000) + "</td><td>Genre " +
            std::to_string(i % 25) + "</td><td/>";
  }
  return rows;
}

HELEMENT Select(HLWINDOW window, const char* selector) {
  HELEMENT root = nullptr, found = nullptr;
  HTMLayoutGetRootElement(window, &root);
  HTMLayoutSelectElements(root, selector, [](HELEMENT e, void* param) {
    *static_cast<HELEMENT*>(param) = e;
    return true;
  }, &found);
  return found;
}

// A window measuring with Pango, the table in it (rows not yet set).
struct TrackList {
  canvas_cairo::PangoText text;
  host::HeadlessHost host{text, kWindow};
  HLWINDOW window = HTMLayoutCreateWindow(host);
  HELEMENT list = nullptr;
  HELEMENT table = nullptr;

  TrackList() {
    const std::string page = kPage;
    HTMLayoutLoadHtml(window, reinterpret_cast<const unsigned char*>(page.data()), page.size());
    list = Select(window, "#List");
    table = Select(window, "#TabMusicList");
  }
  ~TrackList() { HTMLayoutDestroyWindow(window); }
  TrackList(const TrackList&) = delete;
  TrackList& operator=(const TrackList&) = delete;

  void Set(const std::string& html) {
    HTMLayoutSetElementHtml(table, reinterpret_cast<const unsigned char*>(html.data()), html.size(), kReplaceContent);
  }
  // Lays the page out (the list's content size needs every row's height); the content height.
  int Layout() {
    Size content{};
    HTMLayoutGetScrollInfo(list, nullptr, nullptr, &content);
    return content.height;
  }
};

// Bytes the heap has handed out and not taken back (freed blocks reused do not hide growth, as
// they would in the resident size).
std::size_t HeapBytes() {
  const struct mallinfo2 info = mallinfo2();
  return info.uordblks + info.hblkhd;
}

// The rows' content height as laid out must be the rows at 20px each below the header.
bool RightHeight(int height, int rows) { return height > rows * kRowHeight && height < rows * kRowHeight + 40; }

// Memory of the layout alone: what the heap grows by when the rows, already in the document, are
// laid out the first time. Measured before anything else has run, since boxes come from a pool
// that keeps what earlier layouts freed.
void ReportLayoutMemory(int count) {
  TrackList list;
  list.Set(TrackRows(count));
  const std::size_t before = HeapBytes();
  const int height = list.Layout();
  const double bytes = static_cast<double>(HeapBytes()) - static_cast<double>(before);
  std::printf("layout of %d rows: heap grows by %.1f MB, %.0f bytes per row%s\n", count, bytes / 1e6, bytes / count,
              RightHeight(height, count) ? "" : " (wrong content height)");
}

void BM_FirstLayoutAfterRowsAreSet(benchmark::State& state) {
  const int count = static_cast<int>(state.range(0));
  const std::string rows = TrackRows(count);
  TrackList list;
  int height = 0;
  for (auto _ : state) {
    state.PauseTiming();
    list.Set(rows);  // parsing and styling the rows is not layout: measured elsewhere
    state.ResumeTiming();
    height = list.Layout();
  }
  if (!RightHeight(height, count)) state.SkipWithError("wrong content height");
  state.counters["rows"] = count;
}
BENCHMARK(BM_FirstLayoutAfterRowsAreSet)->Arg(4000)->Arg(40000)->Unit(benchmark::kMillisecond)->Repetitions(5)
    ->DisplayAggregatesOnly(true);

void BM_ScrollOnePageThenPaint(benchmark::State& state) {
  const int count = static_cast<int>(state.range(0));
  TrackList list;
  list.Set(TrackRows(count));
  const int height = list.Layout();
  Rect view{};
  HTMLayoutGetScrollInfo(list.list, nullptr, &view, nullptr);
  // What one paint draws, counted on a recording canvas at a page in the middle.
  HTMLayoutSetScrollPos(list.list, {0, height / 2}, false);
  kestrune::html::paint::RecordingCanvas recording(kWindow);
  HTMLayoutPaint(list.window, recording, {0, 0, kWindow.width, kWindow.height});
  canvas_cairo::CairoCanvas canvas(kWindow, list.text);
  int y = 0;
  for (auto _ : state) {
    y += view.height();
    if (y + view.height() > height) y = 0;
    HTMLayoutSetScrollPos(list.list, {0, y}, false);
    HTMLayoutPaint(list.window, canvas, {0, 0, kWindow.width, kWindow.height});
  }
  if (!RightHeight(height, count)) state.SkipWithError("wrong content height");
  state.counters["rows"] = count;
  state.counters["texts_drawn_per_paint"] = static_cast<double>(recording.Texts().size());
  state.counters["ops_per_paint"] = static_cast<double>(recording.ops().size());
}
BENCHMARK(BM_ScrollOnePageThenPaint)->Arg(4000)->Arg(40000)->Unit(benchmark::kMillisecond)->Repetitions(5)
    ->DisplayAggregatesOnly(true);

}  // namespace

int main(int argc, char** argv) {
  ReportLayoutMemory(40000);
  benchmark::Initialize(&argc, argv);
  if (benchmark::ReportUnrecognizedArguments(argc, argv)) return 1;
  benchmark::RunSpecifiedBenchmarks();
  benchmark::Shutdown();
  return 0;
}
