#include "itunesdb/record_format.h"

namespace kestrune::itunesdb {

RecordShape ShapeOf(std::uint32_t tag) {
  switch (tag) {
    case kTagMhbd:
    case kTagMhfd:
      return {RecordKind::kList, 20};
    case kTagMhlt:
    case kTagMhlp:
    case kTagMhli:
    case kTagMhla:
    case kTagMhlf:
      return {RecordKind::kList, 8};
    case kTagMhsd:
    case kTagMhit:
    case kTagMhyp:
    case kTagMhip:
    case kTagMhii:
    case kTagMhni:
    case kTagMhba:
    case kTagMhia:
    case kTagMhif:
      return {RecordKind::kLength, 0};
    case kTagMhod:
      return {RecordKind::kString, 0};
    default:
      return {RecordKind::kUnknown, 0};
  }
}

std::string TagText(std::uint32_t tag) {
  std::string text;
  for (int i = 0; i < 4; ++i) {
    const auto byte = static_cast<unsigned char>(tag >> (8 * i));
    text += (byte >= 0x20 && byte < 0x7F) ? static_cast<char>(byte) : '?';
  }
  return text;
}

}  // namespace kestrune::itunesdb
