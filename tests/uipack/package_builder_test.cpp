#include "uipack/package_builder.h"

#include <gtest/gtest.h>

#include <stdexcept>

#include "base/paths.h"
#include "support/temp_folder.h"
#include "ui/package/ui_package.h"

namespace kestrune::uipack {
namespace {

using Bytes = std::vector<unsigned char>;

void Put(const std::filesystem::path& path, std::string_view text) {
  std::filesystem::create_directories(path.parent_path());
  test::WriteBytes(path, Bytes(text.begin(), text.end()));
}

TEST(UiPack, NamesEachFileByItsPathBelowTheFolderAndLeavesTheReadmeOut) {
  test::TempFolder folder;
  Put(folder / "main.htm", "<html>");
  Put(folder / "styles" / "main.css", "body {}");
  Put(folder / "images" / "icons" / "tick.png", "png");
  Put(folder / "README.md", "about the folder");
  Put(folder / "help" / "README.md", "a page that happens to be called so");
  Put(folder / PathFromText(u"caf\u00e9.htm"), "caf\u00e9");
  std::filesystem::create_directories(folder / "empty");

  const auto files = CollectUiFiles(folder.path());
  std::vector<std::u16string> names;
  for (const UiFile& file : files) names.push_back(file.name);
  EXPECT_EQ(names, (std::vector<std::u16string>{u"caf\u00e9.htm", u"help/README.md",
                                                u"images/icons/tick.png", u"main.htm",
                                                u"styles/main.css"}));
  EXPECT_EQ(files[4].bytes, (Bytes{'b', 'o', 'd', 'y', ' ', '{', '}'}));

  const Bytes package = BuildUiPackage(files);
  for (const UiFile& file : files) {
    EXPECT_EQ(ui::UiPackage::Load(package, file.name), file.bytes);
  }
}

TEST(UiPack, RefusesTwoFilesThatWouldShareAStream) {
  const std::vector<UiFile> twins = {{u"Logo.png", {1}}, {u"logo.PNG", {2}}};
  EXPECT_THROW(BuildUiPackage(twins), std::invalid_argument);
  const std::vector<UiFile> distinct = {{u"logo.png", {1}}, {u"logo.png ", {2}}};
  EXPECT_NO_THROW(BuildUiPackage(distinct));
}

}  // namespace
}  // namespace kestrune::uipack
