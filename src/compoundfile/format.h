#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <string_view>

namespace kestrune::compoundfile {

// The layout of a compound file (OLE structured storage) that the reader and the writer share.

inline constexpr std::array<unsigned char, 8> kSignature = {0xD0, 0xCF, 0x11, 0xE0,
                                                            0xA1, 0xB1, 0x1A, 0xE1};
inline constexpr std::size_t kHeaderSize = 512;
inline constexpr std::size_t kSectorSize = 512;  // version 3; the header fills sector -1
inline constexpr std::size_t kMiniSectorSize = 64;
inline constexpr std::size_t kDirectoryEntrySize = 128;
inline constexpr std::size_t kHeaderDifatCount = 109;
// Streams below this size live in the mini stream.
inline constexpr std::uint64_t kMiniStreamCutoff = 4096;
inline constexpr std::size_t kMaxNameUnits = 31;

// Sector numbers above kMaxRegularSector mark the sector's use instead of a chain link.
inline constexpr std::uint32_t kMaxRegularSector = 0xFFFFFFFA;
inline constexpr std::uint32_t kDifatSector = 0xFFFFFFFC;
inline constexpr std::uint32_t kFatSector = 0xFFFFFFFD;
inline constexpr std::uint32_t kEndOfChain = 0xFFFFFFFE;
inline constexpr std::uint32_t kFreeSector = 0xFFFFFFFF;
inline constexpr std::uint32_t kNoEntry = 0xFFFFFFFF;

enum class EntryType : unsigned char { kUnallocated = 0, kStorage = 1, kStream = 2, kRoot = 5 };
enum class EntryColor : unsigned char { kRed = 0, kBlack = 1 };

// Byte offsets of the header's fields.
namespace header {
inline constexpr std::size_t kMinorVersion = 24;
inline constexpr std::size_t kMajorVersion = 26;
inline constexpr std::size_t kByteOrder = 28;
inline constexpr std::size_t kSectorShift = 30;
inline constexpr std::size_t kMiniSectorShift = 32;
inline constexpr std::size_t kDirectorySectorCount = 40;
inline constexpr std::size_t kFatSectorCount = 44;
inline constexpr std::size_t kFirstDirectorySector = 48;
inline constexpr std::size_t kMiniStreamCutoff = 56;
inline constexpr std::size_t kFirstMiniFatSector = 60;
inline constexpr std::size_t kMiniFatSectorCount = 64;
inline constexpr std::size_t kFirstDifatSector = 68;
inline constexpr std::size_t kDifatSectorCount = 72;
inline constexpr std::size_t kDifat = 76;
}  // namespace header

// Byte offsets of a directory entry's fields.
namespace entry {
inline constexpr std::size_t kName = 0;
inline constexpr std::size_t kNameLength = 64;
inline constexpr std::size_t kType = 66;
inline constexpr std::size_t kColor = 67;
inline constexpr std::size_t kLeftSibling = 68;
inline constexpr std::size_t kRightSibling = 72;
inline constexpr std::size_t kChild = 76;
inline constexpr std::size_t kStartSector = 116;
inline constexpr std::size_t kSize = 120;
}  // namespace entry

// The order of siblings in a storage's tree: shorter names first, then unit by unit after
// upper-casing a–z. ole32 upper-cases every letter, so the two orders agree on ASCII names.
int CompareEntryNames(std::u16string_view a, std::u16string_view b);

}  // namespace kestrune::compoundfile
