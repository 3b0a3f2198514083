#pragma once

#include <cstdint>
#include <string>
#include <string_view>

namespace kestrune::cli {

// A JSON string literal of program text: quotes, backslashes and control characters escaped,
// other characters as UTF-8, and an unpaired surrogate unit as its \uXXXX escape so that the
// text comes back exactly.
std::string JsonString(std::u16string_view text);

}  // namespace kestrune::cli
