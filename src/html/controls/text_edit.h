#pragma once

#include <string>

#include "html/controls/control.h"

namespace kestrune::html::controls {

// A text input: the element's text is its value. The caret and the selection are positions in
// that text (UTF-16 units); the painter draws them from here, the layout says where a click is.
class TextEdit final : public Control {
 public:
  using Control::Control;

  unsigned Type(const Element& element) const override;
  ControlValue GetValue(const Element& element) const override;
  bool SetValue(Element& element, const ControlValue& value) override;
  void Attached(Element& element) override;
  bool OnMouse(Element& element, events::MouseParams& mouse) override;
  bool OnKey(Element& element, events::KeyParams& key) override;
  bool OnMethod(Element& element, events::MethodParams& method) override;
  unsigned Subscription() const override {
    return events::kHandleMouse | events::kHandleKey | events::kHandleFocus | events::kHandleMethodCall;
  }

  std::size_t caret() const { return caret_; }
  std::size_t selectionStart() const { return std::min(anchor_, caret_); }
  std::size_t selectionEnd() const { return std::max(anchor_, caret_); }

 private:
  static std::u16string Text(const Element& element);
  void SetText(Element& element, std::u16string text);
  // Replaces the selection; answers whether the text changed.
  bool Replace(Element& element, std::u16string_view with);
  void MoveCaret(std::size_t to, bool extend);
  bool Editable(const Element& element) const;

  std::size_t caret_ = 0;
  std::size_t anchor_ = 0;
  bool selecting_ = false;
  std::u16string returned_;  // the text a "get text" method call points to
};

}  // namespace kestrune::html::controls
