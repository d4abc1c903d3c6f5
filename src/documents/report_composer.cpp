#include "documents/report_composer.hpp"

#include <algorithm>
#include <cmath>

#include "documents/arabic_joining.hpp"
#include "documents/text_direction.hpp"
#include "documents/visible_text.hpp"

namespace talutil {

namespace {

constexpr std::int32_t hair_line = 10;  // Half a point.
constexpr std::uint32_t black = 0;

std::int32_t rounded(double value) { return static_cast<std::int32_t>(std::lround(value)); }

Box rule(std::int32_t left, std::int32_t top, std::int32_t width) {
  return {.place = {left, top, width, 0}, .fill = {}, .line_width = hair_line, .line_colour = black};
}

/// Whether a text can be shown as it is.
bool is_plain(TextView text) {
  return std::ranges::none_of(text, [](char16_t unit) { return is_control(unit) || is_joining(unit); });
}

/// Shows control characters in flowing text, but keeps tabs, which have stops of their own there.
Text with_visible_controls(TextView text) {
  Text result;
  for (const char16_t unit : text) {
    if (is_control(unit) && unit != u'\t')
      append_visible(result, unit);
    else
      result += unit;
  }
  return result;
}

}  // namespace

const PaperSize& paper_size(std::int32_t code) noexcept {
  // The platform's printing codes. ISO sizes are in millimetres, others in inches, converted to the nearest twip.
  static constexpr PaperSize sizes[] = {
      {1, 12240, 15840},   // Letter, 8.5 x 11
      {5, 12240, 20160},   // Legal, 8.5 x 14
      {7, 10440, 15120},   // Executive, 7.25 x 10.5
      {8, 16838, 23811},   // A3, 297 x 420
      {9, 11906, 16838},   // A4, 210 x 297
      {11, 8391, 11906},   // A5, 148 x 210
      {12, 14570, 20636},  // B4 (JIS), 257 x 364
      {13, 10318, 14570},  // B5 (JIS), 182 x 257
      {3, 15840, 24480},   // Tabloid, 11 x 17
  };
  const auto* const found = std::ranges::find(sizes, code, &PaperSize::code);
  return found == std::end(sizes) ? sizes[4] : *found;
}

ReportComposer::ReportComposer(FontMetrics& metrics, PageSetup setup) : metrics_(metrics), setup_(std::move(setup)) {
  const Text header = visible_line(setup_.header);
  document_.title = trim_blanks(header);
  begin_page();
  if (!document_.title.empty()) document_.bookmarks.push_back({document_.title});
}

void ReportComposer::begin_page() {
  document_.pages.push_back({setup_.width, setup_.height, {}});
  notes_.push_back(note_);
  y_ = setup_.margin_top;
}

std::int32_t ReportComposer::add_runs(TextView text, std::int32_t left, std::int32_t top, const FontStyle& font,
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
ReportComposer::FontRun ReportComposer::first_font_run(TextView text, const FontStyle& font) {
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

double ReportComposer::add_part(TextView text, double x, std::int32_t top, const FontStyle& font,
                                std::uint32_t colour) {
  while (!text.empty()) {
    const FontRun run = first_font_run(text, font);
    const double width = metrics_.width(run.text, font);
    page().items.emplace_back(TextRun{rounded(x), top, rounded(width), run.style, run.is_wide, colour, Text(run.text),
                                      run.is_named_font, false});
    x += width;
    text.remove_prefix(run.text.size());
  }
  return x;
}

/// Adds a part that runs from right to left, beginning at its right end.
double ReportComposer::add_reversed_part(TextView text, double left, std::int32_t top, const FontStyle& font,
                                         std::uint32_t colour) {
  const double right = left + metrics_.width(text, font);
  double x = right;
  while (!text.empty()) {
    const FontRun run = first_font_run(text, font);
    const double width = metrics_.width(run.text, font);
    x -= width;
    page().items.emplace_back(TextRun{rounded(x), top, rounded(width), run.style, run.is_wide, colour, Text(run.text),
                                      run.is_named_font, true});
    text.remove_prefix(run.text.size());
  }
  return right;
}

double ReportComposer::after_tab(double x, const FontStyle& font) {
  constexpr double characters = 8;
  const double distance = characters * to_twips(metrics_.width(u' ', font), font);
  return (std::floor(x / distance) + 1) * distance;
}

/// From right to left, a line begins at the right margin, and so do its tab stops.
void ReportComposer::add_line(TextView line, const FontStyle& font, bool is_right_to_left) {
  const std::int32_t height = line_height(font);
  if (y_ + height > setup_.bottom() && y_ > setup_.margin_top) begin_page();
  if (is_right_to_left) line = line.substr(0, line.find_last_not_of(u' ') + 1);
  double x = 0;
  for (std::size_t start = 0; start < line.size();) {
    const std::size_t end = std::min(line.find(u'\t', start), line.size());
    const TextView words = line.substr(start, end - start);
    const double width = metrics_.width(words, font);
    const double left = is_right_to_left ? setup_.room() - x - width : x;
    add_runs(words, setup_.margin_left + rounded(left), y_, font, {.is_right_to_left = is_right_to_left});
    x += width;
    start = end;
    for (; start < line.size() && line[start] == u'\t'; ++start) x = after_tab(x, font);
  }
  y_ += height;
}

void ReportComposer::add_paragraph(TextView text, const FontStyle& font) {
  const double room = setup_.room();
  const bool is_reversed = is_right_to_left(text);
  std::size_t line_start = 0;
  std::size_t word_start = 0;  // After the last position at which the line may be broken.
  double x = 0;
  double word_width = 0;
  for (std::size_t i = 0; i < text.size(); ++i) {
    const bool is_blank = text[i] == u' ' || text[i] == u'\t';
    const double width = text[i] == u'\t' ? after_tab(x, font) - x : to_twips(metrics_.width(text[i], font), font);
    // Blanks at the end of a line may extend beyond its edge.
    if (!is_blank && x + width > room && i > line_start) {
      const bool breaks_word = word_start == line_start || !setup_.wraps_words;
      const std::size_t end = breaks_word ? i : word_start;
      add_line(text.substr(line_start, end - line_start), font, is_reversed);
      line_start = end;
      x = breaks_word ? 0 : word_width;
      if (breaks_word) word_width = 0;
      word_start = line_start;
    }
    x += width;
    word_width += width;
    if (is_blank) {
      word_start = i + 1;
      word_width = 0;
    }
  }
  add_line(text.substr(line_start), font, is_reversed);
}

void ReportComposer::add_text(TextView text, const FontStyle& font) {
  for (std::size_t at = 0; at < text.size();) {
    const std::size_t end = std::min(text.find_first_of(u"\r\n\f", at), text.size());
    const TextView paragraph = text.substr(at, end - at);
    const bool ends_page = end < text.size() && text[end] == u'\f';
    // A form feed on a line of its own adds no empty line.
    if (!paragraph.empty() || !ends_page) {
      if (is_plain(paragraph))
        add_paragraph(paragraph, font);
      else
        add_paragraph(joined(with_visible_controls(paragraph)), font);
    }
    if (ends_page) begin_page();
    at = text.substr(end).starts_with(u"\r\n") ? end + 2 : end + 1;
  }
}

TextView ReportComposer::fitting(TextView text, double room, const FontStyle& font) {
  double width = 0;
  for (std::size_t i = 0; i < text.size(); ++i) {
    width += to_twips(metrics_.width(text[i], font), font);
    if (width > room) return text.substr(0, i);
  }
  return text;
}

/// Takes the next line of a text that is wrapped at a width: broken between words if possible, otherwise after a
/// character. `text` becomes the rest after the break.
TextView ReportComposer::take_line(TextView& text, double room, const FontStyle& font) {
  const std::size_t line_end = std::min(text.find(u'\n'), text.size());
  const TextView line = text.substr(0, line_end);
  std::size_t shown = fitting(line, room, font).size();
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

void ReportComposer::add_text_box(TextView text, const TwipsRectangle& place, const FontStyle& font) {
  const std::int32_t height = line_height(font);
  const Text shown = joined(visible_text(text));
  const LineLook look{.is_right_to_left = is_right_to_left(shown)};
  TextView rest = shown;
  for (std::int32_t top = place.top; !rest.empty() && top + height <= place.top + std::max(place.height, height);
       top += height) {
    add_runs(take_line(rest, place.width, font), place.left, top, font, look);
  }
}

void ReportComposer::add_picture(Picture picture) {
  const std::int32_t room_down = setup_.bottom() - setup_.margin_top;
  const double scale = std::min({1.0, static_cast<double>(setup_.room()) / std::max(picture.place.width, 1),
                                 static_cast<double>(room_down) / std::max(picture.place.height, 1)});
  picture.place.width = rounded(picture.place.width * scale);
  picture.place.height = rounded(picture.place.height * scale);
  if (y_ + picture.place.height > setup_.bottom() && y_ > setup_.margin_top) begin_page();
  picture.place.left = setup_.margin_left;
  picture.place.top = y_;
  y_ += picture.place.height;
  page().items.emplace_back(std::move(picture));
}

/// Wraps a text; all lines are indented like the first.
std::vector<Text> ReportComposer::lines_of(TextView text, const FontStyle& font) {
  constexpr std::size_t most_blanks = 8;
  const Text indent(std::min({text.find_first_not_of(u' '), text.size(), most_blanks}), u' ');
  const double room = setup_.room() - metrics_.width(indent, font);
  std::vector<Text> lines;
  for (text.remove_prefix(indent.size()); !text.empty();) lines.push_back(indent + Text(take_line(text, room, font)));
  return lines;
}

ReportComposer::HeaderLines ReportComposer::header_lines() {
  constexpr float smallest = 6;
  constexpr std::int32_t edge = 360;  // Printers leave a quarter of an inch unprinted at the most.
  const Text text = joined(visible_text(setup_.header));
  const std::int32_t room = setup_.margin_top - line_height(setup_.header_font) - edge;
  HeaderLines header{setup_.header_font, lines_of(text, setup_.header_font), is_right_to_left(text)};
  for (std::size_t kept = text.size();;) {
    const auto most = static_cast<std::size_t>(std::max(1, room / line_height(header.font)));
    if (header.lines.size() <= most) return header;
    if (header.font.points > smallest) {
      header.font.points -= 1;
      header.lines = lines_of(text, header.font);
    } else {
      // The name of the report begins the header, and dates end it.
      kept = kept * most / header.lines.size();
      header.lines = lines_of(text.substr(0, kept / 2) + u" … " + text.substr(text.size() - kept / 2), header.font);
    }
  }
}

void ReportComposer::add_header(const HeaderLines& header) {
  const std::int32_t height = line_height(header.font);
  const std::int32_t bottom = setup_.margin_top - line_height(setup_.header_font);
  std::int32_t top = bottom - height * static_cast<std::int32_t>(header.lines.size());
  for (const Text& line : header.lines) {
    const std::int32_t spare = setup_.room() - rounded(metrics_.width(line, header.font));
    const std::int32_t left = setup_.margin_left + (header.is_right_to_left ? std::max(0, spare) : 0);
    add_runs(line, left, top, header.font, {.is_right_to_left = header.is_right_to_left});
    top += height;
  }
  if (setup_.has_rule && !document_.title.empty()) {
    page().items.emplace_back(rule(setup_.margin_left, bottom + line_height(setup_.header_font) / 4, setup_.room()));
  }
}

void ReportComposer::add_footer(std::size_t page_index) {
  const FontStyle font = setup_.footer_font.value_or(setup_.header_font);
  const std::int32_t top = setup_.bottom() + line_height(font);
  const Text footer = joined(setup_.footer);
  const LineLook look{.is_right_to_left = is_right_to_left(footer)};
  const std::int32_t date_end = add_runs(footer, setup_.margin_left, top, font, look);
  const Text number = u"Page " + number_to_text(static_cast<std::int32_t>(page_index + 1)) + u" of " +
                      number_to_text(static_cast<std::int32_t>(document_.pages.size()));
  const std::int32_t number_left = setup_.width - setup_.margin_right - rounded(metrics_.width(number, font));
  add_runs(number, number_left, top, font, {});
  const Text& note = notes_[page_index];
  const std::int32_t width = rounded(metrics_.width(note, font));
  const std::int32_t left = setup_.margin_left + (setup_.room() - width) / 2;
  const std::int32_t gap = line_height(font);
  const bool fits = left > date_end + gap && left + width < number_left - gap;
  add_runs(note, left, fits ? top : top + line_height(font), font, {});
}

Document ReportComposer::finish() {
  const HeaderLines header = header_lines();
  for (std::size_t i = 0; i < document_.pages.size(); ++i) {
    // Swapped with the last page, because that is the one being written to.
    std::swap(document_.pages[i], document_.pages.back());
    add_header(header);
    add_footer(i);
    std::swap(document_.pages[i], document_.pages.back());
  }
  return std::move(document_);
}

}  // namespace talutil
