#pragma once

#include <cstdint>
#include <filesystem>
#include <system_error>

namespace kestrune::platform {

// The file operations of an export.
class Files {
 public:
  virtual ~Files() = default;

  // True when a file or a folder stands at the path.
  virtual bool FileExists(const std::filesystem::path& path) const = 0;

  // The size of the file at the path; 0 when it is no file or its status cannot be read, so
  // that a folder never passes for an earlier copy.
  virtual std::uint64_t FileSizeOf(const std::filesystem::path& path) const = 0;

  // Creates the folder and every missing parent; true when the folder is there afterwards.
  virtual bool CreateFolderPath(const std::filesystem::path& path) = 0;

  // Copies the bytes of `source` to `target`, replacing a file there. The copy is written under a
  // temporary name in the target's folder and renamed into place only once it is whole, so a
  // copy that fails half-way (disk full, device gone) leaves nothing at the target.
  virtual std::error_code CopyFileReplacing(const std::filesystem::path& source,
                                            const std::filesystem::path& target) = 0;

  // Makes the file an ordinary writable one: the device's files are often read-only or hidden.
  virtual void SetNormalAttributes(const std::filesystem::path& path) = 0;
};

}  // namespace kestrune::platform
