#include "itunesdb/db_chunk.h"

#include <string>

namespace kestrune::itunesdb {

void RequireField(const RecordBytes& record, std::size_t offset, std::size_t width) {
  if (offset > record.size() || width > record.size() - offset) {
    throw MalformedDatabase("field at " + std::to_string(offset) + " outside a record of " +
                            std::to_string(record.size()) + " bytes");
  }
}

std::uint32_t DbChunk::U32At(std::size_t offset) const {
  RequireField(rawRecord, offset, 4);
  return LoadU32Le(rawRecord.data() + offset);
}

std::uint16_t DbChunk::U16At(std::size_t offset) const {
  RequireField(rawRecord, offset, 2);
  return LoadU16Le(rawRecord.data() + offset);
}

std::uint8_t DbChunk::U8At(std::size_t offset) const {
  RequireField(rawRecord, offset, 1);
  return rawRecord[offset];
}

}  // namespace kestrune::itunesdb
