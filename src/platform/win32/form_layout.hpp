#pragma once

#include "platform/win32/form_parts.hpp"

namespace talutil::win32 {

/// The positions and sizes of a form and its parts.
class FormLayout {
 public:
  /// Sets the window's initial size.
  FormLayout(HWND window, FormParts& parts, const FormDescription& description, DWORD style);

  /// Makes growing labels as high as their texts, closes the gaps of hidden parts, and resizes the window to match.
  void fit();

  /// After the window has come to a monitor with other dots per inch: it moves to the place that the system suggests,
  /// and everything on it is scaled.
  void set_dots(int dots, const RECT& place);

  /// After the window was resized: parts follow its edges, and the columns of tables fill them.
  void follow() const;

  /// Moves the window to the middle of the screen's work area.
  void centre() const;

  /// Changes the window's frame.
  void set_style(DWORD style);

  /// The minimum size when the user resizes the window; zero if it is not resizable.
  [[nodiscard]] SIZE smallest() const noexcept { return smallest_; }

 private:
  void size_to_inside() const;
  void stack();
  [[nodiscard]] SIZE outer_size() const;

  HWND window_;
  FormParts& parts_;
  const FormDescription& description_;
  DWORD style_;
  int dots_;
  SIZE inner_;
  SIZE smallest_{};
};

}  // namespace talutil::win32
