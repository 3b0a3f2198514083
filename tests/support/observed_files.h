#pragma once

#include <functional>
#include <memory>

#include "platform/system.h"

namespace kestrune::test {

// The system's files, counting the copies asked for and telling `beforeCopy` of each (with its
// number from 1) before it is made.
class ObservedFiles : public platform::Files {
 public:
  bool FileExists(const std::filesystem::path& path) const override {
    return real_->FileExists(path);
  }
  std::uint64_t FileSizeOf(const std::filesystem::path& path) const override {
    return real_->FileSizeOf(path);
  }
  bool CreateFolderPath(const std::filesystem::path& path) override {
    return real_->CreateFolderPath(path);
  }
  std::error_code CopyFileReplacing(const std::filesystem::path& source,
                                    const std::filesystem::path& target) override {
    ++copies;
    if (beforeCopy) beforeCopy(copies);
    return real_->CopyFileReplacing(source, target);
  }
  void SetNormalAttributes(const std::filesystem::path& path) override {
    real_->SetNormalAttributes(path);
  }

  int copies = 0;
  std::function<void(int)> beforeCopy;

 private:
  std::unique_ptr<platform::Files> real_ = platform::MakeSystemFiles();
};

}  // namespace kestrune::test
