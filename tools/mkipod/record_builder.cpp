#include "mkipod/record_builder.h"

#include <stdexcept>

#include "base/bytes.h"
#include "base/utf.h"

namespace kestrune::mkipod {

RecordBuilder::RecordBuilder(std::string_view tag, std::uint32_t headerLength)
    : header_(headerLength) {
  if (tag.size() != 4 || headerLength < 12)
    throw std::invalid_argument("bad record tag or header length");
  for (std::size_t i = 0; i < 4; ++i) header_[i] = static_cast<unsigned char>(tag[i]);
  StoreU32Le(header_.data() + 4, headerLength);
}

RecordBuilder& RecordBuilder::U8(std::size_t offset, std::uint8_t value) {
  header_.at(offset) = value;
  return *this;
}

RecordBuilder& RecordBuilder::U16(std::size_t offset, std::uint16_t value) {
  if (offset + 2 > header_.size()) throw std::out_of_range("field outside the header");
  StoreU16Le(header_.data() + offset, value);
  return *this;
}

RecordBuilder& RecordBuilder::U32(std::size_t offset, std::uint32_t value) {
  if (offset + 4 > header_.size()) throw std::out_of_range("field outside the header");
  StoreU32Le(header_.data() + offset, value);
  return *this;
}

RecordBuilder& RecordBuilder::U64(std::size_t offset, std::uint64_t value) {
  U32(offset, static_cast<std::uint32_t>(value));
  return U32(offset + 4, static_cast<std::uint32_t>(value >> 32));
}

RecordBuilder& RecordBuilder::Child(const Bytes& child) {
  Append(children_, child);
  ++childCount_;
  return *this;
}

Bytes RecordBuilder::ByLength() const {
  Bytes record = header_;
  StoreU32Le(record.data() + 8, static_cast<std::uint32_t>(header_.size() + children_.size()));
  Append(record, children_);
  return record;
}

Bytes RecordBuilder::AsList(std::size_t countOffset) const {
  if (countOffset + 4 > header_.size()) throw std::out_of_range("count outside the header");
  Bytes record = header_;
  if (countOffset != 8) {
    StoreU32Le(record.data() + 8, static_cast<std::uint32_t>(header_.size() + children_.size()));
  }
  StoreU32Le(record.data() + countOffset, static_cast<std::uint32_t>(childCount_));
  Append(record, children_);
  return record;
}

Bytes StringMhod(std::uint32_t type, std::u16string_view text, StringEncoding encoding,
                 bool extraByte) {
  Bytes encoded;
  if (encoding == StringEncoding::kUtf8) {
    const std::string utf8 = EncodeUtf8(text);
    encoded.assign(utf8.begin(), utf8.end());
  } else {
    for (char16_t unit : text) {
      encoded.push_back(static_cast<unsigned char>(unit));
      encoded.push_back(static_cast<unsigned char>(unit >> 8));
    }
  }
  if (extraByte) encoded.push_back(0x7A);
  Bytes body(16);
  StoreU32Le(body.data(), static_cast<std::uint32_t>(encoding));
  StoreU32Le(body.data() + 4, static_cast<std::uint32_t>(encoded.size()));
  StoreU32Le(body.data() + 8, 1);
  Append(body, encoded);
  return RawMhod(type, body);
}

Bytes RawMhod(std::uint32_t type, const Bytes& body) {
  Bytes record(24);
  const char tag[] = "mhod";
  for (std::size_t i = 0; i < 4; ++i) record[i] = static_cast<unsigned char>(tag[i]);
  StoreU32Le(record.data() + 4, 24);
  StoreU32Le(record.data() + 8, static_cast<std::uint32_t>(24 + body.size()));
  StoreU32Le(record.data() + 12, type);
  Append(record, body);
  return record;
}

Bytes PositionMhod(std::uint32_t position) {
  Bytes body(20);
  StoreU32Le(body.data(), position);
  return RawMhod(100, body);
}

void Append(Bytes& to, const Bytes& bytes) { to.insert(to.end(), bytes.begin(), bytes.end()); }

}  // namespace kestrune::mkipod
