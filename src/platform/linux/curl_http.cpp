#include <curl/curl.h>

#include "base/utf.h"
#include "platform/http.h"

namespace kestrune::platform {
namespace {

std::size_t Collect(char* data, std::size_t size, std::size_t count, void* body) {
  auto& out = *static_cast<std::vector<unsigned char>*>(body);
  out.insert(out.end(), data, data + size * count);
  return size * count;
}

class CurlHttpClient final : public HttpClient {
 public:
  CurlHttpClient() { curl_global_init(CURL_GLOBAL_DEFAULT); }

  HttpResponse Fetch(const HttpRequest& request) override {
    HttpResponse response;
    CURL* curl = curl_easy_init();
    if (curl == nullptr) {
      response.error = "curl_easy_init failed";
      return response;
    }
    const std::string url = EncodeUtf8(UrlWithQuery(request));
    const std::string form = request.post ? EncodeForm(request.parameters) : std::string();
    curl_easy_setopt(curl, CURLOPT_URL, url.c_str());
    curl_easy_setopt(curl, CURLOPT_FOLLOWLOCATION, 1L);
    curl_easy_setopt(curl, CURLOPT_CONNECTTIMEOUT, 15L);
    curl_easy_setopt(curl, CURLOPT_TIMEOUT, 60L);
    curl_easy_setopt(curl, CURLOPT_NOSIGNAL, 1L);
    curl_easy_setopt(curl, CURLOPT_WRITEFUNCTION, &Collect);
    curl_easy_setopt(curl, CURLOPT_WRITEDATA, &response.body);
    if (request.post) {
      curl_easy_setopt(curl, CURLOPT_POST, 1L);
      curl_easy_setopt(curl, CURLOPT_POSTFIELDS, form.c_str());
      curl_easy_setopt(curl, CURLOPT_POSTFIELDSIZE, static_cast<long>(form.size()));
    }
    const CURLcode result = curl_easy_perform(curl);
    if (result == CURLE_OK) {
      long status = 0;
      curl_easy_getinfo(curl, CURLINFO_RESPONSE_CODE, &status);
      response.completed = true;
      response.status = static_cast<unsigned>(status);
    } else {
      response.error = curl_easy_strerror(result);
      response.body.clear();
    }
    curl_easy_cleanup(curl);
    return response;
  }
};

}  // namespace

std::unique_ptr<HttpClient> MakeSystemHttpClient() { return std::make_unique<CurlHttpClient>(); }

}  // namespace kestrune::platform
