#include "base/paths.h"

#include "base/utf.h"

namespace kestrune {

std::filesystem::path PathFromText(std::u16string_view text) {
#ifdef _WIN32
  return std::filesystem::path(std::wstring(text.begin(), text.end()));
#else
  return std::filesystem::path(EncodeUtf8(text));
#endif
}

std::u16string TextFromPath(const std::filesystem::path& path) {
#ifdef _WIN32
  const std::wstring& wide = path.native();
  return std::u16string(wide.begin(), wide.end());
#else
  return DecodeUtf8(path.native());
#endif
}

FileHandle OpenForReading(const std::filesystem::path& path) {
#ifdef _WIN32
  return FileHandle(_wfopen(path.c_str(), L"rb"));
#else
  return FileHandle(std::fopen(path.c_str(), "rb"));
#endif
}

}  // namespace kestrune
