#pragma once

#include <memory>
#include <optional>
#include <string>
#include <unordered_map>
#include <vector>

#include "html/dom/geometry.h"

namespace kestrune::html::layout {

// A picture the page refers to: its encoded bytes (canvases decode them) and its size.
struct Image {
  std::vector<unsigned char> bytes;
  Size size;
};

// Width and height from a PNG's header; none when the bytes are not a PNG.
std::optional<Size> PngSize(const std::vector<unsigned char>& bytes);

// Where the layout finds the bytes of an image URL (the window's resources).
class ImageSource {
 public:
  virtual ~ImageSource() = default;
  virtual const std::vector<unsigned char>* ImageData(const std::u16string& url) = 0;
};

// Images by URL, decoded once; canvases cache their own forms of an image by its address,
// checking that the image still lives.
class ImageCache {
 public:
  explicit ImageCache(ImageSource& source) : source_(source) {}
  // None when the URL has no data or the data is not a picture we read.
  std::shared_ptr<const Image> Get(const std::u16string& url);
  void Clear() { images_.clear(); }

 private:
  ImageSource& source_;
  std::unordered_map<std::u16string, std::shared_ptr<const Image>> images_;
};

}  // namespace kestrune::html::layout
