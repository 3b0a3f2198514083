#pragma once

#include <span>

namespace kestrune::platform {

// Makes `package` the program's embedded package. The generated source that links the bytes
// into the program calls it while the program starts; the bytes stay for the whole run.
void RegisterEmbeddedPackage(std::span<const unsigned char> package);

}  // namespace kestrune::platform
