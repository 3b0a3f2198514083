#pragma once

#include <windows.h>

#include <string_view>
#include <vector>

namespace kestrune::platform {

// Owns one open registry key: closes it when given another, when closed and when destroyed.
class RegistryKey {
 public:
  RegistryKey() = default;
  ~RegistryKey();
  RegistryKey(RegistryKey&& other) noexcept;
  RegistryKey& operator=(RegistryKey&& other) noexcept;
  RegistryKey(const RegistryKey&) = delete;
  RegistryKey& operator=(const RegistryKey&) = delete;

  LONG Open(HKEY root, const wchar_t* subkey, REGSAM access);
  LONG Create(HKEY root, const wchar_t* subkey, REGSAM access);

  // The value's type and all its bytes: the size is asked first, so no length limit applies.
  LONG QueryValue(const wchar_t* name, DWORD& type, std::vector<BYTE>& data) const;

  // A REG_SZ value of (length + 1) × 2 bytes: the text and its terminator.
  LONG SetString(const wchar_t* name, std::wstring_view text);

  void Close();
  bool is_open() const { return key_ != nullptr; }
  HKEY get() const { return key_; }

 private:
  void Reset(HKEY key);
  HKEY key_ = nullptr;
};

}  // namespace kestrune::platform
