#pragma once

#include <optional>
#include <span>
#include <string_view>
#include <vector>

namespace kestrune::ui {

// The interface files the program carries: a compound file whose root storage holds one
// enciphered stream per file, named with StreamNameFor of the name the file is requested by.
// Every call opens the package anew; nothing is kept between requests.
class UiPackage {
 public:
  UiPackage() = delete;

  // The file requested by `name` (the start page's file name, or a URL exactly as the engine
  // requests it) from the program's own package: exactly its plain length in bytes. None when
  // the program carries no package, the package does not open, it lacks the file, or the
  // file's stream is inconsistent.
  static std::optional<std::vector<unsigned char>> Load(std::u16string_view name);

  // The same from the package held in `package`.
  static std::optional<std::vector<unsigned char>> Load(std::span<const unsigned char> package,
                                                        std::u16string_view name);
};

}  // namespace kestrune::ui
