#pragma once

#include "platform/win32/form_parts.hpp"

namespace talutil::win32 {

/// Where a form and its parts lie.
class FormLayout {
 public:
  /// Gives the window its first size.
  FormLayout(HWND window, FormParts& parts, const FormDescription& description, DWORD style);

  /// Makes growing labels as high as their texts, takes the room of hidden parts away, and the window follows.
  void fit();

  /// The window has another size: parts follow its edges.
  void follow() const;

  /// Into the middle of the screen's work area.
  void centre() const;

  /// The window has another frame.
  void set_style(DWORD style);

  /// The smallest size that its user can give the window; zero where it cannot be resized.
  [[nodiscard]] SIZE smallest() const noexcept { return smallest_; }

 private:
  void size_to_inside() const;
  [[nodiscard]] SIZE outer_size() const;

  HWND window_;
  FormParts& parts_;
  const FormDescription& description_;
  DWORD style_;
  SIZE inner_;
  SIZE smallest_{};
};

}  // namespace talutil::win32
