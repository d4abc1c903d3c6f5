#include "documents/report_composer.hpp"

#include <algorithm>

#include "automation/numbers.hpp"
#include "documents/arabic_joining.hpp"
#include "documents/text_direction.hpp"
#include "documents/visible_text.hpp"

namespace talutil {

namespace {

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

/// A line of a kept text at its place.
PlacedLine placed(TextView kept, const FontStyle& font) {
  return {.units = kept.data(), .length = static_cast<std::uint32_t>(kept.size()), .font = font};
}

}  // namespace

ReportComposer::ReportComposer(std::shared_ptr<FontMetrics> metrics, PageSetup setup)
    : metrics_(*metrics), pages_(std::make_unique<ReportPages>(std::move(metrics), std::move(setup))) {
  const Text header = visible_line(pages_->setup().header);
  document_.title = trim_blanks(header);
  begin_page();
  if (!document_.title.empty()) document_.bookmarks.push_back({document_.title});
}

void ReportComposer::begin_page() {
  pages_->begin_page();
  y_ = setup().margin_top;
}

/// @param line of a kept text
void ReportComposer::add_line(TextView line, const FontStyle& font, bool is_right_to_left) {
  const std::int32_t height = line_height(font);
  if (y_ + height > setup().bottom() && y_ > setup().margin_top) begin_page();
  if (is_right_to_left) line = line.substr(0, line.find_last_not_of(u' ') + 1);
  PlacedLine placed_line = placed(line, font);
  placed_line.top = y_;
  placed_line.flows = true;
  placed_line.is_right_to_left = is_right_to_left;
  if (!line.empty()) pages_->add(placed_line);
  y_ += height;
}

/// @param text kept
void ReportComposer::add_paragraph(TextView text, const FontStyle& font) {
  const double room = setup().room();
  const bool is_reversed = is_right_to_left(text);
  std::size_t line_start = 0;
  std::size_t word_start = 0;  // After the last position at which the line may be broken.
  double x = 0;
  double word_width = 0;
  for (std::size_t i = 0; i < text.size(); ++i) {
    const bool is_blank = text[i] == u' ' || text[i] == u'\t';
    const double width =
        text[i] == u'\t' ? after_tab(x, font, metrics_) - x : to_twips(metrics_.width(text[i], font), font);
    // Blanks at the end of a line may extend beyond its edge.
    if (!is_blank && x + width > room && i > line_start) {
      const bool breaks_word = word_start == line_start || !setup().wraps_words;
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
      add_paragraph(pages_->keep(is_plain(paragraph) ? paragraph : joined(with_visible_controls(paragraph))), font);
    }
    if (ends_page) begin_page();
    at = text.substr(end).starts_with(u"\r\n") ? end + 2 : end + 1;
  }
}

void ReportComposer::add_text_box(TextView text, const TwipsRectangle& place, const FontStyle& font) {
  const std::int32_t height = line_height(font);
  const TextView shown = pages_->keep(joined(visible_text(text)));
  const bool is_reversed = is_right_to_left(shown);
  TextView rest = shown;
  for (std::int32_t top = place.top; !rest.empty() && top + height <= place.top + std::max(place.height, height);
       top += height) {
    PlacedLine line = placed(take_line(rest, place.width, font, metrics_), font);
    line.left = place.left;
    line.top = top;
    line.is_right_to_left = is_reversed;
    pages_->add(line);
  }
}

void ReportComposer::add_picture(Picture picture) {
  const std::int32_t room_down = setup().bottom() - setup().margin_top;
  const double scale = std::min({1.0, static_cast<double>(setup().room()) / std::max(picture.place.width, 1),
                                 static_cast<double>(room_down) / std::max(picture.place.height, 1)});
  picture.place.width = rounded(picture.place.width * scale);
  picture.place.height = rounded(picture.place.height * scale);
  if (y_ + picture.place.height > setup().bottom() && y_ > setup().margin_top) begin_page();
  picture.place.left = setup().margin_left;
  picture.place.top = y_;
  y_ += picture.place.height;
  pages_->add(std::move(picture));
}

/// From here on, pages show the columns of a part, which each of them says.
void ReportComposer::begin_part(const GridLayout& layout, std::size_t part) {
  const auto words = [](std::size_t number) { return number_to_text(static_cast<std::int32_t>(number)); };
  const auto& [first, end] = layout.parts()[part];
  const Text columns =
      end == first + 1 ? u"Column " + words(end) : u"Columns " + words(first + 1) + u" to " + words(end);
  document_.bookmarks.push_back({columns, pages_->count() - 1, 1});
  pages_->set_note(u"Part " + words(part + 1) + u" of " + words(layout.parts().size()) + u": c" + columns.substr(1) +
                   u" of " + words(layout.grid().columns.size()));
}

void ReportComposer::add_part(const GridLayout& layout, std::size_t part) {
  const std::size_t heading_rows = layout.grid().heading_rows;
  PlacedRows rows{.grid = static_cast<std::uint32_t>(pages_->grids().size() - 1),
                  .part = static_cast<std::uint32_t>(part),
                  .top = y_};
  for (std::size_t row = 0; row < layout.grid().rows.size(); ++row) {
    if (row >= heading_rows && y_ + layout.height(row) > setup().bottom() && y_ > setup().margin_top) {
      pages_->add(rows);
      begin_page();
      rows.first = rows.end;
      rows.top = y_;
      rows.repeats_headings = true;
      y_ += layout.heading_height();
    }
    ++rows.end;
    y_ += layout.height(row);
  }
  pages_->add(rows);
}

void ReportComposer::add_grid(GridContents grid) {
  const GridLayout& layout = pages_->add(GridLayout(std::move(grid), setup(), metrics_));
  for (std::size_t part = 0; part < layout.parts().size(); ++part) {
    if (part > 0) begin_page();
    if (layout.parts().size() > 1) begin_part(layout, part);
    add_part(layout, part);
  }
  pages_->set_note({});
}

Document ReportComposer::finish() {
  document_.pages = PageList(std::move(pages_));
  return std::move(document_);
}

}  // namespace talutil
