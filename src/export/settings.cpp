#include "export/settings.h"

#include <exception>

#include "base/paths.h"
#include "base/text.h"

namespace kestrune {
namespace {

bool IsAsciiLetter(char16_t unit) {
  return (unit >= u'A' && unit <= u'Z') || (unit >= u'a' && unit <= u'z');
}

std::u16string BoolText(bool value) { return value ? u"true" : u"false"; }

std::optional<std::u16string> StringFrom(const platform::RegistryValue& value) {
  if (value.type != platform::kRegSz && value.type != platform::kRegExpandSz) return std::nullopt;
  const std::vector<unsigned char>& bytes = value.data;
  if (bytes.size() < 2 || bytes.size() % 2 != 0) return std::nullopt;
  if (bytes[bytes.size() - 2] != 0 || bytes[bytes.size() - 1] != 0) return std::nullopt;
  std::u16string text;
  for (std::size_t i = 0; i + 1 < bytes.size(); i += 2) {
    const auto unit = static_cast<char16_t>(bytes[i] | (bytes[i + 1] << 8));
    if (unit == 0) break;
    text += unit;
  }
  return text;
}

}  // namespace

std::u16string ReadRegistryString(platform::SettingsStore& store, platform::RegistryRoot root,
                                  std::u16string_view subkey, std::u16string_view name,
                                  std::u16string_view defaultText) {
  try {
    const std::unique_ptr<platform::SettingsKey> key = store.OpenKey(root, subkey);
    if (!key) return std::u16string(defaultText);
    const std::optional<platform::RegistryValue> value = key->QueryValue(name);
    if (!value) return std::u16string(defaultText);
    return StringFrom(*value).value_or(std::u16string(defaultText));
  } catch (const std::exception&) {
    return std::u16string(defaultText);
  }
}

std::u16string ReadSetting(platform::SettingsStore& store, std::u16string_view name,
                           std::u16string_view defaultText) {
  return ReadRegistryString(store, platform::RegistryRoot::kCurrentUser, kSettingsKey, name,
                            defaultText);
}

void WriteSetting(platform::SettingsStore& store, std::u16string_view name,
                  std::u16string_view text) {
  try {
    if (const auto key = store.CreateKey(platform::RegistryRoot::kCurrentUser, kSettingsKey))
      key->SetString(name, text);
  } catch (const std::exception&) {
    // Settings that cannot be stored are not worth interrupting anyone for.
  }
}

ExportOptions LoadExportOptions(platform::SettingsStore& store, const platform::Shell& shell) {
  ExportOptions options;
  options.addToItunes = ReadSetting(store, kAddToItunesValue, u"true") == u"true";
  options.openTarget = ReadSetting(store, kOpenTargetValue, u"true") == u"true";
  options.organized = ReadSetting(store, kOrganizedValue, u"true") == u"true";
  options.outputPath = ReadSetting(store, kOutputPathValue, DefaultOutputFolder(shell));
  return options;
}

void SaveExportOptions(platform::SettingsStore& store, const ExportOptions& options) {
  WriteSetting(store, kAddToItunesValue, BoolText(options.addToItunes));
  WriteSetting(store, kOpenTargetValue, BoolText(options.openTarget));
  WriteSetting(store, kOrganizedValue, BoolText(options.organized));
  if (!options.outputPath.empty()) WriteSetting(store, kOutputPathValue, options.outputPath);
}

std::u16string DefaultOutputFolder(const platform::Shell& shell) {
  const std::u16string program = shell.ProgramPath();
  std::u16string fallback;
  if (program.size() >= 2 && program[1] == u':' && IsAsciiLetter(program[0])) {
    fallback = std::u16string(1, AsciiUpper(program[0])) + u":\\VizUveVuzod";
  } else {
    fallback = shell.SpecialFolderPath(platform::SpecialFolder::kProfile).value_or(u"") +
               kPathSeparator + u"VizUveVuzod";
  }
  const std::optional<std::u16string> music =
      shell.SpecialFolderPath(platform::SpecialFolder::kMusic);
  if (!music) return fallback;
  return *music + kPathSeparator + u"iTunes" + kPathSeparator + u"iTunes Music";
}

}  // namespace kestrune
