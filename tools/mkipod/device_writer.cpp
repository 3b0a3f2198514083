#include "mkipod/device_writer.h"

#include <fstream>
#include <stdexcept>

#include "base/paths.h"
#include "mkipod/database_writer.h"
#include "mkipod/media_files.h"

namespace kestrune::mkipod {

std::filesystem::path MediaPathFor(const std::u16string& location,
                                   const std::filesystem::path& folder) {
  if (location.empty() || location.front() != u':') return {};
  std::filesystem::path path = folder;
  std::u16string component;
  for (std::size_t i = 1; i <= location.size(); ++i) {
    if (i < location.size() && location[i] != u':') {
      component += location[i];
      continue;
    }
    if (component == u".." || component == u"." || component.empty()) return {};
    path /= PathFromText(component);
    component.clear();
  }
  return path;
}

void WriteFile(const std::filesystem::path& path, const Bytes& bytes) {
  std::filesystem::create_directories(path.parent_path());
  std::ofstream out(path, std::ios::binary | std::ios::trunc);
  out.write(reinterpret_cast<const char*>(bytes.data()),
            static_cast<std::streamsize>(bytes.size()));
  if (!out) throw std::runtime_error("cannot write " + path.string());
}

DeviceDescription WriteDevice(DeviceDescription device, const std::filesystem::path& folder) {
  for (TrackDescription& track : device.tracks) {
    if (track.media == MediaKind::kNone || !track.location) continue;
    const std::filesystem::path path = MediaPathFor(*track.location, folder);
    if (path.empty()) continue;
    const Bytes media = track.media == MediaKind::kTone
                            ? ToneWav(track.toneHz, track.lengthMs)
                            : FillerBytes(track.size.value_or(1000), track.id);
    WriteFile(path, media);
    if (!track.size) track.size = static_cast<std::uint32_t>(media.size());
  }
  WriteFile(folder / "iPod_Control" / "iTunes" / "iTunesDB", BuildDatabase(device));
  return device;
}

}  // namespace kestrune::mkipod
