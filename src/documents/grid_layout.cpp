// Lays grids out on pages.
#include <algorithm>
#include <cmath>

#include "documents/grid_contents.hpp"
#include "documents/report_composer.hpp"
#include "documents/text_direction.hpp"

namespace talutil {

namespace {

constexpr std::int32_t cell_padding = 60;
constexpr std::int32_t hair_line = 10;

using Contents = GridContents;

std::int32_t height_of_lines(const Contents& grid, std::int32_t lines) noexcept {
  return lines * line_height(grid.font) + cell_padding;
}

bool is_equal_heading(const Contents& grid, const Contents::Cell& one, const Contents::Cell& other) {
  return !one.text.empty() && one.text == other.text && grid.look(one).background == grid.look(other).background;
}

}  // namespace

/// How the columns and rows of a grid are divided among pages.
struct ReportComposer::GridLayout {
  /// A half-open range of columns that stand next to each other on a page, behind the repeated ones.
  struct Part {
    std::size_t first = 0;
    std::size_t end = 0;
  };

  const GridContents& grid;
  std::vector<std::int32_t> widths;
  std::vector<std::int32_t> heights;
  std::size_t repeated = 0;  ///< The leading columns that stand on every page.
  std::vector<Part> parts;

  /// Fixed columns are repeated unless they leave too little room for the others.
  GridLayout(const GridContents& contents, std::int32_t room) : grid(contents) {
    std::int32_t fixed_width = 0;
    for (std::size_t c = 0; c < grid.columns.size(); ++c) {
      widths.push_back(std::clamp(grid.columns[c].width, 2 * cell_padding, room));
      if (c < grid.heading_columns) fixed_width = std::min(room, fixed_width + widths.back());
    }
    if (fixed_width <= room / 2) repeated = grid.heading_columns;
    const std::int32_t left = room - (repeated == 0 ? 0 : fixed_width);
    for (std::size_t first = repeated; first < widths.size();) {
      Part part{first, first};
      for (std::int32_t width = 0; part.end < widths.size(); ++part.end) {
        std::int32_t& next = widths[part.end];
        next = std::min(next, left);
        if (part.end > first && width + next > left) break;
        width += next;
      }
      first = part.end;
      parts.push_back(part);
    }
    if (parts.empty() && repeated > 0) parts.push_back({repeated, repeated});
  }
};

void ReportComposer::add_check_box(bool is_ticked, const TwipsRectangle& place, const FontStyle& font) {
  const std::int32_t size = line_height(font) * 3 / 5;
  const TwipsRectangle box{place.left + (place.width - size) / 2, place.top + (place.height - size) / 2, size, size};
  page().items.emplace_back(Box{.place = box, .fill = {}, .line_width = hair_line, .line_colour = 0});
  if (!is_ticked) return;
  const std::int32_t inset = size / 4;
  page().items.emplace_back(
      Box{.place = {box.left + inset, box.top + inset, size - 2 * inset, size - 2 * inset}, .fill = 0U});
}

void ReportComposer::add_cell(const GridLayout& layout, std::size_t row, std::size_t column,
                              const TwipsRectangle& place) {
  const GridContents& grid = layout.grid;
  const GridContents::Cell& cell = grid.cell(row, column);
  const CellLook& look = grid.look(cell);
  const GridContents::Lines& lines = grid.is_heading(row, column) ? grid.heading_lines : grid.lines;
  if (look.background || lines) {
    page().items.emplace_back(Box{.place = place,
                                  .fill = look.background,
                                  .line_width = lines ? hair_line : 0,
                                  .line_colour = lines.value_or(0)});
  }
  const FontStyle font = grid.font_of(cell);
  if (grid.is_check_box(row, column)) return add_check_box(cell.is_ticked, place, font);
  const bool is_reversed = is_right_to_left(cell.text);
  Alignment alignment = look.alignment;
  if (alignment == Alignment::general) {
    const bool is_number = row >= grid.heading_rows && text_to_number(cell.text).has_value();
    alignment = is_number || is_reversed ? Alignment::right : Alignment::left;
  }
  const std::int32_t room = place.width - 2 * cell_padding;
  const std::int32_t height = line_height(font);
  std::int32_t top = place.top + cell_padding / 2;
  TextView rest = cell.text;
  while (!rest.empty() && (top + height <= place.top + place.height || rest.size() == cell.text.size())) {
    // Without wrapping the text is cut off where the room ends.
    const TextView line = grid.wraps ? take_line(rest, room, font) : fitting(rest, room, font);
    if (!grid.wraps) rest = {};
    const auto spare = static_cast<std::int32_t>(std::max(0.0, room - metrics_.width(line, font)));
    std::int32_t x = place.left + cell_padding;
    if (alignment == Alignment::centre) x += spare / 2;
    if (alignment == Alignment::right) x += spare;
    add_runs(line, x, top, font, {look.letters, is_reversed});
    top += height;
  }
}

/// Adds the cells of a row, where equal headings of rows and columns that merge are a single cell.
void ReportComposer::add_row(const GridLayout& layout, std::size_t row, std::size_t part) {
  const GridContents& grid = layout.grid;
  const bool is_heading = row < grid.heading_rows;
  const auto continues_down = [&](std::size_t below, std::size_t column) {
    return below > 0 && below < grid.heading_rows && grid.columns[column].merges &&
           is_equal_heading(grid, grid.cell(below - 1, column), grid.cell(below, column));
  };
  std::int32_t left = setup_.margin_left;
  const auto add = [&](std::size_t first, std::size_t end) {
    for (std::size_t c = first; c < end;) {
      TwipsRectangle place{left, y_, layout.widths[c], layout.heights[row]};
      std::size_t next = c + 1;
      for (; is_heading && grid.rows[row].merges && next < end &&
             is_equal_heading(grid, grid.cell(row, c), grid.cell(row, next));
           ++next) {
        place.width += layout.widths[next];
      }
      left += place.width;
      const bool is_single = next == c + 1;
      for (std::size_t below = row + 1; is_single && continues_down(below, c); ++below) {
        place.height += layout.heights[below];
      }
      if (!is_single || !continues_down(row, c)) add_cell(layout, row, c, place);
      c = next;
    }
  };
  add(0, layout.repeated);
  add(layout.parts[part].first, layout.parts[part].end);
  y_ += layout.heights[row];
}

/// The height of each row, the same on every page: as the grid specifies, or as its longest text needs.
void ReportComposer::set_row_heights(GridLayout& layout) {
  const GridContents& grid = layout.grid;
  // A row higher than a page is cut off.
  const std::int32_t most = setup_.bottom() - setup_.margin_top;
  for (std::size_t row = 0; row < grid.rows.size(); ++row) {
    std::int32_t most_lines = 1;
    for (std::size_t c = 0; grid.wraps && grid.rows[row].height == 0 && c < grid.columns.size(); ++c) {
      const GridContents::Cell& cell = grid.cell(row, c);
      std::int32_t lines = 0;
      for (TextView rest = cell.text; !rest.empty() && height_of_lines(grid, lines) < most; ++lines) {
        (void)take_line(rest, layout.widths[c] - 2 * cell_padding, grid.font_of(cell));
      }
      most_lines = std::max(most_lines, lines);
    }
    const std::int32_t height = grid.rows[row].height;
    layout.heights.push_back(std::min(most, height > 0 ? height : height_of_lines(grid, most_lines)));
  }
}

/// From here on, pages show the columns of a part, which each of them says.
void ReportComposer::begin_part(const GridLayout& layout, std::size_t part) {
  const auto words = [](std::size_t number) { return number_to_text(static_cast<std::int32_t>(number)); };
  const auto& [first, end] = layout.parts[part];
  const Text columns =
      end == first + 1 ? u"Column " + words(end) : u"Columns " + words(first + 1) + u" to " + words(end);
  document_.bookmarks.push_back({columns, document_.pages.size() - 1, 1});
  note_ = u"Part " + words(part + 1) + u" of " + words(layout.parts.size()) + u": c" + columns.substr(1) + u" of " +
          words(layout.widths.size());
  notes_.back() = note_;
}

void ReportComposer::add_grid(const GridContents& grid) {
  GridLayout layout(grid, setup_.room());
  set_row_heights(layout);
  for (std::size_t part = 0; part < layout.parts.size(); ++part) {
    if (part > 0) begin_page();
    if (layout.parts.size() > 1) begin_part(layout, part);
    for (std::size_t row = 0; row < grid.rows.size(); ++row) {
      if (row >= grid.heading_rows && y_ + layout.heights[row] > setup_.bottom() && y_ > setup_.margin_top) {
        begin_page();
        for (std::size_t heading = 0; heading < grid.heading_rows; ++heading) add_row(layout, heading, part);
      }
      add_row(layout, row, part);
    }
  }
  note_.clear();
}

}  // namespace talutil
