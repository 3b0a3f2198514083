#include "platform/http.h"

#include "base/utf.h"

namespace kestrune::platform {
namespace {

void AppendEncoded(const std::u16string& text, std::string& out) {
  static const char kHex[] = "0123456789ABCDEF";
  for (char byte : EncodeUtf8(text)) {
    const auto c = static_cast<unsigned char>(byte);
    const bool plain = (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || (c >= '0' && c <= '9') || c == '-' ||
                       c == '_' || c == '.' || c == '~';
    if (plain) {
      out.push_back(static_cast<char>(c));
    } else if (c == ' ') {
      out.push_back('+');
    } else {
      out.push_back('%');
      out.push_back(kHex[c >> 4]);
      out.push_back(kHex[c & 15]);
    }
  }
}

}  // namespace

std::string EncodeForm(const std::vector<std::pair<std::u16string, std::u16string>>& parameters) {
  std::string out;
  for (const auto& [name, value] : parameters) {
    if (!out.empty()) out.push_back('&');
    AppendEncoded(name, out);
    out.push_back('=');
    AppendEncoded(value, out);
  }
  return out;
}

std::u16string UrlWithQuery(const HttpRequest& request) {
  if (request.post || request.parameters.empty()) return request.url;
  const std::string query = EncodeForm(request.parameters);
  return request.url + (request.url.find(u'?') == std::u16string::npos ? u'?' : u'&') + DecodeUtf8(query);
}

}  // namespace kestrune::platform
