#pragma once

#include <string>
#include <vector>

namespace kestrune::html::controls {

// A control's value: undefined, boolean, integer, real, string or array.
struct ControlValue {
  enum class Kind { kUndefined, kBool, kInt, kReal, kString, kArray };
  Kind kind = Kind::kUndefined;
  bool boolean = false;
  int integer = 0;
  double real = 0;
  std::u16string string;
  std::vector<ControlValue> items;

  static ControlValue Bool(bool b) { ControlValue v; v.kind = Kind::kBool; v.boolean = b; return v; }
  static ControlValue Int(int i) { ControlValue v; v.kind = Kind::kInt; v.integer = i; return v; }
  static ControlValue String(std::u16string s) { ControlValue v; v.kind = Kind::kString; v.string = std::move(s); return v; }
  bool operator==(const ControlValue&) const = default;
};

}  // namespace kestrune::html::controls
