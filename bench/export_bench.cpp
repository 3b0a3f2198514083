// Throughput of the export job against cp -r of the same files, measured in the same run:
// 1,000 files of 1 MB each from a device folder to an output folder on the same disk. The target
// (at least 0.9 of cp's throughput) is for the flat export, which like cp makes a handful of
// folders; the organized one, which makes an artist and album folder for nearly every file of
// this device (about 1,000 folders against cp's 51), is measured beside it, and so is cp -r of an
// organized copy of the same files, which has as many folders.
#include <benchmark/benchmark.h>

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <string>
#include <vector>

#include "base/paths.h"
#include "base/text.h"
#include "export/export_job.h"
#include "mkipod/device_writer.h"
#include "mkipod/generated_devices.h"
#include "platform/clock.h"
#include "platform/folder_library.h"
#include "platform/system.h"

namespace {

namespace fs = std::filesystem;
using namespace kestrune;

constexpr std::uint32_t kFiles = 1000;
constexpr std::uint32_t kFileSize = 1 << 20;

class QuietDisplay : public ExportDisplay {
 public:
  QuietDisplay(std::vector<Track> tracks, std::u16string folder, bool organized)
      : tracks_(std::move(tracks)), folder_(std::move(folder)), organized_(organized) {}
  void EnableForm(bool) override {}
  std::vector<Track> CollectTickedTracks() override { return tracks_; }
  std::u16string OutputFolderText() override { return folder_; }
  bool IsTicked(ExportOption option) override {
    return option == ExportOption::kOrganized && organized_;
  }
  void ShowMessage(std::u16string_view, std::u16string_view) override {}
  void ShowProgressPanel() override {}
  void ShowProgress(const ProgressView&) override {}
  void ShowFinish() override {}

 private:
  std::vector<Track> tracks_;
  std::u16string folder_;
  bool organized_;
};

struct Work {
  Work()
      : folder(fs::temp_directory_path() /
               ("kestrune-export-bench-" +
                std::to_string(std::chrono::steady_clock::now().time_since_epoch().count()))) {
    mkipod::GeneratedDeviceOptions options;
    options.tracks = kFiles;
    options.playlists = 0;
    options.mediaSize = kFileSize;
    mkipod::DeviceDescription device = mkipod::GeneratedDevice(options);
    // Every file is 1 MB: a title heard twice would count as an earlier copy and not be copied.
    for (mkipod::TrackDescription& track : device.tracks)
      track.title = track.title.value_or(u"") + u" " + FormatDecimal(track.id);
    mkipod::WriteDevice(device, folder / "device");
    library.emplace(TextFromPath(folder / "device"));
    if (!library->LoadDatabase()) std::abort();
  }
  ~Work() { fs::remove_all(folder); }

