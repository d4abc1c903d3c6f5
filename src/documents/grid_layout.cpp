// Lays grids out on pages.
#include <algorithm>
#include <cmath>

#include "automation/control.hpp"
#include "documents/report_composer.hpp"

namespace talutil {

namespace {

constexpr std::int32_t cell_padding = 60;
constexpr std::int32_t hair_line = 10;
constexpr double boolean_type = 11;
constexpr std::int16_t check_box_setting = 5;
constexpr std::uint32_t usual_heading_colour = 0x00E8E8E8;
constexpr std::uint32_t usual_line_colour = 0x00C0C0C0;

/// Reads a property that the grid may not have.
template <class T>
T answer_or(const Control& grid, TextView member, T otherwise) {
  return grid.answers(member) ? grid.get<T>(member) : otherwise;
}

std::uint32_t colour_or(const Control& grid, TextView member, std::uint32_t otherwise) {
  const auto colour = static_cast<std::uint32_t>(answer_or(grid, member, static_cast<std::int32_t>(otherwise)));
  constexpr std::uint32_t system_colour = 0x80000000;
  // A system colour depends on the user's screen, which has no place in a report.
  return (colour & system_colour) != 0 ? otherwise : colour & 0xFFFFFF;
}

enum class Alignment : std::uint8_t { left, centre, right, general };

/// Grid alignments come in threes (top, middle, bottom): left, centred, right. 9 is right for numbers, left for texts.
Alignment alignment_of(std::int32_t code) noexcept {
  return code < 0 || code > 8 ? Alignment::general : static_cast<Alignment>(code / 3);
}

}  // namespace

/// The contents of a grid: read once, completely, before the first cell is laid out.
struct ReportComposer::GridLayout {
  struct Column {
    std::int32_t index = 0;
    std::int32_t width = 0;
    bool is_boolean = false;
    Alignment alignment = Alignment::general;
  };
  struct Cell {
    Text text;
    bool is_ticked = false;
  };

  FontStyle font;
  std::uint32_t heading_colour = usual_heading_colour;
  std::uint32_t line_colour = usual_line_colour;
  bool has_lines = true;
  bool wraps = false;
  std::vector<Column> columns;
  std::size_t heading_rows = 0;       ///< Among the rows that are shown.
  std::vector<std::int32_t> heights;  ///< Of the rows that are shown; 0 for a row as high as its text.
  std::vector<Cell> cells;            ///< Row by row.

  GridLayout(const Control& grid, const FontStyle& usual_font, std::int32_t room);

