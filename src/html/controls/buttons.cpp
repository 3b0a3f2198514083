#include <vector>

#include "base/text.h"
#include "html/controls/kinds.h"
#include "html/dom/states.h"

namespace kestrune::html::controls {
namespace {

using namespace events;

// Press inside, release inside: a click. Space and Enter click too, and so does method 0.
class PressControl : public Control {
 public:
  using Control::Control;

  bool OnMouse(Element& element, MouseParams& mouse) override {
    if (!(mouse.buttonState & kMainMouseButton) && mouse.cmd != kMouseUp) return false;
    if (mouse.cmd == kMouseDown || mouse.cmd == kMouseDClick) {
      if (IsDisabled(element)) return false;
      pressed_ = true;
      Post(element, kButtonPress, element, kByMouseClick);
      return true;
    }
    if (mouse.cmd == kMouseUp && pressed_) {
      pressed_ = false;
      if (Inside(element, mouse.target) && !IsDisabled(element)) Click(element, kByMouseClick);
      return true;
    }
    return false;
  }

  bool OnKey(Element& element, KeyParams& key) override {
    if (IsDisabled(element) || key.altState != 0) return false;
    if ((key.cmd == kKeyDown && key.keyCode == kVkReturn) || (key.cmd == kKeyUp && key.keyCode == kVkSpace)) {
      Click(element, kByKeyClick);
      return true;
    }
    return false;
  }

  bool OnMethod(Element& element, MethodParams& method) override {
    if (method.methodId != kDoClick || IsDisabled(element)) return false;
    Click(element, kSynthesized);
    return true;
  }

  unsigned Subscription() const override { return kHandleMouse | kHandleKey | kHandleFocus | kHandleMethodCall; }

 protected:
  virtual void Click(Element& element, unsigned reason) = 0;

 private:
  bool pressed_ = false;
};

class Button final : public PressControl {
 public:
  using PressControl::PressControl;
  unsigned Type(const Element&) const override { return kCtlButton; }

 protected:
  void Click(Element& element, unsigned reason) override { Post(element, kButtonClick, element, reason); }
};

// Check boxes and radio buttons: checked from the `checked` attribute, their value is the state.
class Toggle : public PressControl {
 public:
  using PressControl::PressControl;
  void Attached(Element& element) override {
    if (element.HasAttr(dom::kAtomChecked)) element.SetState(element.state() | dom::kStateChecked);
  }
  ControlValue GetValue(const Element& element) const override {
    return ControlValue::Bool((element.state() & dom::kStateChecked) != 0);
  }
};

class CheckBox final : public Toggle {
 public:
  using Toggle::Toggle;
  unsigned Type(const Element&) const override { return kCtlCheckbox; }
  bool SetValue(Element& element, const ControlValue& value) override {
    if (value.kind != ControlValue::Kind::kBool) return false;
    element.SetState(value.boolean ? element.state() | dom::kStateChecked : element.state() & ~dom::kStateChecked);
    return true;
  }

 protected:
  void Click(Element& element, unsigned reason) override {
    element.SetState(element.state() ^ dom::kStateChecked);
    Post(element, kButtonStateChanged, element, reason);
  }
};

// Radio buttons of one name form a group within the nearest form (or the whole document).
class Radio final : public Toggle {
 public:
  using Toggle::Toggle;
  unsigned Type(const Element&) const override { return kCtlRadio; }
  bool SetValue(Element& element, const ControlValue& value) override {
    if (value.kind != ControlValue::Kind::kBool) return false;
    if (value.boolean) Check(element);
    else element.SetState(element.state() & ~dom::kStateChecked);
    return true;
  }

 protected:
  void Click(Element& element, unsigned reason) override {
    if (element.state() & dom::kStateChecked) return;
    Check(element);
    Post(element, kButtonStateChanged, element, reason);
  }

 private:
  static void Check(Element& element) {
    const std::u16string* name = element.Attr(dom::kAtomName);
    Element* scope = &element;
    while (scope->parent() && scope->tag() != dom::kAtomForm) scope = scope->parent();
    if (name != nullptr) {
      std::vector<Element*> pending{scope};
      while (!pending.empty()) {
        Element* e = pending.back();
        pending.pop_back();
        for (std::size_t i = 0; i < e->elementCount(); ++i) pending.push_back(e->ElementAt(i));
        const std::u16string* other = e->Attr(dom::kAtomName);
        if (e != &element && other && *other == *name && ControlOf(*e) && ControlOf(*e)->Type(*e) == kCtlRadio) {
          e->SetState(e->state() & ~dom::kStateChecked);
        }
      }
    }
    element.SetState(element.state() | dom::kStateChecked);
  }
};

class Hyperlink final : public PressControl {
 public:
  using PressControl::PressControl;
  unsigned Type(const Element&) const override { return kCtlHyperlink; }
  void Attached(Element& element) override { element.SetState(element.state() | dom::kStateLink); }

 protected:
  void Click(Element& element, unsigned reason) override {
    element.SetState(element.state() | dom::kStateVisited);
    Post(element, kHyperlinkClick, element, reason == kByMouseClick ? 0 : 1);
  }
};

}  // namespace

std::unique_ptr<Control> MakeButton(ControlHost& host) { return std::make_unique<Button>(host); }
std::unique_ptr<Control> MakeCheckBox(ControlHost& host) { return std::make_unique<CheckBox>(host); }
std::unique_ptr<Control> MakeRadio(ControlHost& host) { return std::make_unique<Radio>(host); }
std::unique_ptr<Control> MakeHyperlink(ControlHost& host) { return std::make_unique<Hyperlink>(host); }

}  // namespace kestrune::html::controls
