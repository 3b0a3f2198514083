#include "mkipod/database_writer.h"

#include <map>

namespace kestrune::mkipod {
namespace {

constexpr std::uint32_t kFileTypeMp3 = 0x4D503320;  // "MP3 " as writers store it

Bytes UnknownBytes(const UnknownRecord& unknown) {
  return RecordBuilder(unknown.tag, unknown.headerLength).ByLength();
}

Bytes TrackRecord(const TrackDescription& track, std::uint32_t headerLength) {
  RecordBuilder mhit("mhit", headerLength);
  mhit.U32(16, track.id).U32(20, 1).U32(24, kFileTypeMp3).U32(36, track.size.value_or(0));
  mhit.U32(40, track.lengthMs);
  const StringEncoding encoding = track.utf8 ? StringEncoding::kUtf8 : StringEncoding::kUtf16;
  auto odd = [&track](std::uint32_t type) {
    for (std::uint32_t oddType : track.oddLengthTypes) {
      if (oddType == type) return true;
    }
    return false;
  };
  const std::pair<std::uint32_t, const std::optional<std::u16string>*> fields[] = {
      {1, &track.title},
      {2, &track.location},
      {3, &track.album},
      {4, &track.artist},
      {5, &track.genre}};
  for (const auto& [type, text] : fields) {
    if (text->has_value()) mhit.Child(StringMhod(type, **text, encoding, odd(type)));
  }
  for (const StringField& field : track.moreStrings) {
    mhit.Child(StringMhod(field.type, field.text, encoding, odd(field.type)));
  }
  for (const RawField& raw : track.rawRecords) mhit.Child(RawMhod(raw.type, Bytes(raw.bodyLength)));
  for (const UnknownRecord& unknown : track.unknownRecords) mhit.Child(UnknownBytes(unknown));
  if (headerLength >= 16) mhit.U32(12, static_cast<std::uint32_t>(mhit.ChildCount()));
  return mhit.ByLength();
}

Bytes PlaylistRecord(const PlaylistDescription& playlist, std::uint64_t playlistId) {
  RecordBuilder mhyp("mhyp", 184);
  mhyp.U8(20, playlist.master ? 1 : 0).U64(28, playlistId);
  std::uint32_t strings = 0;
  if (playlist.name) {
    mhyp.Child(StringMhod(1, *playlist.name));
    ++strings;
  }
  mhyp.U32(12, strings).U32(16, static_cast<std::uint32_t>(playlist.itemIds.size()));
  std::uint32_t position = 0;
  for (std::uint32_t id : playlist.itemIds) {
    RecordBuilder mhip("mhip", 76);
    mhip.U32(24, id);
    if (playlist.positions) {
      mhip.U32(12, 1).Child(PositionMhod(position));
    }
    ++position;
    mhyp.Child(mhip.ByLength());
  }
  return mhyp.ByLength();
}

Bytes PlaylistList(const DeviceDescription& device) {
  RecordBuilder mhlp("mhlp", 92);
  std::uint64_t playlistId = 0x4B45535452554E45;  // any distinct 64-bit ids will do
  if (device.deviceName) {
    PlaylistDescription master;
    master.name = device.deviceName;
    master.master = true;
    master.positions = true;
    for (const TrackDescription& track : device.tracks) master.itemIds.push_back(track.id);
    mhlp.Child(PlaylistRecord(master, playlistId++));
  }
  for (const PlaylistDescription& playlist : device.playlists) {
    mhlp.Child(PlaylistRecord(playlist, playlistId++));
  }
  return mhlp.AsList();
}

Bytes AlbumList(const DeviceDescription& device) {
  std::map<std::u16string, std::u16string> albums;  // album to artist
  for (const TrackDescription& track : device.tracks) {
    if (track.album && !track.album->empty())
      albums.emplace(*track.album, track.artist.value_or(u""));
  }
  RecordBuilder mhla("mhla", 92);
  std::uint16_t albumId = 1;
  for (const auto& [album, artist] : albums) {
    RecordBuilder mhia("mhia", 88);
    mhia.U16(16, albumId++).U32(12, 2);
    mhia.Child(StringMhod(200, album)).Child(StringMhod(201, artist));
    mhla.Child(mhia.ByLength());
  }
  return mhla.AsList();
}

// A small photo family tree: "mhfd" with one image whose name record (type 2) holds its file
// record as a child, the layout photo databases use.
Bytes PhotoTree() {
  RecordBuilder mhni("mhni", 76);
  mhni.Child(StringMhod(3, u":Thumbs:F1019_1.ithmb"));
  Bytes nameRecord = RawMhod(2, mhni.ByLength());
  RecordBuilder mhii("mhii", 152);
  mhii.U32(16, 100).Child(nameRecord);
  RecordBuilder mhli("mhli", 92);
  mhli.Child(mhii.ByLength());
  RecordBuilder mhfd("mhfd", 132);
  mhfd.Child(mhli.AsList());
  return mhfd.AsList(20);
}

Bytes DataSet(std::uint32_t type, const Bytes& content) {
  RecordBuilder mhsd("mhsd", 96);
  mhsd.U32(12, type);
  if (!content.empty()) mhsd.Child(content);
  return mhsd.ByLength();
}

}  // namespace

Bytes BuildDatabase(const DeviceDescription& device) {
  RecordBuilder tracks("mhlt", 92);
  for (const TrackDescription& track : device.tracks) {
    tracks.Child(TrackRecord(track, device.trackHeaderLength));
  }
  const Bytes playlists = PlaylistList(device);

  RecordBuilder mhbd("mhbd", 244);
  mhbd.U32(12, 1).U32(16, 0x19).U64(24, 0x4B45535452554E45).U16(32, 2);
  mhbd.Child(DataSet(1, tracks.AsList()));
  if (device.writerSets) mhbd.Child(DataSet(3, playlists));
  mhbd.Child(DataSet(2, playlists));
  if (device.writerSets) mhbd.Child(DataSet(4, AlbumList(device)));
  for (const DataSetDescription& set : device.moreDataSets) {
    RecordBuilder mhsd("mhsd", 96);
    mhsd.U32(12, set.type);
    if (set.photoTree) mhsd.Child(PhotoTree());
    for (const UnknownRecord& unknown : set.unknownRecords) mhsd.Child(UnknownBytes(unknown));
    mhbd.Child(mhsd.ByLength());
  }
  return mhbd.AsList(20);
}

}  // namespace kestrune::mkipod
