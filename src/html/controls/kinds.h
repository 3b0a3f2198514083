#pragma once

#include <memory>

#include "html/controls/control.h"

namespace kestrune::html::controls {

std::unique_ptr<Control> MakeButton(ControlHost& host);
std::unique_ptr<Control> MakeCheckBox(ControlHost& host);
std::unique_ptr<Control> MakeRadio(ControlHost& host);
std::unique_ptr<Control> MakeHyperlink(ControlHost& host);
std::unique_ptr<Control> MakeTextEdit(ControlHost& host);
std::unique_ptr<Control> MakeSelect(ControlHost& host);
std::unique_ptr<Control> MakeMenu(ControlHost& host);
std::unique_ptr<Control> MakeScrollBar(ControlHost& host);

// Whether a mouse event's target lies in the element (the element or a descendant).
inline bool Inside(const Element& element, const Element* target) {
  return target == &element || element.IsAncestorOf(target);
}

}  // namespace kestrune::html::controls