  [[nodiscard]] std::size_t rows() const noexcept { return heights.size(); }
  [[nodiscard]] const Cell& cell(std::size_t row, std::size_t column) const {
    return cells[row * columns.size() + column];
  }
  [[nodiscard]] std::int32_t height_of_lines(std::int32_t lines) const noexcept {
    return lines * line_height(font) + cell_padding;
  }
};

ReportComposer::GridLayout::GridLayout(const Control& grid, const FontStyle& usual_font, std::int32_t room)
    : font(usual_font),
      heading_colour(colour_or(grid, u"BackColorFixed", usual_heading_colour)),
      line_colour(colour_or(grid, u"GridColor", usual_line_colour)),
      has_lines(answer_or<std::int32_t>(grid, u"GridLines", 1) != 0),
      wraps(answer_or<Boolean>(grid, u"WordWrap", Boolean(false))) {
  if (const Text name = answer_or<Text>(grid, u"FontName", {}); !name.empty()) font.family = family_of(name);
  if (const auto size = answer_or<float>(grid, u"FontSize", font.points); size >= 4 && size <= 72) font.points = size;
  const auto column_count = grid.get<std::int32_t>(u"Cols");
  for (std::int32_t c = 0; c < column_count; ++c) {
    if (grid.answers(u"ColHidden") && grid.get<Boolean>(u"ColHidden", {c})) continue;
    const auto width = grid.answers(u"ColWidth") ? grid.get<std::int32_t>(u"ColWidth", {c}) : 1000;
    if (width == 0) continue;
    Column column{c, std::clamp(width, 2 * cell_padding, room), false, Alignment::general};
    column.is_boolean =
        grid.answers(u"ColDataType") && grid.get(u"ColDataType", {c}).equals_number(boolean_type, grid.locale());
    if (grid.answers(u"ColAlignment")) column.alignment = alignment_of(grid.get<std::int32_t>(u"ColAlignment", {c}));
    columns.push_back(column);
  }

  const auto row_count = grid.get<std::int32_t>(u"Rows");
  const auto fixed_rows = answer_or<std::int32_t>(grid, u"FixedRows", 0);
  const auto text = grid.repeated_get(u"TextMatrix", {0, 0});
  for (std::int32_t r = 0; r < row_count; ++r) {
    if (grid.answers(u"RowHidden") && grid.get<Boolean>(u"RowHidden", {r})) continue;
    if (r < fixed_rows) ++heading_rows;
    heights.push_back(grid.answers(u"RowHeight") ? std::max(0, grid.get<std::int32_t>(u"RowHeight", {r})) : 0);
    text->set(0, r);
    for (const Column& column : columns) {
      Cell& cell = cells.emplace_back();
      if (column.is_boolean && r >= fixed_rows) {
        cell.is_ticked = grid.get(u"Cell", {check_box_setting, r, column.index}).equals_number(1, grid.locale());
        continue;
      }
      text->set(1, column.index);
      cell.text = text->run_text(grid.locale());
    }
  }
}

void ReportComposer::add_cell(const GridLayout& layout, std::size_t row, std::size_t column_index,
                              const TwipsRectangle& place) {
  const GridLayout::Column& column = layout.columns[column_index];
  const GridLayout::Cell& cell = layout.cell(row, column_index);
  const bool is_heading = row < layout.heading_rows;
  if (column.is_boolean && !is_heading) {
    const std::int32_t size = line_height(layout.font) * 3 / 5;
    const TwipsRectangle box{place.left + (place.width - size) / 2, place.top + (place.height - size) / 2, size, size};
    page().items.emplace_back(Box{.place = box, .fill = {}, .line_width = hair_line, .line_colour = 0});
    if (cell.is_ticked) {
      const std::int32_t inset = size / 4;
      page().items.emplace_back(
          Box{.place = {box.left + inset, box.top + inset, size - 2 * inset, size - 2 * inset}, .fill = 0U});
    }
    return;
  }
  Alignment alignment = column.alignment;
  if (alignment == Alignment::general) {
    const bool is_number = !is_heading && text_to_number(cell.text).has_value();
    alignment = is_number ? Alignment::right : Alignment::left;
  }
  const std::int32_t room = place.width - 2 * cell_padding;
  const std::int32_t height = line_height(layout.font);
  std::int32_t top = place.top + cell_padding / 2;
  TextView rest = cell.text;
  while (!rest.empty() && (top + height <= place.top + place.height || rest.size() == cell.text.size())) {
    // Without wrapping only the first line is shown, cut off where the room ends.
    const TextView line = layout.wraps ? take_line(rest, room, layout.font)
                                       : fitting(rest.substr(0, rest.find_first_of(u"\r\n")), room, layout.font);
    if (!layout.wraps) rest = {};
    const auto spare = static_cast<std::int32_t>(std::max(0.0, room - metrics_.width(line, layout.font)));
    std::int32_t x = place.left + cell_padding;
    if (alignment == Alignment::centre) x += spare / 2;
    if (alignment == Alignment::right) x += spare;
    add_runs(line, x, top, layout.font);
    top += height;
  }
}

void ReportComposer::add_row(const GridLayout& layout, std::size_t row, std::int32_t height, std::size_t first,
                             std::size_t end) {
  const bool is_heading = row < layout.heading_rows;
  std::int32_t left = setup_.margin_left;
  for (std::size_t c = first; c < end; ++c) {
    const TwipsRectangle place{left, y_, layout.columns[c].width, height};
    if (is_heading || layout.has_lines) {
      page().items.emplace_back(Box{.place = place,
                                    .fill = is_heading ? std::optional(layout.heading_colour) : std::nullopt,
                                    .line_width = layout.has_lines ? hair_line : 0,
                                    .line_colour = layout.line_colour});
    }
    add_cell(layout, row, c, place);
    left += place.width;
  }
  y_ += height;
}

/// The height of each row, the same on every page: as the grid specifies, or as its longest text needs.
std::vector<std::int32_t> ReportComposer::row_heights(const GridLayout& layout) {
  // A row higher than a page is cut off.
  const std::int32_t most = setup_.bottom() - setup_.margin_top;
  std::vector<std::int32_t> heights(layout.rows());
  for (std::size_t row = 0; row < heights.size(); ++row) {
    std::int32_t most_lines = 1;
    for (std::size_t c = 0; layout.wraps && layout.heights[row] == 0 && c < layout.columns.size(); ++c) {
      std::int32_t lines = 0;
      for (TextView rest = layout.cell(row, c).text; !rest.empty() && layout.height_of_lines(lines) < most; ++lines) {
        (void)take_line(rest, layout.columns[c].width - 2 * cell_padding, layout.font);
      }
      most_lines = std::max(most_lines, lines);
    }
    heights[row] = std::min(most, layout.heights[row] > 0 ? layout.heights[row] : layout.height_of_lines(most_lines));
  }
  return heights;
}

void ReportComposer::add_grid(const Control& grid, const FontStyle& font) {
  const GridLayout layout(grid, font, setup_.room());
  const std::vector<std::int32_t> heights = row_heights(layout);
  for (std::size_t first = 0; first < layout.columns.size();) {
    std::size_t end = first;
    std::int32_t width = 0;
    while (end < layout.columns.size() && (end == first || width + layout.columns[end].width <= setup_.room())) {
      width += layout.columns[end++].width;
    }
    if (first > 0) begin_page();
    const auto add = [&](std::size_t row) { add_row(layout, row, heights[row], first, end); };
    for (std::size_t row = 0; row < layout.rows(); ++row) {
      if (row >= layout.heading_rows && y_ + heights[row] > setup_.bottom() && y_ > setup_.margin_top) {
        begin_page();
        for (std::size_t heading = 0; heading < layout.heading_rows; ++heading) add(heading);
      }
      add(row);
    }
    first = end;
  }
}

}  // namespace talutil
