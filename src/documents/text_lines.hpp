#pragma once

#include "documents/font_metrics.hpp"

/// Lines of text, and those drawn around them: how much of a text one line holds, and how a line is drawn.
namespace talutil {

/// The width of rules and of the lines around cells, in twips: half a point.
inline constexpr std::int32_t hair_line = 10;

/// The start of a text that fits into a width.
[[nodiscard]] TextView fitting(TextView text, double room, const FontStyle& font, FontMetrics& metrics);

/// Takes the next line of a text that is wrapped at a width: broken between words if possible, otherwise after a
/// character. `text` becomes the rest after the break.
TextView take_line(TextView& text, double room, const FontStyle& font, FontMetrics& metrics);

/// The first tab stop behind a position; they are eight characters apart.
[[nodiscard]] double after_tab(double x, const FontStyle& font, FontMetrics& metrics);

struct LineLook {
  std::uint32_t colour = 0;
  bool is_right_to_left = false;  ///< As the paragraph is.
};

/// Adds lines to a page, each as runs that have one font and one direction.
class LineWriter {
 public:
  LineWriter(FontMetrics& metrics, Page& page) noexcept : metrics_(metrics), page_(page) {}

  /// Adds a line, put into the order in which it is seen. Returns where it ends.
  std::int32_t add(TextView text, std::int32_t left, std::int32_t top, const FontStyle& font, const LineLook& look);

 private:
  struct FontRun {
    TextView text;
    FontStyle style;
    bool is_wide = false;
    bool is_named_font = false;
  };

  [[nodiscard]] FontRun first_font_run(TextView text, const FontStyle& font);
  double add_part(TextView text, double x, std::int32_t top, const FontStyle& font, std::uint32_t colour);
  double add_reversed_part(TextView text, double left, std::int32_t top, const FontStyle& font, std::uint32_t colour);

  FontMetrics& metrics_;
  Page& page_;
};

/// The nearest twip.
[[nodiscard]] std::int32_t rounded(double twips) noexcept;

}  // namespace talutil
