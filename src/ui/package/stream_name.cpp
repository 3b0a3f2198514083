#include "ui/package/stream_name.h"

#include <vector>

#include "base/bytes.h"
#include "base/text.h"
#include "ui/package/md5.h"

namespace kestrune::ui {

std::u16string StreamNameFor(std::u16string_view name) {
  const std::u16string upper = AsciiUpper(name);
  std::vector<unsigned char> bytes(2 * upper.size());
  for (std::size_t i = 0; i < upper.size(); ++i) StoreU16Le(bytes.data() + 2 * i, upper[i]);
  return Md5Digest(bytes).substr(0, 30);
}

}  // namespace kestrune::ui
