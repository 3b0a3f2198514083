#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace kestrune::mkipod {

using Bytes = std::vector<unsigned char>;

// Builds one database record: a header of a chosen length with chosen fields, followed by its
// children. The size word (offset 8) is the total length or the child count; lists whose count
// lives elsewhere (offset 20 of "mhbd" and "mhfd") keep the total length at offset 8.
class RecordBuilder {
 public:
  RecordBuilder(std::string_view tag, std::uint32_t headerLength);

  RecordBuilder& U8(std::size_t offset, std::uint8_t value);
  RecordBuilder& U16(std::size_t offset, std::uint16_t value);
  RecordBuilder& U32(std::size_t offset, std::uint32_t value);
  RecordBuilder& U64(std::size_t offset, std::uint64_t value);
  RecordBuilder& Child(const Bytes& child);
  std::size_t ChildCount() const { return childCount_; }

  // The record with offset 8 holding the total length (header plus children).
  Bytes ByLength() const;
  // The record with the child count at `countOffset`; at 8 it is the size word itself.
  Bytes AsList(std::size_t countOffset = 8) const;

 private:
  Bytes header_;
  Bytes children_;
  std::size_t childCount_ = 0;
};

enum class StringEncoding : std::uint32_t { kUtf16 = 1, kUtf8 = 2 };

// A string record as writers store it: a 24-byte header, then the encoding word, the byte
// length, two unknown words and the text without terminator. `extraByte` appends one stray byte
// counted in the length, so that the length is odd.
Bytes StringMhod(std::uint32_t type, std::u16string_view text,
                 StringEncoding encoding = StringEncoding::kUtf16, bool extraByte = false);

// A record of no string layout: a 24-byte header and `body` (podcast addresses, sort indexes,
// playlist positions ...).
Bytes RawMhod(std::uint32_t type, const Bytes& body);

// A playlist item's position record (type 100).
Bytes PositionMhod(std::uint32_t position);

void Append(Bytes& to, const Bytes& bytes);

}  // namespace kestrune::mkipod
