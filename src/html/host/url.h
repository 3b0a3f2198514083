#pragma once

#include <string>
#include <string_view>

namespace kestrune::html::host {

// A URL made absolute against the URL of the document that refers to it. With an empty base
// (a page given from memory) a relative name stays as written; an absolute URL, a rooted path
// or a drive path stays as it is. "." and ".." segments of the result are resolved.
std::u16string CombineUrl(std::u16string_view base, std::u16string_view relative);

// Whether the URL names a file of this machine: a file: URL, or a path without a scheme.
bool IsLocalFile(std::u16string_view url);
// The path of a local-file URL ("file://" removed, "%xx" decoded).
std::u16string LocalPath(std::u16string_view url);

}  // namespace kestrune::html::host
