#pragma once

#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "html/controls/control_value.h"
#include "html/events/dispatcher.h"
#include "html/events/input_router.h"

namespace kestrune::html::controls {

using dom::Element;

// Control types, the engine's numbering.
enum ControlType : unsigned {
  kCtlNo = 0, kCtlUnknown = 1, kCtlEdit = 2, kCtlNumeric = 3, kCtlButton = 4, kCtlCheckbox = 5,
  kCtlRadio = 6, kCtlSelectMultiple = 7, kCtlSelectSingle = 8, kCtlTextarea = 9, kCtlHtmlarea = 10,
  kCtlPassword = 11, kCtlProgress = 12, kCtlSlider = 13, kCtlDecimal = 14, kCtlCurrency = 15,
  kCtlScrollbar = 16, kCtlHyperlink = 17, kCtlMenubar = 18, kCtlMenu = 19,
};

// What a control needs from the window that shows it.
class ControlHost {
 public:
  virtual ~ControlHost() = default;
  virtual events::EventDispatcher& dispatcher() = 0;
  virtual events::InputRouter& input() = 0;
  virtual events::GeometrySource& geometry() = 0;
  virtual std::u16string ClipboardText() = 0;
  virtual void SetClipboardText(const std::u16string& text) = 0;
  // Hides the popup that holds the element, if it is in one; answers its anchor.
  virtual Element* HidePopupHolding(Element& element) = 0;
};

// A built-in control, attached to its element like any behavior (through the `behavior` names
// of the engine's style sheet) and owned by the element.
class Control : public dom::Extension {
 public:
  explicit Control(ControlHost& host) : host_(host) {}

  virtual unsigned Type(const Element& element) const = 0;
  virtual ControlValue GetValue(const Element& element) const;
  virtual bool SetValue(Element& element, const ControlValue& value);

  virtual void Attached(Element&) {}
  virtual bool OnMouse(Element&, events::MouseParams&) { return false; }
  virtual bool OnKey(Element&, events::KeyParams&) { return false; }
  virtual bool OnFocus(Element&, events::FocusParams&) { return false; }
  virtual bool OnMethod(Element&, events::MethodParams&) { return false; }
  virtual unsigned Subscription() const { return events::kHandleMouse | events::kHandleKey | events::kHandleMethodCall; }

 protected:
  ControlHost& host() { return host_; }
  void Post(Element& target, unsigned code, Element& source, std::uintptr_t reason) {
    host_.dispatcher().PostEvent(&target, code, &source, reason);
  }
  static bool IsDisabled(const Element& element) { return events::InputRouter::IsDisabled(element); }

 private:
  ControlHost& host_;
};

// The built-in control of that behavior name, or none.
std::unique_ptr<Control> MakeBuiltInControl(std::string_view name, ControlHost& host);

// Attaches the control to the element (it becomes the element's control and one of its
// handlers); answers false when the element already has a built-in control.
bool AttachControl(Element& element, std::unique_ptr<Control> control, std::string behaviorName,
                   events::EventDispatcher& dispatcher);

Control* ControlOf(const Element& element);

// The element procedure of every built-in control.
bool ControlProc(void* tag, Element* element, unsigned group, void* params);

}  // namespace kestrune::html::controls
