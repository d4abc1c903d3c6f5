#pragma once

#include <cstdint>
#include <span>

#include "automation/text.hpp"
#include "platform/table_source.hpp"

/// Windows with controls: their parts as data, the presenter's view of a window, and the events that a window reports.
namespace talutil {

enum class PartKind : std::uint8_t { label, entry, button, rich_text, table, tabs };

/// How a part moves and grows when its window is resized, as bits.
namespace part_follows {
constexpr std::uint8_t right = 1;   ///< Keeps its distance from the right edge.
constexpr std::uint8_t bottom = 2;  ///< Keeps its distance from the bottom edge.
constexpr std::uint8_t width = 4;
constexpr std::uint8_t height = 8;
}  // namespace part_follows

/// A position and size on a window in dialog units: a quarter of the width and an eighth of the height of the system
/// font.
struct PartPlace {
  std::int16_t left = 0;
  std::int16_t top = 0;
  std::int16_t width = 0;
  std::int16_t height = 0;
};

/// A control of a window. Parts are listed in Tab order. A label names the part that follows it.
struct FormPart {
  std::uint8_t id = 0;  ///< Unique within the window.
  PartKind kind = PartKind::label;
  std::uint8_t follows = 0;  ///< Bits of part_follows.
  bool is_default = false;   ///< The button that Enter presses.
  bool is_growing = false;   ///< A label that is as high as its text and shows "&" literally.
  PartPlace place;
  TextView caption{};  ///< Alt and the letter after "&" select the part.
  TextView tip{};      ///< The tooltip.
};

struct FormDescription {
  std::span<const FormPart> parts;
  std::int16_t width = 0;  ///< Of the client area, in dialog units.
  std::int16_t height = 0;
  bool is_resizable = false;
};

/// Who closes a window, with the numbers that forms use.
enum class CloseMode : std::uint8_t { control_menu = 0, code = 1 };

/// What a window reports to its presenter. None of these throws.
class FormEvents {
 public:
  virtual ~FormEvents() = default;
  virtual void clicked(std::uint8_t part) noexcept = 0;

  /// The user chose another tab, counted from 0.
  virtual void tab_chosen(std::uint8_t part, std::int32_t tab) noexcept = 0;

  /// The Esc key.
  virtual void escaped() noexcept = 0;

  /// The window is about to close. Its parts can still be read.
  virtual void closing(CloseMode mode) noexcept = 0;
};

/// The description of the error raised where a window cannot be shown.
inline constexpr TextView no_screen_for_windows = u"There is no screen to show the window on";

/// A window, hidden until it is shown. Parts are identified by their numbers.
class FormView {
 public:
  virtual ~FormView() = default;

  virtual void set_caption(TextView caption) = 0;

  /// Sets the text of a label, an entry, or a rich text, which counts as RTF if it begins with "{\rtf".
  virtual void set_text(std::uint8_t part, TextView text) = 0;

  /// The text of a part, without its formatting.
  [[nodiscard]] virtual Text text(std::uint8_t part) const = 0;
  virtual void set_visible(std::uint8_t part, bool is_visible) = 0;

  /// Makes the entry show "*" for every character.
  virtual void mask(std::uint8_t part) = 0;

  /// Sets the background colour: 0x00BBGGRR, or a system colour with the highest bit set. Text on it becomes black or
  /// white, whichever is more legible.
  virtual void set_colour(std::int32_t colour) = 0;
  virtual void remove_frame() = 0;

  /// Keeps the window above all others, without moving or resizing it.
  virtual void keep_on_top() = 0;

  /// Takes the ways to close the window from its user; programs can still close it.
  virtual void keep_open() = 0;

  /// Makes growing labels as high as their texts, closes the gaps of hidden parts, and resizes the window to match. A
  /// text that is too high for the screen can be scrolled.
  virtual void fit() = 0;
  virtual void set_tabs(std::uint8_t part, std::span<const TextView> captions) = 0;

  /// Shows a table, which must outlive the view unless another table replaces it.
  /// @param bar_column a column of percentages to be drawn as bars; -1 for none
  virtual void set_table(std::uint8_t part, TableSource& table, std::int32_t bar_column) = 0;

  /// The window as an owner of the system's dialogs; 0 where there are no windows.
  [[nodiscard]] virtual std::intptr_t dialog_owner() const = 0;

  /// Copies a text to the clipboard.
  virtual void copy(TextView text) = 0;

  /// Shows and paints the window and returns. A window that is already visible comes to the front.
  virtual void show() = 0;

  /// Shows the window, even if it is visible already, and returns when it is closed.
  virtual void show_modal() = 0;
  [[nodiscard]] virtual bool is_open() const = 0;

  /// Notifies the presenter, then removes the window from the screen.
  virtual void close(CloseMode mode) = 0;
};

}  // namespace talutil
