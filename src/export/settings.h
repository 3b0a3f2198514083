#pragma once

#include <string>
#include <string_view>

#include "platform/settings_store.h"
#include "platform/shell.h"

namespace kestrune {

inline constexpr std::u16string_view kSettingsKey = u"Software\\Kestrune";
inline constexpr std::u16string_view kAddToItunesValue = u"AddToItunes";
inline constexpr std::u16string_view kOpenTargetValue = u"OpenTarget";
inline constexpr std::u16string_view kOrganizedValue = u"Organized";
// Spelled so by the first releases; stored folders are found only under this name.
inline constexpr std::u16string_view kOutputPathValue = u"OuputPath";

inline constexpr std::u16string_view kBrowseTitle = u"Select a target folder below:";

// The stored text of a string value (REG_SZ, or REG_EXPAND_SZ taken unexpanded) up to its first
// zero unit, or `defaultText` when the key or value is missing, the value has another type, an
// odd byte count or no terminator. A stored empty string gives empty text. Never fails.
std::u16string ReadRegistryString(platform::SettingsStore& store, platform::RegistryRoot root,
                                  std::u16string_view subkey, std::u16string_view name,
                                  std::u16string_view defaultText);

// The same for a value of the program's own key.
std::u16string ReadSetting(platform::SettingsStore& store, std::u16string_view name,
                           std::u16string_view defaultText);

// Stores the text under the program's key, creating it; a failure is silent.
void WriteSetting(platform::SettingsStore& store, std::u16string_view name,
                  std::u16string_view text);

// The four persisted export options.
struct ExportOptions {
  bool addToItunes = true;
  bool openTarget = true;
  bool organized = true;
  std::u16string outputPath;
};

// Only the exact text "true" ticks an option; a missing folder is `DefaultOutputFolder`.
ExportOptions LoadExportOptions(platform::SettingsStore& store, const platform::Shell& shell);

// Writes "true"/"false" for each option; the folder only when it is not empty, so that an
// emptied field keeps the stored folder.
void SaveExportOptions(platform::SettingsStore& store, const ExportOptions& options);

// The folder proposed when none is stored: the user's music folder followed by
// "iTunes/iTunes Music"; without one, "VizUveVuzod" at the root of the program's drive (on
// systems without drive letters, in the user's home folder). Nothing is created.
std::u16string DefaultOutputFolder(const platform::Shell& shell);

}  // namespace kestrune