  fs::path folder;
  std::optional<TrackLibrary> library;
};

Work& TheWork() {
  static Work work;
  return work;
}

std::vector<double> flatSeconds, organizedSeconds, copySeconds, copyTreeSeconds;

void ExportTo(Work& work, const fs::path& out, bool organized, platform::Files& files,
              ExportReport& report) {
  std::vector<Track> tracks;
  for (const auto& [id, track] : work.library->tracks()) tracks.push_back(track);
  QuietDisplay display(std::move(tracks), TextFromPath(out), organized);
  StopRequest stop;
  platform::FolderLibrary unused(out / "Playlists");
  ExportContext context{display, files, stop, {unused, platform::SystemClock()}};
  RunExport(&*work.library, context, report);
}

// Removes the last output and writes back what is dirty, so that each run starts alike.
void Reset(const fs::path& out) {
  fs::remove_all(out);
  std::system("sync");
}

void BM_ExportJob(benchmark::State& state) {
  Work& work = TheWork();
  const fs::path out = work.folder / "out";
  auto files = platform::MakeSystemFiles();
  for (auto _ : state) {
    state.PauseTiming();
    Reset(out);
    ExportReport report;
    state.ResumeTiming();
    const auto start = std::chrono::steady_clock::now();
    ExportTo(work, out, state.range(0) == 1, *files, report);
    const double seconds =
        std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
    state.SetIterationTime(seconds);
    (state.range(0) == 1 ? organizedSeconds : flatSeconds).push_back(seconds);
    const auto copied = std::count_if(
        report.results.begin(), report.results.end(),
        [](const TrackResult& result) { return result.outcome == CopyOutcome::kCopied; });
    if (copied != kFiles) state.SkipWithError("not every file was copied");
  }
  state.SetBytesProcessed(static_cast<std::int64_t>(state.iterations()) * kFiles * kFileSize);
}

// Arg 0: the device's own folders; 1: an organized copy of the same files.
void BM_CpRecursive(benchmark::State& state) {
  Work& work = TheWork();
  const fs::path out = work.folder / "out";
  fs::path source = work.folder / "device" / "iPod_Control" / "Music";
  if (state.range(0) == 1) {
    source = work.folder / "organized";
    ExportReport report;
    if (!fs::exists(source)) ExportTo(work, source, true, *platform::MakeSystemFiles(), report);
  }
  const std::string command = "cp -r '" + source.string() + "' '" + out.string() + "'";
  for (auto _ : state) {
    state.PauseTiming();
    Reset(out);
    state.ResumeTiming();
    const auto start = std::chrono::steady_clock::now();
    if (std::system(command.c_str()) != 0) state.SkipWithError("cp failed");
    const double seconds =
        std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
    state.SetIterationTime(seconds);
    (state.range(0) == 1 ? copyTreeSeconds : copySeconds).push_back(seconds);
  }
  state.SetBytesProcessed(static_cast<std::int64_t>(state.iterations()) * kFiles * kFileSize);
}

// The shared machine's disk is noisy: many single runs, compared by their medians.
BENCHMARK(BM_CpRecursive)
    ->ArgName("organized")
    ->Arg(0)
    ->Arg(1)
    ->Iterations(1)
    ->Repetitions(9)
    ->UseManualTime()
    ->Unit(benchmark::kMillisecond);
BENCHMARK(BM_ExportJob)
    ->ArgName("organized")
    ->Arg(0)
    ->Arg(1)
    ->Iterations(1)
    ->Repetitions(9)
    ->UseManualTime()
    ->Unit(benchmark::kMillisecond);

double Median(std::vector<double> values) {
  std::sort(values.begin(), values.end());
  return values.empty() ? 0 : values[values.size() / 2];
}

}  // namespace

int main(int argc, char** argv) {
  // The runs of the four are shuffled together, so that the machine's slow moments fall on all.
  std::vector<char*> arguments(argv, argv + argc);
  char interleave[] = "--benchmark_enable_random_interleaving=true";
  arguments.insert(arguments.begin() + 1, interleave);
  int count = static_cast<int>(arguments.size());
  benchmark::Initialize(&count, arguments.data());
  benchmark::RunSpecifiedBenchmarks();
  benchmark::Shutdown();
  if (!flatSeconds.empty() && !organizedSeconds.empty() && !copySeconds.empty() &&
      !copyTreeSeconds.empty()) {
    const double megabytes = kFiles * (kFileSize / 1048576.0);
    const double copyRate = megabytes / Median(copySeconds);
    const double copyTreeRate = megabytes / Median(copyTreeSeconds);
    const double flatRate = megabytes / Median(flatSeconds);
    const double organizedRate = megabytes / Median(organizedSeconds);
    std::printf("median MB/s: cp -r %.0f, export flat %.0f: ratio %.2f (target at least 0.90)\n",
                copyRate, flatRate, flatRate / copyRate);
    std::printf(
        "median MB/s: cp -r of the organized tree %.0f, export organized %.0f: ratio %.2f\n",
        copyTreeRate, organizedRate, organizedRate / copyTreeRate);
  }
  return 0;
}
