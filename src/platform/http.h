#pragma once

#include <memory>
#include <string>
#include <utility>
#include <vector>

namespace kestrune::platform {

struct HttpRequest {
  std::u16string url;
  bool post = false;
  // Name/value pairs: the query of a GET, the form body of a POST (UTF-8, URL-encoded).
  std::vector<std::pair<std::u16string, std::u16string>> parameters;
};

struct HttpResponse {
  bool completed = false;  // an answer came (whatever its status)
  unsigned status = 0;     // HTTP status
  std::vector<unsigned char> body;
  std::string error;       // why there is no answer
};

// A blocking HTTP client; the engine runs it on a worker thread.
class HttpClient {
 public:
  virtual ~HttpClient() = default;
  virtual HttpResponse Fetch(const HttpRequest& request) = 0;
};

// The system's client: libcurl on Linux, WinHTTP on Windows.
std::unique_ptr<HttpClient> MakeSystemHttpClient();

// "application/x-www-form-urlencoded" text of the parameters.
std::string EncodeForm(const std::vector<std::pair<std::u16string, std::u16string>>& parameters);
// The URL a GET asks for: the parameters appended as its query.
std::u16string UrlWithQuery(const HttpRequest& request);

}  // namespace kestrune::platform
