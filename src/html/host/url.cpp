#include "html/host/url.h"

#include <vector>

#include "base/text.h"
#include "base/utf.h"

namespace kestrune::html::host {
namespace {

// Length of "scheme:" at the start, or 0. A single letter before ':' is a drive, not a scheme.
std::size_t SchemeLength(std::u16string_view url) {
  for (std::size_t i = 0; i < url.size(); ++i) {
    const char16_t c = url[i];
    const bool letter = (c >= u'a' && c <= u'z') || (c >= u'A' && c <= u'Z');
    if (c == u':') return i >= 2 ? i + 1 : 0;
    if (!(letter || (i > 0 && ((c >= u'0' && c <= u'9') || c == u'+' || c == u'-' || c == u'.')))) return 0;
  }
  return 0;
}

bool IsSeparator(char16_t c) { return c == u'/' || c == u'\\'; }

bool IsDrivePath(std::u16string_view url) {
  return url.size() >= 2 && url[1] == u':' && ((url[0] >= u'a' && url[0] <= u'z') || (url[0] >= u'A' && url[0] <= u'Z'));
}

// Resolves "." and ".." in the path part (after `keep` units, which stay untouched).
std::u16string Normalize(std::u16string_view url, std::size_t keep) {
  std::u16string head(url.substr(0, keep));
  std::u16string_view path = url.substr(keep);
  std::u16string_view tail;
  const std::size_t query = path.find_first_of(u"?#");
  if (query != std::u16string_view::npos) {
    tail = path.substr(query);
    path = path.substr(0, query);
  }
  std::vector<std::u16string_view> segments;
  std::size_t at = 0;
  const bool rooted = !path.empty() && IsSeparator(path[0]);
  char16_t separator = u'/';
  while (at <= path.size()) {
    std::size_t end = at;
    while (end < path.size() && !IsSeparator(path[end])) ++end;
    if (end < path.size()) separator = path[end];
    const std::u16string_view segment = path.substr(at, end - at);
    const bool last = end >= path.size();
    if (segment == u"..") {
      if (!segments.empty() && segments.back() != u"..") segments.pop_back();
      else if (!rooted) segments.push_back(segment);
      if (last) segments.emplace_back();
    } else if (segment == u".") {
      if (last) segments.emplace_back();
    } else if (!(segment.empty() && !last && at != 0)) {
      if (!(segment.empty() && at == 0 && rooted)) segments.push_back(segment);
    }
    at = end + 1;
  }
  std::u16string out = head;
  if (rooted) out.push_back(path[0]);
  for (std::size_t i = 0; i < segments.size(); ++i) {
    if (i > 0) out.push_back(separator);
    out += segments[i];
  }
  out += tail;
  return out;
}

}  // namespace

std::u16string CombineUrl(std::u16string_view base, std::u16string_view relative) {
  if (base.empty() || SchemeLength(relative) > 0 || IsDrivePath(relative)) return std::u16string(relative);
  if (relative.empty()) return std::u16string(base);
  if (relative[0] == u'#' || relative[0] == u'?') {
    const std::size_t cut = base.find(relative[0]);
    return std::u16string(base.substr(0, cut)) + std::u16string(relative);
  }
  const std::size_t scheme = SchemeLength(base);
  std::size_t authorityEnd = scheme;
  if (base.substr(scheme, 2) == u"//") {
    authorityEnd = scheme + 2;
    while (authorityEnd < base.size() && !IsSeparator(base[authorityEnd])) ++authorityEnd;
  } else if (IsDrivePath(base.substr(scheme))) {
    authorityEnd = scheme + 2;
  }
  if (relative.substr(0, 2) == u"//") return std::u16string(base.substr(0, scheme)) + std::u16string(relative);
  if (IsSeparator(relative[0])) return Normalize(std::u16string(base.substr(0, authorityEnd)) + std::u16string(relative), authorityEnd);
  std::u16string_view directory = base.substr(0, base.find_first_of(u"?#"));
  std::size_t slash = directory.size();
  while (slash > authorityEnd && !IsSeparator(directory[slash - 1])) --slash;
  std::u16string joined(directory.substr(0, slash));
  if (slash == authorityEnd && authorityEnd > 0 && (joined.empty() || !IsSeparator(joined.back()))) joined.push_back(u'/');
  joined += relative;
  return Normalize(joined, authorityEnd);
}

bool IsLocalFile(std::u16string_view url) {
  const std::size_t scheme = SchemeLength(url);
  return scheme == 0 || EqualsIgnoringAsciiCase(url.substr(0, scheme), u"file:");
}

std::u16string LocalPath(std::u16string_view url) {
  if (SchemeLength(url) > 0) {
    url.remove_prefix(5);  // "file:"
    if (url.substr(0, 2) == u"//") url.remove_prefix(2);
    // "file:///C:/x" names the drive path "C:/x".
    if (url.size() >= 3 && url[0] == u'/' && IsDrivePath(url.substr(1))) url.remove_prefix(1);
  }
  std::string bytes;
  for (std::size_t i = 0; i < url.size(); ++i) {
    auto hex = [](char16_t c) {
      return (c >= u'0' && c <= u'9') ? c - u'0' : (c >= u'a' && c <= u'f') ? c - u'a' + 10 : (c >= u'A' && c <= u'F') ? c - u'A' + 10 : -1;
    };
    if (url[i] == u'%' && i + 2 < url.size() && hex(url[i + 1]) >= 0 && hex(url[i + 2]) >= 0) {
      bytes.push_back(static_cast<char>(hex(url[i + 1]) * 16 + hex(url[i + 2])));
      i += 2;
    } else {
      bytes += EncodeUtf8(url.substr(i, 1));
    }
  }
  return DecodeUtf8(bytes);
}

}  // namespace kestrune::html::host
