#include "mkipod/generated_devices.h"

#include <algorithm>
#include <array>
#include <string>

#include "base/text.h"
#include "base/utf.h"

namespace kestrune::mkipod {
namespace {

std::u16string U(const char* utf8) { return DecodeUtf8(utf8); }

// Writers name media files with a few random capitals in folders F00 to F49.
std::u16string LocationFor(std::uint32_t index, const char16_t* extension) {
  std::u16string name;
  std::uint32_t value = index * 7919u + 1234;
  for (int i = 0; i < 4 || value != 0; ++i) {
    name += static_cast<char16_t>(u'A' + value % 26);
    value /= 26;
  }
  std::u16string folder = u"F" + FormatDecimal(index % 50 / 10) + FormatDecimal(index % 10);
  return u":iPod_Control:Music:" + folder + u":" + name + extension;
}

// A small deterministic generator: the same seed gives the same device on every platform.
class Random {
 public:
  explicit Random(std::uint64_t seed)
      : state_(seed * 0x9E3779B97F4A7C15ull + 0x2545F4914F6CDD1Dull) {}
  std::uint64_t Next() {
    state_ ^= state_ << 13;
    state_ ^= state_ >> 7;
    state_ ^= state_ << 17;
    return state_;
  }
  std::uint32_t Below(std::uint32_t limit) { return static_cast<std::uint32_t>(Next() % limit); }
  template <typename T, std::size_t N>
  const T& Pick(const std::array<T, N>& items) {
    return items[Below(static_cast<std::uint32_t>(N))];
  }

