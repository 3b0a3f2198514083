#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <string_view>
#include <vector>

namespace kestrune::platform {

enum class RegistryRoot { kCurrentUser, kLocalMachine };

// Value types as the registry numbers them.
inline constexpr std::uint32_t kRegSz = 1;
inline constexpr std::uint32_t kRegExpandSz = 2;
inline constexpr std::uint32_t kRegBinary = 3;
inline constexpr std::uint32_t kRegDword = 4;

struct RegistryValue {
  std::uint32_t type = 0;
  std::vector<unsigned char> data;  // as stored: UTF-16LE with its terminator for strings
};

// One open key. Key and value names compare without regard to ASCII letter case, as the
// registry compares them.
class SettingsKey {
 public:
  virtual ~SettingsKey() = default;

  // The whole stored value, however long; empty when it is missing or cannot be read.
  virtual std::optional<RegistryValue> QueryValue(std::u16string_view name) const = 0;

  // Stores the text as a string value with its terminating zero unit.
  virtual bool SetString(std::u16string_view name, std::u16string_view text) = 0;
};

// The settings store, shaped like the registry: keys under a root, named values in each.
class SettingsStore {
 public:
  virtual ~SettingsStore() = default;

  // The existing key, for reading and writing; empty when it cannot be opened.
  virtual std::unique_ptr<SettingsKey> OpenKey(RegistryRoot root, std::u16string_view subkey) = 0;

  // The key, made with its missing parents when needed; empty when that fails.
  virtual std::unique_ptr<SettingsKey> CreateKey(RegistryRoot root, std::u16string_view subkey) = 0;
};

}  // namespace kestrune::platform
