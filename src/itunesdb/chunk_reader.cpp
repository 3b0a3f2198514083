#include "itunesdb/chunk_reader.h"

#include <climits>
#include <cstring>

namespace kestrune::itunesdb {
namespace {

int OriginOf(SeekOrigin origin) {
  switch (origin) {
    case SeekOrigin::kBegin:
      return SEEK_SET;
    case SeekOrigin::kCurrent:
      return SEEK_CUR;
    case SeekOrigin::kEnd:
      return SEEK_END;
  }
  return SEEK_CUR;
}

}  // namespace

FileChunkReader::FileChunkReader(std::FILE* stream) : stream_(stream) {
  const long start = std::ftell(stream_);
  if (start >= 0 && std::fseek(stream_, 0, SEEK_END) == 0) {
    const long end = std::ftell(stream_);
    // Offsets are 32-bit; a larger file is never read (no database comes near that size).
    fileSize_ = (end >= 0 && end <= INT32_MAX) ? end : 0;
  }
  std::fseek(stream_, start < 0 ? 0 : start, SEEK_SET);
}

std::int32_t FileChunkReader::Tell() { return static_cast<std::int32_t>(std::ftell(stream_)); }

std::optional<RecordBytes> FileChunkReader::ReadChunk() {
  const long start = std::ftell(stream_);
  if (start < 0 || start > fileSize_) return std::nullopt;
  const auto left = static_cast<std::uint64_t>(fileSize_ - start);

  unsigned char head[12];
  if (std::fread(head, 1, 8, stream_) != 8) return std::nullopt;
  const std::uint32_t tag = LoadU32Le(head);
  const std::uint32_t headerLength = LoadU32Le(head + kHeaderLengthOffset);
  std::uint64_t length = headerLength;
  std::size_t alreadyRead = 8;
  if (tag == kTagMhod) {
    // A string record is read whole: its total length decides the buffer.
    if (std::fread(head + 8, 1, 4, stream_) != 4) return std::nullopt;
    length = LoadU32Le(head + kSizeWordOffset);
    alreadyRead = 12;
    if (length < headerLength) return std::nullopt;
  }
  if (headerLength < kMinimumRecordLength || length > left) return std::nullopt;
  if (length < alreadyRead) {
    std::fseek(stream_, static_cast<long>(length) - static_cast<long>(alreadyRead), SEEK_CUR);
    alreadyRead = static_cast<std::size_t>(length);
  }

  RecordBytes record(static_cast<std::size_t>(length));
  std::memcpy(record.data(), head, alreadyRead);
  const std::size_t rest = record.size() - alreadyRead;
  if (rest > 0 && std::fread(record.data() + alreadyRead, 1, rest, stream_) != rest) {
    return std::nullopt;
  }
  return record;
}

void FileChunkReader::Skip(std::int32_t offset) { std::fseek(stream_, offset, SEEK_CUR); }

void FileChunkReader::Seek(std::int32_t offset, SeekOrigin origin) {
  std::fseek(stream_, offset, OriginOf(origin));
}

}  // namespace kestrune::itunesdb
