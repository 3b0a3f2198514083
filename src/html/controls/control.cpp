#include "html/controls/control.h"

#include "html/controls/kinds.h"

namespace kestrune::html::controls {

ControlValue Control::GetValue(const Element& element) const {
  if (const std::u16string* value = element.Attr(dom::kAtomValue)) return ControlValue::String(*value);
  return {};
}

bool Control::SetValue(Element&, const ControlValue&) { return false; }

std::unique_ptr<Control> MakeBuiltInControl(std::string_view name, ControlHost& host) {
  if (name == "button") return MakeButton(host);
  if (name == "checkbox") return MakeCheckBox(host);
  if (name == "radio") return MakeRadio(host);
  if (name == "hyperlink") return MakeHyperlink(host);
  if (name == "edit") return MakeTextEdit(host);
  if (name == "select") return MakeSelect(host);
  if (name == "menu") return MakeMenu(host);
  if (name == "scrollbar") return MakeScrollBar(host);
  return nullptr;
}

Control* ControlOf(const Element& element) {
  const dom::RareData* rare = element.rareIfAny();
  return rare ? static_cast<Control*>(rare->control.get()) : nullptr;
}

bool AttachControl(Element& element, std::unique_ptr<Control> control, std::string behaviorName,
                   events::EventDispatcher& dispatcher) {
  if (ControlOf(element) != nullptr) return false;
  Control* raw = control.get();
  element.rare().control = std::move(control);
  raw->Attached(element);
  dispatcher.AttachHandler(element, {&ControlProc, raw, raw->Subscription(), std::move(behaviorName)});
  return true;
}

bool ControlProc(void* tag, Element* element, unsigned group, void* params) {
  auto* control = static_cast<Control*>(tag);
  switch (group) {
    case events::kHandleInitialization:
      if (static_cast<events::InitializationParams*>(params)->cmd == events::kBehaviorDetach &&
          ControlOf(*element) == control) {
        element->rare().control.reset();  // the control goes with its handler
      }
      return true;
    case events::kHandleMouse: {
      auto& mouse = *static_cast<events::MouseParams*>(params);
      return (mouse.cmd & events::kSinking) == 0 && control->OnMouse(*element, mouse);
    }
    case events::kHandleKey: {
      auto& key = *static_cast<events::KeyParams*>(params);
      return (key.cmd & events::kSinking) == 0 && control->OnKey(*element, key);
    }
    case events::kHandleFocus: {
      auto& focus = *static_cast<events::FocusParams*>(params);
      return (focus.cmd & events::kSinking) == 0 && control->OnFocus(*element, focus);
    }
    case events::kHandleMethodCall: return control->OnMethod(*element, *static_cast<events::MethodParams*>(params));
    default: return false;
  }
}

}  // namespace kestrune::html::controls
