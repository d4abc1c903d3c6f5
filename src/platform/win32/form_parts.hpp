#pragma once

#include <optional>
#include <vector>

#include "platform/form_view.hpp"
#include "platform/win32/handle.hpp"
#include "platform/win32/list_view.hpp"
#include "platform/win32/system_font.hpp"

namespace talutil::win32 {

/// A part of a form and the system's control that implements it.
struct PlacedPart {
  const FormPart* part;
  HWND window;
  RECT place;  ///< At the window's initial size.
  bool is_visible = true;
  std::optional<ListView> table;  ///< If the part is a table.

  [[nodiscard]] bool is(PartKind kind) const noexcept { return part->kind == kind; }
};

/// The parts of a window in order, implemented by the system's controls in the system's font.
class FormParts {
 public:
  /// Creates the controls. Raises 51 if the system fails to.
  FormParts(HWND window, std::span<const FormPart> parts);

  [[nodiscard]] auto begin() noexcept { return parts_.begin(); }
  [[nodiscard]] auto end() noexcept { return parts_.end(); }

  /// Draws the page of a tab behind a label, instead of the buttons' background, which has another colour. Returns the
  /// brush that is left for the label itself, or nothing if there are no tabs.
  [[nodiscard]] std::optional<LRESULT> draw_page_behind(HWND control, HDC device);

  /// A part by its number. Raises 51 if there is no such part.
  [[nodiscard]] const PlacedPart& of(std::uint8_t id) const;
  [[nodiscard]] PlacedPart& of(std::uint8_t id);

  /// The part that a control implements; null for other windows.
  [[nodiscard]] PlacedPart* find(HWND control) noexcept;

  /// The part that a command from the system refers to; null if none.
  [[nodiscard]] const PlacedPart* find_command(WORD command) noexcept;

  /// The button that Enter presses; null if it is not visible or there is none.
  [[nodiscard]] const PlacedPart* default_button() noexcept;
  [[nodiscard]] static WORD command_of(const PlacedPart& part) noexcept;

  [[nodiscard]] const SystemFont& font() const noexcept { return font_; }

  void set_text(std::uint8_t id, TextView text);
  [[nodiscard]] Text text(std::uint8_t id) const;

  /// Gives the parts the size and font of another number of dots per inch; the layout moves them then.
  void set_dots(int dots);

  /// Replaces a label that is higher than the screen by a text that can be scrolled.
  void make_scrollable(PlacedPart& part);

 private:
  [[nodiscard]] HWND make(const FormPart& part, const wchar_t* class_name, DWORD style, DWORD extended_style,
                          const RECT& place) const;
  void add(const FormPart& part);
  [[nodiscard]] RECT place_of(const FormPart& part) const;
  void add_tip(HWND control, TextView tip);

  HWND window_;
  SystemFont font_;
  std::vector<PlacedPart> parts_;
  std::vector<Owned<kind::Window>> tips_;
};

}  // namespace talutil::win32
