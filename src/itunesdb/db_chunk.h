#pragma once

#include <cstddef>
#include <cstdint>
#include <span>

#include "base/bytes.h"
#include "itunesdb/record_format.h"

namespace kestrune::itunesdb {

// A record's bytes as read from the file, in the memory of the tree being built.
using RecordBytes = std::span<unsigned char>;

// One parsed record: its bytes as they stand in the file (the header; for "mhod" the whole
// record, at least 8 bytes either way) and its child records in file order. Both live in the
// RecordArena of the parse and go with it.
struct DbChunk {
  RecordBytes rawRecord;
  std::span<DbChunk> children;

  std::uint32_t Tag() const { return LoadU32Le(rawRecord.data()); }
  std::uint32_t HeaderLength() const { return LoadU32Le(rawRecord.data() + kHeaderLengthOffset); }

  // Field reads stay inside the record: a field beyond its end means the record is too short
  // for what the database claims it is, and the whole database is refused.
  std::uint32_t U32At(std::size_t offset) const {
    RequireField(offset, 4);
    return LoadU32Le(rawRecord.data() + offset);
  }
  std::uint16_t U16At(std::size_t offset) const {
    RequireField(offset, 2);
    return LoadU16Le(rawRecord.data() + offset);
  }
  std::uint8_t U8At(std::size_t offset) const {
    RequireField(offset, 1);
    return rawRecord[offset];
  }

  // Throws MalformedDatabase unless `width` bytes at `offset` lie inside the record.
  void RequireField(std::size_t offset, std::size_t width) const {
    if (offset > rawRecord.size() || width > rawRecord.size() - offset) [[unlikely]] {
      RefuseField(rawRecord.size(), offset);
    }
  }

 private:
  [[noreturn]] static void RefuseField(std::size_t recordSize, std::size_t offset);
};

}  // namespace kestrune::itunesdb
