#pragma once

namespace kestrune::html::dom {

class Element;

// An element procedure: (tag, element, event group, parameter block) -> handled.
using ElementEventProc = bool (*)(void* tag, Element* element, unsigned group, void* params);

}  // namespace kestrune::html::dom
