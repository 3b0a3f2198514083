// ReadPackageStream over compound files written by our writer: on Windows this is ole32
// reading them, on Linux our own reader.
#include <gtest/gtest.h>

#include "compoundfile/writer.h"
#include "platform/embedded_package.h"
#include "support/random_bytes.h"

namespace kestrune::platform {
namespace {

using Bytes = std::vector<unsigned char>;

// The whole stream as ReadPackageStream hands it over, or none when it answers false.
std::optional<Bytes> ReadWhole(const Bytes& package, std::u16string_view name) {
  Bytes bytes;
  const bool read = ReadPackageStream(package, name, [&bytes](PackageStream& stream) {
    bytes.resize(static_cast<std::size_t>(stream.Size()));
    return stream.Read(bytes.data(), bytes.size()) == bytes.size();
  });
  if (!read) return std::nullopt;
  return bytes;
}

TEST(PackageStream, ReadsStreamsOfEverySizeClassByName) {
  const std::vector<compoundfile::NamedStream> streams = {
      {u"empty", {}},
      {u"mini", test::RandomBytes(100, 1)},
      {u"first-large", test::RandomBytes(4096, 2)},
      {u"large", test::RandomBytes(70000, 3)}};
  const Bytes package = compoundfile::WriteCompoundFile(streams);
  for (const auto& stream : streams) {
    EXPECT_EQ(ReadWhole(package, stream.name), stream.bytes) << stream.bytes.size();
  }
  EXPECT_EQ(ReadWhole(package, u"LARGE"), streams[3].bytes);
}

TEST(PackageStream, ReadsAPackageWhoseFatNeedsDifatSectors) {
  const std::vector<compoundfile::NamedStream> streams = {{u"big", test::RandomBytes(8u << 20, 4)},
                                                          {u"small", test::RandomBytes(10, 5)}};
  const Bytes package = compoundfile::WriteCompoundFile(streams);
  EXPECT_EQ(ReadWhole(package, u"big"), streams[0].bytes);
  EXPECT_EQ(ReadWhole(package, u"small"), streams[1].bytes);
}

TEST(PackageStream, AnswersFalseWithoutCallingTheReaderWhenNothingOpens) {
  const std::vector<compoundfile::NamedStream> streams = {{u"present", {1, 2, 3}}};
  const Bytes package = compoundfile::WriteCompoundFile(streams);
  int calls = 0;
  const auto count = [&calls](PackageStream&) { return ++calls > 0; };
  EXPECT_FALSE(ReadPackageStream(package, u"absent", count));
  EXPECT_FALSE(ReadPackageStream({}, u"present", count));
  EXPECT_FALSE(ReadPackageStream(test::RandomBytes(1536, 6), u"present", count));
  EXPECT_EQ(calls, 0);
  EXPECT_TRUE(ReadPackageStream(package, u"present", count));
  EXPECT_FALSE(ReadPackageStream(package, u"present", [](PackageStream&) { return false; }));
}

TEST(PackageStream, AProgramWithoutAPackageHasAnEmptyOne) {
  EXPECT_TRUE(EmbeddedPackage().empty());
}

}  // namespace
}  // namespace kestrune::platform
