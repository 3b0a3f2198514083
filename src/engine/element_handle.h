#pragma once

#include <cstdint>
#include <functional>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "html/api/htmlayout.h"

namespace kestrune::engine {

// The program's handle to an element of the engine's document. Each handle holds one engine
// reference, released when it is replaced or destroyed; an empty handle makes every operation
// do nothing (reads answer empty values).
class ElementHandle {
 public:
  ElementHandle() = default;
  explicit ElementHandle(html::HELEMENT element);
  // Takes over a reference the engine already counted for the caller (a created element).
  static ElementHandle Adopt(html::HELEMENT element);
  ElementHandle(const ElementHandle& other);
  ElementHandle(ElementHandle&& other) noexcept;
  ElementHandle& operator=(ElementHandle other) noexcept;
  ~ElementHandle();

  html::HELEMENT get() const { return element_; }
  explicit operator bool() const { return element_ != nullptr; }
  bool operator==(const ElementHandle& other) const { return element_ == other.element_; }
  bool Is(html::HELEMENT element) const { return element_ != nullptr && element_ == element; }
  void Reset();

  // Navigation.
  ElementHandle Parent() const;
  unsigned ChildCount() const;
  ElementHandle Child(unsigned index) const;
  unsigned Index() const;
  std::string Type() const;
  html::HLWINDOW Window() const;
  // The first element below this one whose "id" is `id` (any depth).
  ElementHandle FindById(std::u16string_view id) const;
  ElementHandle SelectFirst(const std::string& selector) const;
  std::vector<ElementHandle> SelectAll(const std::string& selector) const;
  ElementHandle SelectParent(const std::string& selector) const;

  // Attributes, styles, states, content.
  std::optional<std::u16string> Attribute(const char* name) const;
  void SetAttribute(const char* name, const std::u16string& value) const;
  void RemoveAttribute(const char* name) const;
  std::optional<std::u16string> StyleAttribute(const char* name) const;
  void SetStyleAttribute(const char* name, const std::u16string& value) const;
  unsigned State() const;
  bool HasState(unsigned bits) const { return (State() & bits) == bits && bits != 0; }
  void SetState(unsigned bitsToSet, unsigned bitsToClear, bool update) const;
  void Update(bool renderNow) const;
  std::u16string Text() const;
  void SetText(std::u16string_view text) const;
  std::string Html(bool outer) const;
  void SetHtml(std::string_view utf8, unsigned where) const;
  bool IsVisible() const;
  bool IsEnabled() const;

  // Structure.
  void Insert(const ElementHandle& child, unsigned index) const;
  void Delete() const;
  // Sorts the children in [first, last) by `compare` (negative, zero, positive).
  void SortChildren(unsigned first, unsigned last,
                    const std::function<int(const ElementHandle&, const ElementHandle&)>& compare) const;

  // Events.
  bool Send(unsigned code, const ElementHandle& source, std::uintptr_t reason) const;
  void Post(unsigned code, const ElementHandle& source, std::uintptr_t reason) const;
  bool CallMethod(html::events::MethodParams& params) const;
  void SetTimer(unsigned milliseconds) const;
  void Capture() const;
  void ReleaseCapture() const;

  // Geometry (none until the layout engine supplies it).
  std::optional<html::Rect> Location(unsigned areas) const;
  void ScrollToView(bool toTop, bool smooth) const;
  void SetScrollPos(html::Point position, bool smooth) const;
  void ShowPopup(const ElementHandle& anchor, unsigned placement) const;
  void HidePopup() const;

 private:
  html::HELEMENT element_ = nullptr;
};

// A created element (`tag` with optional text), not yet in any document.
ElementHandle CreateElement(const char* tag, std::u16string_view text = {});

}  // namespace kestrune::engine
