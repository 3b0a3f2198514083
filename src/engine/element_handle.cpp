#include "engine/element_handle.h"

#include <utility>

#include "base/utf.h"

namespace kestrune::engine {

using namespace html;

ElementHandle::ElementHandle(HELEMENT element) : element_(element) {
  if (element_) HTMLayout_UseElement(element_);
}

ElementHandle ElementHandle::Adopt(HELEMENT element) {
  ElementHandle handle;
  handle.element_ = element;
  return handle;
}

ElementHandle::ElementHandle(const ElementHandle& other) : ElementHandle(other.element_) {}

ElementHandle::ElementHandle(ElementHandle&& other) noexcept : element_(std::exchange(other.element_, nullptr)) {}

ElementHandle& ElementHandle::operator=(ElementHandle other) noexcept {
  std::swap(element_, other.element_);
  return *this;
}

ElementHandle::~ElementHandle() { Reset(); }

void ElementHandle::Reset() {
  if (element_) HTMLayout_UnuseElement(std::exchange(element_, nullptr));
}

ElementHandle ElementHandle::Parent() const {
  HELEMENT parent = nullptr;
  if (element_) HTMLayoutGetParentElement(element_, &parent);
  return ElementHandle(parent);
}

unsigned ElementHandle::ChildCount() const {
  unsigned count = 0;
  if (element_) HTMLayoutGetChildrenCount(element_, &count);
  return count;
}

ElementHandle ElementHandle::Child(unsigned index) const {
  HELEMENT child = nullptr;
  if (element_) HTMLayoutGetNthChild(element_, index, &child);
  return ElementHandle(child);
}

unsigned ElementHandle::Index() const {
  unsigned index = 0;
  if (element_) HTMLayoutGetElementIndex(element_, &index);
  return index;
}

std::string ElementHandle::Type() const {
  std::string tag;
  if (element_) HTMLayoutGetElementType(element_, &tag);
  return tag;
}

HLWINDOW ElementHandle::Window() const {
  HLWINDOW window = nullptr;
  if (element_) HTMLayoutGetElementHwnd(element_, &window);
  return window;
}

namespace {

bool KeepFirst(HELEMENT element, void* param) {
  *static_cast<ElementHandle*>(param) = ElementHandle(element);
  return true;
}

bool KeepAll(HELEMENT element, void* param) {
  static_cast<std::vector<ElementHandle>*>(param)->emplace_back(element);
  return false;
}

}  // namespace

ElementHandle ElementHandle::FindById(std::u16string_view id) const {
  ElementHandle found;
  const std::u16string value(id);
  if (element_) HTMLayoutVisitElements(element_, nullptr, "id", value.c_str(), &KeepFirst, &found, 0);
  return found;
}

ElementHandle ElementHandle::SelectFirst(const std::string& selector) const {
  ElementHandle found;
  if (element_) HTMLayoutSelectElements(element_, selector.c_str(), &KeepFirst, &found);
  return found;
}

std::vector<ElementHandle> ElementHandle::SelectAll(const std::string& selector) const {
  std::vector<ElementHandle> found;
  if (element_) HTMLayoutSelectElements(element_, selector.c_str(), &KeepAll, &found);
  return found;
}

ElementHandle ElementHandle::SelectParent(const std::string& selector) const {
  HELEMENT parent = nullptr;
  if (element_) HTMLayoutSelectParent(element_, selector.c_str(), 0, &parent);
  return ElementHandle(parent);
}

std::optional<std::u16string> ElementHandle::Attribute(const char* name) const {
  std::optional<std::u16string> value;
  if (element_) HTMLayoutGetAttributeByName(element_, name, &value);
  return value;
}

void ElementHandle::SetAttribute(const char* name, const std::u16string& value) const {
  if (element_) HTMLayoutSetAttributeByName(element_, name, value.c_str());
}

void ElementHandle::RemoveAttribute(const char* name) const {
  if (element_) HTMLayoutSetAttributeByName(element_, name, nullptr);
}

std::optional<std::u16string> ElementHandle::StyleAttribute(const char* name) const {
  std::optional<std::u16string> value;
  if (element_) HTMLayoutGetStyleAttribute(element_, name, &value);
  return value;
}

void ElementHandle::SetStyleAttribute(const char* name, const std::u16string& value) const {
  if (element_) HTMLayoutSetStyleAttribute(element_, name, value.c_str());
}

unsigned ElementHandle::State() const {
  unsigned state = 0;
  if (element_) HTMLayoutGetElementState(element_, &state);
  return state;
}

void ElementHandle::SetState(unsigned bitsToSet, unsigned bitsToClear, bool update) const {
  if (element_) HTMLayoutSetElementState(element_, bitsToSet, bitsToClear, update);
}

void ElementHandle::Update(bool renderNow) const {
  if (element_) HTMLayoutUpdateElement(element_, renderNow);
}

std::u16string ElementHandle::Text() const {
  std::u16string text;
  if (element_) HTMLayoutGetElementInnerText16(element_, &text);
  return text;
}

void ElementHandle::SetText(std::u16string_view text) const {
  if (element_) HTMLayoutSetElementInnerText16(element_, text.data(), text.size());
}

std::string ElementHandle::Html(bool outer) const {
  std::string html;
  if (element_) HTMLayoutGetElementHtml(element_, &html, outer);
  return html;
}

void ElementHandle::SetHtml(std::string_view utf8, unsigned where) const {
  if (element_) {
    HTMLayoutSetElementHtml(element_, reinterpret_cast<const unsigned char*>(utf8.data()), utf8.size(), where);
  }
}

bool ElementHandle::IsVisible() const {
  bool visible = false;
  if (element_) HTMLayoutIsElementVisible(element_, &visible);
  return visible;
}

bool ElementHandle::IsEnabled() const {
  bool enabled = false;
  if (element_) HTMLayoutIsElementEnabled(element_, &enabled);
  return enabled;
}

void ElementHandle::Insert(const ElementHandle& child, unsigned index) const {
  if (element_ && child.element_) HTMLayoutInsertElement(child.element_, element_, index);
}

void ElementHandle::Delete() const {
  if (element_) HTMLayoutDeleteElement(element_);
}

void ElementHandle::SortChildren(unsigned first, unsigned last,
                                 const std::function<int(const ElementHandle&, const ElementHandle&)>& compare) const {
  if (!element_) return;
  auto trampoline = [](HELEMENT a, HELEMENT b, void* param) {
    const auto& order = *static_cast<const std::function<int(const ElementHandle&, const ElementHandle&)>*>(param);
    return order(ElementHandle(a), ElementHandle(b));
  };
  HTMLayoutSortElements(element_, first, last, trampoline,
                        const_cast<std::function<int(const ElementHandle&, const ElementHandle&)>*>(&compare));
}

bool ElementHandle::Send(unsigned code, const ElementHandle& source, std::uintptr_t reason) const {
  bool handled = false;
  if (element_) HTMLayoutSendEvent(element_, code, source.element_, reason, &handled);
  return handled;
}

void ElementHandle::Post(unsigned code, const ElementHandle& source, std::uintptr_t reason) const {
  if (element_) HTMLayoutPostEvent(element_, code, source.element_, reason);
}

bool ElementHandle::CallMethod(events::MethodParams& params) const {
  return element_ && HTMLayoutCallBehaviorMethod(element_, &params) == DomResult::kOk;
}

void ElementHandle::SetTimer(unsigned milliseconds) const {
  if (element_) HTMLayoutSetTimer(element_, milliseconds);
}

void ElementHandle::Capture() const {
  if (element_) HTMLayoutSetCapture(element_);
}

void ElementHandle::ReleaseCapture() const {
  if (element_) HTMLayoutReleaseCapture(element_);
}

std::optional<Rect> ElementHandle::Location(unsigned areas) const {
  Rect location;
  if (element_ && HTMLayoutGetElementLocation(element_, &location, areas) == DomResult::kOk) return location;
  return std::nullopt;
}

void ElementHandle::ScrollToView(bool toTop, bool smooth) const {
  if (element_) HTMLayoutScrollToView(element_, (toTop ? kScrollToTop : 0u) | (smooth ? kScrollSmooth : 0u));
}

void ElementHandle::SetScrollPos(Point position, bool smooth) const {
  if (element_) HTMLayoutSetScrollPos(element_, position, smooth);
}

void ElementHandle::ShowPopup(const ElementHandle& anchor, unsigned placement) const {
  if (element_) HTMLayoutShowPopup(element_, anchor.element_, placement);
}

void ElementHandle::HidePopup() const {
  if (element_) HTMLayoutHidePopup(element_);
}

ElementHandle CreateElement(const char* tag, std::u16string_view text) {
  HELEMENT created = nullptr;
  const std::u16string value(text);
  HTMLayoutCreateElement(tag, value.c_str(), &created);
  return ElementHandle::Adopt(created);
}

}  // namespace kestrune::engine
