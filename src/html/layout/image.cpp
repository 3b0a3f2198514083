#include "html/layout/image.h"

#include <algorithm>

#include "base/bytes.h"

namespace kestrune::html::layout {
namespace {

// Pictures larger than this are refused: their pixels would not fit a canvas anyway.
constexpr std::uint32_t kMaxSide = 16384;

}  // namespace

std::optional<Size> PngSize(const std::vector<unsigned char>& bytes) {
  static constexpr unsigned char kSignature[8] = {0x89, 'P', 'N', 'G', 0x0D, 0x0A, 0x1A, 0x0A};
  // Signature, then the IHDR chunk: length, "IHDR", width and height (big-endian).
  if (bytes.size() < 24 || !std::equal(std::begin(kSignature), std::end(kSignature), bytes.begin())) return std::nullopt;
  if (bytes[12] != 'I' || bytes[13] != 'H' || bytes[14] != 'D' || bytes[15] != 'R') return std::nullopt;
  const std::uint32_t width = LoadU32Be(bytes.data() + 16);
  const std::uint32_t height = LoadU32Be(bytes.data() + 20);
  if (width == 0 || height == 0 || width > kMaxSide || height > kMaxSide) return std::nullopt;
  return Size{static_cast<int>(width), static_cast<int>(height)};
}

std::shared_ptr<const Image> ImageCache::Get(const std::u16string& url) {
  if (url.empty()) return nullptr;
  auto found = images_.find(url);
  if (found != images_.end()) return found->second;
  // Only found pictures are kept: one that arrives later is found then.
  std::shared_ptr<const Image> image;
  if (const std::vector<unsigned char>* data = source_.ImageData(url)) {
    if (auto size = PngSize(*data)) image = std::make_shared<const Image>(Image{*data, *size});
  }
  if (image) images_.emplace(url, image);
  return image;
}

}  // namespace kestrune::html::layout
