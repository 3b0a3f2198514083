#pragma once

#include <string>
#include <string_view>

namespace kestrune::ui {

// The name of the package stream that holds the file requested by `name`: the first 30 of the
// 32 MD5 digits of the name's UTF-16LE bytes after upper-casing a–z. Requests differing only
// in the case of ASCII letters therefore find the same stream; any other difference does not.
std::u16string StreamNameFor(std::u16string_view name);

}  // namespace kestrune::ui
