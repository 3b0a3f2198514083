#include "platform/folder_library.h"

#include <algorithm>
#include <fstream>

#include "base/paths.h"
#include "base/text.h"
#include "base/utf.h"
#include "platform/file_names.h"

namespace kestrune::platform {
namespace {

constexpr std::u16string_view kExtension = u".m3u8";
constexpr std::string_view kNameTag = "#PLAYLIST:";

bool IsPlaylistFile(const std::filesystem::path& path) {
  return EqualsIgnoringAsciiCase(TextFromPath(path.extension()), kExtension);
}

// Playlist files are text: line breaks and lone surrogate units would break their lines or their
// UTF-8, so they become spaces and U+FFFD.
std::string LineText(std::u16string_view text) {
  std::u16string clean(text);
  for (std::size_t i = 0; i < clean.size(); ++i) {
    const char16_t unit = clean[i];
    const bool high = unit >= 0xD800 && unit <= 0xDBFF;
    const bool low = unit >= 0xDC00 && unit <= 0xDFFF;
    if (unit < u' ') {
      clean[i] = u' ';
    } else if (high && i + 1 < clean.size() && clean[i + 1] >= 0xDC00 && clean[i + 1] <= 0xDFFF) {
      ++i;
    } else if (high || low) {
      clean[i] = u'\uFFFD';
    }
  }
  return EncodeUtf8(clean);
}

std::vector<std::filesystem::path> ListPlaylistFiles(const std::filesystem::path& folder) {
  std::vector<std::filesystem::path> files;
  std::error_code error;
  for (std::filesystem::directory_iterator it(folder, error), end; !error && it != end;
       it.increment(error)) {
    if (it->is_regular_file(error) && IsPlaylistFile(it->path())) files.push_back(it->path());
  }
  std::sort(files.begin(), files.end());
  return files;
}

class DoneTrack : public MediaTrack {
 public:
  explicit DoneTrack(std::u16string location) : location_(std::move(location)) {}
  std::optional<std::u16string> FileLocation() override { return location_; }

 private:
  std::u16string location_;
};

class DoneTracks : public MediaTrackCollection {
 public:
  explicit DoneTracks(std::u16string location) : location_(std::move(location)) {}
  std::optional<std::int32_t> Count() override { return 1; }
  std::unique_ptr<MediaTrack> Item(std::int32_t index) override {
    if (index != 1) return nullptr;
    return std::make_unique<DoneTrack>(location_);
  }

 private:
  std::u16string location_;
};

// Adding to a folder is done at once.
class DoneOperation : public MediaOperationStatus {
 public:
  explicit DoneOperation(std::u16string location) : location_(std::move(location)) {}
  std::optional<AutomationBool> InProgress() override { return kAutomationFalse; }
  std::unique_ptr<MediaTrackCollection> Tracks() override {
    return std::make_unique<DoneTracks>(location_);
  }

 private:
  std::u16string location_;
};

class FolderLibraryPlaylist : public MediaLibraryPlaylist {
 public:
  explicit FolderLibraryPlaylist(std::vector<std::u16string>& files) : files_(files) {}
  std::unique_ptr<MediaOperationStatus> AddFile(std::u16string_view path) override {
    std::error_code error;
    if (!std::filesystem::is_regular_file(PathFromText(path), error)) return nullptr;
    if (std::find(files_.begin(), files_.end(), path) == files_.end()) files_.emplace_back(path);
    return std::make_unique<DoneOperation>(std::u16string(path));
  }

 private:
  std::vector<std::u16string>& files_;
};

}  // namespace

class FolderUserPlaylist : public MediaUserPlaylist {
 public:
  FolderUserPlaylist(const FolderLibrary& library, std::filesystem::path file)
      : library_(library), file_(std::move(file)) {}

  std::optional<AutomationBool> Smart() override { return kAutomationFalse; }

  std::optional<std::u16string> Name() override {
    std::ifstream in(file_, std::ios::binary);
    if (!in) return std::nullopt;
    std::string line;
    while (std::getline(in, line) &&
           (line.empty() || line.front() == '#' || line.front() == '\xEF')) {
      if (!line.empty() && line.back() == '\r') line.pop_back();
      if (line.compare(0, kNameTag.size(), kNameTag) == 0)
        return DecodeUtf8(line.substr(kNameTag.size()));
    }
    return TextFromPath(file_.stem());
  }

  std::unique_ptr<MediaOperationStatus> AddFile(std::u16string_view path) override {
    if (path.find_first_of(u"\r\n") != std::u16string_view::npos) return nullptr;
    const std::string entry = Entry(path);
    if (!Append(entry)) return nullptr;
    return std::make_unique<DoneOperation>(std::u16string(path));
  }

 private:
  std::string Entry(std::u16string_view path) const {
    std::error_code error;
    const std::filesystem::path target =
        std::filesystem::absolute(PathFromText(path), error).lexically_normal();
    const std::filesystem::path base =
        std::filesystem::absolute(file_.parent_path(), error).lexically_normal();
    std::filesystem::path written = target.lexically_relative(base);
    if (written.empty()) written = target;  // another drive: no relative path leads there

    std::optional<MediaInfo> info;
    if (library_.describe_) info = library_.describe_(path);
    std::string line = "#EXTINF:";
    if (info) {
      line += std::to_string((info->lengthMs + 500) / 1000) + ",";
      line += LineText(info->artist.empty() ? info->title : info->artist + u" - " + info->title);
    } else {
      line += "-1," + LineText(TextFromPath(target.stem()));
    }
    return line + "\n" + EncodeUtf8(TextFromPath(written)) + "\n";
  }

