// Compound files written by ole32 (StgCreateDocfileOnILockBytes), read by our reader.
#include <windows.h>
// The structured storage declarations build on windows.h.
#include <gtest/gtest.h>
#include <objbase.h>
#include <ole2.h>

#include <cstring>
#include <string>
#include <vector>

#include "compoundfile/reader.h"
#include "support/random_bytes.h"

namespace kestrune::compoundfile {
namespace {

using Bytes = std::vector<unsigned char>;

struct Stream {
  std::wstring name;
  Bytes bytes;
};

// The file ole32 writes for these streams in the root storage, taken from its global memory.
Bytes WrittenByOle32(const std::vector<Stream>& streams) {
  ILockBytes* lockBytes = nullptr;
  EXPECT_EQ(CreateILockBytesOnHGlobal(nullptr, TRUE, &lockBytes), S_OK);
  IStorage* storage = nullptr;
  EXPECT_EQ(StgCreateDocfileOnILockBytes(
                lockBytes, STGM_CREATE | STGM_READWRITE | STGM_SHARE_EXCLUSIVE, 0, &storage),
            S_OK);
  for (const Stream& written : streams) {
    IStream* stream = nullptr;
    EXPECT_EQ(
        storage->CreateStream(written.name.c_str(),
                              STGM_CREATE | STGM_READWRITE | STGM_SHARE_EXCLUSIVE, 0, 0, &stream),
        S_OK);
    ULONG done = 0;
    if (!written.bytes.empty()) {
      EXPECT_EQ(
          stream->Write(written.bytes.data(), static_cast<ULONG>(written.bytes.size()), &done),
          S_OK);
    }
    stream->Release();
  }
  EXPECT_EQ(storage->Commit(STGC_DEFAULT), S_OK);
  storage->Release();

  STATSTG stat{};
  EXPECT_EQ(lockBytes->Stat(&stat, STATFLAG_NONAME), S_OK);
  HGLOBAL block = nullptr;
  EXPECT_EQ(GetHGlobalFromILockBytes(lockBytes, &block), S_OK);
  Bytes file(static_cast<std::size_t>(stat.cbSize.QuadPart));
  std::memcpy(file.data(), GlobalLock(block), file.size());
  GlobalUnlock(block);
  lockBytes->Release();
  return file;
}

TEST(Ole32CompoundFile, OurReaderReadsEveryStreamOle32Wrote) {
  std::vector<Stream> streams = {{L"Empty", {}},
                                 {L"Mini", test::RandomBytes(100, 1)},
                                 {L"LastMini", test::RandomBytes(4095, 2)},
                                 {L"FirstLarge", test::RandomBytes(4096, 3)},
                                 {L"Large", test::RandomBytes(70000, 4)},
                                 {L"7d5e059c0414a4591d6fdbc9056c2f", test::RandomBytes(761, 5)}};
  // Enough entries for a directory of several sectors and a deep sibling tree.
  for (unsigned i = 0; i < 40; ++i) {
    streams.push_back({L"page" + std::to_wstring(i), test::RandomBytes(300 + 97 * i, 6 + i)});
  }
  const Bytes file = WrittenByOle32(streams);

  const auto reader = CompoundFileReader::Open(file);
  ASSERT_TRUE(reader);
  EXPECT_EQ(reader->StreamNames().size(), streams.size());
  for (const Stream& written : streams) {
    const std::u16string name(written.name.begin(), written.name.end());
    auto stream = reader->OpenStream(name);
    ASSERT_TRUE(stream) << std::string(written.name.begin(), written.name.end());
    Bytes read(static_cast<std::size_t>(stream->Size()));
    EXPECT_EQ(stream->Read(read.data(), read.size()), written.bytes.size());
    EXPECT_EQ(read, written.bytes) << std::string(written.name.begin(), written.name.end());
  }
}

}  // namespace
}  // namespace kestrune::compoundfile
