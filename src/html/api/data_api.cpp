#include <algorithm>
#include <fstream>
#include <iterator>

#include "base/paths.h"
#include "base/utf.h"
#include "html/api/registry.h"
#include "html/controls/control.h"
#include "html/host/url.h"

namespace kestrune::html {

using api_internal::WindowOf;

DomResult HTMLayoutCombineURL(HELEMENT he, char16_t* buffer, unsigned bufferSize) {
  if (he == nullptr) return DomResult::kInvalidHandle;
  if (buffer == nullptr || bufferSize == 0) return DomResult::kInvalidParameter;
  const dom::Document* document = he->document();
  const std::u16string combined = host::CombineUrl(document ? document->url() : std::u16string(), buffer);
  const std::size_t kept = std::min<std::size_t>(combined.size(), bufferSize - 1);
  std::copy_n(combined.begin(), kept, buffer);
  buffer[kept] = u'\0';
  return DomResult::kOk;
}

DomResult HTMLayoutHttpRequest(HELEMENT he, const char16_t* url, unsigned dataType, unsigned requestType,
                               const RequestParam* params, unsigned paramCount) {
  if (he == nullptr) return DomResult::kInvalidHandle;
  if (url == nullptr || (params == nullptr && paramCount > 0) || requestType > kPostAsync) return DomResult::kInvalidParameter;
  host::Window* window = WindowOf(he);
  if (window == nullptr) return DomResult::kPassiveHandle;
  std::vector<std::pair<std::u16string, std::u16string>> parameters;
  for (unsigned i = 0; i < paramCount; ++i) {
    parameters.emplace_back(params[i].name ? params[i].name : u"", params[i].value ? params[i].value : u"");
  }
  window->HttpRequest(*he, url, dataType, requestType == kPostAsync, std::move(parameters));
  return DomResult::kOk;
}

DomResult HTMLayoutRequestElementData(HELEMENT he, const char16_t* url, unsigned dataType, HELEMENT initiator) {
  if (he == nullptr) return DomResult::kInvalidHandle;
  if (url == nullptr) return DomResult::kInvalidParameter;
  host::Window* window = WindowOf(he);
  if (window == nullptr) return DomResult::kPassiveHandle;
  const dom::Document* document = he->document();
  const std::u16string absolute = host::CombineUrl(document ? document->url() : std::u16string(), url);
  window->HttpRequest(initiator ? *initiator : *he, absolute, dataType, false, {}, he);
  return DomResult::kOk;
}

DomResult HTMLayoutControlGetType(HELEMENT he, unsigned* type) {
  if (he == nullptr) return DomResult::kInvalidHandle;
  if (type == nullptr) return DomResult::kInvalidParameter;
  const controls::Control* control = controls::ControlOf(*he);
  const dom::RareData* rare = he->rareIfAny();
  if (control) *type = control->Type(*he);
  else *type = rare && !rare->handlers.empty() ? controls::kCtlUnknown : controls::kCtlNo;
  return DomResult::kOk;
}

DomResult HTMLayoutControlGetValue(HELEMENT he, ControlValue* value) {
  if (he == nullptr) return DomResult::kInvalidHandle;
  if (value == nullptr) return DomResult::kInvalidParameter;
  const controls::Control* control = controls::ControlOf(*he);
  if (control == nullptr) return DomResult::kOperationFailed;
  *value = control->GetValue(*he);
  return DomResult::kOk;
}

DomResult HTMLayoutControlSetValue(HELEMENT he, const ControlValue& value) {
  if (he == nullptr) return DomResult::kInvalidHandle;
  controls::Control* control = controls::ControlOf(*he);
  if (control == nullptr) return DomResult::kOperationFailed;
  if (!control->SetValue(*he, value)) return DomResult::kInvalidParameter;
  api_internal::Settle(he);
  return DomResult::kOk;
}

}  // namespace kestrune::html
