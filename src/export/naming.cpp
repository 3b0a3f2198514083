#include "export/naming.h"

#include "base/paths.h"
#include "base/text.h"
#include "platform/file_names.h"

namespace kestrune {
namespace {

bool IsHighSurrogate(char16_t unit) { return unit >= 0xD800 && unit <= 0xDBFF; }

}  // namespace

void TrimSpaces(std::u16string& text) {
  const std::size_t last = text.find_last_not_of(u' ');
  if (last == std::u16string::npos) {
    text.clear();
    return;
  }
  text.erase(last + 1);
  text.erase(0, text.find_first_not_of(u' '));
}

std::u16string SanitizeName(std::u16string text) {
  if (text.size() > kNameLimit) {
    text.resize(kNameLimit);
    if (IsHighSurrogate(text.back())) text.pop_back();
  }
  TrimSpaces(text);
  if (text.empty()) return std::u16string(kUnknownName);
  platform::ReplaceReservedCharacters(text);
  return platform::MakeNameAcceptable(std::move(text), kUnknownName);
}

std::u16string BaseNameFor(std::u16string_view title, std::u16string_view extension) {
  std::u16string_view base = title;
  if (!extension.empty() && title.size() > extension.size() &&
      EqualsIgnoringAsciiCase(title.substr(title.size() - extension.size()), extension)) {
    base.remove_suffix(extension.size());
  }
  return SanitizeName(std::u16string(base));
}

std::u16string ArtistFolderName(const Track& track) {
  return SanitizeName(track.artist.empty() ? std::u16string(kUnknownArtist) : track.artist);
}

std::u16string AlbumFolderName(const Track& track) {
  return SanitizeName(track.album.empty() ? std::u16string(kUnknownAlbum) : track.album);
}

std::u16string ExtensionOf(std::u16string_view path) {
  std::size_t componentStart = path.size();
  while (componentStart > 0 && !IsPathSeparator(path[componentStart - 1])) --componentStart;
  const std::size_t dot = path.rfind(u'.');
  if (dot == std::u16string_view::npos || dot < componentStart) return {};
  return std::u16string(path.substr(dot));
}

std::u16string TargetPathFor(const Track& track, std::u16string_view extension,
                             std::u16string_view outputFolder, bool organized,
                             platform::Files& files, bool& alreadyPresent) {
  const std::u16string base = BaseNameFor(track.title, extension);
  // The separator is added whatever the folder ends with; a doubled one means the same folder.
  std::u16string folder = std::u16string(outputFolder) + kPathSeparator;
  if (organized)
    folder += ArtistFolderName(track) + kPathSeparator + AlbumFolderName(track) + kPathSeparator;
  files.CreateFolderPath(PathFromText(folder));

  std::u16string target = folder + base + std::u16string(extension);
  for (std::uint64_t n = 0;; ++n) {
    const std::filesystem::path candidate = PathFromText(target);
    if (!files.FileExists(candidate)) break;
    if (track.fileSize != 0 && files.FileSizeOf(candidate) == track.fileSize) {
      alreadyPresent = true;
      break;
    }
    target = folder + base + u"[" + FormatDecimal(n) + u"]" + std::u16string(extension);
  }
  return target;
}

}  // namespace kestrune
