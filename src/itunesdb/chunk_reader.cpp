#include "itunesdb/chunk_reader.h"

#include <algorithm>
#include <climits>
#include <cstring>

namespace kestrune::itunesdb {
namespace {

// Records average a few dozen bytes; reading the stream in large blocks instead of once or twice
// per record takes most of the cost out of the walk.
constexpr long kReadAhead = 1 << 16;

}  // namespace

FileChunkReader::FileChunkReader(std::FILE* stream, RecordArena& arena)
    : stream_(stream), arena_(arena) {
  const long start = std::ftell(stream_);
  if (start >= 0 && std::fseek(stream_, 0, SEEK_END) == 0) {
    const long end = std::ftell(stream_);
    // Offsets are 32-bit; a larger file is never read (no database comes near that size).
    fileSize_ = (end >= 0 && end <= INT32_MAX) ? end : 0;
  }
  position_ = start < 0 ? 0 : start;
  streamPosition_ = -1;  // unknown: the first read seeks
}

std::int32_t FileChunkReader::Tell() { return static_cast<std::int32_t>(position_); }

bool FileChunkReader::ReadThroughWindow(unsigned char* into, std::size_t count) {
  while (count > 0) {
    if (position_ >= windowStart_ && position_ < windowStart_ + static_cast<long>(windowFill_)) {
      const auto offset = static_cast<std::size_t>(position_ - windowStart_);
      const std::size_t take = std::min(count, windowFill_ - offset);
      std::memcpy(into, window_.data() + offset, take);
      into += take;
      count -= take;
      position_ += static_cast<long>(take);
      continue;
    }
    if (streamPosition_ != position_ && std::fseek(stream_, position_, SEEK_SET) != 0) return false;
    if (window_.empty())
      window_.resize(static_cast<std::size_t>(std::clamp<long>(fileSize_, 1, kReadAhead)));
    const std::size_t got = std::fread(window_.data(), 1, window_.size(), stream_);
    windowFill_ = got;
    windowStart_ = position_;
    streamPosition_ = position_ + static_cast<long>(got);
    if (got == 0) return false;
  }
  return true;
}

std::optional<RecordBytes> FileChunkReader::ReadChunk() {
  const long start = position_;
  if (start < 0 || start > fileSize_) return std::nullopt;
  const auto left = static_cast<std::uint64_t>(fileSize_ - start);

  // Tag, header length and, for "mhod", the total length; the size word of other records
  // is read here too but only used from the record.
  unsigned char head[12];
  const std::size_t peeked = left >= 12 ? 12 : 8;
  if (!ReadExactly(head, peeked)) return std::nullopt;
  const std::uint32_t tag = LoadU32Le(head);
  const std::uint32_t headerLength = LoadU32Le(head + kHeaderLengthOffset);
  std::uint64_t length = headerLength;
  if (tag == kTagMhod) {
    // A string record is read whole: its total length decides the buffer.
    if (peeked < 12) return std::nullopt;
    length = LoadU32Le(head + kSizeWordOffset);
    if (length < headerLength) return std::nullopt;
  }
  if (headerLength < kMinimumRecordLength || length > left) return std::nullopt;
  // The whole record is read again from its start: it is in the window almost always.
  position_ = start;
  const auto size = static_cast<std::size_t>(length);
  RecordBytes record(arena_.AllocateArray<unsigned char>(size), size);
  if (!ReadExactly(record.data(), size)) return std::nullopt;
  return record;
}

void FileChunkReader::Skip(std::int32_t offset) { Seek(offset, SeekOrigin::kCurrent); }

void FileChunkReader::Seek(std::int32_t offset, SeekOrigin origin) {
  const long base = origin == SeekOrigin::kBegin     ? 0
                    : origin == SeekOrigin::kCurrent ? position_
                                                     : fileSize_;
  // Nothing moves until the next read; a position before the file's start is refused there.
  position_ = base + offset;
}

}  // namespace kestrune::itunesdb
