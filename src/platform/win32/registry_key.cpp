#include "platform/win32/registry_key.h"

#include <string>
#include <utility>

namespace kestrune::platform {

RegistryKey::~RegistryKey() { Close(); }

RegistryKey::RegistryKey(RegistryKey&& other) noexcept : key_(std::exchange(other.key_, nullptr)) {}

RegistryKey& RegistryKey::operator=(RegistryKey&& other) noexcept {
  if (this != &other) Reset(std::exchange(other.key_, nullptr));
  return *this;
}

void RegistryKey::Reset(HKEY key) {
  if (key_ != nullptr) RegCloseKey(key_);
  key_ = key;
}

void RegistryKey::Close() { Reset(nullptr); }

LONG RegistryKey::Open(HKEY root, const wchar_t* subkey, REGSAM access) {
  HKEY opened = nullptr;
  const LONG result = RegOpenKeyExW(root, subkey, 0, access, &opened);
  Reset(result == ERROR_SUCCESS ? opened : nullptr);
  return result;
}

LONG RegistryKey::Create(HKEY root, const wchar_t* subkey, REGSAM access) {
  HKEY created = nullptr;
  const LONG result = RegCreateKeyExW(root, subkey, 0, nullptr, REG_OPTION_NON_VOLATILE, access,
                                      nullptr, &created, nullptr);
  Reset(result == ERROR_SUCCESS ? created : nullptr);
  return result;
}

LONG RegistryKey::QueryValue(const wchar_t* name, DWORD& type, std::vector<BYTE>& data) const {
  if (key_ == nullptr) return ERROR_INVALID_HANDLE;
  // The value may grow between the two calls; ask again with the new size.
  for (int attempt = 0; attempt < 4; ++attempt) {
    DWORD size = 0;
    LONG result = RegQueryValueExW(key_, name, nullptr, &type, nullptr, &size);
    if (result != ERROR_SUCCESS) return result;
    data.assign(size, 0);
    result =
        RegQueryValueExW(key_, name, nullptr, &type, data.empty() ? nullptr : data.data(), &size);
    if (result == ERROR_MORE_DATA) continue;
    if (result == ERROR_SUCCESS) data.resize(size);
    return result;
  }
  return ERROR_MORE_DATA;
}

LONG RegistryKey::SetString(const wchar_t* name, std::wstring_view text) {
  if (key_ == nullptr) return ERROR_INVALID_HANDLE;
  const std::wstring terminated(text);
  const auto bytes = static_cast<DWORD>((terminated.size() + 1) * sizeof(wchar_t));
  return RegSetValueExW(key_, name, 0, REG_SZ, reinterpret_cast<const BYTE*>(terminated.c_str()),
                        bytes);
}

}  // namespace kestrune::platform
