#include "documents/text_lines.hpp"

#include <algorithm>
#include <cmath>

#include "documents/text_direction.hpp"

namespace talutil {

std::int32_t rounded(double twips) noexcept { return static_cast<std::int32_t>(std::lround(twips)); }

TextView fitting(TextView text, double room, const FontStyle& font, FontMetrics& metrics) {
  double width = 0;
  for (std::size_t i = 0; i < text.size(); ++i) {
    width += to_twips(metrics.width(text[i], font), font);
    if (width > room) return text.substr(0, i);
  }
  return text;
}

TextView take_line(TextView& text, double room, const FontStyle& font, FontMetrics& metrics) {
  const std::size_t line_end = std::min(text.find(u'\n'), text.size());
  const TextView line = text.substr(0, line_end);
  std::size_t shown = fitting(line, room, font, metrics).size();
  if (shown == line.size()) {
    text.remove_prefix(std::min(line_end + 1, text.size()));
    return line;
  }
  const std::size_t blank = line.find_last_of(u' ', shown);
  if (blank != Text::npos && blank > 0) shown = blank;
  // Always take at least one character, even if it does not fit, so that the loop ends.
  shown = std::max<std::size_t>(shown, 1);
  text.remove_prefix(std::min(text.find_first_not_of(u' ', shown), text.size()));
  return line.substr(0, shown);
}

double after_tab(double x, const FontStyle& font, FontMetrics& metrics) {
  constexpr double characters = 8;
  const double distance = characters * to_twips(metrics.width(u' ', font), font);
  return (std::floor(x / distance) + 1) * distance;
}

std::int32_t LineWriter::add(TextView text, std::int32_t left, std::int32_t top, const FontStyle& font,
                             const LineLook& look) {
  if (!look.is_right_to_left && is_seen_as_read(text)) return rounded(add_part(text, left, top, font, look.colour));
  double x = left;
  for (const DirectedText& part : in_visual_order(text, look.is_right_to_left)) {
    x = part.is_right_to_left ? add_reversed_part(part.text, x, top, font, look.colour)
                              : add_part(part.text, x, top, font, look.colour);
  }
  return rounded(x);
}

/// The characters at the start of a text that are drawn in one font.
LineWriter::FontRun LineWriter::first_font_run(TextView text, const FontStyle& font) {
  const bool is_wide = FontMetrics::is_wide(text.front());
  const auto first = is_wide ? metrics_.wide(text.front(), font) : FontMetrics::Wide{.family = font.family};
  const auto continues = [&](char16_t unit) {
    if (FontMetrics::is_wide(unit) != is_wide) return false;
    if (!is_wide) return true;
    const auto& next = metrics_.wide(unit, font);
    return next.family == first.family && next.is_named_font == first.is_named_font;
  };
  std::size_t end = 1;
  while (end < text.size() && continues(text[end])) ++end;
  FontStyle style = font;
  style.family = first.family;
  return {text.substr(0, end), style, is_wide, first.is_named_font};
}

double LineWriter::add_part(TextView text, double x, std::int32_t top, const FontStyle& font, std::uint32_t colour) {
  while (!text.empty()) {
    const FontRun run = first_font_run(text, font);
    const double width = metrics_.width(run.text, font);
    page_.items.emplace_back(TextRun{rounded(x), top, rounded(width), run.style, run.is_wide, colour, Text(run.text),
                                     run.is_named_font, false});
    x += width;
    text.remove_prefix(run.text.size());
  }
  return x;
}

/// Adds a part that runs from right to left, beginning at its right end.
double LineWriter::add_reversed_part(TextView text, double left, std::int32_t top, const FontStyle& font,
                                     std::uint32_t colour) {
  const double right = left + metrics_.width(text, font);
  double x = right;
  while (!text.empty()) {
    const FontRun run = first_font_run(text, font);
    const double width = metrics_.width(run.text, font);
    x -= width;
    page_.items.emplace_back(TextRun{rounded(x), top, rounded(width), run.style, run.is_wide, colour, Text(run.text),
                                     run.is_named_font, true});
    text.remove_prefix(run.text.size());
  }
  return right;
}

}  // namespace talutil
