#include "platform/fake/fake_media_library.h"

namespace kestrune::platform {
namespace {

class FakeTrack : public MediaTrack {
 public:
  explicit FakeTrack(std::u16string location) : location_(std::move(location)) {}
  std::optional<std::u16string> FileLocation() override { return location_; }

 private:
  std::u16string location_;
};

class FakeTracks : public MediaTrackCollection {
 public:
  FakeTracks(std::u16string location, std::int32_t count)
      : location_(std::move(location)), count_(count) {}
  std::optional<std::int32_t> Count() override { return count_; }
  std::unique_ptr<MediaTrack> Item(std::int32_t index) override {
    if (index < 1 || index > count_) return nullptr;
    return std::make_unique<FakeTrack>(location_);
  }

 private:
  std::u16string location_;
  std::int32_t count_;
};

class FakeOperation : public MediaOperationStatus {
 public:
  FakeOperation(FakeMediaLibrary& library, std::u16string path)
      : library_(library), path_(std::move(path)) {}

  std::optional<AutomationBool> InProgress() override {
    ++library_.progressReads;
    if (const auto odd = library_.oddProgress.find(path_); odd != library_.oddProgress.end())
      return odd->second;
    const auto busy = library_.busyReads.find(path_);
    if (busy == library_.busyReads.end() || busy->second == 0) return kAutomationFalse;
    if (busy->second > 0) --busy->second;
    return kAutomationTrue;
  }

  std::unique_ptr<MediaTrackCollection> Tracks() override {
    const auto relocated = library_.relocations.find(path_);
    const auto count = library_.trackCounts.find(path_);
    return std::make_unique<FakeTracks>(
        relocated == library_.relocations.end() ? path_ : relocated->second,
        count == library_.trackCounts.end() ? 1 : count->second);
  }

 private:
  FakeMediaLibrary& library_;
  std::u16string path_;
};

class FakeUserPlaylist : public MediaUserPlaylist {
 public:
  FakeUserPlaylist(FakeMediaLibrary& library, std::size_t index)
      : library_(library), index_(index) {}
  std::optional<AutomationBool> Smart() override {
    return library_.playlists[index_].smart ? kAutomationTrue : kAutomationFalse;
  }
  std::optional<std::u16string> Name() override { return library_.playlists[index_].name; }
  std::unique_ptr<MediaOperationStatus> AddFile(std::u16string_view path) override {
    library_.playlists[index_].files.emplace_back(path);
    return std::make_unique<FakeOperation>(library_, std::u16string(path));
  }

 private:
  FakeMediaLibrary& library_;
  std::size_t index_;
};

class FakePlaylist : public MediaPlaylist {
 public:
  FakePlaylist(FakeMediaLibrary& library, std::size_t index) : library_(library), index_(index) {}
  std::optional<std::int32_t> Kind() override { return library_.playlists[index_].kind; }
  std::unique_ptr<MediaUserPlaylist> AsUserPlaylist() override {
    if (library_.playlists[index_].kind != kPlaylistKindUser) return nullptr;
    return std::make_unique<FakeUserPlaylist>(library_, index_);
  }

 private:
  FakeMediaLibrary& library_;
  std::size_t index_;
};

class FakePlaylists : public MediaPlaylistCollection {
 public:
  explicit FakePlaylists(FakeMediaLibrary& library) : library_(library) {}
  std::optional<std::int32_t> Count() override {
    return static_cast<std::int32_t>(library_.playlists.size());
  }
  std::unique_ptr<MediaPlaylist> Item(std::int32_t index) override {
    if (index < 1 || index > static_cast<std::int32_t>(library_.playlists.size())) return nullptr;
    return std::make_unique<FakePlaylist>(library_, static_cast<std::size_t>(index - 1));
  }

 private:
  FakeMediaLibrary& library_;
};

class FakeSource : public MediaSource {
 public:
  explicit FakeSource(FakeMediaLibrary& library) : library_(library) {}
  std::unique_ptr<MediaPlaylistCollection> Playlists() override {
    if (library_.refusePlaylists) return nullptr;
    return std::make_unique<FakePlaylists>(library_);
  }

 private:
  FakeMediaLibrary& library_;
};

class FakeLibraryPlaylist : public MediaLibraryPlaylist {
 public:
  explicit FakeLibraryPlaylist(FakeMediaLibrary& library) : library_(library) {}
  std::unique_ptr<MediaOperationStatus> AddFile(std::u16string_view path) override {
    library_.libraryFiles.emplace_back(path);
    if (library_.refusedFiles.contains(std::u16string(path))) return nullptr;
    return std::make_unique<FakeOperation>(library_, std::u16string(path));
  }

 private:
  FakeMediaLibrary& library_;
};

class FakeApplication : public MediaApplication {
 public:
  explicit FakeApplication(FakeMediaLibrary& library) : library_(library) {}
  std::unique_ptr<MediaLibraryPlaylist> LibraryPlaylist() override {
    if (library_.refuseLibraryPlaylist) return nullptr;
    return std::make_unique<FakeLibraryPlaylist>(library_);
  }
  std::unique_ptr<MediaSource> LibrarySource() override {
    if (library_.refuseLibrarySource) return nullptr;
    return std::make_unique<FakeSource>(library_);
  }
  std::unique_ptr<MediaPlaylist> CreatePlaylist(std::u16string_view name) override {
    if (library_.refuseCreatePlaylist) return nullptr;
    library_.createdPlaylists.emplace_back(name);
    library_.playlists.emplace_back().name = name;
    return std::make_unique<FakePlaylist>(library_, library_.playlists.size() - 1);
  }

 private:
  FakeMediaLibrary& library_;
};

}  // namespace

CreatedApplication FakeMediaLibrary::CreateApplication(std::u16string_view programId) {
  programIds.emplace_back(programId);
  if (createResult != 0) return {createResult, nullptr};
  return {0, std::make_unique<FakeApplication>(*this)};
}

}  // namespace kestrune::platform
