#include <cstring>
#include <fstream>
#include <iostream>
#include <iterator>
#include <sstream>
#include <string>

#include "base/text.h"
#include "base/utf.h"
#include "mkipod/device_writer.h"
#include "mkipod/generated_devices.h"
#include "mkipod/text_description.h"

namespace {

using namespace kestrune::mkipod;

const char* const kUsage =
    "usage: mkipod DESCRIPTION OUTDIR\n"
    "       mkipod --demo OUTDIR\n"
    "       mkipod --tracks N [--playlists M] [--seed S] [--no-media] [--media-size BYTES] "
    "OUTDIR\n";

std::uint32_t Number(const char* text) {
  const auto value = kestrune::ParseDecimalU32(kestrune::DecodeUtf8(text));
  if (!value) throw std::runtime_error(std::string("not a number: ") + text);
  return *value;
}

std::string ReadAll(const std::string& path) {
  if (path == "-") return std::string(std::istreambuf_iterator<char>(std::cin), {});
  std::ifstream in(path, std::ios::binary);
  if (!in) throw std::runtime_error("cannot read " + path);
  return std::string(std::istreambuf_iterator<char>(in), {});
}

DeviceDescription DescriptionFrom(int argc, char** argv) {
  if (argc == 3 && std::strcmp(argv[1], "--demo") == 0) return DemoDevice();
  if (argc == 3) return ParseDescription(ReadAll(argv[1]));
  GeneratedDeviceOptions options;
  bool generated = false;
  for (int i = 1; i + 1 < argc; ++i) {
    const std::string flag = argv[i];
    if (flag == "--no-media") {
      options.media = false;
    } else if (i + 2 < argc && flag == "--tracks") {
      options.tracks = Number(argv[++i]), generated = true;
    } else if (i + 2 < argc && flag == "--playlists") {
      options.playlists = Number(argv[++i]);
    } else if (i + 2 < argc && flag == "--seed") {
      options.seed = Number(argv[++i]);
    } else if (i + 2 < argc && flag == "--media-size") {
      options.mediaSize = Number(argv[++i]);
    } else {
      throw std::invalid_argument("unexpected argument " + flag);
    }
  }
  if (!generated) throw std::invalid_argument("nothing to write");
  return GeneratedDevice(options);
}

}  // namespace

int main(int argc, char** argv) {
  try {
    if (argc < 3) throw std::invalid_argument("missing arguments");
    const DeviceDescription written = WriteDevice(DescriptionFrom(argc, argv), argv[argc - 1]);
    std::cout << "mkipod: wrote " << written.tracks.size() << " tracks and "
              << written.playlists.size() << " playlists to " << argv[argc - 1] << '\n';
    return 0;
  } catch (const std::invalid_argument& error) {
    std::cerr << "mkipod: " << error.what() << '\n' << kUsage;
    return 64;
  } catch (const std::exception& error) {
    std::cerr << "mkipod: " << error.what() << '\n';
    return 1;
  }
}
