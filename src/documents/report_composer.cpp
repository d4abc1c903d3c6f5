#include "documents/report_composer.hpp"

#include <algorithm>
#include <cmath>

namespace talutil {

namespace {

constexpr std::int32_t hair_line = 10;  // Half a point.
constexpr std::uint32_t black = 0;

std::int32_t rounded(double value) { return static_cast<std::int32_t>(std::lround(value)); }

Box rule(std::int32_t left, std::int32_t top, std::int32_t width) {
  return {.place = {left, top, width, 0}, .fill = {}, .line_width = hair_line, .line_colour = black};
}

bool is_control(char16_t unit) noexcept {
  return (unit < u' ' && unit != u'\t' && unit != u'\r' && unit != u'\n') || unit == 0x7F;
}

/// Shows control characters in caret notation; those that end lines are kept.
Text with_visible_controls(TextView text) {
  Text result;
  for (const char16_t unit : text) {
    if (is_control(unit)) {
      result += u'^';
      result += static_cast<char16_t>(unit ^ 0x40);
    } else {
      result += unit;
    }
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
  begin_page();
}

void ReportComposer::begin_page() {
  document_.pages.push_back({setup_.width, setup_.height, {}});
  y_ = setup_.margin_top;
}

void ReportComposer::begin_section(Text title) {
  document_.bookmarks.push_back({std::move(title), document_.pages.size() - 1});
}

std::int32_t ReportComposer::add_runs(TextView text, std::int32_t left, std::int32_t top, const FontStyle& font) {
  double x = left;
  for (std::size_t start = 0; start < text.size();) {
    const bool is_wide = FontMetrics::is_wide(text[start]);
    std::size_t end = start + 1;
    while (end < text.size() && FontMetrics::is_wide(text[end]) == is_wide) ++end;
    const TextView run = text.substr(start, end - start);
    const double width = metrics_.width(run, font);
    page().items.emplace_back(TextRun{rounded(x), top, rounded(width), font, is_wide, black, Text(run)});
    x += width;
    start = end;
  }
  return rounded(x);
}

double ReportComposer::after_tab(double x, const FontStyle& font) {
  constexpr double characters = 8;
  const double distance = characters * to_twips(metrics_.width(u' ', font), font);
  return (std::floor(x / distance) + 1) * distance;
}

void ReportComposer::add_line(TextView line, const FontStyle& font) {
  const std::int32_t height = line_height(font);
  if (y_ + height > setup_.bottom() && y_ > setup_.margin_top) begin_page();
  double x = 0;
  for (std::size_t start = 0; start < line.size();) {
    const std::size_t end = std::min(line.find(u'\t', start), line.size());
    const std::int32_t left = setup_.margin_left + rounded(x);
    x = add_runs(line.substr(start, end - start), left, y_, font) - setup_.margin_left;
    if (end == start) x = left - setup_.margin_left;
    start = end;
    for (; start < line.size() && line[start] == u'\t'; ++start) x = after_tab(x, font);
  }
  y_ += height;
}

void ReportComposer::add_paragraph(TextView text, const FontStyle& font) {
  const double room = setup_.room();
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
      add_line(text.substr(line_start, end - line_start), font);
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
  add_line(text.substr(line_start), font);
}

void ReportComposer::add_text(TextView text, const FontStyle& font) {
  for (std::size_t at = 0; at < text.size();) {
    const std::size_t end = std::min(text.find_first_of(u"\r\n\f", at), text.size());
    const TextView paragraph = text.substr(at, end - at);
    const bool ends_page = end < text.size() && text[end] == u'\f';
    // A form feed on a line of its own adds no empty line.
    if (!paragraph.empty() || !ends_page) {
      if (std::ranges::any_of(paragraph, is_control))
        add_paragraph(with_visible_controls(paragraph), font);
      else
        add_paragraph(paragraph, font);
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
  const std::size_t line_end = std::min(text.find_first_of(u"\r\n"), text.size());
  const TextView line = text.substr(0, line_end);
  std::size_t shown = fitting(line, room, font).size();
  if (shown == line.size()) {
    text.remove_prefix(std::min(line_end + (text.substr(line_end).starts_with(u"\r\n") ? 2 : 1), text.size()));
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
  const Text shown = with_visible_controls(text);
  TextView rest = shown;
  for (std::int32_t top = place.top; !rest.empty() && top + height <= place.top + std::max(place.height, height);
       top += height) {
    add_runs(take_line(rest, place.width, font), place.left, top, font);
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

Document ReportComposer::finish() {
  const std::size_t count = document_.pages.size();
  const FontStyle& font = setup_.header_font;
  const Text title(trim_blanks(setup_.header));
  for (std::size_t i = 0; i < count; ++i) {
    Page& target = document_.pages[i];
    // Swapped with the last page, because that is the one being written to.
    std::swap(target, document_.pages.back());
    const std::int32_t header_top = setup_.margin_top - 2 * line_height(font);
    add_runs(fitting(setup_.header, setup_.room(), font), setup_.margin_left, header_top, font);
    if (setup_.has_rule && !title.empty()) {
      page().items.emplace_back(
          rule(setup_.margin_left, header_top + line_height(font) + line_height(font) / 4, setup_.room()));
    }
    const std::int32_t footer_top = setup_.bottom() + line_height(font);
    add_runs(setup_.footer, setup_.margin_left, footer_top, font);
    const Text number = u"Page " + number_to_text(static_cast<std::int32_t>(i + 1)) + u" of " +
                        number_to_text(static_cast<std::int32_t>(count));
    add_runs(number, setup_.width - setup_.margin_right - rounded(metrics_.width(number, font)), footer_top, font);
    std::swap(target, document_.pages.back());
  }
  document_.title = title;
  return std::move(document_);
}

}  // namespace talutil
