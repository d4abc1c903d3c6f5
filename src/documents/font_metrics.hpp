#pragma once

#include <array>
#include <memory>
#include <unordered_map>

#include "platform/font_files.hpp"
#include "platform/page_model.hpp"

namespace talutil {

/// The index of a family and weight among the six standard fonts.
[[nodiscard]] constexpr std::size_t font_index(FontFamily family, bool is_bold) noexcept {
  return static_cast<std::size_t>(family) * 2 + (is_bold ? 1 : 0);
}

/// The widths of characters, the same for every renderer: those of PDF's standard fonts for code page 1252 (from the
/// PDF library's tables), and those of an embedded font for all other characters.
class FontMetrics {
 public:
  explicit FontMetrics(FontFiles& files);
  FontMetrics(const FontMetrics&) = delete;
  FontMetrics& operator=(const FontMetrics&) = delete;
  ~FontMetrics();

  /// The width of a character, in thousandths of the font's size.
  [[nodiscard]] std::int32_t width(char16_t unit, const FontStyle& font) {
    // Most characters are these, and every one of a document is measured several times.
    if (unit < 0x80) {
      const std::uint16_t known = widths_[font_index(font.family, font.is_bold)][unit];
      if (known != 0) return known;
    }
    return find_width(unit, font);
  }

  /// The width of a text on one line, in twips.
  [[nodiscard]] double width(TextView text, const FontStyle& font);

  /// Whether a character needs an embedded font.
  [[nodiscard]] static bool is_wide(char16_t unit) noexcept;

  /// How such a character is drawn: in the embedded font that fits the style if that has it, otherwise in the other
  /// one, otherwise in the font that was named for it. If none has it, the first shows a box.
  struct Wide {
    FontFamily family = FontFamily::courier;
    bool is_named_font = false;
    bool is_missing = false;
    std::int32_t width = 0;
  };
  [[nodiscard]] const Wide& wide(char16_t unit, const FontStyle& font);

 private:
  struct Library;

  [[nodiscard]] std::int32_t find_width(char16_t unit, const FontStyle& font);

  FontFiles& files_;
  std::unique_ptr<Library> library_;
  std::array<std::array<std::uint16_t, 256>, 6> widths_{};  ///< By code, per family and weight.
  std::unordered_map<char16_t, Wide> wide_[3];              ///< By family.
};

/// The substitute for a named font: Courier for fixed width, Times for serifs, otherwise Helvetica.
[[nodiscard]] FontFamily family_of(TextView font_name);

}  // namespace talutil
