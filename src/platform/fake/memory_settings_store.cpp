#include "platform/fake/memory_settings_store.h"

#include "base/text.h"

namespace kestrune::platform {

class MemoryKey : public SettingsKey {
 public:
  MemoryKey(MemorySettingsStore& store, MemorySettingsStore::KeyId id)
      : store_(store), id_(std::move(id)) {}

  std::optional<RegistryValue> QueryValue(std::u16string_view name) const override {
    const auto& values = store_.keys_.at(id_);
    const auto found = values.find(AsciiUpper(name));
    if (found == values.end()) return std::nullopt;
    return found->second;
  }

  bool SetString(std::u16string_view name, std::u16string_view text) override {
    store_.keys_.at(id_)[AsciiUpper(name)] = RegistryValue{kRegSz, StringValueBytes(text)};
    return true;
  }

 private:
  MemorySettingsStore& store_;
  MemorySettingsStore::KeyId id_;
};

std::vector<unsigned char> StringValueBytes(std::u16string_view text) {
  std::vector<unsigned char> bytes;
  for (char16_t unit : text) {
    bytes.push_back(static_cast<unsigned char>(unit & 0xFF));
    bytes.push_back(static_cast<unsigned char>(unit >> 8));
  }
  bytes.insert(bytes.end(), {0, 0});
  return bytes;
}

MemorySettingsStore::KeyId MemorySettingsStore::IdOf(RegistryRoot root,
                                                     std::u16string_view subkey) {
  return {root, AsciiUpper(subkey)};
}

std::unique_ptr<SettingsKey> MemorySettingsStore::OpenKey(RegistryRoot root,
                                                          std::u16string_view subkey) {
  const KeyId id = IdOf(root, subkey);
  if (!keys_.contains(id)) return nullptr;
  return std::make_unique<MemoryKey>(*this, id);
}

std::unique_ptr<SettingsKey> MemorySettingsStore::CreateKey(RegistryRoot root,
                                                            std::u16string_view subkey) {
  const KeyId id = IdOf(root, subkey);
  if (!keys_.contains(id)) {
    if (refuseCreate) return nullptr;
    keys_[id];
  }
  return std::make_unique<MemoryKey>(*this, id);
}

void MemorySettingsStore::SetValue(RegistryRoot root, std::u16string_view subkey,
                                   std::u16string_view name, RegistryValue value) {
  keys_[IdOf(root, subkey)][AsciiUpper(name)] = std::move(value);
}

std::optional<RegistryValue> MemorySettingsStore::Value(RegistryRoot root,
                                                        std::u16string_view subkey,
                                                        std::u16string_view name) const {
  const auto key = keys_.find(IdOf(root, subkey));
  if (key == keys_.end()) return std::nullopt;
  const auto value = key->second.find(AsciiUpper(name));
  if (value == key->second.end()) return std::nullopt;
  return value->second;
}

bool MemorySettingsStore::HasKey(RegistryRoot root, std::u16string_view subkey) const {
  return keys_.contains(IdOf(root, subkey));
}

}  // namespace kestrune::platform
