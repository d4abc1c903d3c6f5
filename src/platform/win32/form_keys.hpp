#pragma once

#include "platform/win32/form_parts.hpp"

namespace talutil::win32 {

/// The keyboard on a form: which control has the focus, and the keys for navigation.
class FormKeys {
 public:
  FormKeys(HWND window, FormParts& parts, FormEvents& events) : window_(window), parts_(parts), events_(events) {}

  /// Handles navigation keys. Returns false for other messages, which the system may still handle.
  bool take(const MSG& message);

  /// Moves the focus to a control; selects the text of an entry.
  void focus(HWND control);

  /// When the window loses the focus, and when it gets it back: the focus returns to the same control, or else the
  /// first.
  void remember_focus() noexcept { focused_ = GetFocus(); }
  void return_focus();

 private:
  bool turn_tab(bool is_back);

  HWND window_;
  FormParts& parts_;
  FormEvents& events_;
  HWND focused_ = nullptr;
};

}  // namespace talutil::win32
