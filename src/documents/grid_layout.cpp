#include "documents/grid_layout.hpp"

#include <algorithm>
#include <numeric>

#include "automation/numbers.hpp"
#include "documents/text_direction.hpp"

namespace talutil {

namespace {

constexpr std::int32_t cell_padding = 60;

std::int32_t height_of_lines(const GridContents& grid, std::int32_t lines) noexcept {
  return lines * line_height(grid.font) + cell_padding;
}

bool is_equal_heading(const GridContents::Cell& one, const GridContents::Cell& other) {
  return !one.text.empty() && one.text == other.text && one.look.background == other.look.background;
}

}  // namespace

GridLayout::GridLayout(GridContents contents, const PageSetup& setup, FontMetrics& metrics)
    : grid_(std::move(contents)) {
  divide_columns(setup.room());
  // A row higher than a page is cut off.
  set_heights(setup.bottom() - setup.margin_top, metrics);
}

/// Fixed columns are repeated unless they leave too little room for the others.
void GridLayout::divide_columns(std::int32_t room) {
  std::int32_t fixed_width = 0;
  for (std::size_t c = 0; c < grid_.columns.size(); ++c) {
    widths_.push_back(std::clamp(grid_.columns[c].width, 2 * cell_padding, room));
    if (c < grid_.heading_columns) fixed_width = std::min(room, fixed_width + widths_.back());
  }
  if (fixed_width <= room / 2) repeated_ = grid_.heading_columns;
  const std::int32_t left = room - (repeated_ == 0 ? 0 : fixed_width);
  for (std::size_t first = repeated_; first < widths_.size();) {
    Part part{first, first};
    for (std::int32_t width = 0; part.end < widths_.size(); ++part.end) {
      std::int32_t& next = widths_[part.end];
      next = std::min(next, left);
      if (part.end > first && width + next > left) break;
      width += next;
    }
    first = part.end;
    parts_.push_back(part);
  }
  if (parts_.empty() && repeated_ > 0) parts_.push_back({repeated_, repeated_});
}

void GridLayout::set_heights(std::int32_t most, FontMetrics& metrics) {
  for (std::size_t row = 0; row < grid_.rows.size(); ++row) {
    std::int32_t most_lines = 1;
    for (std::size_t c = 0; grid_.wraps && grid_.rows[row].height == 0 && c < grid_.columns.size(); ++c) {
      const GridContents::Cell cell = grid_.cell(row, c);
      std::int32_t lines = 0;
      for (TextView rest = cell.text; !rest.empty() && height_of_lines(grid_, lines) < most; ++lines) {
        (void)take_line(rest, widths_[c] - 2 * cell_padding, grid_.font_of(cell.look), metrics);
      }
      most_lines = std::max(most_lines, lines);
    }
    const std::int32_t height = grid_.rows[row].height;
    heights_.push_back(std::min(most, height > 0 ? height : height_of_lines(grid_, most_lines)));
  }
}

std::int32_t GridLayout::heading_height() const {
  return std::accumulate(heights_.begin(), heights_.begin() + static_cast<std::ptrdiff_t>(grid_.heading_rows), 0);
}

/// Draws cells on a page.
class GridLayout::CellWriter {
 public:
  CellWriter(const GridContents& grid, Page& page, FontMetrics& metrics)
      : grid_(grid), page_(page), metrics_(metrics), lines_(metrics, page) {}

  void draw(std::size_t row, std::size_t column, const TwipsRectangle& place) {
    const GridContents::Cell cell = grid_.cell(row, column);
    const GridContents::Lines& lines = grid_.is_heading(row, column) ? grid_.heading_lines : grid_.lines;
    if (cell.look.background || lines) {
      page_.items.emplace_back(Box{.place = place,
                                   .fill = cell.look.background,
                                   .line_width = lines ? hair_line : 0,
                                   .line_colour = lines.value_or(0)});
    }
    const FontStyle font = grid_.font_of(cell.look);
    if (grid_.is_check_box(row, column)) return draw_check_box(cell.is_ticked, place, font);
    draw_text(cell, row < grid_.heading_rows, place, font);
  }

 private:
  void draw_check_box(bool is_ticked, const TwipsRectangle& place, const FontStyle& font) {
    const std::int32_t size = line_height(font) * 3 / 5;
    const TwipsRectangle box{place.left + (place.width - size) / 2, place.top + (place.height - size) / 2, size, size};
    page_.items.emplace_back(Box{.place = box, .fill = {}, .line_width = hair_line, .line_colour = 0});
    if (!is_ticked) return;
    const std::int32_t inset = size / 4;
    page_.items.emplace_back(
        Box{.place = {box.left + inset, box.top + inset, size - 2 * inset, size - 2 * inset}, .fill = 0U});
  }

  void draw_text(const GridContents::Cell& cell, bool is_heading, const TwipsRectangle& place, const FontStyle& font) {
    const bool is_reversed = is_right_to_left(cell.text);
    Alignment alignment = cell.look.alignment;
    if (alignment == Alignment::general) {
      const bool is_number = !is_heading && text_to_number(cell.text).has_value();
      alignment = is_number || is_reversed ? Alignment::right : Alignment::left;
    }
    const std::int32_t room = place.width - 2 * cell_padding;
    const std::int32_t height = line_height(font);
    std::int32_t top = place.top + cell_padding / 2;
    TextView rest = cell.text;
    while (!rest.empty() && (top + height <= place.top + place.height || rest.size() == cell.text.size())) {
      // Without wrapping the text is cut off where the room ends.
      const TextView line = grid_.wraps ? take_line(rest, room, font, metrics_) : fitting(rest, room, font, metrics_);
      if (!grid_.wraps) rest = {};
      const auto spare = static_cast<std::int32_t>(std::max(0.0, room - metrics_.width(line, font)));
      std::int32_t x = place.left + cell_padding;
      if (alignment == Alignment::centre) x += spare / 2;
      if (alignment == Alignment::right) x += spare;
      lines_.add(line, x, top, font, {cell.look.letters, is_reversed});
      top += height;
    }
  }

  const GridContents& grid_;
  Page& page_;
  FontMetrics& metrics_;
  LineWriter lines_;
};

/// Whether a heading is the lower part of the one above.
bool GridLayout::continues_down(std::size_t below, std::size_t column) const {
  return below > 0 && below < grid_.heading_rows && grid_.columns[column].merges &&
         is_equal_heading(grid_.cell(below - 1, column), grid_.cell(below, column));
}

void GridLayout::draw_row(Page& page, std::size_t row, std::size_t part, std::int32_t left, std::int32_t top,
                          FontMetrics& metrics) const {
  CellWriter cells(grid_, page, metrics);
  const bool merges = row < grid_.heading_rows && grid_.rows[row].merges;
  const auto draw = [&](std::size_t first, std::size_t end) {
    for (std::size_t c = first; c < end;) {
      TwipsRectangle place{left, top, widths_[c], heights_[row]};
      std::size_t next = c + 1;
      for (; merges && next < end && is_equal_heading(grid_.cell(row, c), grid_.cell(row, next)); ++next) {
        place.width += widths_[next];
      }
      left += place.width;
      const bool is_single = next == c + 1;
      for (std::size_t below = row + 1; is_single && continues_down(below, c); ++below) {
        place.height += heights_[below];
      }
      if (!is_single || !continues_down(row, c)) cells.draw(row, c, place);
      c = next;
    }
  };
  draw(0, repeated_);
  draw(parts_[part].first, parts_[part].end);
}

}  // namespace talutil
