#include "platform/linux/key_file_store.h"

#include <fcntl.h>
#include <unistd.h>

#include <cstdlib>
#include <fstream>
#include <iterator>
#include <optional>
#include <vector>

#include "base/text.h"
#include "base/utf.h"
#include "platform/system.h"

namespace kestrune::platform {
namespace {

using Lines = std::vector<std::string>;

std::string GroupName(RegistryRoot root, std::u16string_view subkey) {
  const char* rootName =
      root == RegistryRoot::kCurrentUser ? "HKEY_CURRENT_USER" : "HKEY_LOCAL_MACHINE";
  return std::string(rootName) + "\\" + EncodeUtf8(subkey);
}

bool SameName(std::string_view a, std::string_view b) {
  return EqualsIgnoringAsciiCase(DecodeUtf8(a), DecodeUtf8(b));
}

std::optional<Lines> ReadLines(const std::filesystem::path& file) {
  std::ifstream in(file, std::ios::binary);
  if (!in) return std::nullopt;
  Lines lines;
  std::string line;
  while (std::getline(in, line)) {
    if (!line.empty() && line.back() == '\r') line.pop_back();
    lines.push_back(std::move(line));
  }
  return lines;
}

bool IsGroupLine(const std::string& line) {
  return line.size() >= 2 && line.front() == '[' && line.back() == ']';
}

// The index of the group's header line, or lines.size().
std::size_t FindGroup(const Lines& lines, const std::string& group) {
  for (std::size_t i = 0; i < lines.size(); ++i) {
    if (IsGroupLine(lines[i]) &&
        SameName(std::string_view(lines[i]).substr(1, lines[i].size() - 2), group))
      return i;
  }
  return lines.size();
}

std::size_t SectionEnd(const Lines& lines, std::size_t header) {
  std::size_t end = header + 1;
  while (end < lines.size() && !IsGroupLine(lines[end])) ++end;
  return end;
}

std::optional<std::size_t> FindEntry(const Lines& lines, std::size_t header,
                                     std::string_view name) {
  for (std::size_t i = header + 1; i < SectionEnd(lines, header); ++i) {
    const std::size_t equals = lines[i].find('=');
    if (equals != std::string::npos && SameName(std::string_view(lines[i]).substr(0, equals), name))
      return i;
  }
  return std::nullopt;
}

std::string Escape(std::string_view value) {
  std::string out;
  for (std::size_t i = 0; i < value.size(); ++i) {
    const char c = value[i];
    if (c == '\\')
      out += "\\\\";
    else if (c == '\n')
      out += "\\n";
    else if (c == '\r')
      out += "\\r";
    else if (c == '\t')
      out += "\\t";
    else if (c == ' ' && i == 0)
      out += "\\s";
    else
      out += c;
  }
  return out;
}

std::string Unescape(std::string_view value) {
  std::string out;
  for (std::size_t i = 0; i < value.size(); ++i) {
    if (value[i] != '\\' || i + 1 == value.size()) {
      out += value[i];
      continue;
    }
    const char next = value[++i];
    if (next == 's')
      out += ' ';
    else if (next == 'n')
      out += '\n';
    else if (next == 'r')
      out += '\r';
    else if (next == 't')
      out += '\t';
    else if (next == '\\')
      out += '\\';
    else
      out += {'\\', next};
  }
  return out;
}

bool WriteAtomically(const std::filesystem::path& file, const Lines& lines) {
  std::error_code error;
  std::filesystem::create_directories(file.parent_path(), error);
  std::string text;
  for (const std::string& line : lines) text += line + '\n';
  const std::filesystem::path temporary = file.string() + "." + std::to_string(::getpid()) + ".tmp";
  const int fd = ::open(temporary.c_str(), O_WRONLY | O_CREAT | O_TRUNC | O_CLOEXEC, 0600);
  if (fd < 0) return false;
  std::size_t written = 0;
  while (written < text.size()) {
    const ssize_t put = ::write(fd, text.data() + written, text.size() - written);
    if (put <= 0) break;
    written += static_cast<std::size_t>(put);
  }
  // The bytes must be on the disk before the name points at them.
  const bool whole = written == text.size() && ::fsync(fd) == 0;
  const bool closed = ::close(fd) == 0;
  if (!whole || !closed || ::rename(temporary.c_str(), file.c_str()) != 0) {
    ::unlink(temporary.c_str());
    return false;
  }
  return true;
}

class KeyFileKey : public SettingsKey {
 public:
  KeyFileKey(std::filesystem::path file, std::string group)
      : file_(std::move(file)), group_(std::move(group)) {}

