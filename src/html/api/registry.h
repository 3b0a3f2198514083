#pragma once

#include "html/api/htmlayout.h"
#include "html/host/window.h"

namespace kestrune::html::api_internal {

// The window whose document holds the element, or none (a detached or created element).
host::Window* WindowOf(const dom::Element* element);
void Register(host::Window& window);
void Unregister(host::Window& window);

// Brings the element's window up to date after a change made through the interface.
void Settle(const dom::Element* element);

}  // namespace kestrune::html::api_internal
