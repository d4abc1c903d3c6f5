#pragma once

#include "automation/control.hpp"

/// What kind of a thing a host's object is. Objects tell by the members that they answer for, which are looked up and
/// not used.
namespace talutil {

/// Forms and picture boxes have a scale of their own; other controls do not answer for one.
[[nodiscard]] inline bool has_scale(const Control& object) {
  return object.answers(u"ScaleMode") && object.answers(u"ScaleX");
}

/// Forms of every kind have a window, one that holds other forms too, which has no scale.
[[nodiscard]] inline bool has_window(const Control& object) { return object.answers(u"hwnd"); }

}  // namespace talutil
