#pragma once

#include <cstdint>
#include <cstdio>
#include <cstring>
#include <optional>
#include <vector>

#include "itunesdb/db_chunk.h"
#include "itunesdb/record_arena.h"

namespace kestrune::itunesdb {

enum class SeekOrigin { kBegin, kCurrent, kEnd };

// The source of records, read front to back one record at a time.
class DbChunkReader {
 public:
  virtual std::int32_t Tell() = 0;
  // The next record: its header, or for "mhod" the whole record, in a new buffer of the tree
  // being built. None when the source ends inside the record or the record's lengths are
  // impossible.
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
  // Record buffers are made in `arena`.
  FileChunkReader(std::FILE* stream, RecordArena& arena);

  std::int32_t Tell() override;
  std::optional<RecordBytes> ReadChunk() override;
  void Skip(std::int32_t offset) override;
  void Seek(std::int32_t offset, SeekOrigin origin) override;

 private:
  bool ReadExactly(unsigned char* into, std::size_t count) {
    const long offset = position_ - windowStart_;
    if (offset >= 0 && static_cast<std::size_t>(offset) + count <= windowFill_) [[likely]] {
      std::memcpy(into, window_.data() + offset, count);
      position_ += static_cast<long>(count);
      return true;
    }
    return ReadThroughWindow(into, count);
  }
  bool ReadThroughWindow(unsigned char* into, std::size_t count);

  std::FILE* stream_;
  RecordArena& arena_;
  // Lengths are checked against the bytes left before a buffer is made for them.
  long fileSize_ = 0;
  // The reader's own position, and a window of the file read ahead of it: asking the stream
  // costs more than reading a small record.
  long position_ = 0;
  long streamPosition_ = -1;
  long windowStart_ = 0;
  std::size_t windowFill_ = 0;
  std::vector<unsigned char> window_;
};

}  // namespace kestrune::itunesdb
