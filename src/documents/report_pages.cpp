#include "documents/report_pages.hpp"

#include <algorithm>
#include <utility>

#include "automation/numbers.hpp"
#include "documents/arabic_joining.hpp"
#include "documents/text_direction.hpp"
#include "documents/visible_text.hpp"

namespace talutil {

namespace {

constexpr std::uint32_t black = 0;

Box rule(std::int32_t left, std::int32_t top, std::int32_t width) {
  return {.place = {left, top, width, 0}, .fill = {}, .line_width = hair_line, .line_colour = black};
}

}  // namespace

ReportPages::ReportPages(std::shared_ptr<FontMetrics> metrics, PageSetup setup)
    : metrics_(std::move(metrics)),
      setup_(std::move(setup)),
      header_(fitting_header()),
      has_title_(!trim_blanks(visible_line(setup_.header)).empty()),
      notes_(1) {}

void ReportPages::begin_page() { starts_.push_back({pieces_.size(), note_}); }

void ReportPages::set_note(Text note) {
  if (note.empty()) {
    note_ = 0;
    return;
  }
  notes_.push_back(std::move(note));
  starts_.back().note = note_ = notes_.size() - 1;
}

void ReportPages::add(Picture picture) {
  pictures_.push_back(std::move(picture));
  pieces_.emplace_back(PlacedPicture{pictures_.size() - 1});
}

Page ReportPages::compose(std::size_t index) const {
  Page page{setup_.width, setup_.height, {}};
  const std::size_t end = index + 1 < starts_.size() ? starts_[index + 1].first_piece : pieces_.size();
  for (std::size_t i = starts_[index].first_piece; i < end; ++i) {
    std::visit([&](const auto& placed) { draw(page, placed); }, pieces_[i]);
  }
  draw_header(page);
  draw_footer(page, index);
  return page;
}

/// A line of flowing text from right to left begins at the right margin, and so do its tab stops.
void ReportPages::draw(Page& page, const PlacedLine& placed) const {
  LineWriter lines(*metrics_, page);
  const TextView line(placed.units, placed.length);
  const LineLook look{.is_right_to_left = placed.is_right_to_left};
  if (!placed.flows) {
    lines.add(line, placed.left, placed.top, placed.font, look);
    return;
  }
  double x = 0;
  for (std::size_t start = 0; start < line.size();) {
    const std::size_t end = std::min(line.find(u'\t', start), line.size());
    const TextView words = line.substr(start, end - start);
    const double width = metrics_->width(words, placed.font);
    const double left = placed.is_right_to_left ? setup_.room() - x - width : x;
    lines.add(words, setup_.margin_left + rounded(left), placed.top, placed.font, look);
    x += width;
    start = end;
    for (; start < line.size() && line[start] == u'\t'; ++start) x = after_tab(x, placed.font, *metrics_);
  }
}

void ReportPages::draw(Page& page, const PlacedRows& rows) const {
  const GridLayout& layout = grids_[rows.grid];
  std::int32_t top = rows.top;
  const auto draw_rows = [&](std::size_t first, std::size_t end) {
    for (std::size_t row = first; row < end; ++row) {
      layout.draw_row(page, row, rows.part, setup_.margin_left, top, *metrics_);
      top += layout.height(row);
    }
  };
  if (rows.repeats_headings) draw_rows(0, layout.grid().heading_rows);
  draw_rows(rows.first, rows.end);
}

/// Wraps a text; all lines are indented like the first.
std::vector<Text> ReportPages::lines_of(TextView text, const FontStyle& font) const {
  constexpr std::size_t most_blanks = 8;
  const Text indent(std::min({text.find_first_not_of(u' '), text.size(), most_blanks}), u' ');
  const double room = setup_.room() - metrics_->width(indent, font);
  std::vector<Text> lines;
  text.remove_prefix(indent.size());
  while (!text.empty()) lines.push_back(indent + Text(take_line(text, room, font, *metrics_)));
  return lines;
}

ReportPages::Header ReportPages::fitting_header() const {
  constexpr float smallest = 6;
  constexpr std::int32_t edge = 360;  // Printers leave a quarter of an inch unprinted at the most.
  const Text text = joined(visible_text(setup_.header));
  const std::int32_t room = setup_.margin_top - line_height(setup_.header_font) - edge;
  Header header{setup_.header_font, lines_of(text, setup_.header_font), is_right_to_left(text)};
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

void ReportPages::draw_header(Page& page) const {
  LineWriter lines(*metrics_, page);
  const std::int32_t height = line_height(header_.font);
  const std::int32_t bottom = setup_.margin_top - line_height(setup_.header_font);
  std::int32_t top = bottom - height * static_cast<std::int32_t>(header_.lines.size());
  for (const Text& line : header_.lines) {
    const std::int32_t spare = setup_.room() - rounded(metrics_->width(line, header_.font));
    const std::int32_t left = setup_.margin_left + (header_.is_right_to_left ? std::max(0, spare) : 0);
    lines.add(line, left, top, header_.font, {.is_right_to_left = header_.is_right_to_left});
    top += height;
  }
  if (setup_.has_rule && has_title_) {
    page.items.emplace_back(rule(setup_.margin_left, bottom + line_height(setup_.header_font) / 4, setup_.room()));
  }
}

void ReportPages::draw_footer(Page& page, std::size_t index) const {
  LineWriter lines(*metrics_, page);
  const FontStyle font = setup_.footer_font.value_or(setup_.header_font);
  const std::int32_t top = setup_.bottom() + line_height(font);
  const Text footer = joined(setup_.footer);
  const LineLook look{.is_right_to_left = is_right_to_left(footer)};
  const std::int32_t date_end = lines.add(footer, setup_.margin_left, top, font, look);
  const Text number = u"Page " + number_to_text(static_cast<std::int32_t>(index + 1)) + u" of " +
                      number_to_text(static_cast<std::int32_t>(starts_.size()));
  const std::int32_t number_left = setup_.width - setup_.margin_right - rounded(metrics_->width(number, font));
  lines.add(number, number_left, top, font, {});
  const Text& note = notes_[starts_[index].note];
  const std::int32_t width = rounded(metrics_->width(note, font));
  const std::int32_t left = setup_.margin_left + (setup_.room() - width) / 2;
  const std::int32_t gap = line_height(font);
  const bool fits = left > date_end + gap && left + width < number_left - gap;
  lines.add(note, left, fits ? top : top + line_height(font), font, {});
}

}  // namespace talutil
