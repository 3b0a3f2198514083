#include "library/device_files.h"

#include <vector>

#include "base/paths.h"
#include "base/text.h"

namespace kestrune {
namespace {

std::vector<std::u16string_view> ComponentsOf(std::u16string_view path) {
  std::vector<std::u16string_view> components;
  std::size_t start = 0;
  for (std::size_t i = 0; i <= path.size(); ++i) {
    if (i == path.size() || IsPathSeparator(path[i])) {
      if (i > start) components.push_back(path.substr(start, i - start));
      start = i + 1;
    }
  }
  return components;
}

bool ClimbsOut(std::u16string_view component) {
  std::size_t dots = 0;
  for (char16_t unit : component) {
    if (unit == u'.') {
      ++dots;
    } else if (unit != u' ') {
      return false;
    }
  }
  return dots >= 2;
}

std::optional<std::filesystem::path> MatchIgnoringCase(const std::filesystem::path& folder,
                                                       std::u16string_view name) {
  std::error_code error;
  for (std::filesystem::directory_iterator it(folder, error), end; !error && it != end;
       it.increment(error)) {
    if (EqualsIgnoringAsciiCase(TextFromPath(it->path().filename()), name)) return it->path();
  }
  return std::nullopt;
}

}  // namespace

bool StaysInsideDrive(std::u16string_view path, std::size_t rootLength) {
  if (rootLength > path.size()) return false;
  const std::u16string_view below = path.substr(rootLength);
  if (below.empty() || !IsPathSeparator(below.front())) return false;
  for (std::u16string_view component : ComponentsOf(below)) {
    if (ClimbsOut(component)) return false;
  }
  return true;
}

std::optional<std::filesystem::path> FindBelowDrive(std::u16string_view path,
                                                    std::size_t rootLength) {
  if (!StaysInsideDrive(path, rootLength)) return std::nullopt;
  std::error_code error;
  std::filesystem::path exact = PathFromText(path);
  if (std::filesystem::exists(exact, error)) return exact;

  std::filesystem::path found = PathFromText(path.substr(0, rootLength));
  if (!std::filesystem::is_directory(found, error)) return std::nullopt;
  for (std::u16string_view component : ComponentsOf(path.substr(rootLength))) {
    if (component == u".") continue;
    std::filesystem::path next = found / PathFromText(component);
    if (std::filesystem::exists(next, error)) {
      found = std::move(next);
      continue;
    }
    std::optional<std::filesystem::path> match = MatchIgnoringCase(found, component);
    if (!match) return std::nullopt;
    found = std::move(*match);
  }
  return found;
}

std::optional<std::filesystem::path> LocateTrackFile(const Track& track) {
  return FindBelowDrive(track.devicePath, track.rootLength);
}

}  // namespace kestrune
