#pragma once

#include "platform/win32/form_parts.hpp"

namespace talutil::win32 {

/// The keyboard on a form: what has the focus, and the keys that move about the window.
class FormKeys {
 public:
  FormKeys(HWND window, FormParts& parts, FormEvents& events) : window_(window), parts_(parts), events_(events) {}

  /// Handles such a key. False for other messages, which the system may still know what to do with.
  bool take(const MSG& message);

  /// Gives a control the focus; the text of an entry is selected.
  void focus(HWND control);

  /// The window loses the focus, or has it: to the control that had it before, else to the first.
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
