#pragma once

#include <filesystem>
#include <span>
#include <string>
#include <vector>

namespace kestrune::uipack {

struct UiFile {
  std::u16string name;  // the name the file is requested by
  std::vector<unsigned char> bytes;
};

// Every file below `folder`, named by its path relative to the folder with '/' between the
// parts ("main.htm", "styles/main.css"), in name order. The folder's own README.md, which
// documents the folder, is left out.
std::vector<UiFile> CollectUiFiles(const std::filesystem::path& folder);

// The package: a compound file with one stream per file, named StreamNameFor(file.name) and
// holding the file enciphered under the package key. Throws std::invalid_argument when two
// files would share a stream (names that differ only in the case of a–z).
std::vector<unsigned char> BuildUiPackage(std::span<const UiFile> files);

}  // namespace kestrune::uipack
