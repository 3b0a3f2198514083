#include <windows.h>
#include <winhttp.h>

#include <string>

#include "base/utf.h"
#include "platform/http.h"

namespace kestrune::platform {
namespace {

std::wstring Wide(std::u16string_view text) { return std::wstring(text.begin(), text.end()); }

struct HandleCloser {
  void operator()(HINTERNET handle) const {
    if (handle) WinHttpCloseHandle(handle);
  }
};
using Handle = std::unique_ptr<void, HandleCloser>;

class WinHttpClient final : public HttpClient {
 public:
  HttpResponse Fetch(const HttpRequest& request) override {
    HttpResponse response;
    const std::wstring url = Wide(UrlWithQuery(request));
    URL_COMPONENTS parts{};
    parts.dwStructSize = sizeof(parts);
    wchar_t host[256] = {};
    wchar_t path[4096] = {};
    parts.lpszHostName = host;
    parts.dwHostNameLength = 256;
    parts.lpszUrlPath = path;
    parts.dwUrlPathLength = 2048;
    wchar_t extra[2048] = {};
    parts.lpszExtraInfo = extra;
    parts.dwExtraInfoLength = 2048;
    if (!WinHttpCrackUrl(url.c_str(), static_cast<DWORD>(url.size()), 0, &parts)) {
      response.error = "malformed URL";
      return response;
    }
    Handle session(WinHttpOpen(L"Kestrune", WINHTTP_ACCESS_TYPE_DEFAULT_PROXY, WINHTTP_NO_PROXY_NAME,
                               WINHTTP_NO_PROXY_BYPASS, 0));
    if (!session) return Failed(response, "WinHttpOpen");
    WinHttpSetTimeouts(session.get(), 15000, 15000, 60000, 60000);
    Handle connection(WinHttpConnect(session.get(), host, parts.nPort, 0));
    if (!connection) return Failed(response, "WinHttpConnect");
    const std::wstring object = std::wstring(path) + extra;
    const DWORD flags = parts.nScheme == INTERNET_SCHEME_HTTPS ? WINHTTP_FLAG_SECURE : 0;
    Handle call(WinHttpOpenRequest(connection.get(), request.post ? L"POST" : L"GET", object.c_str(), nullptr,
                                   WINHTTP_NO_REFERER, WINHTTP_DEFAULT_ACCEPT_TYPES, flags));
    if (!call) return Failed(response, "WinHttpOpenRequest");
    std::string form = request.post ? EncodeForm(request.parameters) : std::string();
    const wchar_t* headers = request.post ? L"Content-Type: application/x-www-form-urlencoded\r\n" : WINHTTP_NO_ADDITIONAL_HEADERS;
    if (!WinHttpSendRequest(call.get(), headers, request.post ? static_cast<DWORD>(-1L) : 0,
                            form.empty() ? WINHTTP_NO_REQUEST_DATA : form.data(), static_cast<DWORD>(form.size()),
                            static_cast<DWORD>(form.size()), 0) ||
        !WinHttpReceiveResponse(call.get(), nullptr)) {
      return Failed(response, "request");
    }
    DWORD status = 0;
    DWORD size = sizeof(status);
    WinHttpQueryHeaders(call.get(), WINHTTP_QUERY_STATUS_CODE | WINHTTP_QUERY_FLAG_NUMBER, WINHTTP_HEADER_NAME_BY_INDEX,
                        &status, &size, WINHTTP_NO_HEADER_INDEX);
    for (;;) {
      DWORD available = 0;
      if (!WinHttpQueryDataAvailable(call.get(), &available)) return Failed(response, "read");
      if (available == 0) break;
      const std::size_t at = response.body.size();
      response.body.resize(at + available);
      DWORD read = 0;
      if (!WinHttpReadData(call.get(), response.body.data() + at, available, &read)) return Failed(response, "read");
      response.body.resize(at + read);
    }
    response.completed = true;
    response.status = status;
    return response;
  }

 private:
  static HttpResponse& Failed(HttpResponse& response, const char* step) {
    response.error = std::string(step) + " failed with error " + std::to_string(GetLastError());
    response.body.clear();
    return response;
  }
};

}  // namespace

std::unique_ptr<HttpClient> MakeSystemHttpClient() { return std::make_unique<WinHttpClient>(); }

}  // namespace kestrune::platform
