// UiPackage::Load as the engine's requests make it: every request opens the package anew,
// finds the file's stream, reads it and deciphers it. The package is shaped like the shipped
// one: 81 files, the largest about 42 KB. Target: at most 1 ms per request, median.
#include <benchmark/benchmark.h>

#include <cmath>
#include <random>
#include <string>

#include "base/text.h"
#include "ui/package/ui_package.h"
#include "uipack/package_builder.h"

namespace {

using kestrune::uipack::UiFile;

constexpr std::size_t kFileCount = 81;
constexpr double kSmallest = 300;
constexpr double kLargest = 42000;

// Pages, style sheets and images with sizes spread evenly on a log scale from 300 bytes to
// 42 KB, the kinds interleaved so that each spans small and large.
const std::vector<UiFile>& Files() {
  static const std::vector<UiFile> files = [] {
    std::mt19937 random(81);
    std::vector<UiFile> made;
    for (std::size_t i = 0; i < kFileCount; ++i) {
      const double share = static_cast<double>(i) / (kFileCount - 1);
      const auto size = static_cast<std::size_t>(kSmallest * std::pow(kLargest / kSmallest, share));
      const char* kind = i % 9 == 0 ? "pages/page" : i % 9 == 1 ? "styles/sheet" : "images/picture";
      const char* extension = i % 9 == 0 ? ".htm" : i % 9 == 1 ? ".css" : ".png";
      UiFile file{kestrune::AsciiToUtf16(kind + std::to_string(i) + extension), {}};
      file.bytes.resize(size);
      for (auto& byte : file.bytes) byte = static_cast<unsigned char>(random());
      made.push_back(std::move(file));
    }
    return made;
  }();
  return files;
}

const std::vector<unsigned char>& Package() {
  static const auto package = kestrune::uipack::BuildUiPackage(Files());
  return package;
}

// One request per iteration, going round all 81 files: the time per iteration is the time
// per request, averaged over the package's mix of sizes.
void BM_LoadEveryFileInTurn(benchmark::State& state) {
  const auto& package = Package();
  std::size_t next = 0;
  std::size_t bytes = 0;
  for (auto _ : state) {
    auto file = kestrune::ui::UiPackage::Load(package, Files()[next].name);
    if (!file) state.SkipWithError("a file did not load");
    bytes += file->size();
    benchmark::DoNotOptimize(file);
    next = (next + 1) % kFileCount;
  }
  state.SetBytesProcessed(static_cast<std::int64_t>(bytes));
  state.counters["package_bytes"] = static_cast<double>(package.size());
}
BENCHMARK(BM_LoadEveryFileInTurn)
    ->Unit(benchmark::kMicrosecond)
    ->Repetitions(9)
    ->ReportAggregatesOnly(true);

// The worst request: the largest file.
void BM_LoadLargestFile(benchmark::State& state) {
  const auto& package = Package();
  const UiFile& largest = Files().back();
  for (auto _ : state) {
    auto file = kestrune::ui::UiPackage::Load(package, largest.name);
    if (!file) state.SkipWithError("the largest file did not load");
    benchmark::DoNotOptimize(file);
  }
  state.counters["file_bytes"] = static_cast<double>(largest.bytes.size());
}
BENCHMARK(BM_LoadLargestFile)
    ->Unit(benchmark::kMicrosecond)
    ->Repetitions(9)
    ->ReportAggregatesOnly(true);

}  // namespace

BENCHMARK_MAIN();
