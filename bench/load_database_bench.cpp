#include <benchmark/benchmark.h>
#include <gpod/itdb.h>

#include <cstdio>
#include <cstring>
#include <fstream>
#include <iostream>
#include <memory>
#include <string>

#include "base/paths.h"
#include "library/track_library.h"
#include "mkipod/device_writer.h"
#include "mkipod/generated_devices.h"

namespace {

using namespace kestrune;

std::filesystem::path g_device;

std::filesystem::path DatabaseFile() { return g_device / "iPod_Control" / "iTunes" / "iTunesDB"; }

void WarmPageCache() {
  std::ifstream in(DatabaseFile(), std::ios::binary);
  std::string chunk(1 << 20, '\0');
  while (in.read(chunk.data(), static_cast<std::streamsize>(chunk.size()))) {
  }
}

void LoadDatabase(benchmark::State& state) {
  WarmPageCache();
  std::size_t tracks = 0;
  for (auto _ : state) {
    auto library = std::make_unique<TrackLibrary>(TextFromPath(g_device));
    if (!library->LoadDatabase()) state.SkipWithError("no database");
    tracks = library->tracks().size();
    // What is timed is the load; the library is kept after a scan, so its end is not.
    state.PauseTiming();
    library.reset();
    state.ResumeTiming();
  }
  state.counters["tracks"] = static_cast<double>(tracks);
}

void LibgpodParseFile(benchmark::State& state) {
  WarmPageCache();
  std::size_t tracks = 0;
  for (auto _ : state) {
    GError* error = nullptr;
    Itdb_iTunesDB* db = itdb_parse_file(DatabaseFile().string().c_str(), &error);
    if (db == nullptr) {
      state.SkipWithError("libgpod refused the database");
      if (error != nullptr) g_error_free(error);
      break;
    }
    tracks = itdb_tracks_number(db);
    state.PauseTiming();
    itdb_free(db);
    state.ResumeTiming();
  }
  state.counters["tracks"] = static_cast<double>(tracks);
}

BENCHMARK(LoadDatabase)->Unit(benchmark::kMillisecond)->Repetitions(7)->ReportAggregatesOnly(true);
BENCHMARK(LibgpodParseFile)
    ->Unit(benchmark::kMillisecond)
    ->Repetitions(7)
    ->ReportAggregatesOnly(true);

long StatusKilobytes(const char* field) {
  std::ifstream status("/proc/self/status");
  std::string line;
  while (std::getline(status, line)) {
    if (line.rfind(field, 0) == 0) return std::stol(line.substr(std::strlen(field)));
  }
  return -1;
}

// One load in a fresh process: the growth of the peak resident size is the load's peak memory.
int PrintPeakMemory(bool libgpod) {
  const long before = StatusKilobytes("VmHWM:");
  std::size_t tracks = 0;
  if (libgpod) {
    Itdb_iTunesDB* db = itdb_parse_file(DatabaseFile().string().c_str(), nullptr);
    if (db == nullptr) return 1;
    tracks = itdb_tracks_number(db);
    std::cout << (libgpod ? "libgpod" : "") << " loaded: resident " << StatusKilobytes("VmRSS:")
              << " kB\n";
    itdb_free(db);
  } else {
    TrackLibrary library(TextFromPath(g_device));
    if (!library.LoadDatabase()) return 1;
    tracks = library.tracks().size();
    std::cout << "loaded: resident " << StatusKilobytes("VmRSS:") << " kB\n";
  }
  const long after = StatusKilobytes("VmHWM:");
  std::cout << tracks << " tracks; peak resident before " << before << " kB, after " << after
            << " kB, growth " << (after - before) << " kB\n";
  return 0;
}

}  // namespace

int main(int argc, char** argv) {
  std::optional<std::filesystem::path> temporary;
  if (argc >= 3 && std::strcmp(argv[1], "--peak") == 0) {
    g_device = argv[2];
    return PrintPeakMemory(argc >= 4 && std::strcmp(argv[3], "libgpod") == 0);
  }
  benchmark::Initialize(&argc, argv);
  if (argc >= 2) {
    g_device = argv[1];
  } else {
    temporary = std::filesystem::temp_directory_path() / "kestrune-bench-device";
    mkipod::GeneratedDeviceOptions options;
    options.tracks = 40000;
    options.playlists = 50;
    options.seed = 1;
    options.media = false;
    mkipod::WriteDevice(mkipod::GeneratedDevice(options), *temporary);
    g_device = *temporary;
  }
  std::cout << "database: " << std::filesystem::file_size(DatabaseFile()) << " bytes\n";
  benchmark::RunSpecifiedBenchmarks();
  benchmark::Shutdown();
  if (temporary) std::filesystem::remove_all(*temporary);
  return 0;
}
