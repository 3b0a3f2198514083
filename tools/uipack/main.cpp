#include <exception>
#include <fstream>
#include <iostream>

#include "uipack/package_builder.h"

int main(int argc, char** argv) {
  if (argc != 3) {
    std::cerr << "usage: uipack SOURCE_FOLDER PACKAGE_FILE\n";
    return 2;
  }
  try {
    const auto files = kestrune::uipack::CollectUiFiles(argv[1]);
    const auto package = kestrune::uipack::BuildUiPackage(files);
    std::ofstream out(argv[2], std::ios::binary | std::ios::trunc);
    out.write(reinterpret_cast<const char*>(package.data()),
              static_cast<std::streamsize>(package.size()));
    out.close();
    if (!out) throw std::runtime_error(std::string("cannot write ") + argv[2]);
    std::cout << "uipack: " << files.size() << " files, " << package.size() << " bytes\n";
    return 0;
  } catch (const std::exception& error) {
    std::cerr << "uipack: " << error.what() << "\n";
    return 1;
  }
}