  bool Append(const std::string& entry) const {
    std::string prefix;
    {
      std::ifstream in(file_, std::ios::binary | std::ios::ate);
      if (!in) return false;
      const std::streamoff size = in.tellg();
      if (size <= 0) {
        prefix = "#EXTM3U\n";
      } else {
        in.seekg(size - 1);
        if (in.get() != '\n') prefix = "\n";
      }
    }
    std::ofstream out(file_, std::ios::binary | std::ios::app);
    out << prefix << entry;
    out.flush();
    return static_cast<bool>(out);
  }

  const FolderLibrary& library_;
  std::filesystem::path file_;
};

namespace {

class FolderPlaylist : public MediaPlaylist {
 public:
  FolderPlaylist(const FolderLibrary& library, std::filesystem::path file)
      : library_(library), file_(std::move(file)) {}
  std::optional<std::int32_t> Kind() override { return kPlaylistKindUser; }
  std::unique_ptr<MediaUserPlaylist> AsUserPlaylist() override {
    return std::make_unique<FolderUserPlaylist>(library_, file_);
  }

 private:
  const FolderLibrary& library_;
  std::filesystem::path file_;
};

class FolderPlaylists : public MediaPlaylistCollection {
 public:
  explicit FolderPlaylists(const FolderLibrary& library)
      : library_(library), files_(ListPlaylistFiles(library.folder())) {}
  std::optional<std::int32_t> Count() override { return static_cast<std::int32_t>(files_.size()); }
  std::unique_ptr<MediaPlaylist> Item(std::int32_t index) override {
    if (index < 1 || index > static_cast<std::int32_t>(files_.size())) return nullptr;
    return std::make_unique<FolderPlaylist>(library_, files_[static_cast<std::size_t>(index - 1)]);
  }

 private:
  const FolderLibrary& library_;
  std::vector<std::filesystem::path> files_;
};

class FolderSource : public MediaSource {
 public:
  explicit FolderSource(const FolderLibrary& library) : library_(library) {}
  std::unique_ptr<MediaPlaylistCollection> Playlists() override {
    return std::make_unique<FolderPlaylists>(library_);
  }

 private:
  const FolderLibrary& library_;
};

// A file name of the folder that no playlist file has, in any letter case: the cleaned name,
// else the cleaned name numbered [0], [1] ...
std::filesystem::path FreePlaylistFile(const std::filesystem::path& folder,
                                       std::u16string_view name) {
  std::u16string base(name);
  ReplaceReservedCharacters(base);
  base = MakeNameAcceptable(std::move(base), u"Playlist");
  std::vector<std::u16string> taken;
  std::error_code error;
  for (std::filesystem::directory_iterator it(folder, error), end; !error && it != end;
       it.increment(error)) {
    taken.push_back(TextFromPath(it->path().filename()));
  }
  std::u16string candidate = base + std::u16string(kExtension);
  for (std::uint32_t n = 0;; ++n) {
    const bool used = std::any_of(taken.begin(), taken.end(), [&](const std::u16string& t) {
      return EqualsIgnoringAsciiCase(t, candidate);
    });
    if (!used) return folder / PathFromText(candidate);
    candidate = base + u"[" + FormatDecimal(n) + u"]" + std::u16string(kExtension);
  }
}

}  // namespace

class FolderApplication : public MediaApplication {
 public:
  explicit FolderApplication(FolderLibrary& library) : library_(library) {}

  std::unique_ptr<MediaLibraryPlaylist> LibraryPlaylist() override {
    return std::make_unique<FolderLibraryPlaylist>(library_.libraryFiles_);
  }

  std::unique_ptr<MediaSource> LibrarySource() override {
    return std::make_unique<FolderSource>(library_);
  }

  std::unique_ptr<MediaPlaylist> CreatePlaylist(std::u16string_view name) override {
    const std::filesystem::path file = FreePlaylistFile(library_.folder_, name);
    std::ofstream out(file, std::ios::binary);
    out << "#EXTM3U\n" << kNameTag << LineText(name) << "\n";
    out.flush();
    if (!out) return nullptr;
    return std::make_unique<FolderPlaylist>(library_, file);
  }

 private:
  FolderLibrary& library_;
};

FolderLibrary::FolderLibrary(std::filesystem::path folder, MediaInfoLookup describe)
    : folder_(std::move(folder)), describe_(std::move(describe)) {}

CreatedApplication FolderLibrary::CreateApplication(std::u16string_view) {
  std::error_code error;
  std::filesystem::create_directories(folder_, error);
  if (!std::filesystem::is_directory(folder_, error)) return {error ? error.value() : 1, nullptr};
  return {0, std::make_unique<FolderApplication>(*this)};
}

}  // namespace kestrune::platform
