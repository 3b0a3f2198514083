#include "uipack/package_builder.h"

#include <algorithm>
#include <fstream>
#include <iterator>
#include <map>
#include <stdexcept>

#include "base/paths.h"
#include "base/utf.h"
#include "compoundfile/writer.h"
#include "ui/package/packaged_file.h"
#include "ui/package/stream_name.h"

namespace kestrune::uipack {
namespace {

std::vector<unsigned char> ReadWholeFile(const std::filesystem::path& path) {
  std::ifstream in(path, std::ios::binary);
  if (!in) throw std::runtime_error("cannot read " + EncodeUtf8(TextFromPath(path)));
  return std::vector<unsigned char>(std::istreambuf_iterator<char>(in), {});
}

}  // namespace

std::vector<UiFile> CollectUiFiles(const std::filesystem::path& folder) {
  std::vector<UiFile> files;
  for (const auto& item : std::filesystem::recursive_directory_iterator(folder)) {
    if (!item.is_regular_file()) continue;
    const std::filesystem::path relative = item.path().lexically_relative(folder);
    if (relative == "README.md") continue;
    std::u16string name = TextFromPath(relative);
    std::replace(name.begin(), name.end(), kPathSeparator, u'/');
    files.push_back({std::move(name), ReadWholeFile(item.path())});
  }
  std::sort(files.begin(), files.end(),
            [](const UiFile& a, const UiFile& b) { return a.name < b.name; });
  return files;
}

std::vector<unsigned char> BuildUiPackage(std::span<const UiFile> files) {
  std::map<std::u16string, std::u16string> requestByStream;
  std::vector<compoundfile::NamedStream> streams;
  for (const UiFile& file : files) {
    std::u16string streamName = ui::StreamNameFor(file.name);
    const auto [taken, added] = requestByStream.emplace(streamName, file.name);
    if (!added) {
      throw std::invalid_argument(EncodeUtf8(u"\"" + taken->second + u"\" and \"" + file.name +
                                             u"\" are requested by the same name"));
    }
    streams.push_back({std::move(streamName), ui::EncipherFile(file.bytes)});
  }
  return compoundfile::WriteCompoundFile(streams);
}

}  // namespace kestrune::uipack
