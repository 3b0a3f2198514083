#include "platform/linux/embedded_package.h"

#include "compoundfile/reader.h"
#include "platform/embedded_package.h"

namespace kestrune::platform {
namespace {

// Constant-initialized, so it is empty before any registration whatever the start-up order.
constinit std::span<const unsigned char> registeredPackage;

class ReaderStream final : public PackageStream {
 public:
  explicit ReaderStream(compoundfile::StreamReader& stream) : stream_(stream) {}
  std::uint64_t Size() override { return stream_.Size(); }
  std::size_t Read(unsigned char* into, std::size_t count) override {
    return stream_.Read(into, count);
  }

 private:
  compoundfile::StreamReader& stream_;
};

}  // namespace

void RegisterEmbeddedPackage(std::span<const unsigned char> package) {
  registeredPackage = package;
}

std::span<const unsigned char> EmbeddedPackage() { return registeredPackage; }

// Our reader needs no writable copy: it reads the linked-in bytes where they are.
bool ReadPackageStream(std::span<const unsigned char> package, std::u16string_view streamName,
                       const PackageStreamReader& read) {
  const auto file = compoundfile::CompoundFileReader::Open(package);
  if (!file) return false;
  auto stream = file->OpenStream(streamName);
  if (!stream) return false;
  ReaderStream reader(*stream);
  return read(reader);
}

}  // namespace kestrune::platform
