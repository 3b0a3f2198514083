#include "cli/commands.h"

#include <exception>
#include <optional>
#include <vector>

#include "base/text.h"
#include "base/utf.h"
#include "cli/json_writer.h"
#include "cli/text_table.h"
#include "library/discovery.h"

namespace kestrune::cli {
namespace {

std::string Decimal(std::uint64_t value) { return EncodeUtf8(FormatDecimal(value)); }

std::string SizeText(std::uint64_t bytes) {
  const char* const units[] = {"bytes", "KB", "MB", "GB", "TB"};
  double value = static_cast<double>(bytes);
  std::size_t unit = 0;
  while (value >= 1024 && unit + 1 < std::size(units)) value /= 1024, ++unit;
  char text[32];
  std::snprintf(text, sizeof text, unit == 0 ? "%.0f %s" : "%.1f %s", value, units[unit]);
  return text;
}

std::string Summary(const TrackLibrary& library) {
  std::uint64_t totalMs = 0, totalBytes = 0;
  for (const auto& [id, track] : library.tracks()) {
    totalMs += track.lengthMs;
    totalBytes += track.fileSize;
  }
  const std::uint64_t seconds = totalMs / 1000;
  char time[48];
  std::snprintf(time, sizeof time, "%llu:%02llu:%02llu",
                static_cast<unsigned long long>(seconds / 3600),
                static_cast<unsigned long long>(seconds / 60 % 60),
                static_cast<unsigned long long>(seconds % 60));
  return JsonString(library.deviceName()) + ": " + Decimal(library.tracks().size()) + " tracks, " +
         Decimal(library.playlists().size()) + " playlists, " + time + ", " + SizeText(totalBytes);
}

// The tracks the listing shows: the whole device, or one playlist's, in ascending id.
std::vector<const Track*> ChosenTracks(const TrackLibrary& library, std::int32_t playlist) {
  std::vector<const Track*> chosen;
  if (playlist < 0) {
    for (const auto& [id, track] : library.tracks()) chosen.push_back(&track);
  } else {
    for (const auto& [id, sameId] :
         library.playlists()[static_cast<std::size_t>(playlist)].trackIds) {
      chosen.push_back(&library.tracks().at(id));
    }
  }
  return chosen;
}

void PrintJson(const TrackLibrary& library, const std::vector<const Track*>& tracks,
               std::ostream& out) {
  out << "{\"device\": " << JsonString(library.deviceName()) << ", \"tracks\": [";
  const char* separator = "\n";
  for (const Track* track : tracks) {
    out << separator << "{\"id\": " << track->trackId << ", \"title\": " << JsonString(track->title)
        << ", \"artist\": " << JsonString(track->artist)
        << ", \"album\": " << JsonString(track->album)
        << ", \"genre\": " << JsonString(track->genre) << ", \"length_ms\": " << track->lengthMs
        << ", \"length\": " << JsonString(track->lengthText) << ", \"size\": " << track->fileSize
        << ", \"path\": " << JsonString(track->devicePath) << "}";
    separator = ",\n";
  }
  out << "\n], \"playlists\": [";
  separator = "\n";
  for (const Playlist& playlist : library.playlists()) {
    out << separator << "{\"name\": " << JsonString(playlist.name) << ", \"track_ids\": [";
    const char* comma = "";
    for (const auto& [id, sameId] : playlist.trackIds) {
      out << comma << id;
      comma = ", ";
    }
    out << "]}";
    separator = ",\n";
  }
  out << "\n]}\n";
}

void PrintTable(const TrackLibrary& library, const std::vector<const Track*>& tracks,
                std::ostream& out) {
  TextTable table({{u"ID", true},
                   {u"TITLE"},
                   {u"ARTIST"},
                   {u"ALBUM"},
                   {u"GENRE", false, 16},
                   {u"TIME", true},
                   {u"SIZE", true}});
  for (const Track* track : tracks) {
    table.AddRow({FormatDecimal(track->trackId), track->title, track->artist, track->album,
                  track->genre, track->lengthText, FormatDecimal(track->fileSize)});
  }
  table.Print(out);
  out << '\n';
  for (std::size_t i = 0; i < library.playlists().size(); ++i) {
    const Playlist& playlist = library.playlists()[i];
    out << "playlist " << i << ": " << JsonString(playlist.name) << ", " << playlist.trackIds.size()
        << " tracks\n";
  }
  out << Summary(library) << '\n';
}

}  // namespace

int RunDevices(const platform::Drives& drives, std::ostream& out, std::ostream& err) {
  std::vector<std::u16string> candidates;
  ListRemovableDrives(drives, candidates);
  if (candidates.empty()) out << "no removable drives\n";
  std::optional<std::size_t> chosen;
  bool searchEnded = false;
  for (std::size_t i = 0; i < candidates.size(); ++i) {
    out << EncodeUtf8(candidates[i]) << "  ";
    try {
      TrackLibrary library(candidates[i]);
      if (!library.LoadDatabase()) {
        out << "no database\n";
        continue;
      }
      const bool wins = !chosen && !searchEnded;
      if (wins) chosen = i;
      out << "loaded  " << Summary(library) << (wins ? "  (the device)" : "") << '\n';
    } catch (const std::exception& error) {
      out << "malformed database: " << error.what()
          << (!chosen && !searchEnded ? "  (ends the search)" : "") << '\n';
      searchEnded = searchEnded || !chosen;
    }
  }
  if (chosen) return kExitOk;
  err << "kestrune-cli: no device found\n";
  return kExitNoDevice;
}

int RunList(const Options& options, const platform::Drives& drives, std::ostream& out,
            std::ostream& err) {
  std::string failure;
  const std::optional<TrackLibrary> library = FindDevice(drives, &failure);
  if (!library) {
    err << "kestrune-cli: no device found" << (failure.empty() ? "" : " (" + failure + ")") << '\n';
    return kExitNoDevice;
  }
  const std::int32_t playlist = options.playlist.value_or(-1);
  if (playlist >= static_cast<std::int64_t>(library->playlists().size())) {
    err << "kestrune-cli: the device has " << library->playlists().size()
        << " playlists, numbered from 0; there is no playlist " << playlist << '\n';
    return kExitUsage;
  }
  const std::vector<const Track*> tracks = ChosenTracks(*library, playlist);
  if (options.json) {
    PrintJson(*library, tracks, out);
  } else {
    PrintTable(*library, tracks, out);
  }
  return kExitOk;
}

}  // namespace kestrune::cli
