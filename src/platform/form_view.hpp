#pragma once

#include <cstdint>
#include <span>

#include "automation/text.hpp"
#include "platform/table_source.hpp"

/// Windows with controls: what stands on them as data, the presenter's view of one, and what it hears of its user.
namespace talutil {

enum class PartKind : std::uint8_t { label, entry, button, rich_text, table, tabs };

/// How a part goes along when its window is resized, as bits.
namespace part_follows {
constexpr std::uint8_t right = 1;   ///< Keeps its distance from the right edge.
constexpr std::uint8_t bottom = 2;  ///< Keeps its distance from the bottom edge.
constexpr std::uint8_t width = 4;
constexpr std::uint8_t height = 8;
}  // namespace part_follows

/// A place on a window in dialog units: a quarter of the width and an eighth of the height of the system font.
struct PartPlace {
  std::int16_t left = 0;
  std::int16_t top = 0;
  std::int16_t width = 0;
  std::int16_t height = 0;
};

/// A control of a window, in the order of the Tab key. A label names the part that follows it.
struct FormPart {
  std::uint8_t id = 0;  ///< Its own number on the window.
  PartKind kind = PartKind::label;
  std::uint8_t follows = 0;  ///< Bits of part_follows.
  bool is_default = false;   ///< The button that Enter presses.
  bool is_growing = false;   ///< A label that is as high as its text, which it shows to the letter.
  PartPlace place;
  TextView caption{};  ///< A letter behind "&" reaches the part by Alt.
  TextView tip{};      ///< Shown where the mouse rests on it.
};

struct FormDescription {
  std::span<const FormPart> parts;
  std::int16_t width = 0;  ///< Of the inside, in dialog units.
  std::int16_t height = 0;
  bool is_resizable = false;
};

/// Who closes a window, by the numbers that forms know.
enum class CloseMode : std::uint8_t { control_menu = 0, code = 1 };

/// What a window reports to its presenter. None of these throws.
class FormEvents {
 public:
  virtual ~FormEvents() = default;
  virtual void clicked(std::uint8_t part) noexcept = 0;

  /// Another tab was chosen, counted from 0.
  virtual void tab_chosen(std::uint8_t part, std::int32_t tab) noexcept = 0;

  /// The Esc key.
  virtual void escaped() noexcept = 0;

  /// The window is about to go. Its parts can still be read.
  virtual void closing(CloseMode mode) noexcept = 0;
};

/// What is raised where a window cannot be shown.
inline constexpr TextView no_screen_for_windows = u"There is no screen to show the window on";

/// A window, hidden until it is shown. Parts are named by their numbers.
class FormView {
 public:
  virtual ~FormView() = default;

  virtual void set_caption(TextView caption) = 0;

  /// The text of a label, an entry, or a rich text, which is taken for such where it begins with "{\rtf".
  virtual void set_text(std::uint8_t part, TextView text) = 0;

  /// What stands in a part, without its formatting.
  [[nodiscard]] virtual Text text(std::uint8_t part) const = 0;
  virtual void set_visible(std::uint8_t part, bool is_visible) = 0;

  /// The entry shows "*" for every character.
  virtual void mask(std::uint8_t part) = 0;

  /// The colour behind the parts, 0x00BBGGRR, or a system colour with the highest bit set. Texts on it are black or
  /// white, whichever is easier to read.
  virtual void set_colour(std::int32_t colour) = 0;
  virtual void remove_frame() = 0;

  /// Above all other windows, without moving or resizing it.
  virtual void keep_on_top() = 0;

  /// Makes growing labels as high as their texts, takes the room of hidden parts away, and the window follows. A text
  /// that is too high for the screen can be scrolled.
  virtual void fit() = 0;
  virtual void set_tabs(std::uint8_t part, std::span<const TextView> captions) = 0;

  /// Shows a table, which outlives the view or gives way to another.
  /// @param bar_column a column of percentages to be drawn as bars; -1 for none
  virtual void set_table(std::uint8_t part, TableSource& table, std::int32_t bar_column) = 0;

  /// Puts a text on the clipboard.
  virtual void copy(TextView text) = 0;

  /// Shows the window, painted, and returns; one that is shown comes to the front.
  virtual void show() = 0;

  /// Shows the window and returns when it is closed, also where it is shown already.
  virtual void show_modal() = 0;
  [[nodiscard]] virtual bool is_open() const = 0;

  /// Tells the presenter, then takes the window from the screen.
  virtual void close(CloseMode mode) = 0;
};

}  // namespace talutil
