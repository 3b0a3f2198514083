#include "itunesdb/record_format.h"

namespace kestrune::itunesdb {

std::string TagText(std::uint32_t tag) {
  std::string text;
  for (int i = 0; i < 4; ++i) {
    const auto byte = static_cast<unsigned char>(tag >> (8 * i));
    text += (byte >= 0x20 && byte < 0x7F) ? static_cast<char>(byte) : '?';
  }
  return text;
}

}  // namespace kestrune::itunesdb
