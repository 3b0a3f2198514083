#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "compoundfile/format.h"

namespace kestrune::compoundfile {

// One stream of an open compound file, read front to back. It borrows the file's bytes.
class StreamReader {
 public:
  std::uint64_t Size() const { return size_; }
  // Copies up to `count` bytes from the current position; fewer at the stream's end.
  std::size_t Read(unsigned char* into, std::size_t count);

 private:
  friend class CompoundFileReader;
  StreamReader(std::span<const unsigned char> file, std::vector<std::size_t> pieceOffsets,
               std::size_t pieceSize, std::uint64_t size);

  std::span<const unsigned char> file_;
  // File offset of each sector (or mini sector) of the stream, in stream order; every piece
  // lies wholly inside the file.
  std::vector<std::size_t> pieceOffsets_;
  std::size_t pieceSize_;
  std::uint64_t size_;
  std::uint64_t position_ = 0;
};

// A version 3 compound file held in memory, opened for reading the streams of its root storage. The
// bytes are untrusted: every sector number, chain, directory entry and size is checked against
// the file before it is used, and anything inconsistent makes Open or OpenStream answer none.
// The reader borrows the bytes; they must outlive it and every stream opened from it.
class CompoundFileReader {
 public:
  static std::optional<CompoundFileReader> Open(std::span<const unsigned char> file);

  // The streams directly in the root storage, in directory order.
  std::vector<std::u16string> StreamNames() const;

  // The root storage's stream of that name, matched as ole32 does for ASCII names (a–z and
  // A–Z alike); none when there is no such stream or its sectors are inconsistent.
  std::optional<StreamReader> OpenStream(std::u16string_view name) const;

 private:
  struct Entry {
    std::u16string name;
    std::uint32_t startSector = kEndOfChain;
    std::uint64_t size = 0;
  };

  explicit CompoundFileReader(std::span<const unsigned char> file) : file_(file) {}

  bool ReadHeader();
  bool ReadFat();
  bool ReadDirectory();
  bool ReadMiniStream();
  std::optional<std::vector<std::uint32_t>> RegularChain(std::uint32_t start,
                                                         std::optional<std::uint64_t> links) const;
  static std::size_t SectorOffset(std::uint32_t sector) {
    return (sector + std::size_t{1}) * kSectorSize;
  }

  std::span<const unsigned char> file_;
  std::uint32_t sectorCount_ = 0;  // whole sectors after the header
  std::vector<std::uint32_t> fat_;
  std::vector<std::uint32_t> miniFat_;
  // The mini stream, where small streams live in 64-byte mini sectors, is the root's data.
  std::uint32_t miniStreamStart_ = kEndOfChain;
  std::uint64_t miniStreamSize_ = 0;
  std::vector<std::uint32_t> miniStreamSectors_;
  std::vector<Entry> streams_;
};

}  // namespace kestrune::compoundfile
