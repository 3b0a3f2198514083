#pragma once

#include <cstddef>
#include <cstdint>
#include <vector>

#include "base/bytes.h"
#include "itunesdb/record_format.h"

namespace kestrune::itunesdb {

using RecordBytes = std::vector<unsigned char>;

// One parsed record: its bytes as they stand in the file (the header; for "mhod" the whole
// record) and its child records in file order.
struct DbChunk {
  RecordBytes rawRecord;
  std::vector<DbChunk> children;

  std::uint32_t Tag() const { return LoadU32Le(rawRecord.data()); }
  std::uint32_t HeaderLength() const { return LoadU32Le(rawRecord.data() + kHeaderLengthOffset); }

  // Field reads stay inside the record: a field beyond its end means the record is too short
  // for what the database claims it is, and the whole database is refused.
  std::uint32_t U32At(std::size_t offset) const;
  std::uint16_t U16At(std::size_t offset) const;
  std::uint8_t U8At(std::size_t offset) const;
};

// Throws MalformedDatabase unless `width` bytes at `offset` lie inside the record.
void RequireField(const RecordBytes& record, std::size_t offset, std::size_t width);

}  // namespace kestrune::itunesdb
