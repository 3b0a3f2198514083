#include "ui/package/ui_package.h"

#include "platform/embedded_package.h"
#include "ui/package/packaged_file.h"
#include "ui/package/stream_name.h"

namespace kestrune::ui {

std::optional<std::vector<unsigned char>> UiPackage::Load(std::u16string_view name) {
  const std::span<const unsigned char> package = platform::EmbeddedPackage();
  if (package.empty()) return std::nullopt;
  return Load(package, name);
}

std::optional<std::vector<unsigned char>> UiPackage::Load(std::span<const unsigned char> package,
                                                          std::u16string_view name) {
  std::optional<StoredFile> stored;
  // Only the reading happens with the package open; it is released before deciphering.
  const bool read = platform::ReadPackageStream(package, StreamNameFor(name),
                                                [&stored](platform::PackageStream& stream) {
                                                  stored = ReadStoredFile(stream);
                                                  return stored.has_value();
                                                });
  if (!read) return std::nullopt;
  return DecipherStoredFile(std::move(*stored));
}

}  // namespace kestrune::ui
