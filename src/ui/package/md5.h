#pragma once

#include <span>
#include <string>

namespace kestrune::ui {

// MD5 (RFC 1321) of the bytes, as 32 lower-case hexadecimal digits in digest byte order.
std::u16string Md5Digest(std::span<const unsigned char> bytes);

}  // namespace kestrune::ui
