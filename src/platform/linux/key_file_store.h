#pragma once

#include <filesystem>
#include <memory>
#include <string>

#include "platform/settings_store.h"

namespace kestrune::platform {

// The settings store as a key file: one "[HKEY_CURRENT_USER\Software\Kestrune]" group per key,
// one "Name=value" line per string value (UTF-8, with the key file escapes \s \n \r \t \\). Each
// change rewrites the file under a temporary name and renames it into place, so that a crash
// leaves the old file or the new one, never half of one. Lines it does not know are kept.
class KeyFileStore : public SettingsStore {
 public:
  explicit KeyFileStore(std::filesystem::path file);

  std::unique_ptr<SettingsKey> OpenKey(RegistryRoot root, std::u16string_view subkey) override;
  std::unique_ptr<SettingsKey> CreateKey(RegistryRoot root, std::u16string_view subkey) override;

  const std::filesystem::path& file() const { return file_; }

 private:
  std::filesystem::path file_;
};

// The user's configuration folder: $XDG_CONFIG_HOME when it is an absolute path, else ~/.config.
std::filesystem::path UserConfigFolder();

// Where the user's settings live: kestrune/settings.ini in the configuration folder.
std::filesystem::path UserSettingsFile();

}  // namespace kestrune::platform
