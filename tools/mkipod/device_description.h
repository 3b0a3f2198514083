#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

namespace kestrune::mkipod {

struct StringField {
  std::uint32_t type = 0;
  std::u16string text;
};

struct RawField {
  std::uint32_t type = 0;
  std::uint32_t bodyLength = 0;  // zero bytes after a 24-byte header
};

// A header-only record of a tag no reader knows.
struct UnknownRecord {
  std::string tag;
  std::uint32_t headerLength = 12;
};

enum class MediaKind {
  kFiller,  // `size` bytes of a fixed pattern (1000 when no size is given)
  kTone,    // a WAV sine tone of `lengthMs`
  kNone,    // no file: the track's file is missing on the device
};

struct TrackDescription {
  std::uint32_t id = 0;
  // Fields left empty are not written; an empty text is written as an empty string record.
  std::optional<std::u16string> title, artist, album, genre, location;
  std::vector<StringField> moreStrings;
  std::vector<RawField> rawRecords;
  std::vector<UnknownRecord> unknownRecords;
  std::vector<std::uint32_t> oddLengthTypes;
  bool utf8 = false;
  std::uint32_t lengthMs = 0;
  std::optional<std::uint32_t> size;  // the media file's size when not given
  MediaKind media = MediaKind::kFiller;
  double toneHz = 440;
};

struct PlaylistDescription {
  std::optional<std::u16string> name;
  std::vector<std::uint32_t> itemIds;  // in file order; duplicates and unknown ids kept
  bool master = false;
  bool positions = false;  // each item carries its position record
};

struct DataSetDescription {
  std::uint32_t type = 0;
  bool photoTree = false;
  std::vector<UnknownRecord> unknownRecords;
};

struct DeviceDescription {
  // Written as a master playlist holding every track, before the other playlists.
  std::optional<std::u16string> deviceName;
  std::vector<TrackDescription> tracks;
  std::vector<PlaylistDescription> playlists;
  std::vector<DataSetDescription> moreDataSets;
  // As common writers do: a second copy of the playlists (set 3) and an album list (set 4).
  bool writerSets = true;
  std::uint32_t trackHeaderLength = 624;
};

}  // namespace kestrune::mkipod
