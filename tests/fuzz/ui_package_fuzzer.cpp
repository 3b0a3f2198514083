// The compound file reader and the package loader on arbitrary bytes: every stream that opens
// reads exactly the size it claims, every stored file that reads deciphers to its plain length,
// and nothing crashes, hangs, reads outside a buffer or allocates beyond what the input holds.
#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>
#include <utility>
#include <vector>

#include "compoundfile/reader.h"
#include "platform/embedded_package.h"
#include "ui/package/packaged_file.h"
#include "ui/package/ui_package.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  using namespace kestrune;
  const std::span<const unsigned char> file(data, size);
  if (const auto reader = compoundfile::CompoundFileReader::Open(file)) {
    for (const auto& name : reader->StreamNames()) {
      if (auto stream = reader->OpenStream(name)) {
        std::vector<unsigned char> sink(4096);
        std::uint64_t total = 0;
        while (const std::size_t got = stream->Read(sink.data(), sink.size())) total += got;
        if (total != stream->Size()) __builtin_trap();
      }
      std::optional<ui::StoredFile> stored;
      platform::ReadPackageStream(file, name, [&stored](platform::PackageStream& stream) {
        stored = ui::ReadStoredFile(stream);
        return stored.has_value();
      });
      if (stored) {
        const std::uint32_t plainLength = stored->plainLength;
        if (ui::DecipherStoredFile(std::move(*stored)).size() != plainLength) __builtin_trap();
      }
    }
  }
  ui::UiPackage::Load(file, u"main.htm");
  return 0;
}
