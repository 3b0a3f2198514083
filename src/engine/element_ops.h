#pragma once

#include <initializer_list>
#include <string>
#include <string_view>
#include <variant>

#include "engine/element_handle.h"

namespace kestrune::engine {

// Panels are shown and hidden through the style attribute "visibility"; redrawn at once.
void ShowElement(const ElementHandle& element, bool visible);
// Clears (enabled) or sets (disabled) the disabled state, with redraw.
void EnableElement(const ElementHandle& element, bool enabled);
// Sets or clears the checked state, with redraw.
void SetElementChecked(const ElementHandle& element, bool checked);
// Replaces the element's text; redrawn at once.
void SetElementText(const ElementHandle& element, std::u16string_view text);
// Replaces the element's content with generated HTML (empty HTML clears it), scrolls the
// element to its origin and updates it.
void SetElementHtmlText(const ElementHandle& element, std::u16string_view html);

// A selector written printf-style: %s takes UTF-8 text, %S UTF-16 text, %d a number, %% a
// percent sign. The result is cut at 2047 bytes, as the selectors of the behaviors always were.
using SelectorArgument = std::variant<int, std::string_view, std::u16string_view>;
std::string FormatSelector(std::string_view format, std::initializer_list<SelectorArgument> arguments);

}  // namespace kestrune::engine
