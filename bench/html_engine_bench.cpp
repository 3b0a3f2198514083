// The engine on the track table: 40,000 rows of the table's row format put into the table in
// one HTMLayoutSetElementHtml call (parsing, inserting, restyling and the tick boxes' built-in
// controls included), and the lookup of a row's tick box by selector.
#include <benchmark/benchmark.h>
#include <unistd.h>

#include <fstream>
#include <string>

#include "html/api/htmlayout.h"
#include "html/host/headless_host.h"

namespace {

using namespace kestrune::html;

constexpr int kRows = 40000;

// A sheet in the manner of the main page: rows, states of rows and tick boxes, cells.
constexpr const char* kPage = R"HTML(<html><head><style>
body { margin: 0; font: 12px "Segoe UI", Arial; }
#MainForm { flow: vertical; width: 100%; height: 100%; }
#TabMusicList { width: 100%; border-spacing: 0; behavior: sortable-grid; }
#TabMusicList tr { height: 20px; }
#TabMusicList tr:nth-child(odd) { background-color: #f4f4f4; }
#TabMusicList tr:current td { background-color: #3399ff; color: white; }
#TabMusicList tr:checked td { background-color: #cce4ff; }
#TabMusicList td { padding: 0 4px; white-space: nowrap; overflow: hidden; text-overflow: ellipsis; }
#TabMusicList td:first-child { width: 40px; text-align: right; color: #888; }
#TabMusicList td:nth-child(2) { width: 1*; }
input[type=checkbox] { width: 13px; height: 13px; margin: 0 4px 0 0; vertical-align: middle; }
input[type=checkbox]:checked { background-image: url(img/tick.png); }
</style></head><body><div id=MainForm><table id=TabMusicList fixedrows=0></table></div></body></html>)HTML";

std::string TrackRows() {
  std::string rows;
  rows.reserve(static_cast<std::size_t>(kRows) * 200);
  for (int i = 1; i <= kRows; ++i) {
    const std::string n = std::to_string(i);
    rows += "<tr><td>" + n + "</td><td><input type=\"checkbox\" action=\"musicselection\" id=\"musicselection\">Track title " +
            n + "</td><td>" + std::to_string(i % 9 + 1) + ":0" + std::to_string(i % 10) + "</td><td>Artist " +
            std::to_string(i % 700) + "</td><td>Album " + std::to_string(i % 3000) + "</td><td>Genre " +
            std::to_string(i % 25) + "</td><td/>";
  }
  return rows;
}

struct Table {
  host::HeadlessHost host;
  HLWINDOW window = HTMLayoutCreateWindow(host);
  HELEMENT table = nullptr;
  Table() {
    const std::string page = kPage;
    HTMLayoutLoadHtml(window, reinterpret_cast<const unsigned char*>(page.data()), page.size());
    HELEMENT root = nullptr;
    HTMLayoutGetRootElement(window, &root);
    HTMLayoutSelectElements(root, "#TabMusicList", [](HELEMENT e, void* param) {
      *static_cast<HELEMENT*>(param) = e;
      return true;
    }, &table);
  }
  ~Table() { HTMLayoutDestroyWindow(window); }
  void Set(const std::string& html) {
    HTMLayoutSetElementHtml(table, reinterpret_cast<const unsigned char*>(html.data()), html.size(), kReplaceContent);
  }
};

// Resident memory of the process: what the rows really cost, pools and fragmentation included.
std::size_t ResidentBytes() {
  std::ifstream statm("/proc/self/statm");
  std::size_t total = 0, resident = 0;
  statm >> total >> resident;
  return resident * static_cast<std::size_t>(sysconf(_SC_PAGESIZE));
}

// Measured once, in a process that has not held rows before (the node pool keeps its memory
// for the next table, so later measurements would see no growth).
double ResidentBytesPerRow(const std::string& rows) {
  static const double perRow = [&] {
    Table table;
    table.Set("");
    const std::size_t empty = ResidentBytes();
    table.Set(rows);
    return static_cast<double>(ResidentBytes() - empty) / kRows;
  }();
  return perRow;
}

void BM_SetElementHtml40000Rows(benchmark::State& state) {
  const std::string rows = TrackRows();
  const double bytesPerRow = ResidentBytesPerRow(rows);
  Table table;
  table.Set(rows);
  for (auto _ : state) {
    table.Set(rows);  // replaces the previous 40,000 rows: their release is part of the cost
  }
  unsigned count = 0;
  HTMLayoutGetChildrenCount(table.table, &count);
  if (count != kRows) state.SkipWithError("wrong row count");
  state.counters["rows"] = count;
  state.counters["resident_bytes_per_row"] = bytesPerRow;
  state.counters["html_bytes_per_row"] = static_cast<double>(rows.size()) / kRows;
}
BENCHMARK(BM_SetElementHtml40000Rows)->Unit(benchmark::kMillisecond)->Repetitions(5)->DisplayAggregatesOnly(true);

void BM_SelectTickBoxInOneRow(benchmark::State& state) {
  Table table;
  table.Set(TrackRows());
  unsigned index = 0;
  benchmark::IterationCount found = 0;
  for (auto _ : state) {
    HELEMENT row = nullptr;
    HTMLayoutGetNthChild(table.table, index, &row);
    index = (index + 7919) % kRows;
    HELEMENT box = nullptr;
    HTMLayoutSelectElements(row, "[id='musicselection']", [](HELEMENT e, void* param) {
      *static_cast<HELEMENT*>(param) = e;
      return true;
    }, &box);
    found += box != nullptr;
    benchmark::DoNotOptimize(box);
  }
  if (found != state.iterations()) state.SkipWithError("a row without its tick box");
}
BENCHMARK(BM_SelectTickBoxInOneRow)->Unit(benchmark::kNanosecond)->Repetitions(5)->DisplayAggregatesOnly(true);

}  // namespace

BENCHMARK_MAIN();
