// The package the build embeds, loaded the way the program loads it: on Windows from the
// resource "UI" of type "ENGINE" of this test's own module through ole32, on Linux from the
// linked-in bytes through our reader.
#include "platform/embedded_package.h"

#include <gtest/gtest.h>

#include <set>

#include "base/utf.h"
#include "compoundfile/reader.h"
#include "ui/package/stream_name.h"
#include "ui/package/ui_package.h"
#include "uipack/package_builder.h"

namespace kestrune::ui {
namespace {

// The interface files as the source tree holds them.
const std::vector<uipack::UiFile>& SourceFiles() {
  static const auto files = uipack::CollectUiFiles(KESTRUNE_UI_SOURCE_DIR);
  return files;
}

TEST(EmbeddedPackage, HoldsAStreamForEveryInterfaceFileAndNothingElse) {
  const auto reader = compoundfile::CompoundFileReader::Open(platform::EmbeddedPackage());
  ASSERT_TRUE(reader);
  std::set<std::u16string> expected;
  for (const auto& file : SourceFiles()) expected.insert(StreamNameFor(file.name));
  const auto names = reader->StreamNames();
  EXPECT_EQ(std::set<std::u16string>(names.begin(), names.end()), expected);
  EXPECT_GE(expected.size(), 3u);
}

TEST(EmbeddedPackage, LoadsEveryFileByTheNameThePagesUse) {
  for (const auto& file : SourceFiles()) {
    EXPECT_EQ(UiPackage::Load(file.name), file.bytes) << EncodeUtf8(file.name);
  }
  // The start page and what it refers to, by the names the page writes.
  for (const char16_t* name : {u"main.htm", u"styles/main.css", u"images/logo.png"}) {
    const auto loaded = UiPackage::Load(name);
    ASSERT_TRUE(loaded) << EncodeUtf8(name);
    EXPECT_FALSE(loaded->empty());
  }
}

TEST(EmbeddedPackage, AnswersFailureForNamesItDoesNotHold) {
  EXPECT_TRUE(UiPackage::Load(u"MAIN.HTM"));
  EXPECT_FALSE(UiPackage::Load(u"main.htm "));
  EXPECT_FALSE(UiPackage::Load(u"README.md"));
  EXPECT_FALSE(UiPackage::Load(u"logo.png"));
}

}  // namespace
}  // namespace kestrune::ui
