#pragma once

#include <cstdint>

namespace kestrune::test {

// Lowers the largest file this process may write, as a full disk would, for the object's
// lifetime: writes past it fail with an error instead of a signal. Linux only.
class FileSizeLimit {
 public:
  explicit FileSizeLimit(std::uint64_t bytes);
  ~FileSizeLimit();
  FileSizeLimit(const FileSizeLimit&) = delete;
  FileSizeLimit& operator=(const FileSizeLimit&) = delete;

 private:
  std::uint64_t previous_ = 0;
};

}  // namespace kestrune::test
