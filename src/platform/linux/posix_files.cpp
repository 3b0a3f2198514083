#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <atomic>
#include <cerrno>
#include <string>
#include <vector>

#include "platform/system.h"

namespace kestrune::platform {
namespace {

std::error_code LastError() { return {errno, std::generic_category()}; }

class Descriptor {
 public:
  explicit Descriptor(int fd) : fd_(fd) {}
  ~Descriptor() {
    if (fd_ >= 0) ::close(fd_);
  }
  Descriptor(const Descriptor&) = delete;
  Descriptor& operator=(const Descriptor&) = delete;
  int get() const { return fd_; }
  // Closing reports the last write errors of some file systems; they must not go unseen.
  std::error_code Close() {
    const int fd = fd_;
    fd_ = -1;
    return ::close(fd) == 0 ? std::error_code{} : LastError();
  }

 private:
  int fd_;
};

std::error_code CopyByReadAndWrite(int in, int out) {
  std::vector<char> buffer(1 << 20);
  for (;;) {
    const ssize_t got = ::read(in, buffer.data(), buffer.size());
    if (got == 0) return {};
    if (got < 0) {
      if (errno == EINTR) continue;
      return LastError();
    }
    for (ssize_t written = 0; written < got;) {
      const ssize_t put =
          ::write(out, buffer.data() + written, static_cast<std::size_t>(got - written));
      if (put < 0) {
        if (errno == EINTR) continue;
        return LastError();
      }
      written += put;
    }
  }
}

// The kernel copies without the data passing through this process, as cp does; file systems or
// kernels that cannot fall back to plain reads and writes.
std::error_code CopyContents(int in, int out) {
  for (bool first = true;; first = false) {
    const ssize_t copied = ::copy_file_range(in, nullptr, out, nullptr, std::size_t{1} << 30, 0);
    if (copied == 0) return {};
    if (copied > 0) continue;
    if (errno == EINTR) continue;
    const bool unsupported =
        errno == EXDEV || errno == ENOSYS || errno == EINVAL || errno == EOPNOTSUPP;
    if (first && unsupported) return CopyByReadAndWrite(in, out);
    return LastError();
  }
}

std::filesystem::path TemporaryNameBeside(const std::filesystem::path& target) {
  static std::atomic<unsigned> counter{0};
  return target.parent_path() /
         (".kestrune-" + std::to_string(::getpid()) + "-" + std::to_string(counter++) + ".part");
}

class PosixFiles : public Files {
 public:
  bool FileExists(const std::filesystem::path& path) const override {
    struct stat status;
    return ::stat(path.c_str(), &status) == 0;
  }

  std::uint64_t FileSizeOf(const std::filesystem::path& path) const override {
    struct stat status;
    if (::stat(path.c_str(), &status) != 0 || !S_ISREG(status.st_mode)) return 0;
    return static_cast<std::uint64_t>(status.st_size);
  }

  bool CreateFolderPath(const std::filesystem::path& path) override {
    std::error_code error;
    std::filesystem::create_directories(path, error);
    return std::filesystem::is_directory(path, error);
  }

  std::error_code CopyFileReplacing(const std::filesystem::path& source,
                                    const std::filesystem::path& target) override {
    Descriptor in(::open(source.c_str(), O_RDONLY | O_CLOEXEC));
    if (in.get() < 0) return LastError();
    const std::filesystem::path temporary = TemporaryNameBeside(target);
    Descriptor out(::open(temporary.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC, 0666));
    if (out.get() < 0) return LastError();
    std::error_code error = CopyContents(in.get(), out.get());
    const std::error_code closeError = out.Close();
    if (!error) error = closeError;
    if (!error && ::rename(temporary.c_str(), target.c_str()) != 0) error = LastError();
    if (error) ::unlink(temporary.c_str());
    return error;
  }

  void SetNormalAttributes(const std::filesystem::path& path) override {
    std::error_code ignored;
    std::filesystem::permissions(
        path, std::filesystem::perms::owner_read | std::filesystem::perms::owner_write,
        std::filesystem::perm_options::add, ignored);
  }
};

}  // namespace

std::unique_ptr<Files> MakeSystemFiles() { return std::make_unique<PosixFiles>(); }

}  // namespace kestrune::platform
