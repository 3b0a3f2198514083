#pragma once

#include <cstdint>
#include <cstdio>
#include <optional>

#include "itunesdb/db_chunk.h"

namespace kestrune::itunesdb {

enum class SeekOrigin { kBegin, kCurrent, kEnd };

// The source of records, read front to back one record at a time.
class DbChunkReader {
 public:
  virtual std::int32_t Tell() = 0;
  // The next record: its header, or for "mhod" the whole record. None when the source ends
  // inside the record or the record's lengths are impossible; nothing is allocated then.
  virtual std::optional<RecordBytes> ReadChunk() = 0;
  virtual void Skip(std::int32_t offset) = 0;
  virtual void Seek(std::int32_t offset, SeekOrigin origin) = 0;

 protected:
  // Never deleted through this interface.
  ~DbChunkReader() = default;
};

// Records from a buffered file stream opened in byte mode. The stream is borrowed: whoever
// opened it closes it.
class FileChunkReader final : public DbChunkReader {
 public:
  explicit FileChunkReader(std::FILE* stream);

  std::int32_t Tell() override;
  std::optional<RecordBytes> ReadChunk() override;
  void Skip(std::int32_t offset) override;
  void Seek(std::int32_t offset, SeekOrigin origin) override;

 private:
  std::FILE* stream_;
  // Lengths are checked against the bytes left before a buffer is made for them.
  long fileSize_ = 0;
};

}  // namespace kestrune::itunesdb
