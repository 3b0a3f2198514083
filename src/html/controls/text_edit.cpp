#include "html/controls/text_edit.h"

#include <algorithm>

#include "base/text.h"
#include "html/controls/kinds.h"
#include "html/dom/states.h"

namespace kestrune::html::controls {

using namespace events;

unsigned TextEdit::Type(const Element& element) const {
  if (element.tag() == dom::kAtomTextarea) return kCtlTextarea;
  const std::u16string* type = element.Attr(dom::kAtomType);
  if (type && EqualsIgnoringAsciiCase(*type, u"password")) return kCtlPassword;
  return kCtlEdit;
}

ControlValue TextEdit::GetValue(const Element& element) const { return ControlValue::String(Text(element)); }

bool TextEdit::SetValue(Element& element, const ControlValue& value) {
  if (value.kind != ControlValue::Kind::kString) return false;
  SetText(element, value.string);
  return true;
}

void TextEdit::Attached(Element& element) {
  const std::u16string* value = element.Attr(dom::kAtomValue);
  if (element.nodes().empty() && value && !value->empty()) SetText(element, *value);
  caret_ = anchor_ = Text(element).size();
}

std::u16string TextEdit::Text(const Element& element) { return dom::InnerText(element); }

void TextEdit::SetText(Element& element, std::u16string text) {
  element.RemoveAllChildren();
  const std::size_t size = text.size();
  if (!text.empty()) element.AppendChild(dom::Text::Create(std::move(text)));
  caret_ = std::min(caret_, size);
  anchor_ = std::min(anchor_, size);
}

bool TextEdit::Editable(const Element& element) const {
  return !IsDisabled(element) && !element.HasAttr(dom::kAtomReadonly) && !(element.state() & dom::kStateReadOnly);
}

bool TextEdit::Replace(Element& element, std::u16string_view with) {
  std::u16string text = Text(element);
  const std::size_t from = std::min(selectionStart(), text.size());
  const std::size_t to = std::min(selectionEnd(), text.size());
  std::u16string insert(with);
  if (Type(element) != kCtlTextarea) insert.erase(std::remove(insert.begin(), insert.end(), u'\n'), insert.end());
  if (const std::u16string* max = element.Attr(dom::kAtomMaxlength)) {
    if (auto limit = ParseDecimalU32(*max)) {
      const std::size_t room = *limit > text.size() - (to - from) ? *limit - (text.size() - (to - from)) : 0;
      if (insert.size() > room) insert.resize(room);
    }
  }
  if (from == to && insert.empty()) return false;
  text.replace(from, to - from, insert);
  caret_ = anchor_ = from + insert.size();
  SetText(element, std::move(text));
  Post(element, kEditValueChanged, element, kByKeyClick);
  return true;
}

void TextEdit::MoveCaret(std::size_t to, bool extend) {
  caret_ = to;
  if (!extend) anchor_ = to;
}

bool TextEdit::OnMouse(Element& element, MouseParams& mouse) {
  // A press puts the caret at the character under the pointer (Shift extends the selection);
  // moving with the button held selects.
  const bool main = (mouse.buttonState & kMainMouseButton) != 0;
  if ((mouse.cmd == kMouseDown && main) || (mouse.cmd == kMouseMove && main && selecting_)) {
    const std::size_t size = Text(element).size();
    const std::size_t at = std::min(host().geometry().CharacterAt(element, mouse.posDocument).value_or(size), size);
    MoveCaret(at, mouse.cmd == kMouseMove || (mouse.altState & kShiftKeyPressed));
    selecting_ = true;
    element.MarkPaintDirty();
    return true;
  }
  if (mouse.cmd == kMouseUp) selecting_ = false;
  return false;
}

bool TextEdit::OnKey(Element& element, KeyParams& key) {
  if (IsDisabled(element)) return false;
  const bool shift = key.altState & kShiftKeyPressed;
  const bool control = key.altState & kControlKeyPressed;
  const std::size_t size = Text(element).size();
  element.MarkPaintDirty();  // the caret or the selection may move
  if (key.cmd == kKeyChar) {
    if (control || (key.altState & kAltKeyPressed)) return false;
    char16_t c = static_cast<char16_t>(key.keyCode);
    if (c == u'\r') {
      if (Type(element) != kCtlTextarea) return false;
      c = u'\n';
    } else if (c < 0x20 || c == 0x7F) {
      return false;
    }
    if (Editable(element)) Replace(element, std::u16string_view(&c, 1));
    return true;
  }
  if (key.cmd != kKeyDown) return false;
  switch (key.keyCode) {
    case kVkLeft:
      if (!shift && selectionStart() != selectionEnd()) MoveCaret(selectionStart(), false);
      else MoveCaret(caret_ > 0 ? caret_ - 1 : 0, shift);
      return true;
    case kVkRight:
      if (!shift && selectionStart() != selectionEnd()) MoveCaret(selectionEnd(), false);
      else MoveCaret(std::min(caret_ + 1, size), shift);
      return true;
    case kVkHome: MoveCaret(0, shift); return true;
    case kVkEnd: MoveCaret(size, shift); return true;
    case kVkBack:
      if (!Editable(element)) return true;
      if (selectionStart() == selectionEnd() && caret_ > 0) anchor_ = caret_ - 1;
      Replace(element, u"");
      return true;
    case kVkDelete:
      if (!Editable(element)) return true;
      if (selectionStart() == selectionEnd() && caret_ < size) anchor_ = caret_ + 1;
      Replace(element, u"");
      return true;
    default: break;
  }
  if (!control) return false;
  const std::u16string text = Text(element);
  switch (key.keyCode) {
    case 'A':
      anchor_ = 0;
      caret_ = size;
      return true;
    case 'C':
    case 'X':
      if (selectionStart() != selectionEnd() && Type(element) != kCtlPassword) {
        host().SetClipboardText(text.substr(selectionStart(), selectionEnd() - selectionStart()));
        if (key.keyCode == 'X' && Editable(element)) Replace(element, u"");
      }
      return true;
    case 'V':
      if (Editable(element)) Replace(element, host().ClipboardText());
      return true;
    default: return false;
  }
}

bool TextEdit::OnMethod(Element& element, MethodParams& method) {
  switch (method.methodId) {
    case kGetTextValue: {
      auto& params = static_cast<TextValueParams&>(method);
      returned_ = Text(element);
      params.text = returned_.c_str();
      params.length = static_cast<unsigned>(returned_.size());
      return true;
    }
    case kSetTextValue: {
      auto& params = static_cast<TextValueParams&>(method);
      SetText(element, params.text ? std::u16string(params.text, params.length) : std::u16string());
      return true;
    }
    case kTextEditGetSelection: {
      auto& params = static_cast<TextSelectionParams&>(method);
      params.selectionStart = static_cast<unsigned>(selectionStart());
      params.selectionEnd = static_cast<unsigned>(selectionEnd());
      return true;
    }
    case kTextEditSetSelection: {
      auto& params = static_cast<TextSelectionParams&>(method);
      const std::size_t size = Text(element).size();
      anchor_ = std::min<std::size_t>(params.selectionStart, size);
      caret_ = std::min<std::size_t>(params.selectionEnd, size);
      return true;
    }
    case kTextEditReplaceSelection: {
      auto& params = static_cast<TextValueParams&>(method);
      Replace(element, params.text ? std::u16string_view(params.text, params.length) : std::u16string_view());
      return true;
    }
    case kDoClick: return true;
    default: return false;
  }
}

std::unique_ptr<Control> MakeTextEdit(ControlHost& host) { return std::make_unique<TextEdit>(host); }

}  // namespace kestrune::html::controls
