#pragma once

#include <cstdio>
#include <filesystem>
#include <memory>
#include <string>
#include <string_view>

namespace kestrune {

// The platform's folder separator as program text.
#ifdef _WIN32
inline constexpr char16_t kPathSeparator = u'\\';
#else
inline constexpr char16_t kPathSeparator = u'/';
#endif

// Windows takes the slash as a separator too.
inline bool IsPathSeparator(char16_t unit) {
#ifdef _WIN32
  return unit == u'\\' || unit == u'/';
#else
  return unit == u'/';
#endif
}

// Paths are made from UTF-16 program text: wide on Windows; on Linux the UTF-8 form that
// EncodeUtf8 gives, so a lone surrogate in a device's text still names one file.
std::filesystem::path PathFromText(std::u16string_view text);
std::u16string TextFromPath(const std::filesystem::path& path);

struct FileCloser {
  void operator()(std::FILE* file) const { std::fclose(file); }
};
using FileHandle = std::unique_ptr<std::FILE, FileCloser>;

// Opens a file for reading in byte mode ("rb"); empty when it cannot be opened.
FileHandle OpenForReading(const std::filesystem::path& path);

}  // namespace kestrune
