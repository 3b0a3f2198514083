#include "platform/embedded_package.h"

#include <windows.h>
// The structured storage declarations build on windows.h.
#include <objbase.h>
#include <ole2.h>

#include <algorithm>
#include <cstring>
#include <memory>
#include <string>

namespace kestrune::platform {
namespace {

// Read-write, share-exclusive: the only mode in which ole32 opens a storage on lock bytes.
constexpr DWORD kOpenMode = STGM_READWRITE | STGM_SHARE_EXCLUSIVE;
static_assert(kOpenMode == 0x12);

struct ComRelease {
  void operator()(IUnknown* object) const { object->Release(); }
};
template <typename Interface>
using ComPtr = std::unique_ptr<Interface, ComRelease>;

class OleStream final : public PackageStream {
 public:
  explicit OleStream(IStream* stream) : stream_(stream) {}

  std::uint64_t Size() override {
    STATSTG stat{};
    if (FAILED(stream_->Stat(&stat, STATFLAG_NONAME))) return 0;
    return stat.cbSize.QuadPart;
  }

  std::size_t Read(unsigned char* into, std::size_t count) override {
    std::size_t done = 0;
    while (done < count) {
      const auto chunk = static_cast<ULONG>(std::min<std::size_t>(count - done, 0x40000000));
      ULONG got = 0;
      if (FAILED(stream_->Read(into + done, chunk, &got)) || got == 0) break;
      done += got;
    }
    return done;
  }

 private:
  IStream* stream_;
};

}  // namespace

std::span<const unsigned char> EmbeddedPackage() {
  const HMODULE module = GetModuleHandleW(nullptr);
  const HRSRC found = FindResourceW(module, L"UI", L"ENGINE");
  if (found == nullptr) return {};
  const HGLOBAL loaded = LoadResource(module, found);
  if (loaded == nullptr) return {};
  const void* bytes = LockResource(loaded);
  const DWORD size = SizeofResource(module, found);
  if (bytes == nullptr || size == 0) return {};
  return {static_cast<const unsigned char*>(bytes), size};
}

bool ReadPackageStream(std::span<const unsigned char> package, std::u16string_view streamName,
                       const PackageStreamReader& read) {
  if (package.empty()) return false;
  // ole32 may write to what it opens, so it gets a copy of its own in movable global memory.
  const HGLOBAL block = GlobalAlloc(GMEM_MOVEABLE | GMEM_ZEROINIT, package.size());
  if (block == nullptr) return false;
  void* copy = GlobalLock(block);
  if (copy == nullptr) {
    GlobalFree(block);
    return false;
  }
  std::memcpy(copy, package.data(), package.size());
  GlobalUnlock(block);

  ILockBytes* lockBytes = nullptr;
  if (FAILED(CreateILockBytesOnHGlobal(block, TRUE, &lockBytes))) {
    GlobalFree(block);
    return false;
  }
  const ComPtr<ILockBytes> ownedLockBytes(lockBytes);  // frees the block when released

  IStorage* storage = nullptr;
  if (FAILED(StgOpenStorageOnILockBytes(lockBytes, nullptr, kOpenMode, nullptr, 0, &storage))) {
    return false;
  }
  const ComPtr<IStorage> ownedStorage(storage);

  const std::wstring name(streamName.begin(), streamName.end());
  IStream* stream = nullptr;
  if (FAILED(storage->OpenStream(name.c_str(), nullptr, kOpenMode, 0, &stream))) return false;
  const ComPtr<IStream> ownedStream(stream);
  OleStream reader(stream);
  return read(reader);
}

}  // namespace kestrune::platform
