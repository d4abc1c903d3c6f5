#pragma once

#include "automation/control.hpp"

/// Recognises the kind of a host's object by the members it has, which are looked up but not used.
namespace talutil {

/// Forms and picture boxes have a scale; other controls do not.
[[nodiscard]] inline bool has_scale(const Control& object) {
  return object.answers(u"ScaleMode") && object.answers(u"ScaleX");
}

/// All forms have a window, including those that contain other forms, which have no scale.
[[nodiscard]] inline bool has_window(const Control& object) { return object.answers(u"hwnd"); }

}  // namespace talutil
