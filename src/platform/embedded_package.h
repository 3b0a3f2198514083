#pragma once

#include <cstddef>
#include <cstdint>
#include <functional>
#include <span>
#include <string_view>

namespace kestrune::platform {

// One stream of a package, open for reading front to back.
class PackageStream {
 public:
  // The size its directory entry gives.
  virtual std::uint64_t Size() = 0;
  // Reads up to `count` bytes and answers how many it read: fewer at the stream's end.
  virtual std::size_t Read(unsigned char* into, std::size_t count) = 0;

 protected:
  ~PackageStream() = default;  // never deleted through this interface
};

using PackageStreamReader = std::function<bool(PackageStream&)>;

// The compound file the program carries: on Windows the resource "UI" of type "ENGINE" in the
// program's own module, on Linux the bytes linked into the program. Empty when it carries none.
std::span<const unsigned char> EmbeddedPackage();

// Opens the compound file held in `package` anew, opens the stream `streamName` of its root
// storage and hands it to `read`; everything opened is released before the answer. False when
// the file does not open, the stream is missing, or `read` answers false. On Windows this is
// ole32 on a fresh global-memory copy of the bytes; on Linux our own reader on the bytes as
// they are.
bool ReadPackageStream(std::span<const unsigned char> package, std::u16string_view streamName,
                       const PackageStreamReader& read);

}  // namespace kestrune::platform
