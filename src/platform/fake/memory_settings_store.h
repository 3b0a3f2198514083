#pragma once

#include <map>
#include <string>
#include <utility>

#include "platform/settings_store.h"

namespace kestrune::platform {

// The settings store in memory, where tests can also place values of any type and length.
class MemorySettingsStore : public SettingsStore {
 public:
  std::unique_ptr<SettingsKey> OpenKey(RegistryRoot root, std::u16string_view subkey) override;
  std::unique_ptr<SettingsKey> CreateKey(RegistryRoot root, std::u16string_view subkey) override;

  void SetValue(RegistryRoot root, std::u16string_view subkey, std::u16string_view name,
                RegistryValue value);
  std::optional<RegistryValue> Value(RegistryRoot root, std::u16string_view subkey,
                                     std::u16string_view name) const;
  bool HasKey(RegistryRoot root, std::u16string_view subkey) const;

  // When set, no key can be created (a locked-down registry).
  bool refuseCreate = false;

 private:
  friend class MemoryKey;
  using KeyId = std::pair<RegistryRoot, std::u16string>;
  using Values = std::map<std::u16string, RegistryValue>;
  static KeyId IdOf(RegistryRoot root, std::u16string_view subkey);
  std::map<KeyId, Values> keys_;
};

// UTF-16LE bytes of the text followed by a zero unit, as string values are stored.
std::vector<unsigned char> StringValueBytes(std::u16string_view text);

}  // namespace kestrune::platform
