#pragma once

#include <cstddef>
#include <cstdint>
#include <stdexcept>
#include <string>

namespace kestrune::itunesdb {

// A database that cannot be read as a whole: truncated, inconsistent lengths, fields outside
// their record, nesting beyond reason. The device search catches it.
class MalformedDatabase : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

// The walk's context: it only changes how an "mhod" is walked.
enum class ChunkContext { kNone, kMusic, kPhoto };

// A tag as its four bytes read in file order, so that "mhbd" compares as one word.
constexpr std::uint32_t TagValue(const char (&tag)[5]) {
  return static_cast<std::uint32_t>(static_cast<unsigned char>(tag[0])) |
         static_cast<std::uint32_t>(static_cast<unsigned char>(tag[1])) << 8 |
         static_cast<std::uint32_t>(static_cast<unsigned char>(tag[2])) << 16 |
         static_cast<std::uint32_t>(static_cast<unsigned char>(tag[3])) << 24;
}

inline constexpr std::uint32_t kTagMhbd = TagValue("mhbd");
inline constexpr std::uint32_t kTagMhsd = TagValue("mhsd");
inline constexpr std::uint32_t kTagMhlt = TagValue("mhlt");
inline constexpr std::uint32_t kTagMhit = TagValue("mhit");
inline constexpr std::uint32_t kTagMhod = TagValue("mhod");
inline constexpr std::uint32_t kTagMhlp = TagValue("mhlp");
inline constexpr std::uint32_t kTagMhyp = TagValue("mhyp");
inline constexpr std::uint32_t kTagMhip = TagValue("mhip");
inline constexpr std::uint32_t kTagMhfd = TagValue("mhfd");
inline constexpr std::uint32_t kTagMhli = TagValue("mhli");
inline constexpr std::uint32_t kTagMhii = TagValue("mhii");
inline constexpr std::uint32_t kTagMhni = TagValue("mhni");
inline constexpr std::uint32_t kTagMhla = TagValue("mhla");
inline constexpr std::uint32_t kTagMhba = TagValue("mhba");
inline constexpr std::uint32_t kTagMhia = TagValue("mhia");
inline constexpr std::uint32_t kTagMhlf = TagValue("mhlf");
inline constexpr std::uint32_t kTagMhif = TagValue("mhif");

// How a record's children are found.
enum class RecordKind {
  kList,     // a count of children at `countOffset`
  kLength,   // children fill the bytes from the end of the header to the total length
  kString,   // "mhod": no children, except the one child of types 2 and 5 in the photo context
  kUnknown,  // no children; only the header belongs to the record
};

struct RecordShape {
  RecordKind kind = RecordKind::kUnknown;
  std::size_t countOffset = 0;  // list kind only
};

// The kind of a tag, tested against the 17 known tags (they are distinct, so the order of the
// tests does not matter).
constexpr RecordShape ShapeOf(std::uint32_t tag) {
  switch (tag) {
    case kTagMhbd:
    case kTagMhfd:
      return {RecordKind::kList, 20};
    case kTagMhlt:
    case kTagMhlp:
    case kTagMhli:
    case kTagMhla:
    case kTagMhlf:
      return {RecordKind::kList, 8};
    case kTagMhsd:
    case kTagMhit:
    case kTagMhyp:
    case kTagMhip:
    case kTagMhii:
    case kTagMhni:
    case kTagMhba:
    case kTagMhia:
    case kTagMhif:
      return {RecordKind::kLength, 0};
    case kTagMhod:
      return {RecordKind::kString, 0};
    default:
      return {RecordKind::kUnknown, 0};
  }
}

// Common header and the fields the library reads.
inline constexpr std::size_t kTagOffset = 0;
inline constexpr std::size_t kHeaderLengthOffset = 4;
inline constexpr std::size_t kSizeWordOffset = 8;
inline constexpr std::size_t kMinimumRecordLength = 8;

inline constexpr std::size_t kMhbdChildCountOffset = 20;
inline constexpr std::size_t kMhsdSetTypeOffset = 12;
inline constexpr std::uint32_t kTrackSet = 1;
inline constexpr std::uint32_t kPlaylistSet = 2;
inline constexpr std::size_t kMhitTrackIdOffset = 16;
inline constexpr std::size_t kMhitFileSizeOffset = 36;
inline constexpr std::size_t kMhitLengthMsOffset = 40;
inline constexpr std::size_t kMhodTypeOffset = 12;
inline constexpr std::size_t kMhodStringEncodingOffset = 24;
inline constexpr std::size_t kMhodStringLengthOffset = 28;
inline constexpr std::size_t kMhodStringOffset = 40;
inline constexpr std::size_t kMhypMasterFlagOffset = 20;
inline constexpr std::size_t kMhipTrackIdOffset = 24;

// Deep enough for every real database (the music records nest six levels), shallow enough
// that a hostile file cannot exhaust the stack.
inline constexpr int kMaximumNesting = 64;

// Encoding word values seen in string records; every value but UTF-8 means UTF-16LE.
inline constexpr std::uint32_t kMhodEncodingUtf8 = 2;

std::string TagText(std::uint32_t tag);

}  // namespace kestrune::itunesdb