 private:
  std::uint64_t state_;
};

struct DemoAlbum {
  const char* artist;
  const char* album;
  const char* genre;
  std::array<const char*, 6> titles;
};

const DemoAlbum kDemoAlbums[] = {
    {"The Lantern Keepers",
     "Harbour Lights",
     "Folk",
     {"Salt on the Window", "Lamplighter", "North Pier", "Fog Signal", "Tidewater", "Homeward"}},
    {"Mira Okafor",
     "Copper Skies",
     "Soul",
     {"Golden Hour", "Hold the Line", "Copper Skies", "Slow Burn", "Letters", "Sunday Kind"}},
    {"Velvet Static",
     "Night Transmission",
     "Electronic",
     {"Signal Lost", "Neon Rain", "Carrier Wave", "Afterglow", "Undertow", "Static Bloom"}},
    {"Los Hermanos Quiroga",
     "Café de Medianoche",
     "Latin",
     {"Camino Largo", "Luna de Papel", "El Último Tren", "Mañana Será", "Cumbia del Río", "Adiós"}},
    {"Brass & Timber",
     "Old Roads",
     "Americana",
     {"Dust Bowl Waltz", "Pine Box", "County Line", "Iron Horse", "Porch Light", "Long Gone"}},
    {"Saga Lindqvist",
     "Vinterljus",
     "Jazz",
     {"Snöfall", "Blue Hour", "Ljus i mörkret", "Midnight Ferry", "Frost Flowers", "Vårvind"}},
};

}  // namespace

DeviceDescription DemoDevice() {
  DeviceDescription device;
  device.deviceName = u"Kestrune Demo";
  const double scale[] = {261.63, 293.66, 329.63, 349.23, 392.00, 440.00, 493.88, 523.25};
  std::uint32_t index = 0;
  for (const DemoAlbum& album : kDemoAlbums) {
    for (const char* title : album.titles) {
      TrackDescription track;
      track.id = 100 + index * 2;  // writers leave gaps between ids
      track.title = U(title);
      track.artist = U(album.artist);
      track.album = U(album.album);
      track.genre = U(album.genre);
      track.location = LocationFor(index, u".wav");
      track.media = MediaKind::kTone;
      track.toneHz = scale[index % 8];
      track.lengthMs = 4000 + (index * 1370) % 9000;
      device.tracks.push_back(std::move(track));
      ++index;
    }
  }
  auto ids = [&device](std::initializer_list<std::uint32_t> positions) {
    std::vector<std::uint32_t> out;
    for (std::uint32_t position : positions) out.push_back(device.tracks[position].id);
    return out;
  };
  device.playlists = {
      {U("Morning Run"), ids({7, 13, 25, 2, 19, 31}), false, true},
      {U("Late Night"), ids({12, 13, 14, 15, 16, 17, 33, 34}), false, true},
      {U("Favourites"), ids({0, 6, 12, 18, 24, 30}), false, true},
      {U("Road Trip"), ids({24, 25, 26, 27, 28, 29, 3, 8, 20}), false, true},
      {U("Rainy Day ☂"), ids({1, 4, 9, 32, 35}), false, true},
  };
  return device;
}

DeviceDescription GeneratedDevice(const GeneratedDeviceOptions& options) {
  static const std::array<const char*, 24> kWords = {
      "Blue",   "River",  "Midnight", "Echo",   "Golden", "Shadow",   "Paper",    "Silver",
      "Hollow", "Summer", "Glass",    "Wild",   "Quiet",  "Electric", "Northern", "Velvet",
      "Stone",  "Fire",   "Ocean",    "Little", "Broken", "Distant",  "Crimson",  "Winter"};
  static const std::array<const char*, 16> kNouns = {
      "Heart", "Road",   "Light",    "Dream", "City",    "Song",   "Sky",    "Garden",
      "Train", "Letter", "Mountain", "Moon",  "Harbour", "Window", "Fields", "Rain"};
  static const std::array<const char*, 12> kGenres = {
      "Rock",    "Pop",  "Jazz",    "Folk",  "Electronic", "Classical",
      "Hip-Hop", "Soul", "Country", "Blues", "Reggae",     "Ambient"};

  Random random(options.seed);
  DeviceDescription device;
  device.deviceName = u"iPod " + FormatDecimal(std::uint64_t{options.seed});
  const std::uint32_t artists = std::max<std::uint32_t>(1, options.tracks / 40);
  for (std::uint32_t i = 0; i < options.tracks; ++i) {
    TrackDescription track;
    track.id = 1000 + i;
    track.title = U(random.Pick(kWords)) + u" " + U(random.Pick(kNouns));
    const std::uint32_t artist = random.Below(artists);
    track.artist = U(kWords[artist % kWords.size()]) + u" " +
                   U(kNouns[artist / kWords.size() % kNouns.size()]) + u" " + FormatDecimal(artist);
    // Each artist has up to four albums, each always under the same name.
    const std::uint32_t album = artist * 4 + random.Below(4);
    track.album = U(kNouns[album % kNouns.size()]) + u" of " +
                  U(kWords[album / kNouns.size() % kWords.size()]) + u" " + FormatDecimal(album);
    track.genre = U(random.Pick(kGenres));
    track.location = LocationFor(i, u".mp3");
    track.lengthMs = 90000 + random.Below(330000);
    if (options.media) {
      track.size = options.mediaSize;
    } else {
      track.media = MediaKind::kNone;
      track.size = 2000000 + random.Below(9000000);
    }
    device.tracks.push_back(std::move(track));
  }
  for (std::uint32_t p = 0; p < options.playlists; ++p) {
    PlaylistDescription playlist;
    playlist.name = U(random.Pick(kWords)) + u" Mix " + FormatDecimal(std::uint64_t{p + 1});
    playlist.positions = true;
    // Sizes from a handful to 1,400 tracks: with 40,000 tracks and 50 playlists the database
    // comes to about 60 MB, as real databases of devices that size do.
    const std::uint32_t count =
        options.tracks == 0 ? 0 : 10 + random.Below(std::min(1400u, options.tracks));
    for (std::uint32_t k = 0; k < count; ++k)
      playlist.itemIds.push_back(1000 + random.Below(options.tracks));
    device.playlists.push_back(std::move(playlist));
  }
  return device;
}

}  // namespace kestrune::mkipod
