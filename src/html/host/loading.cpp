#include <filesystem>
#include <fstream>
#include <iterator>

#include "base/paths.h"
#include "base/text.h"
#include "base/utf.h"
#include "html/host/url.h"
#include "html/host/window.h"
#include "html/parse/html_parser.h"

namespace kestrune::html::host {

using dom::Element;

namespace {

// @import chains deeper than this are not followed (a sheet may import itself).
constexpr int kMaxImportDepth = 4;

std::u16string DecodeText(const unsigned char* bytes, std::size_t length) {
  if (length >= 2 && bytes[0] == 0xFF && bytes[1] == 0xFE) return DecodeUtf16Le(bytes + 2, length - 2);
  if (length >= 3 && bytes[0] == 0xEF && bytes[1] == 0xBB && bytes[2] == 0xBF) {
    bytes += 3;
    length -= 3;
  }
  return DecodeUtf8(std::string_view(reinterpret_cast<const char*>(bytes), length));
}

std::optional<std::vector<unsigned char>> ReadLocalFile(const std::u16string& url) {
  const std::filesystem::path path = PathFromText(LocalPath(url));
  // Without a document URL a relative name cannot be placed anywhere.
  if (!path.is_absolute()) return std::nullopt;
  std::ifstream file(path, std::ios::binary);
  if (!file) return std::nullopt;
  return std::vector<unsigned char>(std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>());
}

}  // namespace

// The request in progress: DataReady for its URI answers it.
struct Window::PendingLoad {
  const std::u16string& uri;
  std::optional<std::vector<unsigned char>> data;
};

bool Window::LoadHtml(const unsigned char* bytes, std::size_t length, std::u16string url) {
  if (bytes == nullptr && length > 0) return false;
  if (document_->root()) ElementsLeaving(*document_->root());
  popups_.clear();
  resources_.clear();
  document_->SetUrl(std::move(url));
  parse::ParseDocument(DecodeText(bytes, length), *document_);
  styles_->ClearPageSheets();
  LoadStyleSheets();
  RequestImages(*document_->root());
  view_->ImagesChanged();
  Update();
  NotificationHeader complete{this, 0, kNotifyDocumentComplete};
  Notify(complete);
  host_.Invalidate(nullptr);
  return true;
}

bool Window::DataReady(std::u16string_view uri, const unsigned char* bytes, std::size_t length) {
  std::vector<unsigned char> data(bytes, bytes + (bytes ? length : 0));
  if (pendingLoad_ && pendingLoad_->uri == uri) {
    pendingLoad_->data = std::move(data);
    return true;
  }
  // Given outside a request: a resource for the page from now on.
  resources_[std::u16string(uri)] = std::move(data);
  view_->ImagesChanged();
  Update();
  return true;
}

const std::vector<unsigned char>* Window::Resource(const std::u16string& url) const {
  auto found = resources_.find(url);
  return found == resources_.end() ? nullptr : &found->second;
}

std::optional<std::vector<unsigned char>> Window::Fetch(const std::u16string& url, unsigned dataType, Element* initiator) {
  PendingLoad pending{url, std::nullopt};
  PendingLoad* outer = pendingLoad_;
  pendingLoad_ = &pending;
  LoadDataNotification request{{this, 0, kNotifyLoadData}, url.c_str(), nullptr, 0, dataType, document_->root(), initiator};
  Notify(request.header);
  pendingLoad_ = outer;
  if (pending.data) return pending.data;
  if (request.outData != nullptr) {
    const auto* data = static_cast<const unsigned char*>(request.outData);
    return std::vector<unsigned char>(data, data + request.outDataSize);
  }
  if (IsLocalFile(url)) return ReadLocalFile(url);
  return std::nullopt;
}

void Window::LoadStyleSheets() {
  std::vector<Element*> pending{document_->root()};
  std::vector<Element*> inOrder;
  while (!pending.empty()) {
    Element* e = pending.back();
    pending.pop_back();
    inOrder.push_back(e);
    for (std::size_t i = e->elementCount(); i > 0; --i) pending.push_back(e->ElementAt(i - 1));
  }
  for (Element* e : inOrder) {
    if (e->tag() == dom::kAtomStyle) {
      AddSheet(dom::InnerText(*e), document_->url(), 0);
      continue;
    }
    const std::u16string* rel = e->Attr(dom::kAtomRel);
    const std::u16string* href = e->Attr(dom::kAtomHref);
    if (e->tag() != dom::kAtomLink || !rel || !href || AsciiUpper(*rel).find(u"STYLESHEET") == std::u16string::npos) continue;
    const std::u16string url = CombineUrl(document_->url(), *href);
    if (auto data = Fetch(url, events::kDataStyle, e)) AddSheet(DecodeText(data->data(), data->size()), url, 0);
  }
}

void Window::AddSheet(std::u16string_view text, const std::u16string& sheetUrl, int depth) {
  css::StyleSheet sheet = css::ParseStyleSheet(text);
  if (depth < kMaxImportDepth) {
    for (const std::u16string& import : sheet.imports) {
      const std::u16string url = CombineUrl(sheetUrl, import);
      if (auto data = Fetch(url, events::kDataStyle, nullptr)) AddSheet(DecodeText(data->data(), data->size()), url, depth + 1);
    }
  }
  // Images a sheet names are relative to the sheet; styles carry them as combined URLs.
  for (css::Rule& rule : sheet.rules) {
    for (css::Declaration& declaration : rule.declarations) {
      if (declaration.id != css::PropertyId::kBackgroundImage || declaration.value.empty() ||
          !declaration.value[0].Is(css::Token::Type::kUrl)) {
        continue;
      }
      std::u16string& image = declaration.value[0].text;
      image = CombineUrl(sheetUrl, image);
      if (!resources_.contains(image)) {
        if (auto data = Fetch(image, events::kDataImage, nullptr)) resources_[image] = std::move(*data);
      }
    }
  }
  styles_->AddPageSheet(std::move(sheet));
}

void Window::RequestImages(Element& subtree) {
  for (Element* e = &subtree; e; e = dom::NextElementInOrder(e, &subtree)) {
    if (e->tag() != dom::kAtomImg) continue;
    const std::u16string* src = e->Attr(dom::kAtomSrc);
    if (src == nullptr || src->empty()) continue;
    const std::u16string url = CombineUrl(document_->url(), *src);
    if (resources_.contains(url)) continue;
    if (auto data = Fetch(url, events::kDataImage, e)) resources_[url] = std::move(*data);
  }
}

}  // namespace kestrune::html::host
