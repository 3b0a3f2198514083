#include "library/track_library.h"

#include <algorithm>
#include <cstdio>

#include "base/paths.h"
#include "base/text.h"
#include "base/utf.h"
#include "itunesdb/chunk_reader.h"
#include "itunesdb/parse_chunk.h"
#include "library/device_files.h"

namespace kestrune {

using itunesdb::DbChunk;
using itunesdb::MalformedDatabase;

namespace {

constexpr std::uint32_t kLastStringType = 14;

// Where the device keeps its database, below the drive.
constexpr std::u16string_view kDatabaseLocation = u"/iPod_Control/iTunes/iTunesDB";

std::u16string DecodeString(const DbChunk& mhod) {
  const itunesdb::RecordBytes& record = mhod.rawRecord;
  const std::uint32_t byteLength = mhod.U32At(itunesdb::kMhodStringLengthOffset);
  if (byteLength > record.size() - itunesdb::kMhodStringOffset) {
    throw MalformedDatabase("string runs past its record");
  }
  const unsigned char* text = record.data() + itunesdb::kMhodStringOffset;
  if (mhod.U32At(itunesdb::kMhodStringEncodingOffset) == itunesdb::kMhodEncodingUtf8) {
    return DecodeUtf8(std::string_view(reinterpret_cast<const char*>(text), byteLength));
  }
  return DecodeUtf16Le(text, byteLength);
}

const DbChunk& FirstChild(const DbChunk& set, const char* what) {
  if (set.children.empty()) throw MalformedDatabase(std::string(what) + " has no list");
  return set.children.front();
}

// What ReadMhodText gives for each type from 1 to 14, in one pass over the children: the
// first record of each type counts.
void ReadTrackStrings(const DbChunk& node, std::array<std::u16string, 15>& texts) {
  std::uint32_t found = 0;
  for (const DbChunk& child : node.children) {
    if (child.Tag() != itunesdb::kTagMhod) continue;
    const std::uint32_t type = child.U32At(itunesdb::kMhodTypeOffset);
    if (type == 0 || type > kLastStringType || (found & (1u << type)) != 0) continue;
    found |= 1u << type;
    texts[type] = DecodeString(child);
  }
}

}  // namespace

bool ReadMhodText(const DbChunk& node, std::uint32_t type, std::u16string& text) {
  if (type == 0 || type > kLastStringType) return false;
  for (const DbChunk& child : node.children) {
    if (child.Tag() != itunesdb::kTagMhod || child.U32At(itunesdb::kMhodTypeOffset) != type) {
      continue;
    }
    text = DecodeString(child);
    return true;
  }
  return false;
}

std::u16string FormatLength(std::uint32_t milliseconds) {
  const std::uint32_t seconds = (milliseconds / 1000) % 60;
  std::u16string text = FormatDecimal(milliseconds / 60000);
  text += u':';
  text += static_cast<char16_t>(u'0' + seconds / 10);
  text += static_cast<char16_t>(u'0' + seconds % 10);
  return text;
}

TrackLibrary::TrackLibrary(std::u16string rootPath) : rootPath_(std::move(rootPath)) {}

bool TrackLibrary::LoadDatabase() {
  std::u16string databasePath = rootPath_ + std::u16string(kDatabaseLocation);
  for (char16_t& unit : databasePath) {
    if (unit == u'/') unit = kPathSeparator;
  }
  const auto file = FindBelowDrive(databasePath, rootPath_.size());
  if (!file) return false;
  FileHandle stream = OpenForReading(*file);
  if (!stream) return false;
  return ReadDatabase(stream.get());
}

bool TrackLibrary::ReadDatabase(std::FILE* stream) {
  // An empty file is a placeholder some devices keep beside a database of another form.
  const int first = std::fgetc(stream);
  if (first == EOF || std::ungetc(first, stream) == EOF) return false;
  // The tree lives only while the library is built, and goes with its arena.
  itunesdb::RecordArena arena;
  itunesdb::FileChunkReader reader(stream, arena);
  std::optional<itunesdb::RecordBytes> head = reader.ReadChunk();
  if (!head) throw MalformedDatabase("the database ends inside its first record");
  if (LoadU32Le(head->data()) != itunesdb::kTagMhbd) return false;
  const DbChunk root = itunesdb::ParseChunk(*head, reader, itunesdb::ChunkContext::kNone, arena);

  const DbChunk* trackSet = nullptr;
  const DbChunk* playlistSet = nullptr;
  for (const DbChunk& set : root.children) {
    const std::uint32_t type = set.U32At(itunesdb::kMhsdSetTypeOffset);
    if (type == itunesdb::kTrackSet) trackSet = &set;
    if (type == itunesdb::kPlaylistSet) playlistSet = &set;
  }
  if (trackSet == nullptr) throw MalformedDatabase("the database has no track set");
  if (playlistSet == nullptr) throw MalformedDatabase("the database has no playlist set");
  LoadTracks(FirstChild(*trackSet, "the track set"));
  LoadPlaylists(FirstChild(*playlistSet, "the playlist set"));
  return true;
}

void TrackLibrary::LoadTracks(const DbChunk& trackList) {
  for (const DbChunk& record : trackList.children) {
    // Filled in place: a later track with the same id replaces the earlier one.
    const std::uint32_t id = record.U32At(itunesdb::kMhitTrackIdOffset);
    auto [entry, added] = tracks_.try_emplace(id);
    Track& track = entry->second;
    if (!added) track = Track{};
    track.trackId = id;
    track.fileSize = record.U32At(itunesdb::kMhitFileSizeOffset);
    track.lengthMs = record.U32At(itunesdb::kMhitLengthMsOffset);
    ReadTrackStrings(record, track.mhodText);

    const std::u16string& location = track.mhodText[kLocationMhod];
    track.devicePath.reserve(rootPath_.size() + location.size());
    track.devicePath = rootPath_;
    track.devicePath += location;
    std::replace(track.devicePath.begin() + static_cast<std::ptrdiff_t>(rootPath_.size()),
                 track.devicePath.end(), u':', kPathSeparator);
    track.rootLength = static_cast<std::uint32_t>(rootPath_.size());

    track.title = track.mhodText[kTitleMhod];
    track.artist = track.mhodText[kArtistMhod];
    track.album = track.mhodText[kAlbumMhod];
    track.genre = track.mhodText[kGenreMhod];
    track.lengthText = FormatLength(track.lengthMs);
  }
}

void TrackLibrary::LoadPlaylists(const DbChunk& playlistList) {
  for (const DbChunk& record : playlistList.children) {
    std::u16string name;
    ReadMhodText(record, 1, name);
    if (record.U8At(itunesdb::kMhypMasterFlagOffset) != 0) {
      deviceName_ = std::move(name);
      continue;
    }
    Playlist& playlist = playlists_.emplace_back();
    playlist.name = std::move(name);
    for (const DbChunk& item : record.children) {
      if (item.Tag() != itunesdb::kTagMhip) continue;
      const std::uint32_t id = item.U32At(itunesdb::kMhipTrackIdOffset);
      if (tracks_.contains(id)) playlist.trackIds.emplace(id, id);
    }
  }
}

}  // namespace kestrune
