#include <string>

#include "platform/system.h"
#include "platform/win32/registry_key.h"

namespace kestrune::platform {
namespace {

// Read and write access, as the settings are opened for both.
constexpr REGSAM kAccess = KEY_READ | KEY_WRITE;

std::wstring Wide(std::u16string_view text) { return std::wstring(text.begin(), text.end()); }

HKEY RootKey(RegistryRoot root) {
  return root == RegistryRoot::kCurrentUser ? HKEY_CURRENT_USER : HKEY_LOCAL_MACHINE;
}

class RegistrySettingsKey : public SettingsKey {
 public:
  explicit RegistrySettingsKey(RegistryKey key) : key_(std::move(key)) {}

  std::optional<RegistryValue> QueryValue(std::u16string_view name) const override {
    RegistryValue value;
    DWORD type = 0;
    std::vector<BYTE> data;
    if (key_.QueryValue(Wide(name).c_str(), type, data) != ERROR_SUCCESS) return std::nullopt;
    value.type = type;
    value.data.assign(data.begin(), data.end());
    return value;
  }

  bool SetString(std::u16string_view name, std::u16string_view text) override {
    return key_.SetString(Wide(name).c_str(), Wide(text)) == ERROR_SUCCESS;
  }

 private:
  RegistryKey key_;
};

class RegistryStore : public SettingsStore {
 public:
  std::unique_ptr<SettingsKey> OpenKey(RegistryRoot root, std::u16string_view subkey) override {
    RegistryKey key;
    if (key.Open(RootKey(root), Wide(subkey).c_str(), kAccess) != ERROR_SUCCESS) return nullptr;
    return std::make_unique<RegistrySettingsKey>(std::move(key));
  }

  std::unique_ptr<SettingsKey> CreateKey(RegistryRoot root, std::u16string_view subkey) override {
    RegistryKey key;
    if (key.Create(RootKey(root), Wide(subkey).c_str(), kAccess) != ERROR_SUCCESS) return nullptr;
    return std::make_unique<RegistrySettingsKey>(std::move(key));
  }
};

}  // namespace

std::unique_ptr<SettingsStore> MakeSystemSettingsStore() {
  return std::make_unique<RegistryStore>();
}

}  // namespace kestrune::platform