  std::optional<RegistryValue> QueryValue(std::u16string_view name) const override {
    const std::optional<Lines> lines = ReadLines(file_);
    if (!lines) return std::nullopt;
    const std::size_t header = FindGroup(*lines, group_);
    if (header == lines->size()) return std::nullopt;
    const std::optional<std::size_t> entry = FindEntry(*lines, header, EncodeUtf8(name));
    if (!entry) return std::nullopt;
    const std::string& line = (*lines)[*entry];
    const std::u16string text =
        DecodeUtf8(Unescape(std::string_view(line).substr(line.find('=') + 1)));
    RegistryValue value{kRegSz, {}};
    for (char16_t unit : text) {
      value.data.push_back(static_cast<unsigned char>(unit & 0xFF));
      value.data.push_back(static_cast<unsigned char>(unit >> 8));
    }
    value.data.insert(value.data.end(), {0, 0});
    return value;
  }

  bool SetString(std::u16string_view name, std::u16string_view text) override {
    const std::string utf8Name = EncodeUtf8(name);
    if (utf8Name.empty() || utf8Name.find_first_of("=\n\r") != std::string::npos ||
        utf8Name.front() == '[') {
      return false;
    }
    // A string value ends at its first zero unit for every reader.
    const std::u16string_view stored = text.substr(0, text.find(u'\0'));
    Lines lines = ReadLines(file_).value_or(Lines{});
    std::size_t header = FindGroup(lines, group_);
    if (header == lines.size()) lines.push_back("[" + group_ + "]");
    const std::string value = "=" + Escape(EncodeUtf8(stored));
    if (const std::optional<std::size_t> entry = FindEntry(lines, header, utf8Name)) {
      // As in the registry, the name keeps the letter case it was first stored with.
      lines[*entry] = lines[*entry].substr(0, lines[*entry].find('=')) + value;
    } else {
      std::size_t end = SectionEnd(lines, header);
      while (end > header + 1 && lines[end - 1].empty()) --end;
      lines.insert(lines.begin() + static_cast<std::ptrdiff_t>(end), utf8Name + value);
    }
    return WriteAtomically(file_, lines);
  }

 private:
  std::filesystem::path file_;
  std::string group_;
};

}  // namespace

KeyFileStore::KeyFileStore(std::filesystem::path file) : file_(std::move(file)) {}

std::unique_ptr<SettingsKey> KeyFileStore::OpenKey(RegistryRoot root, std::u16string_view subkey) {
  const std::string group = GroupName(root, subkey);
  const std::optional<Lines> lines = ReadLines(file_);
  if (!lines || FindGroup(*lines, group) == lines->size()) return nullptr;
  return std::make_unique<KeyFileKey>(file_, group);
}

std::unique_ptr<SettingsKey> KeyFileStore::CreateKey(RegistryRoot root,
                                                     std::u16string_view subkey) {
  const std::string group = GroupName(root, subkey);
  Lines lines = ReadLines(file_).value_or(Lines{});
  if (FindGroup(lines, group) == lines.size()) {
    if (!lines.empty() && !lines.back().empty()) lines.emplace_back();
    lines.push_back("[" + group + "]");
    if (!WriteAtomically(file_, lines)) return nullptr;
  }
  return std::make_unique<KeyFileKey>(file_, group);
}

std::filesystem::path UserConfigFolder() {
  const char* configHome = std::getenv("XDG_CONFIG_HOME");
  if (configHome != nullptr && configHome[0] == '/') return configHome;
  const char* home = std::getenv("HOME");
  return std::filesystem::path(home != nullptr ? home : "/") / ".config";
}

std::filesystem::path UserSettingsFile() {
  return UserConfigFolder() / "kestrune" / "settings.ini";
}

std::unique_ptr<SettingsStore> MakeSystemSettingsStore() {
  return std::make_unique<KeyFileStore>(UserSettingsFile());
}

}  // namespace kestrune::platform
