#include "itunesdb/db_chunk.h"

#include <string>

namespace kestrune::itunesdb {

void DbChunk::RefuseField(std::size_t recordSize, std::size_t offset) {
  throw MalformedDatabase("field at " + std::to_string(offset) + " outside a record of " +
                          std::to_string(recordSize) + " bytes");
}

}  // namespace kestrune::itunesdb
